#include "module/model/Record_Filling.h"
#include "module/model/TargetHelper.h"
#include "module/runtime/objects/Ref.h"
#include "tests/module/model/Taken_Instances.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

#include <list>
#include <map>

using namespace KPRV;

namespace {

struct Lun_Instances : testing::Test
{
    const TargetHelper* helper = TargetHelper::getTargetHelperObject();
    Log_Capture log;
    _hbaPortInfo port = {};
    std::list<Json::Value> answers;
    _hbaLunInfo lun = {};

    Lun_Instances()
    {
        copy_text(port.portWWN, "W");
        lun.path = "W__";
        lun.vendor = told(" V ");
        lun.productID = told(" P ");
        lun.serialNumber = told(" S ");
        lun.description = told(" D ");
    }

    Cut_Text told(const std::string& text) { return {answers.emplace_back(text), text.size()}; }
};

struct Row
{
    uint32 id_type;
    const char* name;
    const char* format;
    const char* name_space;
};

constexpr Row rows[] = {
    {0, "V+P+S", "7", "7"}, {1, " D ", "11", "4"}, {2, " D ", "10", "3"},
    {3, " D ", "9", "2"},   {8, " D ", "1", "1"},  {10, "Unable To Fetch", "0", "0"},
};

} // namespace

TEST_F(Lun_Instances, NamesByIdType)
{
    for (const Row& row : rows) {
        lun.idType = row.id_type;
        Set_Properties extent = taken(helper->getStorageExtentInstance(port, lun));
        EXPECT_EQ(extent["Name"], row.name) << row.id_type;
        EXPECT_EQ(extent["NameFormat"], row.format) << row.id_type;
        EXPECT_EQ(extent["NameNamespace"], row.name_space) << row.id_type;
        EXPECT_EQ(taken(helper->getTapeDriveInstance(port, lun))["Name"], row.name) << row.id_type;
    }
    EXPECT_EQ(log.said("ERR"), Lines{});
}

TEST_F(Lun_Instances, AnIdTypeThatIsNotKnown)
{
    for (const uint32 id_type : {4u, 5u, 7u, 9u, 11u, 4294967295u}) {
        log.clear();
        lun.idType = id_type;
        Set_Properties extent = taken(helper->getStorageExtentInstance(port, lun));
        EXPECT_EQ(extent.at("Name"), "");
        EXPECT_FALSE(extent.contains("NameFormat"));
        EXPECT_FALSE(extent.contains("NameNamespace"));
        EXPECT_EQ(taken(helper->getTapeDriveInstance(port, lun)).at("Name"), "");
        EXPECT_EQ(log.said("ERR"),
                  (Lines{"ERR Default idType. Should not have reached here. ",
                         "ERR Default case for lunInfo.idType. Should not have reached here. "}));
    }
}

TEST_F(Lun_Instances, ADiskGoesByItsDeviceNameIfItHasOne)
{
    lun.idType = 5;
    for (const char* name : {"", "   "}) {
        lun.deviceName = told(name);
        Set_Properties disk = taken(helper->getLogicalDiskInstance(port, lun));
        EXPECT_EQ(disk["Name"], " D ");
        EXPECT_EQ(disk["NameFormat"], "1");
        EXPECT_EQ(disk["NameNamespace"], "1");
    }
    lun.deviceName = told(" /dev/sdb ");
    Set_Properties disk = taken(helper->getLogicalDiskInstance(port, lun));
    EXPECT_EQ(disk["Name"], "/dev/sdb");
    EXPECT_EQ(disk["NameFormat"], "12");
    EXPECT_EQ(disk["NameNamespace"], "8");
    EXPECT_EQ(log.said("ERR"), Lines{});
}

TEST_F(Lun_Instances, EveryNumberHasANameOfItsOwn)
{
    for (const auto& [number, name] : std::map<uint32, std::string>{{0, "LUN_0"},
                                                                    {1, "LUN_1"},
                                                                    {63, "LUN_63"},
                                                                    {64, "LUN_64"},
                                                                    {2147483647, "LUN_2147483647"},
                                                                    {2147483648, "LUN_-2147483648"},
                                                                    {4294967295, "LUN_-1"}}) {
        lun.number = number;
        Set_Properties disk = taken(helper->getLogicalDiskInstance(port, lun));
        EXPECT_EQ(disk["ElementName"], name);
        EXPECT_EQ(disk["DeviceID"], "W__V_P_" + name);
    }
}

TEST_F(Lun_Instances, LongNamesAreWhole)
{
    const std::string vendor(8, 'v'), product(16, 'p'), serial(64, 's'), description(64, 'd'),
        device(64, 'n');
    const std::string path = std::string(47, 'l') + "_" + std::string(23, 'r') + "_";
    lun = {2147483648, path, told(vendor), told(product), told(serial), told(device), told(description), 0};
    Set_Properties extent = taken(helper->getStorageExtentInstance(port, lun));
    EXPECT_EQ(extent["Name"], vendor + "+" + product + "+" + serial);
    EXPECT_EQ(extent["DeviceID"], path + vendor + "_" + product + "_LUN_-2147483648");
    lun.idType = 2;
    EXPECT_EQ(taken(helper->getStorageExtentInstance(port, lun))["Name"], description);
    EXPECT_EQ(taken(helper->getLogicalDiskInstance(port, lun))["Name"], device);
}

TEST_F(Lun_Instances, TheNameOfOneIsNotWrittenThroughAnother)
{
    lun.number = 1;
    const Ref<KALDERA_LogicalDisk> first(helper->getLogicalDiskInstance(port, lun));
    first->ElementName.value.append("!");
    EXPECT_EQ(taken(helper->getLogicalDiskInstance(port, lun))["ElementName"], "LUN_1");
}

TEST_F(Lun_Instances, BuildersAreTraced)
{
    taken(helper->getStorageExtentInstance(port, lun));
    taken(helper->getTapeDriveInstance(port, lun));
    taken(helper->getLogicalDiskInstance(port, lun));
    EXPECT_EQ(log.said(), (Lines{"DBG Returned instance of StorageExtent for port WWN= W",
                                 "DBG Returned instance of TapeDrive for port WWN= W",
                                 "DBG Returned instance of logicalDisk for port WWN= W"}));
    EXPECT_EQ(log.traces()[0], "DBG Entering: getStorageExtentInstance");
    EXPECT_EQ(log.traces()[2], "DBG Entering: getTapeDriveInstance");
    EXPECT_EQ(log.traces()[4], "DBG Entering: getLogicalDiskInstance");
}
