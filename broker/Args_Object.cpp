// The function table of `CMPIArgs`: the arguments of a method call.
#include "broker/Convert.h"

namespace KPRV::broker {

namespace {

CMPIStatus add_arg(const CMPIArgs* self, const char* name, const CMPIValue* value, CMPIType type)
{
    Call<Args_Object> call("CMAddArg", self, nullptr, name);
    Plain_Value read;
    if (call && call.need_text(call.core(), name, "argument name") &&
        !read_value(call, call.core(), value, type, read))
        KPRV::broker::set_value(call->content, name, std::move(read));
    return call.status();
}

CMPIData get_arg(const CMPIArgs* self, const char* name, CMPIStatus* rc)
{
    Call<Args_Object> call("CMGetArg", self, rc, name);
    return call ? make_entry(call, call.core(), call->content, name, "argument name", CMPI_RC_ERR_NOT_FOUND)
                : no_data();
}

CMPIData get_arg_at(const CMPIArgs* self, CMPICount index, CMPIString** name, CMPIStatus* rc)
{
    Call<Args_Object> call("CMGetArgAt", self, rc);
    return call ? make_entry_at(call, call.core(), call->content, index, name) : no_data();
}

CMPICount get_arg_count(const CMPIArgs* self, CMPIStatus* rc)
{
    Call<Args_Object> call("CMGetArgCount", self, rc);
    return call ? static_cast<CMPICount>(call->content.size()) : 0;
}

} // namespace

const CMPIArgsFT args_table = {
    CMPIVersion100, release_slot<Args_Object>, clone_slot<Args_Object>, add_arg, get_arg, get_arg_at,
    get_arg_count};

} // namespace KPRV::broker
