#include "module/model/AdapterHelper.h"

#include "tests/module/model/Adapter_Fixture.h"

using namespace KPRV;

using AdapterHelper_Walk = Adapter_Fixture;

TEST_F(AdapterHelper_Walk, OneHbaAsAController)
{
    library.adapters({{WWN, hba()}});
    const auto set = walk(PORTCONTROLLER);
    ASSERT_EQ(set.size(), 1u);
    EXPECT_EQ(set[0].at("DeviceID"), "20008c7cff000001");
    EXPECT_EQ(set[0].at("Name"), "S1");
    EXPECT_EQ(set[0].at("SystemName"), "10.0.0.1");
    EXPECT_EQ(set[0].at("OperationalStatus"), "{11}");
    EXPECT_EQ(library.told(),
              (Lines{"getAllAdaptersIndexString null", R"(getHbaByWwn {"wwn":"20:00:8c:7c:ff:00:00:01"})"}));
    EXPECT_EQ(log.said(), (Lines{"INFO Number of Adapters: 1",
                                 "INFO The string 20:00:8c:7c:ff:00:00:01 is already in : format",
                                 "INFO Adapter Type : FC HBA", "INFO Number of instances: 1"}));
}

TEST_F(AdapterHelper_Walk, ACnaGoesByItsMac)
{
    library.adapters({{MAC, cna()}});
    const auto controllers = walk(PORTCONTROLLER);
    EXPECT_EQ(controllers[0].at("DeviceID"), "8c7cff000002");
    EXPECT_EQ(controllers[0].at("ControllerType"), "1");
    EXPECT_EQ(library.told()[1], R"(getHbaByWwn {"mac":"8c:7c:ff:00:00:02"})");
    EXPECT_TRUE(log.has("INFO Adapter Type : CNA"));
    EXPECT_EQ(walk(PHYSICALPACKAGE)[0].at("Tag"), "10000000-0000-0000-0000-8c7cff000002");
}

TEST_F(AdapterHelper_Walk, PackagesAndProducts)
{
    library.adapters({{WWN, hba()}, {MAC, cna()}});
    EXPECT_EQ(walk(PHYSICALPACKAGE, "Name"),
              (Lines{"KLDR Fiber Channel Adapter S1", "KLDR Ethernet Adapter S1"}));
    EXPECT_EQ(walk(PRODUCT, "Version"), (Lines{"FW 1", "FW 1"}));
    EXPECT_EQ(walk(PRODUCT, "Description"), (Lines{"Kaldera FC HBA", "Kaldera CNA"}));
    // Neither is asked for its flash.
    EXPECT_EQ(library.count("getFlashInfo"), 0u);
}

TEST_F(AdapterHelper_Walk, AnAdapterThatIsStopped)
{
    library.adapters({{WWN, with(hba(), "hbaData", "hbaStatus", false)}});
    const auto set = walk(PORTCONTROLLER);
    EXPECT_EQ(set[0].at("OperationalStatus"), "{10}");
    EXPECT_EQ(set[0].at("EnabledState"), "3");
    library.adapters({{WWN, without(hba(), "hbaData", "hbaStatus")}});
    EXPECT_EQ(walk(PORTCONTROLLER, "OperationalStatus"), Lines{"{10}"});
}

TEST_F(AdapterHelper_Walk, AnOemCard)
{
    Json::Value answer = with(hba(), "hbaData", "oem", "DELL");
    answer = with(answer, "hbaData", "oemSerialNum", "P177");
    answer = with(answer, "hbaData", "uuid", "0123456789abcdef");
    library.adapters({{WWN, answer}});
    const auto set = walk(PHYSICALPACKAGE);
    EXPECT_EQ(set[0].at("SKU"), "");
    EXPECT_EQ(set[0].at("SerialNumber"), "77");
    EXPECT_EQ(set[0].at("Tag"), "0123456789abcdef");
}

