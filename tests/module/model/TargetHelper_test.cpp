#include "module/model/TargetHelper.h"

#include "module/managers/HDRManager.h"
#include "tests/module/model/Port_Fixture.h"

using namespace KPRV;

namespace {

Json::Value lun(int number, const char* more = "{}")
{
    Json::Value result = json("{'vendor': 'ACME    ', 'productID': ' DISK ', 'lunDescIdType': 3}");
    result["number"] = number;
    const Json::Value members = json(more);
    for (const std::string& name : members.getMemberNames())
        result[name] = members[name];
    return result;
}

Json::Value target(const char* type, const std::vector<Json::Value>& luns)
{
    Json::Value result = json("{'deviceData': {'isTarget': true}, 'lunList': []}");
    result["deviceData"]["type"] = type;
    for (const Json::Value& each : luns)
        result["lunList"].append(each);
    return result;
}

struct Targets : Port_Fixture
{
    Json::Value described = lun(1, "{'lunDescription': '600a'}");
};

} // namespace

TEST_F(Targets, ALunAsAnExtent)
{
    remote_ports({REMOTE}, target("Disk", {described}));
    const char* device_id = "10008c7cff000001_500601600000000a_ACME_DISK_LUN_1";
    EXPECT_EQ(walk(STORAGEEXTENT),
              (std::vector<Set_Properties>{{
                  {"CreationClassName", "KALDERA_StorageExtent"},
                  {"SystemCreationClassName", "KALDERA_ComputerSystem"},
                  {"SystemName", "10.0.0.1"},
                  {"ElementName", "LUN_1"},
                  {"DeviceID", device_id},
                  {"OtherIdentifyingInfo", "{" + std::string(device_id) + "}"},
                  {"IdentifyingDescriptions", "{It is a unique identification for a Storage Extent}"},
                  {"OperationalStatus", "{2}"},
                  {"Name", "600a"},
                  {"NameFormat", "9"},
                  {"NameNamespace", "2"},
              }}));
    const Lines told = library.told();
    EXPECT_EQ(Lines(told.begin() + 2, told.end()),
              (Lines{R"(getPortByWwn {"wwn":"10:00:8c:7c:ff:00:00:01"})",
                     R"(getAllRemotePorts {"lPortWwn":"10:00:8c:7c:ff:00:00:01",)"
                     R"("pPortWwn":"10:00:8c:7c:ff:00:00:01"})",
                     R"(getCompleteRemotePort {"lPortWwn":"10:00:8c:7c:ff:00:00:01",)"
                     R"("pPortWwn":"10:00:8c:7c:ff:00:00:01","rPortWwn":"50:06:01:60:00:00:00:0a"})"}));
    EXPECT_EQ(log.said(), (Lines{"DBG numOfPorts = 1", "DBG libGetAllRemotePorts. Number of rports -  1",
                                 "DBG Loop for the rport index =   0", "DBG Device type = Disk",
                                 std::string("DBG rPortWwns[0]=") + REMOTE, "DBG Number of Luns = 1.",
                                 "DBG Returned instance of StorageExtent for port WWN= 10008c7cff000001"}));
}

TEST_F(Targets, WhichClassADeviceTypeFeeds)
{
    for (const char* type : {"Tape", "Media Changer", "Disk", "tape", "Tape ", ""}) {
        const bool tape = std::string(type) == "Tape" || std::string(type) == "Media Changer";
        remote_ports({REMOTE}, target(type, {described, lun(2, "{'lunDescription': ''}")}));
        EXPECT_EQ(walk(TAPEDRIVE).size(), tape ? 2u : 0u) << type;
        EXPECT_EQ(walk(STORAGEEXTENT).size(), tape ? 0u : 2u) << type;
        EXPECT_EQ(walk(LOGICALDISK).size(), tape ? 0u : 2u) << type;
    }
    EXPECT_EQ(log.said("INFO"), Lines(8, "INFO Continue with next rport. Looking for another device type "));
}

