#include "tests/bench/Libraries.h"

#include "tests/bench/Lean_Broker.h"

#include <cstdio>
#include <cstdlib>
#include <dlfcn.h>

namespace KPRV::bench {

namespace {

[[noreturn]] void give_up(const char* text)
{
    fprintf(stderr, "bench: %s\n", text);
    exit(1);
}

template <class Function>
Function function(void* library, const char* name)
{
    return reinterpret_cast<Function>(find_symbol(library, name));
}

} // namespace

void* open_library(const char* path)
{
    void* const library = dlopen(path, RTLD_NOW | RTLD_GLOBAL);
    if (!library)
        give_up(dlerror());
    return library;
}

void* find_symbol(void* library, const std::string& name)
{
    void* const symbol = dlsym(library, name.c_str());
    if (!symbol)
        give_up(dlerror());
    return symbol;
}

Fast_Library& Fast_Library::get()
{
    static Fast_Library library;
    return library;
}

Fast_Library::Fast_Library() : Fast_Library(open_library(KLDR_FAST_LIBRARY)) {}

Fast_Library::Fast_Library(void* library)
    : prepare(function<Prepare_Storage>(library, "prepare_storage")),
      record(function<Record_Calls>(library, "record_calls")),
      get_adapters(function<JsonReqFP>(library, "getAllAdaptersIndexString")),
      get_adapter(function<JsonReqFP>(library, "getHbaByWwn")),
      get_fc_ports(function<JsonReqFP>(library, "getFcPhyPortIndicesByAdapter")),
      get_port(function<JsonReqFP>(library, "getPortByWwn")),
      get_remote_ports(function<JsonReqFP>(library, "getAllRemotePorts")),
      get_remote_port(function<JsonReqFP>(library, "getCompleteRemotePort")),
      get_server_time(function<JsonReqFP>(library, "getServerTime")),
      get_fc(function<JsonReqFP>(library, "getFcByFcWwn")),
      _send_event(function<evtProcessCB>(library, "send_event"))
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
    const auto factory =
        function<Factory>(_handle, (std::string(class_name) + "_Provider_Create_" + kind + "MI").c_str());
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
