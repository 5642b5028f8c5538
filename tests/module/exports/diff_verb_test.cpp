// kldrcim diff: what a host looked like, and what it looks like now.
#include "tests/module/exports/Kldrcim_Fixture.h"

#include <json/json.h>

namespace KPRV {
namespace {

class Diff_Verb : public Kldrcim_Fixture
{
protected:
    /// Keeps the tree of the demo host, with texts in place of others, as a file.
    void keep(const char* file, const std::vector<std::pair<std::string, std::string>>& changes = {},
              const std::string& options = "")
    {
        std::string text = demo();
        for (const auto& [before, now] : changes) {
            const std::size_t at = text.find(before);
            ASSERT_NE(text.npos, at) << before;
            text.replace(at, before.size(), now);
        }
        with(text);
        const Outcome run = kldrcim("tree --format json " + options);
        ASSERT_EQ(0, run.status) << run.error;
        folder.write(file, run.out);
    }
    Outcome diff(const std::string& arguments = "")
    {
        return kldrcim("diff " + arguments + " " + folder.path("old") + " " + folder.path("new"));
    }
    static std::string demo()
    {
        std::ifstream file(KLDR_INVENTORIES "/demo.json");
        return {std::istreambuf_iterator<char>(file), {}};
    }
    static constexpr const char* hba = " at Kaldera FC HBA KLDR00A1001 (2000024b4c100000)";
    static constexpr const char* port = " at FC port 10:00:02:4b:4c:10:00:00";
};

TEST_F(Diff_Verb, EqualInventoriesSayNothing)
{
    keep("old");
    keep("new");
    const Outcome run = diff();
    EXPECT_EQ(0, run.status);
    EXPECT_EQ("", run.out);
    EXPECT_EQ("", run.error);
    EXPECT_EQ("[]\n", diff("--format json").out);
}

TEST_F(Diff_Verb, StatesAndSpeedsThatChange)
{
    keep("old");
    keep("new",
         {{"\"portStatusValue\": 12", "\"portStatusValue\": 13"},
          {"\"operatingSpeed\": 16", "\"operatingSpeed\": 4"},
          {"\"serialNumber\": \"KLDR00A1001\"", "\"serialNumber\": \"KLDR00A1001\", \"hbaStatus\": false"}});
    const Outcome run = diff();
    EXPECT_EQ(1, run.status);
    EXPECT_EQ(
        "changed  Kaldera FC HBA KLDR00A1001 (2000024b4c100000): state in service -> stopped\n"
        "changed  FC port 10:00:02:4b:4c:10:00:01 at Kaldera FC HBA KLDR00A1001 (2000024b4c100000): state "
        "no contact -> link down\n"
        "changed  FC port 10:00:02:4b:4c:30:00:00 at Kaldera FC HBA 00417 (2000024b4c300000): speed 16 Gb/s "
        "-> 4 Gb/s\n",
        run.out);
}

TEST_F(Diff_Verb, TargetsAndUnitsThatComeAndGo)
{
    keep("old");
    keep("new",
         {{"50:24:b4:c0:00:50:00:01", "50:24:b4:c0:00:50:00:09"},
          {"{ \"vendor\": \"KLDR\", \"productID\": \"ARRAY 4000\", \"productSerialNumber\": "
           "\"KA4000170001\",\n                  \"lunDescription\": \"6024b4c0000400000000000000000001\" },",
           ""},
          {"6024b4c0000400000000000000000003\" }", "6024b4c0000400000000000000000003\", \"number\": 7 }"}});
    const std::string out = diff().out,
                      place = " at target 50:24:b4:c0:00:40:00:01" + std::string(port) + hba;
    EXPECT_TRUE(
        has(out, "went     disk LUN_2 KLDR ARRAY 4000, 6024b4c0000400000000000000000003" + place + "\n"))
        << out;
    EXPECT_TRUE(
        has(out, "came     disk LUN_7 KLDR ARRAY 4000, 6024b4c0000400000000000000000003" + place + "\n"))
        << out;
    // Numbers are counted anew behind a unit that went.
    EXPECT_TRUE(has(out, "changed  disk LUN_0" + place +
                             ": unit KLDR ARRAY 4000, 6024b4c0000400000000000000000001 -> KLDR ARRAY 4000, "
                             "6024b4c0000400000000000000000002\n"))
        << out;
    EXPECT_TRUE(has(out, std::string("went     target 50:24:b4:c0:00:50:00:01") + port + hba +
                             " with 1 logical unit\n"))
        << out;
    EXPECT_TRUE(has(out, std::string("came     target 50:24:b4:c0:00:50:00:09") + port + hba +
                             " with 1 logical unit\n"))
        << out;
}

TEST_F(Diff_Verb, AnAdapterStandsForAllThatHangsFromIt)
{
    keep("new");
    with(R"({"adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00", "serialNumber": "KLDR00A1001"},
        "fcPorts": [{"wwn": "10:00:02:4b:4c:10:00:01", "portStatusValue": 12, "operatingSpeed": 99999}]}]})");
    folder.write("old", kldrcim("tree --format json").out);
    EXPECT_EQ(
        "came     FC port 10:00:02:4b:4c:10:00:00" + std::string(hba) +
            " with 3 targets, 5 logical units\n"
            "came     Kaldera CNA KLDR00A1002 (024b4c200000) with 2 FC ports, 2 Ethernet ports\n"
            "came     Kaldera FC HBA 00417 (2000024b4c300000) with 1 FC port, 1 target, 3 logical units\n",
        diff().out);
}

