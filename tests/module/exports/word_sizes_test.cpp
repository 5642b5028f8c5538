// Numbers at and beyond the bounds of 32 and 64 bits, wherever the library or a client can name one. Both
// word sizes are held against one text, and so against each other.
#include "tests/module/exports/Golden.h"
#include "tests/module/exports/Rich_Fixture.h"

namespace KPRV {
namespace {

/// A number in the library's answer about one element, and the property that it becomes.
struct Place
{
    const char* call;
    const char* address;
    const char* member;
    const char* class_name;
    const char* property;
    /// Which of the class's instances it is about: begins its key.
    const char* key;
};

constexpr const char* PORT = "10:00:02:4b:4c:a1:00:00";
constexpr const char* PORT_KEY = "1000024b4ca10000";
constexpr const char* MAC = "02:4b:4c:a2:00:01";
constexpr const char* TARGET = "50:24:b4:c0:00:a3:00:01";

// clang-format off
const Place places[] = {
    {"getPortByWwn",             PORT,   "portStatusValue",              "FCPort",           "OperationalStatus",                PORT_KEY},
    {"getPortByWwn",             PORT,   "portTypeMOFValue",             "FCPort",           "PortType",                         PORT_KEY},
    {"getPortByWwn",             PORT,   "operatingSpeed",               "FCPort",           "Speed",                            PORT_KEY},
    {"getPortByWwn",             PORT,   "supportedPortSpeeds.0",        "FCPort",           "MaxSpeed",                         PORT_KEY},
    {"getPortByWwn",             PORT,   "maxFrameSize",                 "FCPort",           "SupportedMaximumTransmissionUnit", PORT_KEY},
    {"getEthPortByEthMac",       MAC,    "ethData.ethPortStateMOFValue", "EthernetPort",     "OperationalStatus",                "024b4ca20001"},
    {"getCompleteRemotePort",    TARGET, "lunList.0.number",             "StorageExtent",    "DeviceID",                         "1000024b4ca20000_"},
    {"getCompleteRemotePort",    TARGET, "lunList.0.lunDescIdType",      "StorageExtent",    "Name",                             "1000024b4ca20000_"},
    {"getDynamicPortStatistics", PORT,   "2.id",                         "FCPortStatistics", "BytesTransmitted",                 PORT_KEY},
};
// clang-format on

const char* const numbers[] = {
    "-1",
    "2147483647",
    "2147483648",
    "-2147483648",
    "-2147483649",
    "4294967295",
    "4294967296",
    "4294967307",
    "1e9",
    "1e10",
    "9223372036854775807",
    "9223372036854775808",
    "18446744073709551615",
    "18446744073709551627",
};

/// Counters come as texts.
const char* const counters[] = {
    "-1",
    "4294967296",
    "9223372036854775807",
    "9223372036854775808",
    "18446744073709551616",
    "-9223372036854775809",
    "0x10",
    " 12",
    "12x",
    "",
};

/// Adapter ids and port numbers in a connector's tag, behind the serial number that the library tells.
const char* const tags[] = {"x_4294967298_1", "x_4294967298", "x_2_4294967297", "x_-4294967294_0", "x_2"};

class Word_Sizes : public Rich_Fixture
{
protected:
    void answer_with(const Place& place, const Json::Value& value)
    {
        Json::Value fault;
        fault["call"] = place.call;
        fault["address"] = place.address;
        fault["do"] = "set";
        fault["member"] = place.member;
        fault["value"] = value;
        simulator.clear_faults();
        simulator.add_fault(fault.toStyledString());
    }
    /// What the library is asked by way of the agent, or the agent's refusal.
    std::string asked(const std::string& method, const std::string& params)
    {
        const broker::Path_Value service =
            server->enumerate_instance_names("KALDERA_AgentService").paths.at(0);
        const std::string request = R"({"method": ")" + method + R"(", "params": )" + params + "}";
        mark();
        const broker::Result result = server->invoke_method(
            service, "executeMethod", {{"request", broker::Plain_Value::text(request)}});
        Json::FastWriter writer;
        writer.omitEndingLineFeed();
        if (const auto calls = simulator.calls(); !calls.empty())
            return writer.write(calls[0].request);
        Json::Value reply;
        Json::Reader().parse(result.out.at(0).value.as_text(), reply);
        return reply["error"]["message"].asString();
    }
    /// What the property became; "-" where the element is lost.
    std::string told(const Place& place)
    {
        const broker::Result result = enumerate(std::string("KALDERA_") + place.class_name);
        for (const broker::Instance_Value& instance : result.instances)
            for (const broker::Named_Value& key : instance.path.keys)
                if (key.value.as_text().starts_with(place.key))
                    return broker::plain_text(*instance.property(place.property));
        return "-";
    }
    /// The pairs of an association whose far end has the key.
    std::string pairs(const char* class_name, const char* role, const std::string& key)
    {
        std::string text;
        for (const broker::Instance_Value& pair : enumerate(class_name).instances)
            if (broker::plain_text(*pair.property(role)).find(key) != std::string::npos)
                for (const broker::Named_Value& end : pair.properties)
                    if (end.name != role)
                        text += " " + broker::plain_text(end.value);
        return text.empty() ? " -" : text;
    }
};

TEST_F(Word_Sizes, AnswerAlike)
{
    open_rich();
    std::string text;
    for (const Place& place : places) {
        text += std::string(place.call) + " " + place.member + "\n";
        for (const char* number : numbers) {
            Json::Value value;
            ASSERT_TRUE(Json::Reader().parse(number, value));
            answer_with(place, value);
            text += std::string("    ") + number + ": " + told(place) + "\n";
        }
    }
    text += "a counter\n";
    const Place counted = {"getDynamicPortStatistics", PORT,    "2.value", "FCPortStatistics",
                           "BytesTransmitted",         PORT_KEY};
    for (const char* counter : counters) {
        answer_with(counted, counter);
        text += std::string("    ") + counter + ": " + told(counted) + "\n";
    }
    text += "the tag of a connector\n";
    for (const char* tag : tags) {
        answer_with({"getOpticsSFP", "10:00:02:4b:4c:a2:00:00", "serialNo", nullptr, nullptr, nullptr}, tag);
        text += std::string("    ") + tag + "_2_0\n" +
                "        in:" + pairs("KALDERA_PhysicalConnectorContainer", "PartComponent", tag) + "\n" +
                "        for:" + pairs("KALDERA_EthernetPortRealizes", "Antecedent", tag) + "\n";
    }
    simulator.clear_faults();
    text += "a parameter\n";
    for (const char* number : numbers)
        text +=
            std::string("    ") + number + ": " +
            asked("configuration.createVnic", R"(["02:4b:4c:a2:00:00", )" + std::string(number) + ", 1]") +
            "\n";
    expect_golden("word_sizes", text, ".txt");
}

} // namespace
} // namespace KPRV