TEST_F(AdapterHelper_Walk, AnAdapterWithoutDriversHasEmptyFields)
{
    Json::Value answer = cna();
    answer["driver"] = Json::objectValue;
    library.adapters({{MAC, answer}});
    const auto set = walk(PORTCONTROLLER);
    EXPECT_EQ(set[0].at("DeviceID"), "8c7cff000002");
    EXPECT_EQ(set[0].at("Name"), "");
    EXPECT_EQ(walk(PHYSICALPACKAGE)[0].at("Manufacturer"), "");
    EXPECT_EQ(walk(ADAPTERSOFTWAREIDENTITY, "InstanceID"),
              (Lines{"8c7cff000002_bios", "8c7cff000002_firmware"}));
    // An FC HBA has its WWN from the storage driver only.
    library.adapters({{WWN, without(hba(), "driver", "storageDriverName")}});
    EXPECT_EQ(walk(PORTCONTROLLER, "DeviceID"), Lines{""});
}

TEST_F(AdapterHelper_Walk, SoftwareOfOneHba)
{
    library.adapters({{WWN, hba()}});
    EXPECT_EQ(walk(ADAPTERSOFTWAREIDENTITY, "InstanceID"),
              (Lines{"sdrv", "20008c7cff000001_bios", "20008c7cff000001_firmware"}));
    EXPECT_EQ(walk(ADAPTERSOFTWAREIDENTITY, "VersionString"), (Lines{"3.2.3", "BIOS 2", "FW 1"}));
}

TEST_F(AdapterHelper_Walk, SoftwareOfTwins)
{
    library.adapters(
        {{MAC, cna()}, {"8c:7c:ff:00:00:03", with(cna(), "hbaData", "hbaMAC", "8c:7c:ff:00:00:03")}});
    EXPECT_EQ(walk(ADAPTERSOFTWAREIDENTITY, "InstanceID"),
              (Lines{"ndrv", "sdrv", "8c7cff000002_bios", "8c7cff000002_firmware", "8c7cff000003_bios",
                     "8c7cff000003_firmware"}));
    EXPECT_EQ(library.told(),
              (Lines{"getAllAdaptersIndexString null", R"(getHbaByWwn {"mac":"8c:7c:ff:00:00:02"})",
                     R"(getFlashInfo {"indexStr":"8c:7c:ff:00:00:02"})",
                     R"(getHbaByWwn {"mac":"8c:7c:ff:00:00:03"})",
                     R"(getFlashInfo {"indexStr":"8c:7c:ff:00:00:03"})"}));
    EXPECT_TRUE(log.has("INFO Number of instances: 6"));
}

TEST_F(AdapterHelper_Walk, SoftwareOfAMixedHost)
{
    // Each driver is listed once, from the first adapter that names it.
    library.adapters({{WWN, hba()},
                      {MAC, with(cna(), "driver", "storageDriverName", "other")},
                      {"20:00:8c:7c:ff:00:00:04", hba()}});
    EXPECT_EQ(
        walk(ADAPTERSOFTWAREIDENTITY, "InstanceID"),
        (Lines{"sdrv", "20008c7cff000001_bios", "20008c7cff000001_firmware", "ndrv", "8c7cff000002_bios",
               "8c7cff000002_firmware", "20008c7cff000001_bios", "20008c7cff000001_firmware"}));
}

TEST_F(AdapterHelper_Walk, AnEmptyDriverNameIsNone)
{
    library.adapters({{MAC, with(cna(), "driver", "networkDriverName", "")}, {MAC, cna()}});
    library.adapters({{MAC, with(cna(), "driver", "networkDriverName", "")}});
    EXPECT_EQ(walk(ADAPTERSOFTWAREIDENTITY, "Name"),
              (Lines{"Storage driver for Kaldera adapter", "KLDR Ethernet Adapter S1 BIOS",
                     "KLDR Ethernet Adapter S1 Firmware"}));
}

