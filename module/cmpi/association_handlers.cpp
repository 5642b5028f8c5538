#include "module/cmpi/association_handlers.h"
#include "module/cmpi/Converter.h"

#include <cmpimacs.h>

namespace KPRV {

/// The shape of the five: takes over the instance and hands it on while no result has failed.
template <class Deliver>
static bool deliver(Instance* instance, void* client_data, Deliver deliver_one)
{
    const Ref<Instance> owner(instance);
    auto& results = *static_cast<Association_Results*>(client_data);
    if (!instance || results.rc != CMPI_RC_OK)
        return false;
    deliver_one(results);
    return results.rc == CMPI_RC_OK;
}

/// A far end keeps its own name space. (Association instances are always answered in the request's.)
static const char* name_space_of_far_end(const Instance* instance, const Association_Results& results)
{
    return instance->__name_space.empty() ? results.name_space : instance->__name_space.c_str();
}

static void return_instance(const Association_Results& results, CMPIInstance* ci)
{
    CMReturnInstance(results.result, ci);
    CMRelease(ci);
}

static void return_path(const Association_Results& results, CMPIObjectPath* path)
{
    CMReturnObjectPath(results.result, path);
    CMRelease(path);
}

bool associators1::_proc(Instance* instance, int, void* client_data)
{
    return deliver(instance, client_data, [&](Association_Results& results) {
        // No path is given, so that each instance has one built, and a line in the log about it.
        CMPIInstance* ci;
        if (make_cmpi_instance(results.broker, instance, name_space_of_far_end(instance, results), nullptr,
                               results.properties, ci) != CMPI_RC_OK)
            results.rc = CMPI_RC_ERR_FAILED;
        else
            return_instance(results, ci);
    });
}

bool associators2::_proc(Instance* instance, int, void* client_data)
{
    return deliver(instance, client_data, [&](Association_Results& results) {
        CMPIObjectPath* path;
        results.rc =
            make_cmpi_object_path(results.broker, instance, name_space_of_far_end(instance, results), path);
        if (results.rc != CMPI_RC_OK)
            return;
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        CMPIInstance* const ci =
            CBGetInstance(results.broker, results.context, path, results.properties, &status);
        if (ci)
            return_instance(results, ci);
        else
            results.rc = CMPI_RC_ERR_FAILED;
    });
}

bool associator_names::_proc(Instance* instance, int, void* client_data)
{
    return deliver(instance, client_data, [&](Association_Results& results) {
        CMPIObjectPath* path;
        results.rc =
            make_cmpi_object_path(results.broker, instance, name_space_of_far_end(instance, results), path);
        if (results.rc == CMPI_RC_OK)
            return_path(results, path);
    });
}

bool references_handler::_proc(Instance* instance, int, void* client_data)
{
    return deliver(instance, client_data, [&](Association_Results& results) {
        CMPIObjectPath* path;
        results.rc = make_cmpi_object_path(results.broker, instance, results.name_space, path, &results.ends);
        if (results.rc != CMPI_RC_OK)
            return;
        // Without a list every cell counts as wanted, so that null properties go out as zero or empty text.
        // Settled.
        filter_properties(instance, results.properties, false);
        CMPIInstance* ci;
        results.rc = make_cmpi_instance(results.broker, instance, results.name_space, path,
                                        results.properties, ci, &results.ends);
        if (results.rc == CMPI_RC_OK)
            return_instance(results, ci);
    });
}

bool reference_names::_proc(Instance* instance, int, void* client_data)
{
    return deliver(instance, client_data, [&](Association_Results& results) {
        __set_null_flags(instance, false, true, 1);
        CMPIObjectPath* path;
        results.rc = make_cmpi_object_path(results.broker, instance, results.name_space, path, &results.ends);
        if (results.rc == CMPI_RC_OK)
            return_path(results, path);
    });
}

} // namespace KPRV
