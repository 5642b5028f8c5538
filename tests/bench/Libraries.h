#pragma once

#include "module/adapter/CIMProviderZntj.h"
#include "tests/bench/Storage_Size.h"

#include <cmpidt.h>
#include <cmpift.h>

#include <string>

namespace KPRV::bench {

/// The prepared adapter library, opened by its path; whoever asks for it by name from then on, as the module
/// and the plain twins do, gets the same one.
class Fast_Library
{
public:
    static Fast_Library& get();

    /// Tells the module of an event, as the library does.
    void send_event(const char* text) const;

    /// What the calls to come answer.
    const Prepare_Storage prepare;
    /// Who takes note of them.
    const Record_Calls record;

private:
    Fast_Library();
    explicit Fast_Library(void* library);

    const evtProcessCB _send_event;
};

/// The built module, opened as a server opens it, with the prepared library below it.
class Module
{
public:
    static Module& get();

    /// The management interfaces of a class. The program ends if there is none.
    CMPIInstanceMI* instances(const char* class_name) const;
    CMPIAssociationMI* associations(const char* class_name) const;
    CMPIMethodMI* methods(const char* class_name) const;
    CMPIIndicationMI* indications(const char* class_name) const;

private:
    Module();
    template <class MI>
    MI* create(const char* class_name, const char* kind) const;

    void* _handle;
};

} // namespace KPRV::bench
