#include "module/model/AccessPointHelper.h"

#include "module/model/Fresh_Instances.h"
#include "module/model/Instance_Building.h"
#include "module/model/Record_Filling.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"

namespace KPRV {

AccessPointHelper::AccessPointHelper() : _life("AccessPointHelper", LOG_HERE) {}

AccessPointHelper* AccessPointHelper::getAccessPointHelperInstance()
{
    static AccessPointHelper helper;
    return &helper;
}

Array<Instance*> AccessPointHelper::getInstancesByClass(classId_t) const
{
    LOG_SCOPE("getInstancesByClass");
    char host[255] = {};
    constexpr int LOCALHOST = 3;
    if (ProviderUtil::getHostInfo(host, sizeof host) == LOCALHOST) {
        LOG(WARN, "getHostInfo returned localhost");
        return {};
    }
    _adapterData adapter = {};
    adapter.systemName = host;
    Ref<KALDERA_RemoteServiceAccessPoint> point(getRemoteServiceAccessPointInstance(adapter));
    if (!point)
        return {};
    Array<Instance*> instances = only(point.steal());
    LOG(INFO, "Number of instances: %d", static_cast<int>(instances.size()));
    return instances;
}

KALDERA_RemoteServiceAccessPoint*
AccessPointHelper::getRemoteServiceAccessPointInstance(const _adapterData& adapter) const
{
    LOG_SCOPE("getRemoteServiceAccessPointInstance");
    const int port = ProviderUtil::getAgentPort();
    if (port == 0) {
        LOG(WARN, "The QXM Agent is not running so no service available");
        return nullptr;
    }
    const std::string url =
        std::string("https://") + adapter.systemName.c_str() + ":" + std::to_string(port) + "/index.html";
    constexpr uint16 URL = 200;
    Ref<KALDERA_RemoteServiceAccessPoint> point(create<KALDERA_RemoteServiceAccessPoint>(true));
    set_system_keys(*point, REMOTESERVICEACCESSPOINT, adapter.systemName);
    point->Name.set("QXM Service");
    point->ElementName.set("Quintex Manager Service Access Point");
    point->AccessInfo.set(to_String(url));
    point->InfoFormat.set(URL);
    return point.steal();
}

} // namespace KPRV
