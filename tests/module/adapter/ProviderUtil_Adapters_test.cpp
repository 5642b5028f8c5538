#include "module/adapter/ProviderUtil.h"

#include "tests/support/Fake_Library.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

using namespace KPRV;

namespace {

constexpr const char* WWN = "10:00:8c:7c:ff:00:00:01";
constexpr const char* MAC = "8c:7c:ff:00:00:02";

struct ProviderUtil_Adapters : testing::Test
{
    Fake_Library library;
    Log_Capture log;

    void list(const char* addresses)
    {
        library.answers("getAllAdaptersIndexString",
                        json(std::string("{'indexStrings': ") + addresses + "}"));
    }
    void adapter(const std::string& hba_data, const std::string& driver = "{}")
    {
        library.answers("getHbaByWwn", json("{'hbaData': " + hba_data + ", 'driver': " + driver + "}"));
    }
};

} // namespace

TEST_F(ProviderUtil_Adapters, TheNumberOfAdapters)
{
    Json::Value out;
    list("['a', 'b']");
    EXPECT_EQ(ProviderUtil::getNumberOfAdapters(out), 2);
    EXPECT_EQ(out, json("{'indexStrings': ['a', 'b']}"));
    list("[]");
    EXPECT_EQ(ProviderUtil::getNumberOfAdapters(out), 0);
    library.answers("getAllAdaptersIndexString", json("{'error': 'x'}"));
    EXPECT_EQ(ProviderUtil::getNumberOfAdapters(out), -1);
    EXPECT_EQ(out, json("{'error': 'x'}"));
    EXPECT_EQ(log.said(), (Lines{"INFO Number of Adapters: 2", "INFO Number of Adapters: 0",
                                 "ERR libGetAllAdaptersIndexString returns NULL."}));
    EXPECT_EQ(log.traces()[0], "DBG Entering: getNumberOfAdapters");
    EXPECT_EQ(log.lines()[0].file, "ProviderUtil.cpp");
}

TEST_F(ProviderUtil_Adapters, AddressesByIdCountFrom1)
{
    list("['a', 'b']");
    EXPECT_TRUE(ProviderUtil::getAddrByAdapterId(1) == "a");
    EXPECT_TRUE(ProviderUtil::getAddrByAdapterId(2) == "b");
    EXPECT_EQ(log.said(), Lines{});
    EXPECT_TRUE(ProviderUtil::getAddrByAdapterId(3) == "");
    EXPECT_EQ(log.said(), Lines{"INFO numOfAdapters = 2. Id = 3"});
    // Out of contract, yet no reason to fall over.
    EXPECT_TRUE(ProviderUtil::getAddrByAdapterId(0) == "");
    EXPECT_TRUE(ProviderUtil::getAddrByAdapterId(-1) == "");
    EXPECT_EQ(library.count("getAllAdaptersIndexString"), 5u);
}

TEST_F(ProviderUtil_Adapters, AddressesOfNoList)
{
    list("[]");
    EXPECT_TRUE(ProviderUtil::getAddrByAdapterId(1) == "");
    EXPECT_EQ(log.said(), Lines{});
    library.answers("getAllAdaptersIndexString", Json::Value());
    EXPECT_TRUE(ProviderUtil::getAddrByAdapterId(1) == "");
    EXPECT_EQ(log.said(), Lines{"ERR libGetAllAdaptersIndexString returns NULL."});
}

TEST_F(ProviderUtil_Adapters, DetailsAreAskedForByMacOrWwn)
{
    adapter("{'model': 'x'}");
    Json::Value out;
    EXPECT_EQ(ProviderUtil::getAdapterDetails("8c7cff000002", out), 0);
    EXPECT_EQ(out["hbaData"]["model"], "x");
    EXPECT_EQ(ProviderUtil::getAdapterDetails(MAC, out), 0);
    EXPECT_EQ(ProviderUtil::getAdapterDetails("10008c7cff000001", out), 0);
    EXPECT_EQ(ProviderUtil::getAdapterDetails(WWN, out), 0);
    EXPECT_EQ(ProviderUtil::getAdapterDetails("AABBCC", out), 0);
    EXPECT_EQ(
        library.told(),
        (Lines{R"(getHbaByWwn {"mac":"8c:7c:ff:00:00:02"})", R"(getHbaByWwn {"mac":"8c:7c:ff:00:00:02"})",
               R"(getHbaByWwn {"wwn":"10:00:8c:7c:ff:00:00:01"})",
               R"(getHbaByWwn {"wwn":"10:00:8c:7c:ff:00:00:01"})", R"(getHbaByWwn {"wwn":"AA:BB:CC"})"}));
    EXPECT_EQ(log.said("ERR"), Lines{});
}

