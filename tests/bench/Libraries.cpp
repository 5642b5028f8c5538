#include "tests/bench/Libraries.h"

#include "tests/bench/Lean_Broker.h"
#include "tests/bench/Open_Library.h"

#include <cstdio>
#include <cstdlib>

namespace KPRV::bench {

namespace {

[[noreturn]] void give_up(const char* text)
{
    fprintf(stderr, "bench: %s\n", text);
    exit(1);
}

} // namespace

Fast_Library& Fast_Library::get()
{
    static Fast_Library library;
    return library;
}

Fast_Library::Fast_Library() : Fast_Library(open_library(KLDR_FAST_LIBRARY)) {}

Fast_Library::Fast_Library(void* library)
    : prepare(find_function<Prepare_Storage>(library, "prepare_storage")),
      record(find_function<Record_Calls>(library, "record_calls")),
      _send_event(find_function<evtProcessCB>(library, "send_event"))
{
}

Module& Module::get()
{
    static Module module;
    return module;
}

Module::Module() : _handle(nullptr)
{
    // First, so that the module finds it in its place.
    Fast_Library::get();
    _handle = open_library(KLDR_MODULE);
}

template <class MI>
MI* Module::create(const char* class_name, const char* kind) const
{
    using Factory = MI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
    const auto factory = find_function<Factory>(
        _handle, (std::string(class_name) + "_Provider_Create_" + kind + "MI").c_str());
    const Lean_Broker& server = Lean_Broker::get();
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    MI* const mi = factory(server.broker(), server.context(), &status);
    if (!mi || status.rc != CMPI_RC_OK)
        give_up(class_name);
    return mi;
}

CMPIInstanceMI* Module::instances(const char* class_name) const
{
    return create<CMPIInstanceMI>(class_name, "Instance");
}

CMPIAssociationMI* Module::associations(const char* class_name) const
{
    return create<CMPIAssociationMI>(class_name, "Association");
}

CMPIIndicationMI* Module::indications(const char* class_name) const
{
    return create<CMPIIndicationMI>(class_name, "Indication");
}

void Fast_Library::send_event(const char* text) const
{
    _send_event(text);
}

CMPIMethodMI* Module::methods(const char* class_name) const
{
    return create<CMPIMethodMI>(class_name, "Method");
}

} // namespace KPRV::bench
