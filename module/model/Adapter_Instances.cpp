// Of `AdapterHelper`, the instances of one adapter: controller, card, product, software.
#include "module/adapter/ProviderUtil.h"
#include "module/model/AdapterHelper.h"
#include "module/model/Instance_Building.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"

#include <algorithm>
#include <string>

namespace KPRV {

namespace {

const char* kind(const _adapterData& adapter)
{
    return adapter.isCNA ? "Kaldera CNA" : "Kaldera FC HBA";
}

std::string card(const _adapterData& adapter)
{
    return std::string("KLDR ") + (adapter.isCNA ? "Ethernet Adapter" : "Fiber Channel Adapter");
}

/// The card's UUID. Without one, the adapter's address in the guise of one, which
/// `ProviderUtil::getNodeMACOrWWNFromTag` takes apart again.
std::string tag(const _adapterData& adapter)
{
    if (*adapter.uuid)
        return adapter.uuid;
    if (adapter.isCNA)
        return std::string("10000000-0000-0000-0000-") + adapter.mac;
    const std::string wwn = adapter.nodeWWN;
    const size_t head = std::min(wwn.size(), size_t(4));
    return "10000000-0000-0000-" + wwn.substr(0, head) + "-" + wwn.substr(head);
}

template <class T>
void describe(T& instance, const String& text)
{
    instance.ElementName.set(text);
    instance.Caption.set(text);
    instance.Description.set(text);
}

/// The texts in which the identities of one kind of software differ from another's.
struct Software
{
    std::string id;
    std::string version;
    std::string title;
    std::string name;
    std::string identity;
};

Software card_software(const _adapterData& adapter, const char* id, const char* version, const char* what)
{
    const std::string serial = *adapter.serialNumber ? std::string(adapter.serialNumber) + " " : "";
    return {std::string(adapter.address()) + "_" + id, version, std::string(what) + " for " + kind(adapter),
            card(adapter) + " " + serial + what, adapter.model};
}

Software driver_software(const char* id, const char* version, const char* what)
{
    const std::string name = std::string(what) + " for Kaldera adapter";
    return {id, version, what, name, name};
}

Software software(const _adapterData& adapter, softwareType_t type, bool network)
{
    switch (type) {
    case SOFTWARE_FIRMWARE:
        return card_software(adapter, "firmware", adapter.firmwareVersion, "Firmware");
    case SOFTWARE_BIOS:
        return card_software(adapter, "bios", adapter.biosVersion, "BIOS");
    case SOFTWARE_DRIVER:
        return network ? driver_software(adapter.networkDriverName, adapter.networkDriverVersion,
                                         "Network driver")
                       : driver_software(adapter.storageDriverName, adapter.storageDriverVersion,
                                         "Storage driver");
    }
    LOG(INFO, "Default case . Other software types");
    return {};
}

} // namespace

KALDERA_PortController* AdapterHelper::getPortControllerInstance(const _adapterData& adapter,
                                                                 const Wanted& wanted) const
{
    LOG_SCOPE("getPortControllerInstance");
    auto controller = create_wanted(wanted, &KALDERA_PortController::DeviceID, adapter.address());
    if (!controller)
        return nullptr;
    set_system_keys(*controller, PORTCONTROLLER, adapter.systemName);
    controller->DeviceID.set(adapter.address());
    if (!wanted.whole())
        return controller.steal();
    static const Lasting_Array<String> disabled = {"The adapter is disabled"};
    static const Lasting_Array<String> in_service = {"The adapter is in service"};
    const bool stopped = adapter.status == 10;
    controller->Name.set(adapter.serialNumber);
    controller->OperationalStatus.set(array_of({static_cast<uint16>(adapter.status)}));
    controller->StatusDescriptions.set(stopped ? disabled : in_service);
    controller->EnabledState.set(stopped ? 3 : 2);
    describe(*controller, kind(adapter));
    // Alone among the four, a controller is listed by its serial number.
    controller->ElementName.set(adapter.serialNumber);
    controller->ControllerType.set(adapter.isCNA ? 1 : 4);
    if (adapter.isCNA)
        controller->OtherControllerType.set("CNA - FC and Ethernet types");
    return controller.steal();
}

KALDERA_PhysicalPackage* AdapterHelper::getPhysicalPackageInstance(const _adapterData& adapter,
                                                                   const Wanted& wanted) const
{
    LOG_SCOPE("getPhysicalPackageInstance");
    const std::string own_tag = tag(adapter);
    auto package = create_wanted(wanted, &KALDERA_PhysicalPackage::Tag, own_tag);
    if (!package)
        return nullptr;
    package->CreationClassName.set(class_name_text(PHYSICALPACKAGE));
    package->Tag.set(to_String(own_tag));
    if (!wanted.whole())
        return package.steal();
    const std::string serial = *adapter.serialNumber ? std::string(" ") + adapter.serialNumber : "";
    package->Manufacturer.set(adapter.vendor);
    describe(*package, kind(adapter));
    package->Model.set(adapter.model);
    package->SerialNumber.set(adapter.serialNumber);
    package->PartNumber.set(adapter.partNumber);
    package->SKU.set(adapter.fruNumber);
    package->Name.set(to_String(card(adapter) + serial));
    package->PackageType.set(9);
    return package.steal();
}

KALDERA_Product* AdapterHelper::getProductInstance(const _adapterData& adapter, const Wanted& wanted) const
{
    LOG_SCOPE("getProductInstance");
    auto product = create_wanted(wanted, &KALDERA_Product::IdentifyingNumber, adapter.serialNumber);
    if (!product)
        return nullptr;
    product->Version.set(adapter.firmwareVersion);
    product->Name.set("KALDERA CIM Provider");
    product->Vendor.set(adapter.vendor);
    product->IdentifyingNumber.set(adapter.serialNumber);
    if (wanted.whole())
        describe(*product, kind(adapter));
    return product.steal();
}

KALDERA_AdapterSoftwareIdentity*
AdapterHelper::getAdapterSoftwareIdentityInstance(const _adapterData& adapter, softwareType_t type,
                                                  bool network, const Wanted& wanted) const
{
    LOG_SCOPE("getAdapterSoftwareIdentityInstance");
    static const Lasting_Array<String> identity_info = {"SoftwareID", "SoftwareStatus"};
    const Software texts = software(adapter, type, network);
    auto identity = create_wanted(wanted, &KALDERA_AdapterSoftwareIdentity::InstanceID, texts.id);
    if (!identity)
        return nullptr;
    identity->InstanceID.set(to_String(texts.id));
    if (!wanted.whole())
        return identity.steal();
    identity->VersionString.set(to_String(texts.version));
    identity->Classifications.set(array_of({static_cast<uint16>(type)}));
    describe(*identity, to_String(texts.title));
    identity->Name.set(to_String(texts.name));
    identity->Manufacturer.set(adapter.vendor);
    identity->IdentityInfoType.set(identity_info);
    identity->IdentityInfoValue.set(array_of<String>({to_String(texts.identity), "Primary"}));
    return identity.steal();
}

} // namespace KPRV
