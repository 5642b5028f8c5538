#include "module/diagnostics/Tested_Element.h"

#include "module/model/AdapterHelper.h"
#include "module/model/EthernetPortHelper.h"
#include "module/model/PortHelper.h"
#include "module/runtime/ground/Array.h"
#include "module/schema/CIM_LogicalDevice.h"

#include <utility>

namespace KPRV {

namespace {

/// All instances of the element's class, and the address that is its key among them.
std::pair<Array<Instance*>, const String*> candidates(const Tested_Element& element)
{
    switch (element.class_id) {
    case FCPORT:
        return {PortHelper::getPortHelperObject()->getInstancesByClass(FCPORT), &element.port_wwn};
    case ETHERNETPORT:
        return {EthernetPortHelper::getEthernetPortHelperObject()->getInstancesByClass(ETHERNETPORT),
                &element.port_mac};
    case PORTCONTROLLER:
        return {AdapterHelper::getAdapterHelperInstance()->getInstancesByClass(PORTCONTROLLER),
                &element.adapter_address};
    default:
        return {{}, nullptr};
    }
}

} // namespace

Instance* find_tested_element(const Tested_Element& element)
{
    const auto [list, address] = candidates(element);
    Instance* found = nullptr;
    for (Instance* const instance : list) {
        const CIM_LogicalDevice* const device = cast<CIM_LogicalDevice>(instance);
        if (!found && device && device->DeviceID.value.equali(*address))
            found = instance;
        else
            destroyer(instance);
    }
    return found;
}

} // namespace KPRV
