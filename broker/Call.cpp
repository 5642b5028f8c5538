#include "broker/Call.h"

namespace KPRV::broker {

namespace {

/// A broken pointer belongs to no host; the frame tells whose provider is running.
void blame_current(const char* call, const std::string& what)
{
    if (Call_Frame* frame = Call_Frame::top())
        frame->core().violations.add(call, what);
    else
        std::fprintf(stderr, "CMPI contract violation outside any call: %s: %s\n", call, what.c_str());
}

std::string a_kind(Object_Kind kind)
{
    const char* name = kind_name(kind);
    return std::string(std::string_view("aeio").find(name[0]) == std::string_view::npos ? "a " : "an ") +
           name;
}

/// Empty if the object is good.
std::string fault_of(const Object* object, Object_Kind kind)
{
    if (!object)
        return "this is not " + a_kind(kind) + " of this server";
    if (object->kind != kind)
        return a_kind(object->kind) + " where " + a_kind(kind) + " is wanted";
    if (!object->live)
        return a_kind(kind) + " made by " + object->maker + " is used after its end";
    return {};
}

} // namespace

Object* Call_Base::check(const void* address, Object_Kind kind, std::string_view argument)
{
    Object* object = find_object(address);
    std::string fault = fault_of(object, kind);
    if (!fault.empty()) {
        if (object)
            object->core.violations.add(_name, fault);
        else
            blame_current(_name, fault);
        set(CMPI_RC_ERR_INVALID_HANDLE);
        return nullptr;
    }
    if (CMPIrc rc = object->core.calls.enter(_name, argument))
        set(rc);
    return object;
}

Object* argument_object(Call_Base& call, Core& core, const void* address, Object_Kind kind)
{
    Object* object = find_object(address);
    std::string fault = address ? fault_of(object, kind) : "null " + std::string(kind_name(kind));
    if (fault.empty())
        return object;
    call.violation(core, CMPI_RC_ERR_INVALID_PARAMETER, fault);
    return nullptr;
}

} // namespace KPRV::broker
