#include "module/model/AdapterHelper.h"
#include "module/model/Record_Filling.h"

#include "module/adapter/ProviderUtil.h"
#include "module/runtime/objects/Ref.h"
#include "tests/support/Instance_Text.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

using namespace KPRV;

namespace {

const AdapterHelper& helper()
{
    return *AdapterHelper::getAdapterHelperInstance();
}

_adapterData an_hba()
{
    _adapterData adapter = {};
    copy_text(adapter.nodeWWN, "20008c7cff000001");
    adapter.systemName = "10.0.0.1";
    copy_text(adapter.model, "825");
    copy_text(adapter.serialNumber, "S1");
    copy_text(adapter.vendor, "KLDR");
    copy_text(adapter.fruNumber, "F1");
    copy_text(adapter.partNumber, "P1");
    copy_text(adapter.storageDriverName, "sdrv");
    copy_text(adapter.storageDriverVersion, "3.2.3");
    copy_text(adapter.networkDriverName, "ndrv");
    copy_text(adapter.networkDriverVersion, "3.2.4");
    copy_text(adapter.firmwareVersion, "FW 1");
    copy_text(adapter.biosVersion, "BIOS 2");
    adapter.status = 11;
    return adapter;
}

_adapterData a_cna()
{
    _adapterData adapter = an_hba();
    copy_text(adapter.mac, "8c7cff000002");
    adapter.isCNA = true;
    return adapter;
}

/// What is set in a builder's instance, which is then dropped.
Set_Properties controller(const _adapterData& adapter)
{
    const Ref<Instance> instance(helper().getPortControllerInstance(adapter));
    return set_properties(instance.ptr());
}
Set_Properties package(const _adapterData& adapter)
{
    const Ref<Instance> instance(helper().getPhysicalPackageInstance(adapter));
    return set_properties(instance.ptr());
}
Set_Properties product(const _adapterData& adapter)
{
    const Ref<Instance> instance(helper().getProductInstance(adapter));
    return set_properties(instance.ptr());
}
Set_Properties software(const _adapterData& adapter, softwareType_t type, bool network = false)
{
    const Ref<Instance> instance(helper().getAdapterSoftwareIdentityInstance(adapter, type, network));
    return set_properties(instance.ptr());
}

} // namespace

TEST(Adapter_Instances, ControllerOfAnHba)
{
    EXPECT_EQ(controller(an_hba()), (Set_Properties{
                                        {"CreationClassName", "KALDERA_PortController"},
                                        {"SystemName", "10.0.0.1"},
                                        {"SystemCreationClassName", "KALDERA_ComputerSystem"},
                                        {"Name", "S1"},
                                        {"ElementName", "S1"},
                                        {"DeviceID", "20008c7cff000001"},
                                        {"OperationalStatus", "{11}"},
                                        {"StatusDescriptions", "{The adapter is in service}"},
                                        {"EnabledState", "2"},
                                        {"Caption", "Kaldera FC HBA"},
                                        {"Description", "Kaldera FC HBA"},
                                        {"ControllerType", "4"},
                                    }));
}

TEST(Adapter_Instances, ControllerOfACna)
{
    Set_Properties expected = controller(an_hba());
    expected["DeviceID"] = "8c7cff000002";
    expected["Caption"] = expected["Description"] = "Kaldera CNA";
    expected["ControllerType"] = "1";
    expected["OtherControllerType"] = "CNA - FC and Ethernet types";
    EXPECT_EQ(controller(a_cna()), expected);
}

TEST(Adapter_Instances, ControllerThatIsStopped)
{
    _adapterData adapter = an_hba();
    adapter.status = 10;
    Set_Properties set = controller(adapter);
    EXPECT_EQ(set["OperationalStatus"], "{10}");
    EXPECT_EQ(set["StatusDescriptions"], "{The adapter is disabled}");
    EXPECT_EQ(set["EnabledState"], "3");
    adapter.status = 0;
    set = controller(adapter);
    EXPECT_EQ(set["StatusDescriptions"], "{The adapter is in service}");
    EXPECT_EQ(set["EnabledState"], "2");
}

TEST(Adapter_Instances, PackageOfAnHba)
{
    EXPECT_EQ(package(an_hba()), (Set_Properties{
                                     {"CreationClassName", "KALDERA_PhysicalPackage"},
                                     {"Tag", "10000000-0000-0000-2000-8c7cff000001"},
                                     {"Manufacturer", "KLDR"},
                                     {"Caption", "Kaldera FC HBA"},
                                     {"ElementName", "Kaldera FC HBA"},
                                     {"Description", "Kaldera FC HBA"},
                                     {"Model", "825"},
                                     {"SerialNumber", "S1"},
                                     {"PartNumber", "P1"},
                                     {"SKU", "F1"},
                                     {"Name", "KLDR Fiber Channel Adapter S1"},
                                     {"PackageType", "9"},
                                 }));
}

TEST(Adapter_Instances, PackageOfACna)
{
    _adapterData adapter = a_cna();
    Set_Properties expected = package(an_hba());
    expected["Tag"] = "10000000-0000-0000-0000-8c7cff000002";
    expected["Caption"] = expected["ElementName"] = expected["Description"] = "Kaldera CNA";
    expected["Name"] = "KLDR Ethernet Adapter S1";
    EXPECT_EQ(package(adapter), expected);
    copy_text(adapter.serialNumber, "");
    EXPECT_EQ(package(adapter)["Name"], "KLDR Ethernet Adapter");
    EXPECT_EQ(package(adapter)["SerialNumber"], "");
}

