// The function table of `CMPISelectExp`: a filter that gives its text and understands none of it.
#include "broker/Convert.h"

namespace KPRV::broker {

namespace {

CMPIString* get_string(const CMPISelectExp* self, CMPIStatus* rc)
{
    Call<Select_Object> call("CMGetSelExpString", self, rc);
    return call ? make_object<String_Object>(call.core(), call.name(), call->query)->cmpi() : nullptr;
}

/// Every slot that would have to understand the query.
template <class Result, class... Arguments>
Result not_supported(const CMPISelectExp* self, Arguments..., CMPIStatus* rc)
{
    Call<Select_Object> call("CMEvaluateSelExp", self, rc);
    if (call)
        call.fail(CMPI_RC_ERR_NOT_SUPPORTED);
    return Result();
}

} // namespace

const CMPISelectExpFT select_table = {CMPIVersion100,
                                      release_slot<Select_Object>,
                                      clone_slot<Select_Object>,
                                      not_supported<CMPIBoolean, const CMPIInstance*>,
                                      get_string,
                                      not_supported<CMPISelectCond*>,
                                      not_supported<CMPISelectCond*>,
                                      not_supported<CMPIBoolean, CMPIAccessor*, void*>};

} // namespace KPRV::broker
