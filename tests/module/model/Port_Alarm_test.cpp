#include "tests/module/model/Port_Fixture.h"

using namespace KPRV;

namespace {

struct Port_Alarm : Port_Fixture
{
    Port_Alarm() { library.answers("setPortByWwn", json("{}")); }
    void beacon(bool on) { library.answers("getPortByWwn", with(fc_port(), "beaconState", on)); }
};

} // namespace

TEST_F(Port_Alarm, ABeaconIsAnAlarmDevice)
{
    Set_Properties expected = {
        {"CreationClassName", "KALDERA_AlarmDevice"},
        {"SystemCreationClassName", "KALDERA_ComputerSystem"},
        {"SystemName", "10.0.0.1"},
        {"Description", "10.0.0.1"},
        {"DeviceID", "10008c7cff000001"},
        {"ElementName", "10008c7cff000001"},
        {"Caption", "a port"},
        {"Urgency", "3"},
        {"VisibleAlarm", "true"},
        {"AlarmState", "1"},
    };
    EXPECT_EQ(walk(ALARMDEVICE), std::vector<Set_Properties>{expected});
    beacon(true);
    expected["AlarmState"] = "3";
    EXPECT_EQ(walk(ALARMDEVICE), std::vector<Set_Properties>{expected});
}

TEST_F(Port_Alarm, AMezzanineCardHasNone)
{
    library.answers("getPortByWwn", with(fc_port(), "isMezz", true));
    EXPECT_TRUE(walk(ALARMDEVICE).empty());
    EXPECT_EQ(log.said(), Lines{"DBG numOfPorts = 1"});
}

TEST_F(Port_Alarm, APortThatDoesNotTellHasNone)
{
    for (const char* name : {"isMezz", "beaconState"}) {
        log.clear();
        library.answers("getPortByWwn", without(fc_port(), name));
        EXPECT_TRUE(walk(ALARMDEVICE).empty());
        EXPECT_EQ(log.said("INFO"), Lines{"INFO beaconState is NOT available failed for 10008c7cff000001."});
    }
}

TEST_F(Port_Alarm, On)
{
    EXPECT_EQ(helper->setAlarmState("10008c7cff000001", 3), 1);
    EXPECT_EQ(library.told(),
              (Lines{R"(getPortByWwn {"wwn":"10:00:8c:7c:ff:00:00:01"})",
                     R"(setPortByWwn {"indexStr":"10:00:8c:7c:ff:00:00:01","port":{"beaconState":true},)"
                     R"("propArray":["beaconState"]})"}));
    EXPECT_EQ(log.said(), Lines{"INFO setAlarmState success"});
    EXPECT_EQ(log.traces(), (Lines{"DBG Entering: setAlarmState", "DBG Returning: setAlarmState"}));
}

TEST_F(Port_Alarm, AnyOtherStateIsOff)
{
    beacon(true);
    for (const int state : {0, 1, 2, 4, -3}) {
        library.calls.clear();
        EXPECT_EQ(helper->setAlarmState(PORT, state), 1);
        EXPECT_EQ(library.calls.at(1).request["port"]["beaconState"], false);
    }
}

TEST_F(Port_Alarm, AStateThatIsAlreadySet)
{
    EXPECT_EQ(helper->setAlarmState("10008c7cff000001", 1), 3);
    EXPECT_EQ(log.said(), Lines{"WARN setAlarmState : State already set"});
    beacon(true);
    EXPECT_EQ(helper->setAlarmState("10008c7cff000001", 3), 3);
    EXPECT_EQ(library.count("setPortByWwn"), 0u);
}

TEST_F(Port_Alarm, AMezzanineCardRefuses)
{
    library.answers("getPortByWwn", with(fc_port(), "isMezz", true));
    EXPECT_EQ(helper->setAlarmState("10008c7cff000001", 3), 2);
    EXPECT_EQ(log.said(), Lines{"WARN setAlarmState: Operation not supported on Mezz cards"});
    EXPECT_EQ(library.count("setPortByWwn"), 0u);
}

TEST_F(Port_Alarm, APortThatCannotBeRead)
{
    for (const Json::Value& answer :
         {Json::Value(), json("{'error': 1}"), json("[]"), without(fc_port(), "isMezz"),
          without(fc_port(), "beaconState"), with(fc_port(), "error", "x")}) {
        library.answers("getPortByWwn", answer);
        EXPECT_EQ(helper->setAlarmState("10008c7cff000001", 3), 0);
    }
    EXPECT_EQ(log.said(), Lines(6, "ERR Current ALARM STATE is not available"));
}

TEST_F(Port_Alarm, APortThatCannotBeSet)
{
    for (const char* answer : {"null", "{'error': 1}"}) {
        library.answers("setPortByWwn", json(answer));
        EXPECT_EQ(helper->setAlarmState("10008c7cff000001", 3), 0);
    }
    EXPECT_EQ(log.said(), Lines(2, "ERR libSetPortByWwn response is null or has error"));
}

TEST_F(Port_Alarm, Exceptions)
{
    for (const auto& [symbol, name] :
         {std::pair("setPortByWwn", "libSetPortByWwn"), std::pair("getPortByWwn", "libGetPortByWwn")}) {
        log.clear();
        library.throws(symbol, HbaAgentError{7, "busy"});
        EXPECT_EQ(helper->setAlarmState("10008c7cff000001", 3), 0);
        library.throws(symbol, std::runtime_error("broken"));
        EXPECT_EQ(helper->setAlarmState("10008c7cff000001", 3), 0);
        library.throws(symbol, 5);
        EXPECT_EQ(helper->setAlarmState("10008c7cff000001", 3), 0);
        const std::string error = std::string("ERR ") + name;
        EXPECT_EQ(log.said(),
                  (Lines{error + " got User exception 7: busy", error + " got std exception: broken",
                         error + " got default exception"}));
    }
    library.calls.clear();
    EXPECT_EQ(helper->setAlarmState("", 3), 0);
    EXPECT_TRUE(library.calls.empty());
}
