// The function table of `CMPIContext`: what a server tells a provider beside the request.
#include "broker/Convert.h"

namespace KPRV::broker {

namespace {

CMPIData entry_data(Call<Context_Object>& call, const char* name, const Plain_Value& value)
{
    CMPIData data = make_data(call.core(), call.name(), value);
    if (call->principal_without_text && same_name(name, CMPIPrincipal))
        data.value.string = make_object<String_Object>(call.core(), call.name(), nullptr)->cmpi();
    return data;
}

CMPIData get_entry(const CMPIContext* self, const char* name, CMPIStatus* rc)
{
    Call<Context_Object> call("CMGetContextEntry", self, rc, name);
    if (!call || !call.need_text(call.core(), name, "entry name"))
        return no_data();
    if (const Plain_Value* value = find_value(call->entries, name))
        return entry_data(call, name, *value);
    call.fail(CMPI_RC_ERR_NO_SUCH_PROPERTY);
    return no_data();
}

CMPIData get_entry_at(const CMPIContext* self, CMPICount index, CMPIString** name, CMPIStatus* rc)
{
    Call<Context_Object> call("CMGetContextEntryAt", self, rc);
    return call ? make_entry_at(call, call.core(), call->entries, index, name) : no_data();
}

CMPICount get_entry_count(const CMPIContext* self, CMPIStatus* rc)
{
    Call<Context_Object> call("CMGetContextEntryCount", self, rc);
    return call ? static_cast<CMPICount>(call->entries.size()) : 0;
}

CMPIStatus add_entry(const CMPIContext* self, const char* name, const CMPIValue* value, CMPIType type)
{
    Call<Context_Object> call("CMAddContextEntry", self, nullptr, name);
    Plain_Value read;
    if (call && call.need_text(call.core(), name, "entry name") &&
        !read_value(call, call.core(), value, type, read))
        set_value(call->entries, name, std::move(read));
    return call.status();
}

/// Both public servers refuse this: contexts are copied by `CBPrepareAttachThread` only.
CMPIContext* refuse_clone(const CMPIContext* self, CMPIStatus* rc)
{
    Call<Context_Object> call("CMClone", self, rc, "context");
    return call ? call.violation(call.core(), CMPI_RC_ERR_NOT_SUPPORTED, "servers do not clone contexts")
                : nullptr;
}

} // namespace

const CMPIContextFT context_table = {
    CMPIVersion100, release_slot<Context_Object>, refuse_clone, get_entry, get_entry_at, get_entry_count,
    add_entry};

} // namespace KPRV::broker
