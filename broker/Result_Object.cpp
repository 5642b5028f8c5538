// The function table of `CMPIResult`: takes what a provider returns, if the operation may return it.
#include "broker/Convert.h"

namespace KPRV::broker {

namespace {

/// Nothing of the call is in hand here.
CMPIStatus delivered(const Call<Result_Object>& call)
{
    if (Call_Frame* const frame = Call_Frame::top())
        frame->pack_old();
    return call.status();
}

/// True if the operation may return this kind of thing now.
bool may_return(Call<Result_Object>& call, Result_Object::Accepts what, const char* name)
{
    if (call->done_count)
        call.violation(call.core(), CMPI_RC_ERR_FAILED, "after CMReturnDone");
    else if (!(call->accepts & what))
        call.violation(call.core(), CMPI_RC_ERR_NOT_SUPPORTED,
                       std::string("this operation returns no ") + name);
    return static_cast<bool>(call);
}

CMPIStatus return_data(const CMPIResult* self, const CMPIValue* value, CMPIType type)
{
    Call<Result_Object> call("CMReturnData", self, nullptr);
    if (!call || !may_return(call, Result_Object::DATA, "data"))
        return call.status();
    Plain_Value read;
    // A method without a return value passes type 0, which is a null value of no type.
    if (type == CMPI_null || !read_value(call, call.core(), value, type, read))
        call->data.push_back(std::move(read));
    return call.status();
}

/// What is returned to a reader who has had enough is dropped: servers do not tell the provider that its
/// client has gone.
CMPIStatus return_instance(const CMPIResult* self, const CMPIInstance* instance)
{
    Call<Result_Object> call("CMReturnInstance", self, nullptr);
    if (!call || !may_return(call, Result_Object::INSTANCES, "instances"))
        return call.status();
    auto* object = argument_object<Instance_Object>(call, call.core(), instance);
    if (object && !call->stopped)
        call->stopped = !call->receiver.instance(object->value());
    return delivered(call);
}

CMPIStatus return_object_path(const CMPIResult* self, const CMPIObjectPath* path)
{
    Call<Result_Object> call("CMReturnObjectPath", self, nullptr);
    if (!call || !may_return(call, Result_Object::PATHS, "paths"))
        return call.status();
    auto* object = argument_object<Path_Object>(call, call.core(), path);
    if (object && !call->stopped)
        call->stopped = !call->receiver.path(Path_Value(object->content));
    return delivered(call);
}

CMPIStatus return_done(const CMPIResult* self)
{
    Call<Result_Object> call("CMReturnDone", self, nullptr);
    if (call && call->done_count++)
        call.violation(call.core(), CMPI_RC_ERR_FAILED, "a second time");
    return call.status();
}

CMPIResult* refuse_clone(const CMPIResult* self, CMPIStatus* rc)
{
    Call<Result_Object> call("CMClone", self, rc, "result");
    return call ? call.violation(call.core(), CMPI_RC_ERR_NOT_SUPPORTED, "servers do not clone results")
                : nullptr;
}

} // namespace

const CMPIResultFT result_table = {CMPIVersion100,  release_slot<Result_Object>, refuse_clone, return_data,
                                   return_instance, return_object_path,          return_done};

} // namespace KPRV::broker
