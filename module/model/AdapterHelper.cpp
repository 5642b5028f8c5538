#include "module/model/AdapterHelper.h"

#include "module/adapter/Adapter_List.h"
#include "module/adapter/CIMProviderZntj.h"
#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"
#include "module/model/Fresh_Instances.h"

namespace KPRV {

/// One walk over the adapters. All adapters share their drivers, which are published once, from the first
/// that names them.
struct AdapterHelper::Walk
{
    classId_t id;
    const Wanted& wanted;
    Fresh_Instances instances = {};
    Host_Name host = Host_Name(256);
    bool network_driver_done = false;
    bool storage_driver_done = false;
};

namespace {

/// True if the adapter's flash, and with it its BIOS, can be read.
bool flash_readable(const String& index)
{
    Json::Value request(Json::objectValue);
    request["indexStr"] = index.c_str();
    const Json::Value response = libGetFlashInfo(request);
    return ProviderUtil::isValidJsonResponse(response) && asBool(member(response, "flashStatus"));
}

} // namespace

AdapterHelper::AdapterHelper() : _life("AdapterHelper", LOG_HERE) {}

AdapterHelper* AdapterHelper::getAdapterHelperInstance()
{
    static AdapterHelper helper;
    return &helper;
}

Array<Instance*> AdapterHelper::getInstancesByClass(classId_t id, const Wanted& wanted) const
{
    LOG_SCOPE("getInstancesByClass");
    Json::Value response;
    const Json::Value* list = query_adapter_list(LOG_HERE, response);
    if (!list)
        return {};
    const int count = static_cast<int>(list->size());
    LOG(INFO, "Number of Adapters: %d", count);
    if (count == 0) {
        LOG(WARN, "No adapters in the system!");
        return {};
    }

    Walk walk = {.id = id, .wanted = wanted};
    for (int number = 1; number <= count; number++) {
        const String index = adapter_address(LOG_HERE, *list, static_cast<unsigned>(number - 1));
        try {
            publish(walk, index, number);
        } catch (const Not_Convertible&) {
            // A member of the wrong type loses its adapter only, as a failed call does.
            log_caught({"libGetHbaByWwn", index.c_str()}, LOG_HERE);
        }
    }
    LOG(INFO, "Number of instances: %d", static_cast<int>(walk.instances.size()));
    return walk.instances.release();
}

void AdapterHelper::publish(Walk& walk, const String& index, int number) const
{
    Json::Value answer;
    if (ProviderUtil::getAdapterDetails(index, answer) != 0) {
        LOG(INFO, "Unable to get Adapter info %d - %s", number, index.c_str());
        return;
    }
    _adapterData adapter = {};
    if (!fill(answer, number, index.c_str(), walk.host, adapter))
        return;

    switch (walk.id) {
    case PHYSICALPACKAGE:
        walk.instances.append(getPhysicalPackageInstance(adapter, walk.wanted));
        break;
    case PRODUCT:
        walk.instances.append(getProductInstance(adapter, walk.wanted));
        break;
    case PORTCONTROLLER:
        walk.instances.append(getPortControllerInstance(adapter, walk.wanted));
        break;
    case ADAPTERSOFTWAREIDENTITY:
        publish_software(walk, answer, index, adapter);
        break;
    default:
        LOG(INFO, "Default case . Other classes ");
    }
}

void AdapterHelper::publish_software(Walk& walk, const Json::Value& answer, const String& index,
                                     _adapterData& adapter) const
{
    const auto append = [&](softwareType_t type, bool network) {
        walk.instances.append(getAdapterSoftwareIdentityInstance(adapter, type, network, walk.wanted));
    };
    if (!walk.network_driver_done && *adapter.networkDriverName) {
        append(SOFTWARE_DRIVER, true);
        walk.network_driver_done = true;
    }
    if (!walk.storage_driver_done && *adapter.storageDriverName) {
        append(SOFTWARE_DRIVER, false);
        walk.storage_driver_done = true;
    }
    fill_bios(answer, adapter);
    if (flash_readable(index))
        append(SOFTWARE_BIOS, false);
    append(SOFTWARE_FIRMWARE, false);
}

} // namespace KPRV
