// The function table of `CMPIDateTime`: a moment or an interval.
#include "broker/Convert.h"
#include "broker/values/Datetime_Text.h"

namespace KPRV::broker {

namespace {

CMPIUint64 get_binary_format(const CMPIDateTime* self, CMPIStatus* rc)
{
    Call<Datetime_Object> call("CMGetBinaryFormat", self, rc);
    return call ? datetime_microseconds(call->text()) : 0;
}

CMPIString* get_string_format(const CMPIDateTime* self, CMPIStatus* rc)
{
    Call<Datetime_Object> call("CMGetStringFormat", self, rc);
    return call ? make_object<String_Object>(call.core(), call.name(), call->held())->cmpi() : nullptr;
}

CMPIBoolean is_interval(const CMPIDateTime* self, CMPIStatus* rc)
{
    Call<Datetime_Object> call("CMIsInterval", self, rc);
    return call && is_interval_text(call->text());
}

} // namespace

const CMPIDateTimeFT datetime_table = {CMPIVersion100,
                                       release_slot<Datetime_Object>,
                                       clone_slot<Datetime_Object>,
                                       get_binary_format,
                                       get_string_format,
                                       is_interval};

} // namespace KPRV::broker