TEST_F(Targets, ATextEndsAtItsFirstZeroByte)
{
    for (const char* name : {"vendor", "productID", "lunDescription"}) {
        static constexpr char text[] = "A\0B";
        described[name] = Json::Value(text, text + 3);
    }
    remote_ports({REMOTE}, target("Disk", {described}));
    Set_Properties extent = walk(STORAGEEXTENT).at(0);
    EXPECT_EQ(extent["DeviceID"], "10008c7cff000001_500601600000000a_A_A_LUN_1");
    EXPECT_EQ(extent["Name"], "A");
}

TEST_F(Targets, DisksAndDrives)
{
    remote_ports({REMOTE}, target("Disk", {described}));
    Set_Properties disk = walk(LOGICALDISK).at(0);
    EXPECT_EQ(disk["CreationClassName"], "KALDERA_LogicalDisk");
    EXPECT_EQ(disk["IdentifyingDescriptions"], "{It is a unique identification for a Logical Disk}");
    EXPECT_EQ(disk["Name"], "600a");
    EXPECT_EQ(disk["NameFormat"], "1");
    EXPECT_EQ(disk["NameNamespace"], "1");
    remote_ports({REMOTE}, target("Tape", {described}));
    Set_Properties drive = walk(TAPEDRIVE).at(0);
    EXPECT_EQ(drive["CreationClassName"], "KALDERA_TapeDrive");
    EXPECT_EQ(drive["IdentifyingDescriptions"], "{It is a unique identification for a Tape Drive}");
    EXPECT_EQ(drive["Name"], "600a");
    EXPECT_EQ(drive.size(), 9u);
}

TEST_F(Targets, AnInitiatorHasNoLuns)
{
    remote_ports({REMOTE}, json("{'deviceData': {'isTarget': false}}"));
    EXPECT_TRUE(walk(STORAGEEXTENT).empty());
    EXPECT_EQ(log.said().back(), "DBG Nothing to do since the its not a Target Rport.");
    remote_ports({REMOTE}, json("{}"));
    EXPECT_TRUE(walk(STORAGEEXTENT).empty());
    EXPECT_EQ(log.said("ERR"), Lines{});
}

TEST_F(Targets, ALunWithoutDescription)
{
    remote_ports({REMOTE}, target("Disk", {lun(1)}));
    Set_Properties set = walk(STORAGEEXTENT).at(0);
    EXPECT_EQ(set["Name"], "Unable To Fetch");
    EXPECT_EQ(set["NameFormat"], "0");
    EXPECT_EQ(set["NameNamespace"], "0");
    remote_ports({REMOTE}, target("Disk", {lun(1, "{'productSerialNumber': ' S 1 '}")}));
    set = walk(STORAGEEXTENT).at(0);
    EXPECT_EQ(set["Name"], "ACME+DISK+S 1");
    EXPECT_EQ(set["NameFormat"], "7");
    EXPECT_EQ(set["NameNamespace"], "7");
}

TEST_F(Targets, OneLunWithoutDescriptionDecidesForAllThatFollow)
{
    const Json::Value with_serial = lun(3, "{'lunDescription': '600c', 'productSerialNumber': 'S3'}");
    remote_ports({REMOTE, REMOTE_2},
                 target("Disk", {described, with_serial, lun(2), described, with_serial}));
    EXPECT_EQ(
        walk(STORAGEEXTENT, "Name"),
        (Lines{"600a", "600c", "Unable To Fetch", "Unable To Fetch", "ACME+DISK+S3",
               // The next remote port of the same walk is under the same rule.
               "Unable To Fetch", "ACME+DISK+S3", "Unable To Fetch", "Unable To Fetch", "ACME+DISK+S3"}));
    // The next walk is not.
    EXPECT_EQ(walk(STORAGEEXTENT, "Name")[0], "600a");
    // A disk goes by its description all the same.
    EXPECT_EQ(walk(LOGICALDISK, "Name")[3], "600a");
}

TEST_F(Targets, ASerialNumberIsReadOnlyWhereItNamesTheLun)
{
    remote_ports({REMOTE}, target("Disk", {lun(1, "{'lunDescription': 'd', 'lunDescIdType': 0,"
                                                  " 'productSerialNumber': 'S1'}")}));
    EXPECT_EQ(walk(STORAGEEXTENT, "Name"), Lines{"ACME+DISK+"});
}

