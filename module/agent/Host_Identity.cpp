// Of `ProviderDiscoveryMethods`, what a hypervisor's own provider tells of manufacturer and model, asked
// by an up-call.
#include "module/agent/ProviderDiscoveryMethods.h"

#include "module/runtime/dispatch/cimom.h"
#include "module/runtime/system/log.h"
#include "module/schema/CIM_ComputerSystem.h"

namespace KPRV {

namespace {

constexpr const char* HYPERVISOR_NAME_SPACE = "vmware/esxv2";
constexpr const char* HYPERVISOR_CLASS = "VMWARE_ESXComputerSystem";

/// Where the class keeps manufacturer and model. A shorter list is no identity.
constexpr uint32 MANUFACTURER = 1;
constexpr uint32 MODEL = 2;

} // namespace

Array<String> ProviderDiscoveryMethods::getOtherIdentifyingInfo()
{
    LOG_SCOPE("getOtherIdentifyingInfo");
    Array<String> result;
    const Ref<CIM_ComputerSystem> model(create<CIM_ComputerSystem>(true));
    Instance_Enumerator systems;
    if (cimom::enum_instances(HYPERVISOR_NAME_SPACE, model.ptr(), systems) != 0)
        return result;
    LOG(DBG, "ComputerSystem Instance in vmware/esx2 ");
    for (; systems; systems++) {
        const Ref<Instance> instance = systems();
        const auto* const system = cast<CIM_ComputerSystem>(instance.ptr());
        if (!system)
            continue;
        LOG(DBG, "Creation class name - %s", system->CreationClassName.value.c_str());
        if (!(system->CreationClassName.value == HYPERVISOR_CLASS))
            continue;
        const Array<String>& info = system->OtherIdentifyingInfo.value;
        if (info.size() > MODEL) {
            result.append(info[MANUFACTURER]);
            result.append(info[MODEL]);
        }
        break;
    }
    return result;
}

} // namespace KPRV
