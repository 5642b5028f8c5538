#include "broker/values/Value_Text.h"
#include "module/runtime/ground/Types.h"
#include "tests/module/exports/Module_Fixture.h"

#include <sstream>

namespace KPRV {
namespace {

class Alarm : public Module_Fixture
{
protected:
    static constexpr const char* PORT = "1000024b4c100000";

    broker::Path_Value alarm_of(const std::string& port)
    {
        const broker::Result all = server->enumerate_instance_names("KALDERA_AlarmDevice");
        for (const broker::Path_Value& path : all.paths) {
            if (path.key("DeviceID")->as_text() == port)
                return path;
        }
        throw std::invalid_argument("no alarm device of " + port);
    }
    broker::Result set(const broker::Path_Value& alarm, uint16 state)
    {
        mark();
        return server->invoke_method(
            alarm, "SetAlarmState",
            {{"RequestedAlarmState", broker::Plain_Value::unsigned_number(CMPI_uint16, state)}});
    }
    /// What the method returns: 0 set, 1 not available, 2 any other failure.
    void expect_set(const broker::Path_Value& alarm, uint16 state, uint32 expected)
    {
        SCOPED_TRACE(state);
        const broker::Result result = set(alarm, state);
        EXPECT_EQ(CMPI_RC_OK, result.rc) << result.message;
        EXPECT_EQ(CMPI_uint32, result.return_value.type);
        EXPECT_FALSE(result.return_value.null);
        EXPECT_EQ(expected, result.return_value.as_uint());
        EXPECT_TRUE(result.out.empty());
    }
    std::string state_of(const std::string& port)
    {
        const broker::Result found = server->get_instance(alarm_of(port));
        return broker::plain_text(*found.instances.at(0).property("AlarmState"));
    }
    static Json::Value json(const std::string& text)
    {
        Json::Value value;
        std::istringstream(text) >> value;
        return value;
    }
    Lines provider_said() const { return said_by("KALDERA_AlarmDevice_Provider.cpp"); }
    static Lines traced(const Lines& lines)
    {
        Lines result = {"DBG Entering: SetAlarmState"};
        result.insert(result.end(), lines.begin(), lines.end());
        result.push_back("DBG Returning: SetAlarmState");
        return result;
    }
    /// One failure of the port's query or of its setting; the library's other call is fine.
    void expect_failure(const std::string& fault, const Lines& calls, const char* said)
    {
        SCOPED_TRACE(fault);
        const broker::Path_Value alarm = alarm_of(PORT);
        simulator.add_fault(fault);
        expect_set(alarm, 3, 2);
        EXPECT_EQ(calls, simulator.call_names());
        EXPECT_EQ(Lines{said}, this->said("ERR"));
        EXPECT_EQ(traced({"DBG return value = 2"}), provider_said());
        simulator.clear_faults();
        EXPECT_EQ("1", state_of(PORT));
    }
};

const Lines QUERY = {"getPortByWwn"};
const Lines QUERY_AND_SETTING = {"getPortByWwn", "setPortByWwn"};

TEST_F(Alarm, IsSetAndSeenByTheNextEnumeration)
{
    open();
    const broker::Path_Value alarm = alarm_of(PORT);
    EXPECT_EQ("1", state_of(PORT));
    expect_set(alarm, 3, 0);
    EXPECT_EQ(QUERY_AND_SETTING, simulator.call_names());
    EXPECT_EQ(json(R"({"wwn": "10:00:02:4b:4c:10:00:00"})"), simulator.requests("getPortByWwn").at(0));
    EXPECT_EQ(json(R"({"indexStr": "10:00:02:4b:4c:10:00:00", "port": {"beaconState": true},
                       "propArray": ["beaconState"]})"),
              simulator.requests("setPortByWwn").at(0));
    EXPECT_EQ(traced({"DBG return value = 0"}), provider_said());
    EXPECT_EQ(traced({"INFO setAlarmState success"}).at(1), said("INFO").at(0));
    EXPECT_EQ("3", state_of(PORT));
    EXPECT_EQ("1", state_of("1000024b4c100001")) << "the other ports stay as they are";

    expect_set(alarm, 1, 0);
    EXPECT_EQ(json(R"({"indexStr": "10:00:02:4b:4c:10:00:00", "port": {"beaconState": false},
                       "propArray": ["beaconState"]})"),
              simulator.requests("setPortByWwn").at(0));
    EXPECT_EQ("1", state_of(PORT));
}

TEST_F(Alarm, KnowsOffAndOnOnlyAndAsksTheLibraryForNothingElse)
{
    open();
    const broker::Path_Value alarm = alarm_of(PORT);
    for (const int state : {0, 2, 4, 5, 65535}) {
        expect_set(alarm, static_cast<uint16>(state), 2);
        EXPECT_TRUE(simulator.call_names().empty());
        EXPECT_EQ(traced({"ERR Error: Invalid Input State"}), provider_said());
        EXPECT_TRUE(said_by("Port_Alarm.cpp").empty());
    }
    EXPECT_EQ("1", state_of(PORT));
}

TEST_F(Alarm, WithoutAStateIsAskedForNone)
{
    open();
    const broker::Path_Value alarm = alarm_of(PORT);
    mark();
    const broker::Result result = server->invoke_method(alarm, "SetAlarmState", {});
    EXPECT_EQ(CMPI_RC_OK, result.rc);
    EXPECT_EQ(2u, result.return_value.as_uint());
    EXPECT_TRUE(simulator.call_names().empty());
}

