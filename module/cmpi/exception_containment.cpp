#include "module/cmpi/exception_containment.h"
#include "module/cmpi/cimple_cmpi_adapter.h"

#if KLDR_CONTAIN_EXCEPTIONS
#include "contracts/adapter/HbaAgentError.h"
#include "module/cmpi/CMPI_Adapter.h"
#include "module/cmpi/entries.h"
#include "module/runtime/system/forced_unwinding.h"

#include <algorithm>
#include <cmpimacs.h>
#include <cstdio>
#include <exception>
#include <string_view>
#include <tuple>
#endif

namespace KPRV {

#if KLDR_CONTAIN_EXCEPTIONS

namespace {

/// Runs the function, then `otherwise(text)` for what it throws. Forced unwinding, of a thread that is
/// cancelled or exits, must not end here.
template <class Function, class Otherwise>
auto run_contained(Function function, Otherwise otherwise) -> decltype(function())
{
    try {
        return function();
    } catch (const std::exception& error) {
        return otherwise(error.what());
    } catch (const HbaAgentError& error) {
        return otherwise(error.message.c_str());
    } catch (...) {
        rethrow_forced_unwinding();
        return otherwise("an exception of unknown type");
    }
}

/// Where a text must end that was cut there: no part of a character stays. It begins with an entry's name.
size_t end_of_whole_characters(std::string_view text)
{
    size_t lead = text.size();
    while ((text[lead - 1] & 0xC0) == 0x80)
        lead--;
    const auto first = static_cast<unsigned char>(text[lead - 1]);
    const size_t length = first >= 0xF0 ? 4 : first >= 0xE0 ? 3 : first >= 0xC2 ? 2 : 1;
    return lead - 1 + length > text.size() ? lead - 1 : text.size();
}

/// What the client gets in the place of an exception. Memory may be what has run out: the text is made on the
/// stack, and a server that has none for a string gets a status without one.
CMPIStatus failed_status(const CMPIBroker* broker, const char* entry, const char* method, const char* what)
{
    char text[1024];
    const int length = method ? snprintf(text, sizeof(text), "%s(%s): %s", entry, method, what)
                              : snprintf(text, sizeof(text), "%s: %s", entry, what);
    if (length >= static_cast<int>(sizeof(text)))
        text[end_of_whole_characters({text, sizeof(text) - 1})] = '\0';

    const auto make_string = [&] {
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        CMPIString* const string = CMNewString(broker, text, &status);
        return status.rc == CMPI_RC_OK ? string : nullptr;
    };
    const auto none = [](const char*) -> CMPIString* { return nullptr; };
    return {CMPI_RC_ERR_FAILED, broker ? run_contained(make_string, none) : nullptr};
}

/// The entries themselves: the same for all providers.
const CMPI_Static_Data& entries()
{
    static const CMPI_Static_Data data = [] {
        CMPI_Static_Data tables = {};
        fill_instance_operations(tables.instance_ft);
        fill_method_operations(tables.method_ft);
        fill_association_operations(tables.association_ft);
        fill_indication_operations(tables.indication_ft);
        fill_cleanup_operations(tables);
        return tables;
    }();
    return data;
}

/// The method that a client calls, by the only text among the arguments of its entry; null for other entries.
template <class MI, class... Arguments>
const char* method_of(const MI*, const Arguments&... arguments)
{
    if constexpr (std::is_same_v<MI, CMPIMethodMI> && (std::is_same_v<Arguments, const char*> || ...))
        return std::get<const char*>(std::tuple(arguments...));
    else
        return nullptr;
}

/// A text as an argument of a template.
template <size_t N>
struct Entry_Name
{
    consteval Entry_Name(const char (&name)[N]) { std::copy_n(name, N, text); }
    char text[N] = {};
};

/// Exchanges one slot; the last argument only tells its signature.
template <Entry_Name name, auto table, auto slot, class MI, class... Arguments>
void contain(CMPI_Static_Data& data, CMPIStatus (*)(MI*, Arguments...))
{
    data.*table.*slot = [](MI* mi, Arguments... arguments) {
        return run_contained([&] { return (entries().*table.*slot)(mi, arguments...); },
                             [&](const char* what) {
                                 const CMPI_Adapter* const adapter = _adapter(mi);
                                 return failed_status(adapter ? adapter->broker : nullptr, name.text,
                                                      method_of(mi, arguments...), what);
                             });
    };
}

} // namespace

void contain_exceptions(CMPI_Static_Data& data)
{
#define CONTAIN(table, slot)                                                                                 \
    contain<#slot, &CMPI_Static_Data::table, &decltype(CMPI_Static_Data::table)::slot>(data, data.table.slot)
    CONTAIN(instance_ft, cleanup);
    CONTAIN(instance_ft, enumerateInstanceNames);
    CONTAIN(instance_ft, enumerateInstances);
    CONTAIN(instance_ft, getInstance);
    CONTAIN(instance_ft, createInstance);
    CONTAIN(instance_ft, modifyInstance);
    CONTAIN(instance_ft, deleteInstance);
    CONTAIN(instance_ft, execQuery);
    CONTAIN(method_ft, cleanup);
    CONTAIN(method_ft, invokeMethod);
    CONTAIN(association_ft, cleanup);
    CONTAIN(association_ft, associators);
    CONTAIN(association_ft, associatorNames);
    CONTAIN(association_ft, references);
    CONTAIN(association_ft, referenceNames);
    CONTAIN(indication_ft, cleanup);
    CONTAIN(indication_ft, authorizeFilter);
    CONTAIN(indication_ft, mustPoll);
    CONTAIN(indication_ft, activateFilter);
    CONTAIN(indication_ft, deActivateFilter);
    CONTAIN(indication_ft, enableIndications);
    CONTAIN(indication_ft, disableIndications);
#undef CONTAIN
}

void* create_mi(void* static_data, const Registration* registration, const CMPIBroker* broker,
                const CMPIContext* context, const char* provider_name, char mi_kind, CMPIStatus* status)
{
    const auto create = [&] {
        void* mi = nullptr;
        cimple_cmpi_adapter('C', static_data, registration, broker, context, provider_name, mi_kind, &mi);
        return mi;
    };
    const auto tell = [&](const char* what) -> void* {
        const CMPIStatus failed = failed_status(broker, provider_name, nullptr, what);
        if (status)
            *status = failed;
        return nullptr;
    };
    return run_contained(create, tell);
}

#else

void contain_exceptions(CMPI_Static_Data&) {}

void* create_mi(void* static_data, const Registration* registration, const CMPIBroker* broker,
                const CMPIContext* context, const char* provider_name, char mi_kind, CMPIStatus*)
{
    void* mi = nullptr;
    cimple_cmpi_adapter('C', static_data, registration, broker, context, provider_name, mi_kind, &mi);
    return mi;
}

#endif

} // namespace KPRV
