#include "module/diagnostics/Tested_Element.h"

#include "module/model/AdapterHelper.h"
#include "module/model/EthernetPortHelper.h"
#include "module/model/PortHelper.h"
#include "module/runtime/ground/Array.h"
#include "module/schema/CIM_LogicalDevice.h"

namespace KPRV {

namespace {

/// The element's address, which is a key of its class.
const String& address_of(const Tested_Element& element)
{
    return element.class_id == FCPORT         ? element.port_wwn
           : element.class_id == ETHERNETPORT ? element.port_mac
                                              : element.adapter_address;
}

/// All instances of the class, for the caller to release.
Array<Instance*> candidates(classId_t id)
{
    switch (id) {
    case FCPORT:
        return PortHelper::getPortHelperObject()->getInstancesByClass(FCPORT);
    case ETHERNETPORT:
        return EthernetPortHelper::getEthernetPortHelperObject()->getInstancesByClass(ETHERNETPORT);
    case PORTCONTROLLER:
        return AdapterHelper::getAdapterHelperInstance()->getInstancesByClass(PORTCONTROLLER);
    default:
        return {};
    }
}

} // namespace

Instance* find_tested_element(const Tested_Element& element)
{
    const String& address = address_of(element);
    const Array<Instance*> list = candidates(element.class_id);
    Instance* found = nullptr;
    for (Instance* const instance : list) {
        const CIM_LogicalDevice* const device = cast<CIM_LogicalDevice>(instance);
        if (!found && device && device->DeviceID.value.equali(address))
            found = instance;
        else
            destroyer(instance);
    }
    return found;
}

} // namespace KPRV
