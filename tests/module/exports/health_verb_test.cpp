// kldrcim health: each finding, its rank and what is said of it.
#include "tests/module/exports/Kldrcim_Fixture.h"

#include <json/json.h>

namespace KPRV {
namespace {

class Health_Verb : public Kldrcim_Fixture
{
protected:
    /// Two ports that see the same target, in good order but for what is put in their places.
    static std::string host(const std::string& adapter = "", const std::string& port = "",
                            const std::string& more = "")
    {
        return R"({"remotePorts": [{"remotePortWwn": "50:24:b4:c0:00:40:00:01"}],
            "adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00")" +
               adapter + R"(}, "fcPorts": [
                {"wwn": "10:00:02:4b:4c:10:00:00", "remotePorts": ["50:24:b4:c0:00:40:00:01"])" +
               port + R"(},
                {"wwn": "10:00:02:4b:4c:10:00:01", "remotePorts": ["50:24:b4:c0:00:40:00:01"]}]}])" +
               more + "}";
    }
    /// "RANK FINDING ELEMENT DETAIL" of each finding.
    std::vector<std::string> findings(const std::string& arguments = "")
    {
        Json::Value report;
        const Outcome run = kldrcim("health --format json " + arguments);
        EXPECT_TRUE(Json::Reader().parse(run.out, report)) << run.out << run.error;
        status = run.status;
        std::vector<std::string> texts;
        for (const Json::Value& each : report["findings"])
            texts.push_back(each["rank"].asString() + " " + each["finding"].asString() + " " +
                            each["element"].asString() +
                            (each["detail"].asString().empty() ? "" : ": " + each["detail"].asString()));
        return texts;
    }
    using Texts = std::vector<std::string>;

    int status = -1;
};

TEST_F(Health_Verb, NothingToSayIsOneLine)
{
    with(host());
    const Outcome run = kldrcim("health");
    EXPECT_EQ(0, run.status);
    EXPECT_EQ("ok        nothing is wrong with 1 adapter, 2 ports, 1 target\n", run.out);
    EXPECT_EQ("", run.error);
    EXPECT_EQ(Texts{}, findings());
    EXPECT_EQ("KALDERA OK - 1 adapter, 2 ports, 1 target | critical=0;;;0 warning=0;;;0 unknown=0;;;0 "
              "adapters=1;;;0 ports=2;;;0 ports_in_service=2;;;0;2 targets=1;;;0\n",
              kldrcim("health --format plugin").out);
}

TEST_F(Health_Verb, WorstFirstWithPathAndAdvice)
{
    const Outcome run = kldrcim("health");
    EXPECT_EQ(2, run.status);
    const std::string out = run.out;
    EXPECT_EQ(0u, out.find("critical  FC port 10:00:02:4b:4c:10:00:01: no contact, nothing is at the other "
                           "end; check the cable, the transceiver and the switch port  "
                           "root/kaldera:KALDERA_FCPort."))
        << out;
    EXPECT_TRUE(has(out, ",DeviceID=\"1000024b4c100001\"\nwarning   target 50:24:b4:c0:00:50:00:01: only one "
                         "port sees it;"))
        << out;
    EXPECT_EQ("KALDERA CRITICAL - FC port 10:00:02:4b:4c:10:00:01: no contact, nothing is at the other end, "
              "and 2 more | critical=1;;;0 warning=2;;;0 unknown=0;;;0 adapters=3;;;0 ports=7;;;0 "
              "ports_in_service=6;;;0;7 targets=3;;;0\n",
              kldrcim("health --format plugin").out);
}

