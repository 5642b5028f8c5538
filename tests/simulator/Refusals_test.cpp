#include "tests/simulator/Simulator_Fixture.h"

#include <filesystem>
#include <fstream>
#include <unistd.h>

namespace KPRV::simulator {
namespace {

struct Refusal
{
    const char* inventory;
    const char* reason;
};

const std::string deep = std::string(65, '[') + std::string(65, ']');

// An FC port whose members go on in line 3, and a remote port of it whose members go on in line 4.
#define TARGET "50:24:b4:c0:00:00:00:01"
#define ON_PORT(members, reason)                                                                             \
    {                                                                                                        \
        "{\"adapters\": [{\"hbaData\": {\"wwn\": \"20:00:02:4b:4c:20:00:00\"}, \"fcPorts\": [\n"             \
        "{\"wwn\": \"10:00:02:4b:4c:20:00:00\",\n" members "}]}]}",                                          \
            reason                                                                                           \
    }
#define ON_REMOTE_PORT(members, reason)                                                                      \
    ON_PORT("\"remotePorts\": [{\"remotePortWwn\": \"" TARGET "\",\n" members "}]", reason)
#define COUNTER(line, text)                                                                                  \
    line ": a counter must be [id, value] or [id, value, growth per second], not " text

// clang-format off
const Refusal refusals[] = {
    // Syntax.
    {"",                                                    "1: Syntax error: value, object or array expected."},
    {"{\n  \"adapters\": [\n}",                             "3: Syntax error: value, object or array expected."},
    {"{\n  \"host\": {}\n  \"library\": {}\n}",             "3: Missing ',' or '}' in object declaration"},
    {"{}\n\n7",                                             "3: Extra non-whitespace after JSON value."},
    {"{\"host\": {},\n\n\"host\": {}}",                     "3: Duplicate key: 'host'"},
    {"// [[[\n/* [[[ */ \"[[[\\\"[[\"",                     "2: the inventory must be an object"},
    {deep.c_str(),                                          "1: nested deeper than 64 levels"},

    // The host.
    {"[]",                                                  "1: the inventory must be an object"},
    {"{\n\"adapter\": []}",                                 "2: unknown member \"adapter\" in the inventory"},
    {"{\n\"adapters\":\n{}}",                               "3: \"adapters\" in the inventory must be an array, not {}"},
    {"{\"host\": {\n\"hostModel\": 7}}",                    "2: \"hostModel\" in host must be a text, not 7"},
    {"{\"host\": null}",                                    "1: \"host\" in the inventory must be an object, not null"},
    {"{\"library\": {\n\"version\": 3}}",                   "2: \"version\" in library must be a text, not 3"},
    {"{\"answers\": {\n\"getPort\": 1}}",                   "2: unknown entry point \"getPort\" in answers"},

    // Adapters.
    {"{\"adapters\": [\n7]}",                               "2: an adapter must be an object"},
    {"{\"adapters\": [\n{}]}",                              "2: missing member \"hbaData\" in an adapter"},
    {"{\"adapters\": [{\n\"hbaData\": {}}]}",               "2: missing member \"wwn\" or \"hbaMAC\" in hbaData"},
    {"{\"adapters\": [{\"hbaData\": {\n\"wwn\": \"10:00\"}}]}",
     "2: \"wwn\" in hbaData must be a WWN, eight colon-separated pairs of hexadecimal digits, not \"10:00\""},
    {"{\"adapters\": [{\"hbaData\": {\n\"hbaMAC\": \"02:4b:4c:20:00:0g\"}}]}",
     "2: \"hbaMAC\" in hbaData must be a MAC, six colon-separated pairs of hexadecimal digits, "
     "not \"02:4b:4c:20:00:0g\""},
    {"{\"adapters\": [{\"address\":\n\"2000024b4c100000\", \"hbaData\": {}}]}",
     "2: \"address\" in an adapter must be a WWN or a MAC in colon form, not \"2000024b4c100000\""},
    {"{\"adapters\": [{\"hbaData\": {\"hbaMAC\": \"02:4b:4c:20:00:00\",\n\"modle\": \"825\"}}]}",
     "2: unknown member \"modle\" in hbaData"},
    {"{\"adapters\": [{\"hbaData\": {\"hbaMAC\": \"02:4b:4c:20:00:00\",\n\"portCount\": -1}}]}",
     "2: \"portCount\" in hbaData must be an unsigned integer of 32 bits, not -1"},
    {"{\"adapters\": [{\"hbaData\": {\"hbaMAC\": \"02:4b:4c:20:00:00\",\n\"hbaStatus\": \"on\"}}]}",
     "2: \"hbaStatus\" in hbaData must be true or false, not \"on\""},
    {"{\"adapters\": [{\"hbaData\": {\"hbaMAC\": \"02:4b:4c:20:00:00\"},\n\"driver\": {\"name\": \"x\"}}]}",
     "2: unknown member \"name\" in driver"},
    {"{\"adapters\": [{\"hbaData\": {\"hbaMAC\": \"02:4b:4c:20:00:00\"},\n\"firmware\": {\"bios\": \"x\"}}]}",
     "2: unknown member \"bios\" in firmware"},
    {"{\"adapters\": [{\"hbaData\": {\"hbaMAC\": \"02:4b:4c:20:00:00\"},\n\"answers\": {\"x\": 1}}]}",
     "2: unknown entry point \"x\" in answers"},

    // Ports.
    {"{\"adapters\": [{\"hbaData\": {\"hbaMAC\": \"02:4b:4c:20:00:00\"}, \"fcPorts\": [\n{}]}]}",
     "2: missing member \"wwn\" in an FC port"},
    {"{\"adapters\": [{\"hbaData\": {\"hbaMAC\": \"02:4b:4c:20:00:00\"}, \"fcPorts\": [{\n"
     "\"wwn\": \"10:00:02:4b:4c:20:00:00\",\n\"operatingSpeed\": 8.0}]}]}",
     "3: \"operatingSpeed\" in an FC port must be an unsigned integer of 32 bits, not 8.0"},
    {"{\"adapters\": [{\"hbaData\": {\"hbaMAC\": \"02:4b:4c:20:00:00\"}, \"fcPorts\": [{\n"
     "\"wwn\": \"10:00:02:4b:4c:20:00:00\",\n\"supportedPortSpeeds\": [\"8\"]}]}]}",
     "3: \"supportedPortSpeeds\" in an FC port must be an array of unsigned integers, not [\"8\"]"},
    {"{\"adapters\": [{\"hbaData\": {\"hbaMAC\": \"02:4b:4c:20:00:00\"}, \"ethPorts\": [\n{}]}]}",
     "2: missing member \"mac\" in an Ethernet port"},
    {"{\"adapters\": [{\"hbaData\": {\"hbaMAC\": \"02:4b:4c:20:00:00\"}, \"ethPorts\": [{\n"
     "\"mac\": \"02:4b:4c:20:00:00\", \"ethData\": {\n\"mtu\": \"big\"}}]}]}",
     "3: \"mtu\" in ethData must be an unsigned integer of 32 bits, not \"big\""},

    // What is behind and inside a port.
    {"{\"adapters\": [{\"hbaData\": {\"hbaMAC\": \"02:4b:4c:20:00:00\"}, \"ethPorts\": [\n"
     "{\"mac\": \"02:4b:4c:20:00:00\",\n\"remotePorts\": []}]}]}",
     "3: unknown member \"remotePorts\" in an Ethernet port"},
    ON_PORT("\"optics\": \"SFP\"",                      "3: \"optics\" in an FC port must be an object, not \"SFP\""),
    ON_PORT("\"optics\": {\n\"vendor\": \"x\"}",        "4: unknown member \"vendor\" in optics"),
    ON_PORT("\"optics\": {\n\"serialNo\": 7}",          "4: \"serialNo\" in optics must be a text, not 7"),
    ON_PORT("\"optics\": {\n\"readings\": []}",         "4: \"readings\" in optics must be an object, not []"),
    ON_PORT("\"optics\": {\"readings\": {\n\"voltage\": -1}}",
            "4: \"voltage\" in readings must be an unsigned integer of 32 bits, not -1"),
    ON_PORT("\"statistics\": {}",                         "3: \"statistics\" in an FC port must be an array, not {}"),
    ON_PORT("\"statistics\": [[1, 2],\n7]",               COUNTER("4", "7")),
    ON_PORT("\"statistics\": [\n[1]]",                    COUNTER("4", "[1]")),
    ON_PORT("\"statistics\": [\n[1, -2]]",                COUNTER("4", "[1,-2]")),
    ON_PORT("\"statistics\": [\n[-1, 2]]",                COUNTER("4", "[-1,2]")),
    ON_PORT("\"statistics\": [\n[1, 2.0]]",               COUNTER("4", "[1,2.0]")),
    ON_PORT("\"statistics\": [\n[1, \"2\", 3]]",          COUNTER("4", "[1,\"2\",3]")),
    ON_PORT("\"statistics\": [\n[1, 2, 3, 4]]",           COUNTER("4", "[1,2,3,4]")),
    ON_PORT("\"remotePorts\": {}",                        "3: \"remotePorts\" in an FC port must be an array, not {}"),
    ON_PORT("\"remotePorts\": null",                      "3: \"remotePorts\" in an FC port must be an array, not null"),
    ON_PORT("\"remotePorts\": [\n7]",                     "4: a remote port must be an object"),
    ON_PORT("\"remotePorts\": [\nnull]",                  "4: a remote port must be an object"),
    ON_PORT("\"remotePorts\": [\n{}]",                    "4: missing member \"remotePortWwn\" in a remote port"),
    ON_PORT("\"remotePorts\": [\n\"" TARGET "\"]",        "4: unknown remote port \"" TARGET "\""),
    ON_PORT("\"remotePorts\": [{\"remotePortWwn\": \"" TARGET "\"},\n{\n\"remotePortWwn\": \"50:24:B4:C0:00:00:00:01\"}]",
            "5: duplicate remote port \"50:24:B4:C0:00:00:00:01\""),
    ON_REMOTE_PORT("\"lun\": []",                         "4: unknown member \"lun\" in a remote port"),
    ON_REMOTE_PORT("\"remoteNodeWwn\": \"02:4b:4c:20:00:00\"",
                   "4: \"remoteNodeWwn\" in a remote port must be a WWN, eight colon-separated pairs of hexadecimal "
                   "digits, not \"02:4b:4c:20:00:00\""),
    ON_REMOTE_PORT("\"deviceData\": []",                  "4: \"deviceData\" in a remote port must be an object, not []"),
    ON_REMOTE_PORT("\"deviceData\": {\n\"istarget\": true}", "5: unknown member \"istarget\" in deviceData"),
    ON_REMOTE_PORT("\"deviceData\": {\n\"isTarget\": 1}", "5: \"isTarget\" in deviceData must be true or false, not 1"),
    ON_REMOTE_PORT("\"lunList\": {}",                     "4: \"lunList\" in a remote port must be an array, not {}"),
    ON_REMOTE_PORT("\"lunList\": [{},\n7]",               "5: a LUN must be an object"),
    ON_REMOTE_PORT("\"lunList\": [{\n\"lunId\": 1}]",    "5: unknown member \"lunId\" in a LUN"),
    ON_REMOTE_PORT("\"lunList\": [{\n\"number\": -1}]",
                   "5: \"number\" in a LUN must be an unsigned integer of 32 bits, not -1"),
    ON_REMOTE_PORT("\"lunList\": [{\n\"vendor\": 7}]",   "5: \"vendor\" in a LUN must be a text, not 7"),
    ON_REMOTE_PORT("\"lunList\": [{\"number\": 1},\n{}]", "5: duplicate LUN number 1"),
    {"{\"remotePorts\":\n7}",                             "2: \"remotePorts\" in the inventory must be an array, not 7"},
    {"{\"remotePorts\": [\n\"" TARGET "\"]}",             "2: unknown remote port \"" TARGET "\""},
    {"{\"remotePorts\": [{\"remotePortWwn\": \"" TARGET "\"},\n{\"remotePortWwn\": \"" TARGET "\"}]}",
     "2: duplicate remote port \"" TARGET "\""},

    // Settings and tests.
    ON_PORT("\"settings\": {\n\"lld\": {}}",             "4: unknown setting \"lld\""),
    ON_PORT("\"settings\": {\n\"authentication\": 7}",   "4: the setting \"authentication\" must be an object"),
    {"{\"adapters\": [{\"hbaData\": {\"hbaMAC\": \"02:4b:4c:20:00:00\"},\n\"settings\": {\"x\": {}}}]}",
     "2: unknown setting \"x\""},
    {"{\"postedTests\": {\n\"millis\": 1}}",             "2: unknown member \"millis\" in postedTests"},
    {"{\"postedTests\": {\n\"milliseconds\": -1}}",
     "2: \"milliseconds\" in postedTests must be an unsigned integer of 32 bits, not -1"},

    // Duplicates: of another adapter, in another letter case; of another port; of another adapter's port.
    {"{\"adapters\": [{\"hbaData\": {\"wwn\": \"20:00:02:4b:4c:20:00:00\"}},\n"
     "{\"hbaData\": {\"wwn\": \"20:00:02:4B:4C:20:00:00\"}}]}",
     "2: duplicate address \"20:00:02:4B:4C:20:00:00\""},
    {"{\"adapters\": [{\"hbaData\": {\"wwn\": \"20:00:02:4b:4c:20:00:00\"}, \"fcPorts\": [\n"
     "{\"wwn\": \"10:00:02:4b:4c:20:00:00\"},\n{\"wwn\": \"10:00:02:4b:4c:20:00:00\"}]}]}",
     "3: duplicate address \"10:00:02:4b:4c:20:00:00\""},
    {"{\"adapters\": [{\"hbaData\": {\"wwn\": \"20:00:02:4b:4c:20:00:00\"}},\n"
     "{\"hbaData\": {\"wwn\": \"20:00:02:4b:4c:20:00:01\"}, \"fcPorts\": [{\"wwn\": \"20:00:02:4b:4c:20:00:00\"}]}]}",
     "2: duplicate address \"20:00:02:4b:4c:20:00:00\""},

    // Faults.
    {"{\"faults\": [\n{\"do\": \"null\"}]}",                "2: missing member \"call\" in a fault"},
    {"{\"faults\": [\n{\"call\": \"getHost\"}]}",           "2: missing member \"do\" in a fault"},
    {"{\"faults\": [{\n\"call\": \"get\", \"do\": \"null\"}]}", "2: unknown entry point \"get\""},
    {"{\"faults\": [{\"call\": \"*\",\n\"do\": \"sing\"}]}", "2: unknown fault \"sing\""},
    {"{\"faults\": [{\"call\": \"*\", \"do\": \"null\",\n\"at\": -1}]}",
     "2: \"at\" in a fault must be an unsigned integer of 32 bits, not -1"},
    {"{\"faults\": [\n{\"call\": \"*\", \"do\": \"delay\"}]}",
     "2: missing member \"milliseconds\" in a fault that does \"delay\""},
    {"{\"faults\": [\n{\"call\": \"*\", \"do\": \"set\", \"member\": \"a\"}]}",
     "2: missing member \"value\" in a fault that does \"set\""},
    {"{\"faults\": [{\"call\": \"*\", \"do\": \"throw\",\n\"type\": \"long\"}]}", "2: unknown exception \"long\""},
};
// clang-format on

// What the action throws; empty if it throws nothing.
template <typename Action>
std::string thrown_text(Action action)
{
    try {
        action();
        return "";
    } catch (const std::runtime_error& refused) {
        return refused.what();
    }
}

std::string reason_of(Simulator_Control& simulator, const std::string& text)
{
    return thrown_text([&] { simulator.load_text(text); });
}

class Refusals_test : public Simulator_Fixture
{
};

TEST_F(Refusals_test, EachMistakeIsToldWithItsLine)
{
    for (const Refusal& refusal : refusals)
        EXPECT_EQ(reason_of(simulator, refusal.inventory), std::string("inventory:") + refusal.reason);
}

TEST_F(Refusals_test, SixtyFourLevelsAreNotTooMany)
{
    std::string text = "{\"answers\": {\"getHost\": " + std::string(62, '[') + std::string(62, ']') + "}}";
    EXPECT_EQ(reason_of(simulator, text), "");
}

TEST_F(Refusals_test, ARefusedInventoryLeavesNoAdaptersAndInitialisingSaysWhy)
{
    simulator.load_file(inventory("twins.json"));
    const std::string reason = reason_of(simulator, "{\"host\": 7}");
    EXPECT_EQ(simulator.status()["problem"].asString(), reason);
    EXPECT_EQ(simulator.symbol<unsigned()>("getNumberOfAdapters")(), 0u);
    const Json::Value answer = call("init_hba_lib", "{'appId': 2}");
    EXPECT_EQ(error_code(answer), 4);
    EXPECT_EQ(answer["error"]["message"].asString(), reason);
    simulator.load_file(inventory("twins.json"));
    EXPECT_EQ(call("init_hba_lib", "{'appId': 2}"), json("{'result': 0}"));
}

TEST_F(Refusals_test, ARefusedFileOfTheEnvironmentIsToldOnceOnStandardError)
{
    const auto path = std::filesystem::current_path() / ("refused_" + std::to_string(getpid()) + ".json");
    std::ofstream(path) << "{\n\"adapters\": 7}";
    setenv("KLDR_SIMULATOR_INVENTORY", path.c_str(), 1);
    simulator.reset();
    testing::internal::CaptureStderr();
    testing::internal::CaptureStdout();
    const Json::Value answer = call("init_hba_lib", "{'appId': 2}");
    call("getHost");
    const std::string reason = path.string() + ":2: \"adapters\" in the inventory must be an array, not 7";
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "simulator: " + reason + "\n");
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "");
    EXPECT_EQ(answer["error"]["message"].asString(), reason);
    std::filesystem::remove(path);
}

TEST_F(Refusals_test, AFileThatCannotBeReadIsRefused)
{
    const std::pair<std::string, std::string> unreadable[] = {
        {"no/such/file.json", "No such file or directory"},
        {SIMULATOR_INVENTORIES, "Is a directory"},
    };
    for (const auto& [path, reason] : unreadable)
        EXPECT_EQ(thrown_text([&] { simulator.load_file(path); }), path + ":0: cannot be read: " + reason);
}

TEST_F(Refusals_test, AnEmptyFileIsNoInventory)
{
    EXPECT_EQ(thrown_text([&] { simulator.load_file("/dev/null"); }),
              "/dev/null:1: Syntax error: value, object or array expected.");
}

TEST_F(Refusals_test, AFaultThatIsAddedIsCheckedLikeOneOfTheInventory)
{
    EXPECT_EQ(thrown_text([&] { simulator.add_fault("{\"call\": \"*\",\n\"do\": \"sing\"}"); }),
              "fault:2: unknown fault \"sing\"");
}

} // namespace
} // namespace KPRV::simulator
