// Bad answers of the adapter library to methods of devices.
#include "tests/faults/Sweep_Fixture.h"

namespace KPRV::invoked_answers {
namespace {

struct Way
{
    const char* entry_point;
    const char* method;
};

constexpr Way ways[] = {
#define INVOKED(entry_point, method) {#entry_point, method},
#include "tests/faults/Ways_In.def"
};

/// What both methods return when they have failed. Smaller numbers are outcomes that a readable answer can
/// have.
constexpr unsigned failed = 2;

class Invoked_Answers : public Sweep_Fixture, public testing::TestWithParam<Way>
{
protected:
    void SetUp() override
    {
        open_host();
        firmware.write("image", "firmware-version=3.2.2.0\n");
        alarm = find("KALDERA_AlarmDevice", "1000024b4ccc0000");
        controller = find("KALDERA_PortController", "2000024b4ccc0000");
        service = server->enumerate_instance_names("KALDERA_HBASoftwareInstallationService").paths.at(0);
    }
    void TearDown() override { close_host(); }

    broker::Path_Value find(const char* class_name, const std::string& device)
    {
        for (const broker::Path_Value& path : server->enumerate_instance_names(class_name).paths)
            if (path.key("DeviceID")->as_text() == device)
                return path;
        throw std::invalid_argument(device);
    }

    broker::Result invoke()
    {
        if (GetParam().method == std::string("SetAlarmState")) {
            constexpr unsigned ON = 3;
            return server->invoke_method(
                alarm, "SetAlarmState",
                {{"RequestedAlarmState", broker::Plain_Value::unsigned_number(CMPI_uint16, ON)}});
        }
        const broker::Plain_Value update = broker::Plain_Value::unsigned_number(CMPI_uint16, 5);
        return server->invoke_method(service, "InstallFromURI",
                                     {{"URI", broker::Plain_Value::text("file://" + firmware.path("image"))},
                                      {"Target", broker::Plain_Value::path(controller)},
                                      {"InstallOptions", broker::Plain_Value::array(CMPI_uint16, {update})}});
    }
    /// The return value, of a call that must succeed as such.
    std::uint64_t outcome()
    {
        const broker::Result result = invoke();
        EXPECT_EQ(CMPI_RC_OK, result.rc) << result.exception.value_or(result.message);
        EXPECT_FALSE(result.return_value.null);
        return result.return_value.null ? ~0u : result.return_value.as_uint();
    }

    Temp_Folder firmware;
    broker::Path_Value alarm, controller, service;
};

TEST_P(Invoked_Answers, AreTheMethodsOutcome)
{
    const Way& way = GetParam();
    simulator.clear_calls();
    const std::uint64_t done = outcome();
    EXPECT_EQ(0u, done);
    ASSERT_TRUE(was_called(way.entry_point));
    const Json::Value request = simulator.requests(way.entry_point).at(0);
    restore();
    const std::vector<std::string> neighbours =
        lasting_texts(server->enumerate_instances("KALDERA_ComputerSystem"));
    for (const Bad_Answer& bad : bad_json_answers(true_answer(way.entry_point, request))) {
        SCOPED_TRACE(bad.name);
        restore();
        simulator.add_fault(bad.fault(way.entry_point));
        const std::uint64_t now = outcome();
        EXPECT_TRUE(now == failed || (now < failed && !bad.is_failure())) << now;
        EXPECT_EQ(neighbours, lasting_texts(server->enumerate_instances("KALDERA_ComputerSystem")));
        expect_nothing_left();
        restore();
        EXPECT_EQ(done, elsewhere([&] { return outcome(); }));
        expect_nothing_left();
    }
}

INSTANTIATE_TEST_SUITE_P(Way, Invoked_Answers, testing::ValuesIn(ways), [](const auto& row) {
    return std::string(row.param.method) + "_" + row.param.entry_point;
});

} // namespace
} // namespace KPRV::invoked_answers