TEST_F(Targets, ANullDescriptionIsOne)
{
    remote_ports({REMOTE}, target("Disk", {lun(1, "{'lunDescription': null}")}));
    EXPECT_EQ(walk(STORAGEEXTENT, "Name"), Lines{""});
    EXPECT_EQ(walk(STORAGEEXTENT, "NameFormat"), Lines{"9"});
}

TEST_F(Targets, NumbersBeyondThePositiveRange)
{
    Json::Value large = described;
    large["number"] = 4294967295u;
    remote_ports({REMOTE}, target("Disk", {large}));
    EXPECT_EQ(walk(STORAGEEXTENT, "ElementName"), Lines{"LUN_-1"});
    EXPECT_EQ(walk(LOGICALDISK, "DeviceID"), Lines{"10008c7cff000001_500601600000000a_ACME_DISK_LUN_-1"});
}

TEST_F(Targets, LunsThatLackAMember)
{
    Json::Value answer = target("Disk", {without(described, "vendor"), without(described, "number"),
                                         without(described, "productID"), 5, Json::Value(), described});
    remote_ports({REMOTE}, answer);
    EXPECT_EQ(walk(STORAGEEXTENT, "Name"), Lines{"600a"});
    EXPECT_EQ(log.said("ERR"), Lines(5, "ERR LUN info is NOT available"));
}

TEST_F(Targets, WrongTypesLoseTheirLunAlone)
{
    for (const char* name : {"vendor", "number", "productID", "lunDescIdType", "lunDescription"}) {
        remote_ports({REMOTE}, target("Disk", {with(described, name, Json::arrayValue), described}));
        EXPECT_EQ(walk(STORAGEEXTENT, "Name"), Lines{"600a"}) << name;
    }
    EXPECT_EQ(log.said("ERR")[0],
              "ERR libGetCompleteRemotePort got std exception: Type is not convertible to string");
    EXPECT_EQ(log.said("ERR").size(), 5u);
    remote_ports({REMOTE}, target("Disk", {lun(1, "{'productSerialNumber': 5}"), lun(-1), lun(2)}));
    EXPECT_EQ(walk(STORAGEEXTENT, "ElementName"), Lines{"LUN_2"});
}

TEST_F(Targets, ADeviceTypeOfTheWrongTypeLosesItsRemotePort)
{
    remote_ports({REMOTE, REMOTE_2}, target("Disk", {described}));
    library.answers("getCompleteRemotePort", [this](const Json::Value& request) {
        Json::Value answer = target("Disk", {described});
        if (request["rPortWwn"] == REMOTE)
            answer["deviceData"]["type"] = 5;
        return answer;
    });
    EXPECT_EQ(walk(STORAGEEXTENT).size(), 1u);
    EXPECT_EQ(log.said("ERR").size(), 1u);
}

TEST_F(Targets, WithoutALunList)
{
    for (const char* list : {"{}", "'x'", "5"}) {
        remote_ports({REMOTE}, with(target("Disk", {}), "lunList", json(list)));
        EXPECT_TRUE(walk(STORAGEEXTENT).empty()) << list;
    }
    remote_ports({REMOTE}, without(target("Disk", {}), "lunList"));
    EXPECT_TRUE(walk(STORAGEEXTENT).empty());
    EXPECT_EQ(log.said("ERR"),
              Lines(4, std::string("ERR No LUN Info is available for Rport ") + REMOTE + "."));
    // Null counts as a list.
    remote_ports({REMOTE}, with(target("Disk", {}), "lunList", Json::Value()));
    EXPECT_TRUE(walk(STORAGEEXTENT).empty());
    EXPECT_EQ(log.said().back(), "DBG Number of Luns = 0.");
}

TEST_F(Targets, AHoleInTheListIsARemotePortWithoutAWwn)
{
    remote_ports({}, target("Disk", {described}));
    Json::Value list;
    list[2]["remotePortWwn"] = REMOTE;
    library.answers("getAllRemotePorts", list);
    EXPECT_EQ(walk(STORAGEEXTENT).size(), 3u);
    Lines asked;
    for (const Fake_Library::Call& call : library.calls)
        if (call.name == "getCompleteRemotePort")
            asked.push_back(call.request["rPortWwn"].asString());
    EXPECT_EQ(asked, (Lines{"", "", REMOTE}));
    EXPECT_EQ(log.said("DBG rPortWwns"),
              (Lines{"DBG rPortWwns[0]=", "DBG rPortWwns[1]=", std::string("DBG rPortWwns[2]=") + REMOTE}));
}