TEST(Adapter_Instances, ATagGivesTheAddressBackUnlessItIsAUuid)
{
    const auto address = [](const std::string& tag) {
        return std::string(ProviderUtil::getNodeMACOrWWNFromTag(tag.c_str(), "").c_str());
    };
    EXPECT_EQ(address(package(an_hba())["Tag"]), "20008c7cff000001");
    EXPECT_EQ(address(package(a_cna())["Tag"]), "8c7cff000002");
    _adapterData adapter = a_cna();
    copy_text(adapter.uuid, "0123456789abcdef0123456789abcdef");
    EXPECT_EQ(package(adapter)["Tag"], "0123456789abcdef0123456789abcdef");
    EXPECT_NE(address(package(adapter)["Tag"]), "8c7cff000002");
    EXPECT_EQ(package({})["Tag"], "10000000-0000-0000--");
}

TEST(Adapter_Instances, Product)
{
    Set_Properties expected = {
        {"ElementName", "Kaldera FC HBA"}, {"Caption", "Kaldera FC HBA"},
        {"Description", "Kaldera FC HBA"}, {"Version", "FW 1"},
        {"Name", "KALDERA CIM Provider"},  {"Vendor", "KLDR"},
        {"IdentifyingNumber", "S1"},
    };
    EXPECT_EQ(product(an_hba()), expected);
    expected["Caption"] = expected["ElementName"] = expected["Description"] = "Kaldera CNA";
    EXPECT_EQ(product(a_cna()), expected);
}

TEST(Adapter_Instances, Firmware)
{
    EXPECT_EQ(software(an_hba(), SOFTWARE_FIRMWARE), (Set_Properties{
                                                         {"InstanceID", "20008c7cff000001_firmware"},
                                                         {"VersionString", "FW 1"},
                                                         {"Classifications", "{10}"},
                                                         {"ElementName", "Firmware for Kaldera FC HBA"},
                                                         {"Caption", "Firmware for Kaldera FC HBA"},
                                                         {"Description", "Firmware for Kaldera FC HBA"},
                                                         {"Name", "KLDR Fiber Channel Adapter S1 Firmware"},
                                                         {"Manufacturer", "KLDR"},
                                                         {"IdentityInfoType", "{SoftwareID, SoftwareStatus}"},
                                                         {"IdentityInfoValue", "{825, Primary}"},
                                                     }));
    _adapterData adapter = a_cna();
    copy_text(adapter.serialNumber, "");
    Set_Properties set = software(adapter, SOFTWARE_FIRMWARE, true);
    EXPECT_EQ(set["InstanceID"], "8c7cff000002_firmware");
    EXPECT_EQ(set["ElementName"], "Firmware for Kaldera CNA");
    EXPECT_EQ(set["Name"], "KLDR Ethernet Adapter Firmware");
}

TEST(Adapter_Instances, Bios)
{
    Set_Properties expected = software(a_cna(), SOFTWARE_FIRMWARE);
    expected["InstanceID"] = "8c7cff000002_bios";
    expected["VersionString"] = "BIOS 2";
    expected["Classifications"] = "{32770}";
    expected["ElementName"] = expected["Caption"] = expected["Description"] = "BIOS for Kaldera CNA";
    expected["Name"] = "KLDR Ethernet Adapter S1 BIOS";
    EXPECT_EQ(software(a_cna(), SOFTWARE_BIOS), expected);
}

TEST(Adapter_Instances, Drivers)
{
    Set_Properties expected = {
        {"InstanceID", "ndrv"},
        {"VersionString", "3.2.4"},
        {"Classifications", "{2}"},
        {"ElementName", "Network driver"},
        {"Caption", "Network driver"},
        {"Description", "Network driver"},
        {"Name", "Network driver for Kaldera adapter"},
        {"Manufacturer", "KLDR"},
        {"IdentityInfoType", "{SoftwareID, SoftwareStatus}"},
        {"IdentityInfoValue", "{Network driver for Kaldera adapter, Primary}"},
    };
    EXPECT_EQ(software(a_cna(), SOFTWARE_DRIVER, true), expected);
    expected["InstanceID"] = "sdrv";
    expected["VersionString"] = "3.2.3";
    expected["ElementName"] = expected["Caption"] = expected["Description"] = "Storage driver";
    expected["Name"] = "Storage driver for Kaldera adapter";
    expected["IdentityInfoValue"] = "{Storage driver for Kaldera adapter, Primary}";
    EXPECT_EQ(software(a_cna(), SOFTWARE_DRIVER, false), expected);
}

TEST(Adapter_Instances, SoftwareOfNoKnownTypeHasEmptyTexts)
{
    Log_Capture log("INFO");
    EXPECT_EQ(software(an_hba(), softwareType_t(5)), (Set_Properties{
                                                         {"InstanceID", ""},
                                                         {"VersionString", ""},
                                                         {"Classifications", "{5}"},
                                                         {"ElementName", ""},
                                                         {"Caption", ""},
                                                         {"Description", ""},
                                                         {"Name", ""},
                                                         {"Manufacturer", "KLDR"},
                                                         {"IdentityInfoType", "{SoftwareID, SoftwareStatus}"},
                                                         {"IdentityInfoValue", "{, Primary}"},
                                                     }));
    EXPECT_EQ(log.said(), Lines{"INFO Default case . Other software types"});
}

TEST(Adapter_Instances, BuildersAreTraced)
{
    Log_Capture log;
    controller(an_hba());
    software(an_hba(), SOFTWARE_BIOS);
    EXPECT_EQ(log.traces(),
              (Lines{"DBG Entering: getPortControllerInstance", "DBG Returning: getPortControllerInstance",
                     "DBG Entering: getAdapterSoftwareIdentityInstance",
                     "DBG Returning: getAdapterSoftwareIdentityInstance"}));
}