TEST_F(Health_Verb, StatesOfAdaptersAndPorts)
{
    const std::string port = " FC port 10:00:02:4b:4c:10:00:00";
    const std::pair<const char*, std::string> states[] = {
        {"3", "warning port-degraded"},       {"6", "critical port-failed"},
        {"8", "warning port-not-in-service"}, {"9", "warning port-disabled"},
        {"10", "warning port-disabled"},      {"12", "critical port-no-contact"},
        {"13", "critical port-link-down"},    {"99", "warning port-not-in-service"},
    };
    for (const auto& [number, finding] : states) {
        with(host("", std::string(", \"portStatusValue\": ") + number));
        EXPECT_EQ(Texts{finding + port}, findings()) << number;
        EXPECT_EQ(finding.starts_with("critical") ? 2 : 1, status) << number;
    }
    with(host(", \"hbaStatus\": false"));
    EXPECT_EQ(Texts{"critical adapter-out-of-service Kaldera FC HBA KLDR000001 (2000024b4c100000)"},
              findings());
}

TEST_F(Health_Verb, StatesOfEthernetPorts)
{
    with(R"({"adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:20:00:00", "hbaMAC": "02:4b:4c:20:00:00"},
        "ethPorts": [{"mac": "02:4b:4c:20:00:00", "ethData": {"ethPortStateMOFValue": 13}}]}]})");
    EXPECT_EQ(Texts{"critical port-link-down Ethernet port 02:4b:4c:20:00:00"}, findings());
}

TEST_F(Health_Verb, ALinkThatIsSlowerThanItCouldBe)
{
    with(host("", ", \"operatingSpeed\": 4, \"supportedPortSpeeds\": [16, 8, 4]"));
    EXPECT_EQ(Texts{"warning link-slow FC port 10:00:02:4b:4c:10:00:00: 4 Gb/s of 16 Gb/s"}, findings());
    with(host("", ", \"operatingSpeed\": 99999"));
    EXPECT_EQ(Texts{}, findings());
}

TEST_F(Health_Verb, CountersThatGrowBetweenTwoLooks)
{
    with(host("", ", \"statistics\": [[1402, 5, 1000], [1416, 3, 100], [1423, 7]]"));
    EXPECT_EQ(Texts{}, findings());
    const Texts found = findings("--interval 1");
    ASSERT_EQ(1u, found.size());
    EXPECT_TRUE(found[0].starts_with("warning port-errors-growing FC port 10:00:02:4b:4c:10:00:00: CRCErrors "
                                     "+1"))
        << found[0];
    EXPECT_FALSE(has(found[0], ",")) << found[0];
    const std::string line = kldrcim("health --interval 1 --format plugin").out;
    EXPECT_TRUE(has(line, " errors_grown=1")) << line;
    EXPECT_EQ(1, status);
}

TEST_F(Health_Verb, TargetsThatAreLostOrHaveOnePath)
{
    with(R"({"adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00"}, "fcPorts": [
        {"wwn": "10:00:02:4b:4c:10:00:00", "remotePorts": [
            {"remotePortWwn": "50:24:b4:c0:00:40:00:01", "deviceData": {"stateMofValue": 12}},
            {"remotePortWwn": "50:24:b4:c0:00:40:00:02", "deviceData": {"stateMofValue": 10}},
            {"remotePortWwn": "50:24:b4:c0:00:40:00:03", "deviceData": {"isTarget": false}}]}]}]})");
    EXPECT_EQ((Texts{"critical target-lost target 50:24:b4:c0:00:40:00:01",
                     "warning target-not-in-service target 50:24:b4:c0:00:40:00:02",
                     "warning single-path-target target 50:24:b4:c0:00:40:00:01",
                     "warning single-path-target target 50:24:b4:c0:00:40:00:02"}),
              findings());
    EXPECT_EQ((Texts{"warning target-not-in-service target 50:24:b4:c0:00:40:00:02",
                     "warning single-path-target target 50:24:b4:c0:00:40:00:02"}),
              findings("--ignore 50:24:B4:C0:00:40:00:01"));
    EXPECT_EQ(Texts{}, findings("--ignore 5024b4c000400001 --ignore single-path-target --ignore "
                                "target-not-in-service"));
    EXPECT_EQ(0, status);
}

