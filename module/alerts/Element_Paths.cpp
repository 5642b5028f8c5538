#include "module/alerts/Element_Paths.h"

#include "module/adapter/ProviderUtil.h"
#include "module/runtime/objects/Model_Path.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"
#include "module/schema/KALDERA_AgentService.h"
#include "module/schema/KALDERA_ComputerSystem.h"
#include "module/schema/KALDERA_EthernetPort.h"
#include "module/schema/KALDERA_FCPort.h"

namespace KPRV {

namespace {

/// The path of a transient instance of the class, whose keys `fill` sets.
template <class Class, class Fill>
String path_of(Fill fill)
{
    const Ref<Class> instance(create<Class>(false));
    fill(*instance);
    String path;
    instance_to_model_path(instance.ptr(), path);
    return ProviderUtil::updateNamespacePath(path);
}

template <class Port>
String port_path(classId_t id, const String& port_id)
{
    return path_of<Port>([&](Port& port) {
        port.SystemCreationClassName.set(ProviderUtil::getClassName(COMPUTERSYSTEM));
        port.CreationClassName.set(ProviderUtil::getClassName(id));
        port.SystemName.set(host_name_of_alerts());
        port.DeviceID.set(port_id);
    });
}

} // namespace

String host_name_of_alerts()
{
    char host[255] = {};
    ProviderUtil::getHostInfo(host, sizeof host);
    return host;
}

String getFCPortObjectPath(const String& port_id)
{
    LOG_SCOPE("getFCPortObjectPath");
    return port_path<KALDERA_FCPort>(FCPORT, port_id);
}

String getEthernetPortObjectPath(const String& port_id)
{
    LOG_SCOPE("getEthernetPortObjectPath");
    return port_path<KALDERA_EthernetPort>(ETHERNETPORT, port_id);
}

String getComputerSystemObjectPath()
{
    LOG_SCOPE("getComputerSystemObjectPath");
    return path_of<KALDERA_ComputerSystem>([](KALDERA_ComputerSystem& system) {
        system.CreationClassName.set(ProviderUtil::getClassName(COMPUTERSYSTEM));
        system.Name.set(host_name_of_alerts());
    });
}

String getAgentServiceObjectPath()
{
    LOG_SCOPE("getAgentServiceObjectPath");
    return path_of<KALDERA_AgentService>(
        [](KALDERA_AgentService& service) { service.Name.set("Kaldera Agent Service Provider"); });
}

} // namespace KPRV