TEST_F(Targets, ABadRemotePortIsLostAlone)
{
    for (const char* answer : {"null", "{'error': 1}"}) {
        library.answers("getCompleteRemotePort", json(answer));
        remote_ports({REMOTE, REMOTE_2}, target("Disk", {described}));
        library.answers("getCompleteRemotePort", [&](const Json::Value& request) {
            return request["rPortWwn"] == REMOTE ? json(answer) : target("Disk", {described});
        });
        EXPECT_EQ(walk(STORAGEEXTENT).size(), 1u) << answer;
    }
    EXPECT_EQ(log.said("ERR"), Lines(2, "ERR libGetCompleteRemotePort response is null or has error"));
    log.clear();
    remote_ports({REMOTE, REMOTE_2}, target("Disk", {described}), REMOTE);
    EXPECT_EQ(walk(STORAGEEXTENT).size(), 1u);
    EXPECT_EQ(log.said("ERR"), (Lines{"ERR libGetCompleteRemotePort got User exception 7: busy",
                                      "ERR libGetCompleteRemotePort response is null or has error"}));
}

TEST_F(Targets, WithoutAListOfRemotePorts)
{
    for (const char* answer : {"null", "{'error': 1}", "{}"}) {
        library.answers("getAllRemotePorts", json(answer));
        EXPECT_TRUE(walk(TAPEDRIVE).empty()) << answer;
    }
    library.throws("getAllRemotePorts", std::runtime_error("broken"));
    EXPECT_TRUE(walk(LOGICALDISK).empty());
    Lines expected(3, "ERR libGetAllRemotePorts returns NULL.");
    expected.push_back("ERR libGetAllRemotePorts got std exception: broken");
    EXPECT_EQ(log.said("ERR"), expected);
}

TEST_F(Targets, TextsAreCutToTheRecord)
{
    const std::string text(100, 'x');
    Json::Value long_lun = lun(1);
    for (const char* name : {"vendor", "productID", "lunDescription"})
        long_lun[name] = text;
    remote_ports({REMOTE}, target("Disk", {long_lun}));
    Set_Properties set = walk(STORAGEEXTENT).at(0);
    EXPECT_EQ(set["DeviceID"],
              "10008c7cff000001_500601600000000a_" + text.substr(0, 8) + "_" + text.substr(0, 16) + "_LUN_1");
    EXPECT_EQ(set["Name"], text.substr(0, 64));
    long_lun = lun(1);
    long_lun["productSerialNumber"] = text;
    remote_ports({REMOTE}, target("Disk", {long_lun}));
    EXPECT_EQ(walk(STORAGEEXTENT, "Name"), Lines{"ACME+DISK+" + text.substr(0, 64)});
}

TEST_F(Targets, AreServedByTheStorageManager)
{
    remote_ports({REMOTE}, target("Disk", {described}));
    EXPECT_EQ(taken(HDRManager::getHDRManager()->getInstances(STORAGEEXTENT)).size(), 1u);
    EXPECT_EQ(taken(HDRManager::getHDRManager()->getInstances(LOGICALDISK)).size(), 1u);
    EXPECT_EQ(taken(HDRManager::getHDRManager()->getInstances(TAPEDRIVE)).size(), 0u);
}

TEST_F(Targets, ALargeHost)
{
    std::vector<Json::Value> luns(64, described), remotes;
    for (int i = 0; i < 64; i++)
        remotes.push_back("50:00:00:00:00:00:00:" + std::to_string(10 + i));
    log.clear();
    remote_ports(remotes, target("Disk", luns));
    Log_Capture quiet("ERR");
    library.answers("getFcPhyPortIndicesByAdapter", list_of({PORT, PORT}));
    EXPECT_EQ(walk(STORAGEEXTENT).size(), 2u * 64 * 64);
    EXPECT_EQ(library.count("getCompleteRemotePort"), 2u * 64);
}