TEST_F(Health_Verb, FirmwareThatDiffersWithinAModel)
{
    const auto adapters = [](const char* model) {
        return std::string(R"({"adapters": [
            {"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00"}, "firmware": {"version": "3.9.0.0"},
             "fcPorts": [{"wwn": "10:00:02:4b:4c:10:00:00"}]},
            {"hbaData": {"wwn": "20:00:02:4b:4c:20:00:00", "model": ")") +
               model + R"("}, "firmware": {"version": "3.10.0.0"},
             "fcPorts": [{"wwn": "10:00:02:4b:4c:20:00:00"}]}]})";
    };
    with(adapters("825"));
    EXPECT_EQ(Texts{"warning firmware-differs Kaldera FC HBA KLDR000001 (2000024b4c100000): 3.9.0.0, and "
                    "3.10.0.0 is in another 825"},
              findings());
    with(adapters("815"));
    EXPECT_EQ(Texts{}, findings());
}

TEST_F(Health_Verb, DriversThatAreMissing)
{
    with(
        R"({"adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00"}, "driver": {"storageDriverName": null},
        "fcPorts": [{"wwn": "10:00:02:4b:4c:10:00:00"}]}]})");
    EXPECT_EQ(Texts{"critical driver-missing Kaldera FC HBA ()"}, findings());
    with(R"({"adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:20:00:00", "hbaMAC": "02:4b:4c:20:00:00"},
        "driver": {"networkDriverName": null},
        "fcPorts": [{"wwn": "10:00:02:4b:4c:20:00:00"}], "ethPorts": [{"mac": "02:4b:4c:20:00:00"}]}]})");
    EXPECT_EQ(Texts{"critical driver-missing Kaldera CNA KLDR000001 (024b4c200000): network driver"},
              findings());
}

TEST_F(Health_Verb, WhatNobodyCanTellIsUnknown)
{
    with("{}");
    EXPECT_TRUE(findings()[0].starts_with("unknown no-adapter host "));
    EXPECT_EQ(3, status);
    const Outcome missing = kldrcim("health", "/nonexistent");
    EXPECT_EQ(3, missing.status);
    EXPECT_TRUE(has(missing.out, ": the adapter library does not answer, so no adapter can be seen; see "
                                 "that libdzntj.so is where the module looks for it"))
        << missing.out;
    with(R"({"faults": [{"call": "*", "do": "null"}]})");
    EXPECT_TRUE(findings()[0].starts_with("unknown adapter-library-missing host "));
    // What answers, but with an error, is there.
    with(R"({"faults": [{"call": "*", "do": "error"}]})");
    EXPECT_TRUE(findings()[0].starts_with("unknown no-adapter host "));
    EXPECT_EQ(3, kldrcim("health --module /nonexistent").status);
}

TEST_F(Health_Verb, AProviderThatDoesNotAnswerIsNamed)
{
    with(host("", "",
              R"(, "faults": [{"call": "getAllAdaptersIndexString", "do": "throw", "at": 2, "times": 0}])"));
    const Texts found = findings();
    EXPECT_EQ(3, status);
    ASSERT_FALSE(found.empty());
    EXPECT_TRUE(found[0].starts_with("unknown no-answer KALDERA_")) << found[0];
}

TEST_F(Health_Verb, BadInputIsNamed)
{
    expect_mistake("health --ignore port-no-contct",
                   "--ignore takes a finding or an address, not \"port-no-contct\" "
                   "(did you mean \"port-no-contact\"?)");
    expect_mistake("health --ignore 10:00:02", "--ignore takes a finding or an address, not \"10:00:02\"");
    expect_mistake("health --ignore ''", "--ignore takes a finding or an address, not \"\"");
    expect_mistake("health --interval 0", "--interval takes a number above 0, not \"0\"");
    expect_mistake("health --interval 1s", "--interval takes a number above 0, not \"1s\"");
    expect_mistake("health --format mof", "--format mof makes no sense for health");
    expect_mistake("health x", "usage: kldrcim [options] health");
    expect_mistake("tree --interval 1", "--interval makes no sense for tree; it is for health");
    expect_mistake("tree --format plugin", "--format plugin makes no sense for tree");
}

} // namespace
} // namespace KPRV