TEST_F(ProviderUtil_Adapters, DetailsNeedBothMembers)
{
    Json::Value out;
    const Lines bad = {
        "null", "[]", "5", "{'hbaData': {}}", "{'driver': {}}", "{'hbaData': {}, 'driver': {}, 'error': 0}"};
    for (const std::string& answer : bad) {
        library.answers("getHbaByWwn", json(answer));
        EXPECT_EQ(ProviderUtil::getAdapterDetails(WWN, out), -1) << answer;
    }
    EXPECT_EQ(log.said("ERR"),
              Lines(bad.size(), std::string("ERR Unable to get adapater details for ") + WWN));
    library.answers("getHbaByWwn", json("{'hbaData': null, 'driver': null}"));
    EXPECT_EQ(ProviderUtil::getAdapterDetails(WWN, out), 0);
}

TEST_F(ProviderUtil_Adapters, DetailsThatThrowAreAFailure)
{
    Json::Value out = "left over";
    library.throws("getHbaByWwn", HbaAgentError{7, "busy"});
    EXPECT_EQ(ProviderUtil::getAdapterDetails("AABB", out), -1);
    EXPECT_TRUE(out.isNull());
    library.throws("getHbaByWwn", std::runtime_error("broken"));
    EXPECT_EQ(ProviderUtil::getAdapterDetails("AABB", out), -1);
    library.throws("getHbaByWwn", 5);
    EXPECT_EQ(ProviderUtil::getAdapterDetails("AABB", out), -1);
    EXPECT_EQ(log.said(), (Lines{"ERR AABB - libGetHbaByWwn got User exception 7: busy",
                                 "ERR AABB - libGetHbaByWwn got std exception: broken",
                                 "ERR AABB - libGetHbaByWwn got default exception"}));
    library.calls.clear();
    EXPECT_EQ(ProviderUtil::getAdapterDetails("", out), -1);
    EXPECT_TRUE(library.calls.empty());
}

TEST_F(ProviderUtil_Adapters, TheSerialNumber)
{
    adapter("{'serialNumber': 'S1', 'oemSerialNum': 'ABC123', 'partNum': 'ABC'}");
    EXPECT_TRUE(ProviderUtil::getAdapterSerialNumber("AABB") == "123");
    adapter("{'serialNumber': 'S1', 'oemSerialNum': 'ABC123', 'partNum': 'XYZ'}");
    EXPECT_TRUE(ProviderUtil::getAdapterSerialNumber("AABB") == "ABC123");
    adapter("{'serialNumber': 'S1', 'oemSerialNum': '', 'partNum': 'XYZ'}");
    EXPECT_TRUE(ProviderUtil::getAdapterSerialNumber("AABB") == "S1");
    adapter("{'serialNumber': 'S1'}");
    EXPECT_TRUE(ProviderUtil::getAdapterSerialNumber("AABB") == "S1");
    EXPECT_EQ(log.said("ERR"), Lines{});
    adapter("{'serialNumber': 5}");
    EXPECT_TRUE(ProviderUtil::getAdapterSerialNumber("AABB") == "");
    EXPECT_EQ(log.said("ERR"),
              Lines{"ERR AABB - libGetHbaByWwn got std exception: Type is not convertible to string"});
}

TEST_F(ProviderUtil_Adapters, TheSerialNumberOfAnUnknownAdapter)
{
    library.answers("getHbaByWwn", json("{'hbaData': {}}"));
    EXPECT_TRUE(ProviderUtil::getAdapterSerialNumber("AABB") == "");
    library.answers("getHbaByWwn", json("{'error': 1}"));
    EXPECT_TRUE(ProviderUtil::getAdapterSerialNumber("AABB") == "");
    EXPECT_EQ(log.said("ERR"),
              (Lines{"ERR Unable to get adapater details for AABB", "ERR Unable to get Adapter info for AABB",
                     "ERR Unable to get adapater details for AABB",
                     "ERR adapter info is NULL or has errors for AABB"}));
}

TEST_F(ProviderUtil_Adapters, WhetherItIsACNA)
{
    adapter("{'isCNA': true}");
    EXPECT_TRUE(ProviderUtil::isCNA("AABB"));
    adapter("{'isCNA': false}");
    EXPECT_FALSE(ProviderUtil::isCNA("AABB"));
    EXPECT_EQ(log.said(), Lines{});
    adapter("{}");
    EXPECT_FALSE(ProviderUtil::isCNA("AABB"));
    EXPECT_EQ(log.said(), Lines{"ERR Unable to get CNA info for AABB"});
    library.answers("getHbaByWwn", Json::Value());
    EXPECT_FALSE(ProviderUtil::isCNA("AABB"));
    EXPECT_EQ(log.said().back(), "ERR Unable to get adapater details for AABB");
}