TEST_F(Diff_Verb, FirmwareThatChangesWhereBothHaveIt)
{
    const std::vector<std::pair<std::string, std::string>> update = {
        {"\"version\": \"3.2.1.0\"", "\"version\": \"3.2.2.0\""}};
    keep("old", {}, "--software");
    keep("new", update, "--software");
    EXPECT_EQ("changed  firmware 3.2.2.0" + std::string(hba) + ": version 3.2.1.0 -> 3.2.2.0\n", diff().out);
    keep("new", update);
    const Outcome run = diff();
    EXPECT_EQ(0, run.status);
    EXPECT_EQ("", run.out);
    EXPECT_EQ("kldrcim: warning: one of them has no software, which was not compared (tree --software)\n",
              run.error);
}

TEST_F(Diff_Verb, TransceiversThatChange)
{
    keep("old", {}, "--connectors");
    keep("new", {{"KO-8SW", "KO-8LW"}}, "--connectors");
    EXPECT_EQ("changed  transceiver KO8S170417_1_0 at card 825" + std::string(hba) +
                  ": description KLDR OPTICS, KO-8SW, 2G,4G,8G -> KLDR OPTICS, KO-8LW, 2G,4G,8G\n",
              diff().out);
}

TEST_F(Diff_Verb, TwoHostsAreComparedByWhatTheySee)
{
    const auto host = [](const char* adapter, const char* last_lun) {
        return R"({"adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:)" + std::string(adapter) +
               R"(:00:00"}, "fcPorts": [{"wwn": "10:00:02:4b:4c:)" + adapter +
               R"(:00:00", "remotePorts": [{"remotePortWwn": "50:24:b4:c0:00:40:00:01", "lunList": [
                {"lunDescription": "6024b4c0000000000000000000000001"}, )" +
               last_lun + "]}]}]}]}";
    };
    with(host("10", R"({"lunDescription": "6024b4c0000000000000000000000002"})"));
    folder.write("old", kldrcim("tree --format json").out);
    with(host("20", R"({"lunDescription": "6024b4c0000000000000000000000003"})"));
    folder.write("new", kldrcim("tree --format json").out);
    const Outcome run = diff();
    EXPECT_EQ(1, run.status);
    EXPECT_EQ("went     disk LUN_1 KLDR Simulated LUN, 6024b4c0000000000000000000000002\n"
              "came     disk LUN_1 KLDR Simulated LUN, 6024b4c0000000000000000000000003\n",
              run.out);
    EXPECT_TRUE(has(run.error,
                    "warning: no adapter is in both; targets and logical units are compared without "
                    "their ports\n"))
        << run.error;
    with(host("20", R"({"lunDescription": "6024b4c0000000000000000000000002", "number": 9})"));
    folder.write("new", kldrcim("tree --format json").out);
    EXPECT_EQ("changed  disk LUN_9: number LUN_1 -> LUN_9\n", diff().out);
}

TEST_F(Diff_Verb, ForPrograms)
{
    keep("old");
    keep("new", {{"\"portStatusValue\": 12", "\"portStatusValue\": 13"}});
    Json::Value changes;
    ASSERT_TRUE(Json::Reader().parse(diff("--format json").out, changes));
    ASSERT_EQ(1u, changes.size());
    EXPECT_EQ("changed", changes[0]["change"].asString());
    EXPECT_EQ("fc_port", changes[0]["kind"].asString());
    EXPECT_EQ("Kaldera FC HBA KLDR00A1001 (2000024b4c100000)", changes[0]["at"][0].asString());
    EXPECT_EQ("state", changes[0]["changes"][0]["name"].asString());
    EXPECT_EQ("no contact", changes[0]["changes"][0]["before"].asString());
    EXPECT_EQ("link down", changes[0]["changes"][0]["now"].asString());
    EXPECT_TRUE(has(changes[0]["path"].asString(), "DeviceID=\"1000024b4c100001\""));
}

TEST_F(Diff_Verb, OneMayComeFromStandardInputAndNobodyIsAsked)
{
    keep("old");
    EXPECT_EQ(0, kldrcim("diff " + folder.path("old") + " - <" + folder.path("old")).status);
    EXPECT_EQ(
        0, kldrcim("diff --module /nonexistent - " + folder.path("old") + " <" + folder.path("old")).status);
}

TEST_F(Diff_Verb, BadInputIsNamed)
{
    keep("old");
    const std::string old = folder.path("old"), bad = folder.path("bad");
    expect_mistake("diff " + old, "usage: kldrcim [options] diff OLD NEW");
    expect_mistake("diff - -", "only one inventory can come from standard input");
    expect_mistake("diff " + old + " " + bad, bad + ": No such file or directory");
    expect_mistake("diff " + folder.path() + " " + old, folder.path() + ": Is a directory");
    expect_mistake("diff --format mof a b", "--format mof makes no sense for diff");
    expect_mistake("diff " + old + " - </dev/null", "standard input: not JSON");
    const std::string member = R"("what": "", "name": "", "path": "")";
    const std::pair<std::string, const char*> texts[] = {
        {"{", "not JSON"},
        {std::string(2000, '['), "not JSON"},
        {"7", "not an object of \"kldrcim tree --format json\""},
        {"[]", "not the inventory of one host"},
        {"{}", "an object has no text \"kind\""},
        {R"({"kind": "house", )" + member + "}", "no kind of object is \"house\""},
        {R"({"kind": "unit", )" + member + "}", "it begins with no host"},
        {R"({"kind": "system", "facts": 7, )" + member + "}", "\"facts\" is no array"},
        {R"({"kind": "system", "children": [7], )" + member + "}",
         "not an object of \"kldrcim tree --format json\""},
    };
    for (const auto& [text, error] : texts) {
        folder.write("bad", text);
        expect_mistake("diff " + old + " " + bad, bad + ": " + error);
    }
}

} // namespace
} // namespace KPRV