TEST_F(AdapterHelper_Walk, FlashThatCannotBeReadHasNoBios)
{
    library.adapters({{WWN, hba()}});
    for (const char* answer : {"null", "{}", "[]", "{'flashStatus': false}", "{'flashStatus': null}",
                               "{'flashStatus': true, 'error': null}"}) {
        library.answers("getFlashInfo", json(answer));
        EXPECT_EQ(walk(ADAPTERSOFTWAREIDENTITY, "InstanceID"), (Lines{"sdrv", "20008c7cff000001_firmware"}))
            << answer;
    }
}

TEST_F(AdapterHelper_Walk, ABiosTextOfBadBytesIsCleared)
{
    for (const char* bad : {"\xF5x", "\x80x", " \xC1"}) {
        library.adapters({{WWN, with(hba(), "firmware", "biosVersion", bad)}});
        library.calls.clear();
        const auto set = walk(ADAPTERSOFTWAREIDENTITY);
        ASSERT_EQ(set.size(), 3u) << bad;
        EXPECT_EQ(set[1].at("InstanceID"), "20008c7cff000001_bios");
        EXPECT_EQ(set[1].at("VersionString"), "");
        EXPECT_EQ(library.count("getFlashInfo"), 1u);
    }
    library.adapters({{WWN, with(hba(), "firmware", "biosVersion", "\xC3\xBC 1")}});
    EXPECT_EQ(walk(ADAPTERSOFTWAREIDENTITY)[1].at("VersionString"), "\xC3\xBC 1");
}

TEST_F(AdapterHelper_Walk, TextsAreCutToTheRecord)
{
    const std::string text(100, 'x');
    Json::Value answer = cna();
    for (const char* name : {"wwn", "hbaMAC", "serialNumber", "model", "fruNum", "partNum", "uuid"})
        answer["hbaData"][name] = text;
    for (const char* name :
         {"storageDriverName", "storageDriverVersion", "networkDriverName", "networkDriverVersion"})
        answer["driver"][name] = text;
    answer["firmware"]["version"] = answer["firmware"]["biosVersion"] = "  " + text;
    library.adapters({{MAC, answer}});
    const auto cut = [&](size_t size) { return text.substr(0, size - 1); };

    auto package = walk(PHYSICALPACKAGE)[0];
    EXPECT_EQ(package["Model"], cut(16));
    EXPECT_EQ(package["SerialNumber"], cut(64));
    EXPECT_EQ(package["PartNumber"], cut(16));
    EXPECT_EQ(package["SKU"], cut(16));
    EXPECT_EQ(package["Tag"], cut(33));
    EXPECT_EQ(walk(PORTCONTROLLER)[0]["DeviceID"], cut(18));
    EXPECT_EQ(walk(PRODUCT)[0]["Version"], cut(64));
    EXPECT_EQ(walk(ADAPTERSOFTWAREIDENTITY, "InstanceID"),
              (Lines{cut(16), cut(16), cut(18) + "_bios", cut(18) + "_firmware"}));
    EXPECT_EQ(walk(ADAPTERSOFTWAREIDENTITY, "VersionString"), (Lines{cut(64), cut(64), cut(64), cut(64)}));
    answer["hbaData"].removeMember("hbaMAC");
    library.adapters({{MAC, answer}});
    EXPECT_EQ(walk(PORTCONTROLLER)[0]["DeviceID"], cut(24));
}

TEST_F(AdapterHelper_Walk, AClassThatIsNotItsOwn)
{
    library.adapters({{WWN, hba()}});
    EXPECT_TRUE(walk(FCPORT).empty());
    EXPECT_TRUE(log.has("INFO Default case . Other classes "));
    EXPECT_TRUE(log.has("INFO Number of instances: 0"));
}

TEST_F(AdapterHelper_Walk, NothingIsRemembered)
{
    library.adapters({{WWN, hba()}});
    EXPECT_EQ(walk(ADAPTERSOFTWAREIDENTITY).size(), 3u);
    EXPECT_EQ(walk(ADAPTERSOFTWAREIDENTITY).size(), 3u);
    EXPECT_EQ(library.count("getAllAdaptersIndexString"), 2u);
    library.adapters({});
    EXPECT_EQ(walk(PORTCONTROLLER).size(), 0u);
}