TEST_F(ProviderUtil_Adapters, WhetherItHasAnEthernetPort)
{
    adapter("{'hasEthPort': true}");
    EXPECT_TRUE(ProviderUtil::hasEthernetPort("AABB"));
    adapter("{'hasEthPort': false}");
    EXPECT_FALSE(ProviderUtil::hasEthernetPort("AABB"));
    adapter("{}");
    EXPECT_FALSE(ProviderUtil::hasEthernetPort("AABB"));
    EXPECT_EQ(log.said(),
              (Lines{"INFO ethFlag = 1", "INFO ethFlag = 0", "ERR Unable to get Ethernet info AABB"}));
    library.answers("getHbaByWwn", Json::Value());
    EXPECT_FALSE(ProviderUtil::hasEthernetPort("AABB"));
    EXPECT_EQ(log.said().back(), "ERR Unable to get adapater details for AABB");
}

TEST_F(ProviderUtil_Adapters, TheDriverVersionIsTheFirstAdapterS)
{
    list("['AABB', 'CCDD']");
    adapter("{}", "{'storageDriverVersion': '  3.2.3 ', 'networkDriverVersion': '9'}");
    EXPECT_TRUE(ProviderUtil::getDriverVersion() == "3.2.3");
    EXPECT_EQ(library.told(), (Lines{"getAllAdaptersIndexString null", R"(getHbaByWwn {"wwn":"AA:BB"})"}));
    adapter("{}", "{'networkDriverVersion': '9'}");
    EXPECT_TRUE(ProviderUtil::getDriverVersion() == "9");
    EXPECT_EQ(log.said(), (Lines{"INFO Driver version is 3.2.3", "INFO Driver version is 9"}));
    adapter("{}", "{'storageDriverVersion': '" + std::string(80, 'v') + "'}");
    EXPECT_TRUE(ProviderUtil::getDriverVersion() == std::string(63, 'v').c_str());
}

TEST_F(ProviderUtil_Adapters, NoDriverVersion)
{
    list("['AABB']");
    adapter("{}");
    EXPECT_TRUE(ProviderUtil::getDriverVersion() == "");
    EXPECT_EQ(log.said(), Lines{"ERR Unable to get driver version for AABB"});
    adapter("{}", "{'storageDriverVersion': 3}");
    EXPECT_TRUE(ProviderUtil::getDriverVersion() == "");
    library.answers("getHbaByWwn", Json::Value());
    EXPECT_TRUE(ProviderUtil::getDriverVersion() == "");
    list("[]");
    EXPECT_TRUE(ProviderUtil::getDriverVersion() == "");
    library.answers("getAllAdaptersIndexString", Json::Value());
    EXPECT_TRUE(ProviderUtil::getDriverVersion() == "");
}

TEST_F(ProviderUtil_Adapters, AModelIsAPrefixInAnyCase)
{
    list("['AABB', 'CCDD']");
    library.answers("getHbaByWwn", [](const Json::Value& request) {
        return json(request["wwn"] == "AA:BB" ? "{'hbaData': {'model': '1860-2P'}, 'driver': {}}"
                                              : "{'hbaData': {'model': '825'}, 'driver': {}}");
    });
    EXPECT_EQ(ProviderUtil::checkIfThisAdapterModelPresent("825-FC"), 1);
    EXPECT_EQ(log.said(), (Lines{"INFO Number of Adapters: 2", "INFO Found the Adapter"}));
    EXPECT_EQ(library.count("getHbaByWwn"), 2u);
    EXPECT_EQ(log.traces().front(), "DBG Entering: checkIfThisAdapterModalPresent");
    EXPECT_EQ(ProviderUtil::checkIfThisAdapterModelPresent("1860-2p"), 1);
    EXPECT_EQ(library.count("getHbaByWwn"), 3u);
    log.clear();
    EXPECT_EQ(ProviderUtil::checkIfThisAdapterModelPresent("82"), 0);
    EXPECT_EQ(log.said(), Lines{"INFO Number of Adapters: 2"});
    EXPECT_EQ(library.count("getHbaByWwn"), 5u);
    EXPECT_EQ(ProviderUtil::checkIfThisAdapterModelPresent(""), 0);
}

TEST_F(ProviderUtil_Adapters, AnEmptyModelMatchesEverything)
{
    list("['AABB']");
    adapter("{'model': ''}");
    EXPECT_EQ(ProviderUtil::checkIfThisAdapterModelPresent("anything"), 1);
    EXPECT_EQ(ProviderUtil::checkIfThisAdapterModelPresent(""), 1);
    adapter("{}");
    EXPECT_EQ(ProviderUtil::checkIfThisAdapterModelPresent("anything"), 1);
}

