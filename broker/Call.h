#pragma once

#include "broker/Call_Frame.h"

namespace KPRV::broker {

/// One CMPI call on an object, from its entry to its status. Checks the object, passes the call log's gate
/// and sets the caller's status. False if the call must not go on: the object is null, unknown, of another
/// kind or released already (each a violation), or the call was told to fail.
class Call_Base
{
public:
    Call_Base(const char* name, CMPIStatus* rc) : _name(name), _rc(rc) { set(CMPI_RC_OK); }

    explicit operator bool() const { return _code == CMPI_RC_OK; }
    const char* name() const { return _name; }
    CMPIrc code() const { return _code; }
    CMPIStatus status() const { return {_code, nullptr}; }

    /// Ends the call with this code; null, so that `return call.fail(...)` serves functions that answer a
    /// pointer.
    std::nullptr_t fail(CMPIrc code)
    {
        set(code);
        return nullptr;
    }
    /// The same, and the provider is to blame.
    std::nullptr_t violation(Core& core, CMPIrc code, const std::string& what)
    {
        core.violations.add(_name, what);
        return fail(code);
    }
    /// A text that must not be null: a violation and code 4 otherwise.
    bool need_text(Core& core, const char* text, const char* what)
    {
        if (!text)
            violation(core, CMPI_RC_ERR_INVALID_PARAMETER, std::string("null ") + what);
        return text != nullptr;
    }

protected:
    void set(CMPIrc code)
    {
        _code = code;
        if (_rc)
            *_rc = {code, nullptr};
    }
    /// The good object of that kind at the address; null after a violation.
    Object* check(const void* address, Object_Kind kind, std::string_view argument);

private:
    const char* _name;
    CMPIStatus* _rc;
    CMPIrc _code = CMPI_RC_OK;
};

template <class T>
class Call : public Call_Base
{
public:
    Call(const char* name, const typename T::Cmpi* self, CMPIStatus* rc, const char* argument = nullptr)
        : Call_Base(name, rc), _object(static_cast<T*>(check(self, T::KIND, argument ? argument : "")))
    {
    }
    T* operator->() const { return _object; }
    T& operator*() const { return *_object; }
    Core& core() const { return _object->core; }

private:
    T* _object;
};

/// An object that came as a further argument of a call; null after a violation.
template <class T>
T* argument_object(Call_Base& call, Core& core, const typename T::Cmpi* address);

Object* argument_object(Call_Base& call, Core& core, const void* address, Object_Kind kind);

template <class T>
T* argument_object(Call_Base& call, Core& core, const typename T::Cmpi* address)
{
    return static_cast<T*>(argument_object(call, core, address, T::KIND));
}

/// The `release` and `clone` slots of every table.
template <class T>
CMPIStatus release_slot(typename T::Cmpi* self)
{
    Call<T> call("CMRelease", self, nullptr, kind_name(T::KIND));
    return call ? CMPIStatus{release_by_provider(*call), nullptr} : call.status();
}

template <class T>
typename T::Cmpi* clone_slot(const typename T::Cmpi* self, CMPIStatus* rc)
{
    Call<T> call("CMClone", self, rc, kind_name(T::KIND));
    return call ? make_clone<T>(call.core(), *call)->cmpi() : nullptr;
}

/// What a getter answers when there is nothing.
inline CMPIData no_data(CMPIValueState state = CMPI_nullValue | CMPI_notFound)
{
    CMPIData data = {};
    data.state = state;
    return data;
}

} // namespace KPRV::broker