// The method has no value for a request that changes nothing, so that it counts as a failure.
TEST_F(Alarm, ThatIsAlreadyInForceIsAFailure)
{
    open();
    const broker::Path_Value alarm = alarm_of(PORT);
    const Lines already = {"WARN setAlarmState : State already set"};
    expect_set(alarm, 1, 2);
    EXPECT_EQ(QUERY, simulator.call_names());
    EXPECT_EQ(already, said("WARN"));
    EXPECT_EQ(traced({"DBG return value = 2"}), provider_said());
    expect_set(alarm, 3, 0);
    expect_set(alarm, 3, 2);
    EXPECT_EQ(QUERY, simulator.call_names());
    EXPECT_EQ(already, said("WARN"));
    EXPECT_EQ("3", state_of(PORT));
}

TEST_F(Alarm, OfAMezzanineCardIsNotAvailable)
{
    open();
    // Such a port has no alarm device, but a client may make the path of one.
    EXPECT_THROW(alarm_of("1000024b4c300000"), std::invalid_argument);
    broker::Path_Value alarm = alarm_of(PORT);
    set_value(alarm.keys, "DeviceID", broker::Plain_Value::text("1000024b4c300000"));
    for (const uint16 state : {uint16(3), uint16(1)}) {
        expect_set(alarm, state, 1);
        EXPECT_EQ(QUERY, simulator.call_names());
        EXPECT_EQ(Lines{"WARN setAlarmState: Operation not supported on Mezz cards"}, said("WARN"));
        EXPECT_EQ(traced({"DBG return value = 1"}), provider_said());
    }
}

TEST_F(Alarm, TakesAnIdWithColonsToo)
{
    open();
    broker::Path_Value alarm = alarm_of(PORT);
    set_value(alarm.keys, "DeviceID", broker::Plain_Value::text("10:00:02:4b:4c:10:00:00"));
    expect_set(alarm, 3, 0);
    EXPECT_EQ("10:00:02:4b:4c:10:00:00", simulator.requests("getPortByWwn").at(0)["wwn"].asString());
    EXPECT_EQ("3", state_of(PORT));
}

TEST_F(Alarm, CannotBeSetWhereThePortDoesNotTellItsState)
{
    open();
    const char* const unknown = "ERR Current ALARM STATE is not available";
    for (const char* how : {R"("do": "null")", R"("do": "error")", R"("do": "remove", "member": "isMezz")",
                            R"("do": "remove", "member": "beaconState")"})
        expect_failure(std::string(R"({"call": "getPortByWwn", )") + how + "}", QUERY, unknown);
}

TEST_F(Alarm, CannotBeSetWhereThePortCannotBeAsked)
{
    open();
    const std::string call = R"({"call": "getPortByWwn", "do": "throw", )";
    expect_failure(call + R"("code": 7, "message": "busy"})", QUERY,
                   "ERR libGetPortByWwn got User exception 7: busy");
    expect_failure(call + R"("type": "std::runtime_error", "message": "lost"})", QUERY,
                   "ERR libGetPortByWwn got std exception: lost");
    expect_failure(call + R"("type": "int"})", QUERY, "ERR libGetPortByWwn got default exception");
}

TEST_F(Alarm, IsAFailureWhereTheSettingFails)
{
    open();
    const std::string call = R"({"call": "setPortByWwn", )";
    const char* const refused = "ERR libSetPortByWwn response is null or has error";
    expect_failure(call + R"("do": "null"})", QUERY_AND_SETTING, refused);
    expect_failure(call + R"("do": "error"})", QUERY_AND_SETTING, refused);
    expect_failure(call + R"("do": "throw", "code": 7, "message": "busy"})", QUERY_AND_SETTING,
                   "ERR libSetPortByWwn got User exception 7: busy");
    expect_failure(call + R"("do": "throw", "type": "std::runtime_error", "message": "lost"})",
                   QUERY_AND_SETTING, "ERR libSetPortByWwn got std exception: lost");
    expect_failure(call + R"("do": "throw", "type": "int"})", QUERY_AND_SETTING,
                   "ERR libSetPortByWwn got default exception");
}

TEST_F(Alarm, OfAPortThatIsNotThereIsAFailure)
{
    open();
    broker::Path_Value alarm = alarm_of(PORT);
    set_value(alarm.keys, "DeviceID", broker::Plain_Value::text("1000000000000000"));
    expect_set(alarm, 3, 2);
    EXPECT_EQ(QUERY, simulator.call_names());
    EXPECT_EQ(Lines{"ERR Current ALARM STATE is not available"}, said("ERR"));
}

TEST_F(Alarm, OfAnotherClassThatHasTheMethodIsNoPort)
{
    open("one_hba.json");
    mark();
    broker::Request request;
    request.operation = broker::Operation::INVOKE_METHOD;
    request.path = {{}, "root/kaldera", "CIM_AlarmDevice", {}};
    request.method = "SetAlarmState";
    request.in = {{"RequestedAlarmState", broker::Plain_Value::unsigned_number(CMPI_uint16, 3)}};
    const broker::Result result = server->run_at("KALDERA_AlarmDevice", request);
    EXPECT_EQ(CMPI_RC_OK, result.rc);
    EXPECT_EQ(2u, result.return_value.as_uint());
    EXPECT_TRUE(simulator.call_names().empty());
}

} // namespace
} // namespace KPRV