TEST_F(ProviderUtil_Adapters, AModelAmongFailingAdapters)
{
    list("['AABB', 'CCDD', 'EEFF']");
    library.answers("getHbaByWwn", [](const Json::Value& request) {
        if (request["wwn"] == "AA:BB")
            return Json::Value();
        return json(request["wwn"] == "CC:DD" ? "{'hbaData': {'model': 825}, 'driver': {}}"
                                              : "{'hbaData': {'model': '825'}, 'driver': {}}");
    });
    EXPECT_EQ(ProviderUtil::checkIfThisAdapterModelPresent("825"), 1);
    EXPECT_EQ(log.said(),
              (Lines{"INFO Number of Adapters: 3", "ERR Unable to get adapater details for AABB",
                     "INFO Unable to get Adapter info 1 - AABB",
                     "ERR CCDD - libGetHbaByWwn got std exception: Type is not convertible to string",
                     "INFO Found the Adapter"}));
    log.clear();
    list("[]");
    EXPECT_EQ(ProviderUtil::checkIfThisAdapterModelPresent("825"), 0);
    EXPECT_EQ(log.said(), (Lines{"INFO Number of Adapters: 0", "WARN No adapters in the system!"}));
}

TEST_F(ProviderUtil_Adapters, AdapterIds)
{
    library.answers("getAdapterId", json("{'adapterId': 3}"));
    EXPECT_EQ(ProviderUtil::getAdapterId("8c7cff000002"), 3);
    EXPECT_EQ(ProviderUtil::getAdapterId("10008c7cff000001"), 3);
    EXPECT_EQ(ProviderUtil::getAdapterIdByIndexStr(WWN), 3);
    EXPECT_EQ(ProviderUtil::getAdapterIdByMacAddr("8c7cff000002"), 3);
    EXPECT_EQ(ProviderUtil::getAdapterIdByNWWN("10008c7cff000001"), 3);
    EXPECT_EQ(library.told()[0], R"(getAdapterId {"indexStr":"8c:7c:ff:00:00:02"})");
    EXPECT_EQ(library.told()[1], R"(getAdapterId {"indexStr":"10:00:8c:7c:ff:00:00:01"})");
    EXPECT_EQ(library.told()[2], R"(getAdapterId {"indexStr":"10:00:8c:7c:ff:00:00:01"})");
    EXPECT_EQ(log.said("ERR"), Lines{});
    library.calls.clear();
    log.clear();
    ProviderUtil::getAdapterId("8c7cff000002");
    EXPECT_EQ(log.traces(), (Lines{"DBG Entering: getAdapterId", "DBG Entering: getAdapterIdByIndexStr",
                                   "DBG Returning: getAdapterIdByIndexStr", "DBG Returning: getAdapterId"}));
    log.clear();
    library.calls.clear();
    EXPECT_EQ(ProviderUtil::getAdapterId(WWN), -1);
    EXPECT_EQ(log.said("ERR"), Lines{"ERR The address passed is not MAC or WWN"});
    EXPECT_TRUE(library.calls.empty());
}

TEST_F(ProviderUtil_Adapters, NoAdapterId)
{
    for (const char* answer :
         {"null", "{}", "{'adapterId': 'x'}", "{'adapterId': -4}", "{'adapterId': 3, 'error': 0}"}) {
        library.answers("getAdapterId", json(answer));
        EXPECT_EQ(ProviderUtil::getAdapterId("8c7cff000002"), -1) << answer;
    }
    EXPECT_EQ(log.said("ERR").size(), 5u);
    library.throws("getAdapterId", HbaAgentError{1, "x"});
    EXPECT_THROW(ProviderUtil::getAdapterId("8c7cff000002"), HbaAgentError);
}

TEST_F(ProviderUtil_Adapters, TheNameOfAnEthernetDevice)
{
    library.answers("getEthPortByEthMac", json("{'ethData': {'ethDev': 'eth0'}}"));
    EXPECT_TRUE(ProviderUtil::getEthDeviceNameByMAC("AABB") == "eth0");
    EXPECT_EQ(log.said(), Lines{});
    library.answers("getEthPortByEthMac", json("{'ethData': {}}"));
    EXPECT_TRUE(ProviderUtil::getEthDeviceNameByMAC("AABB") == "");
    library.answers("getEthPortByEthMac", json("{'error': {}}"));
    EXPECT_TRUE(ProviderUtil::getEthDeviceNameByMAC("AABB") == "");
    library.answers("getEthPortByEthMac", json("{'ethData': {'ethDev': 5}}"));
    EXPECT_TRUE(ProviderUtil::getEthDeviceNameByMAC("AABB") == "");
    EXPECT_EQ(log.said(),
              (Lines{"ERR Unable to get Eth Device Name for AABB", "ERR Ethernet Port Info is NOT available",
                     "ERR Unable to get Eth Device Name for AABB",
                     "ERR AABB - libGetEthPortByEthMac got std exception: "
                     "Type is not convertible to string",
                     "ERR Unable to get Eth Device Name for AABB"}));
}
