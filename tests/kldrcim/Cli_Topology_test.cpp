// The verbs that follow associations, as users run them on the small host.
#include "tests/broker/Toy_Server.h"
#include "tests/kldrcim/Run_Kldrcim.h"

#include <json/json.h>

namespace KPRV::kldrcim {
namespace {

const std::string system_argument = "'KALDERA_ComputerSystem.Name=\"10.0.0.5\"' ";
const std::string tape_argument = "'KALDERA_TapeDrive.DeviceID=\"tape_only\"' ";

TEST(Cli_Topology, Tree)
{
    Outcome run = on_fabric("tree");
    EXPECT_EQ(0, run.status);
    EXPECT_EQ(no_library, run.error);
    EXPECT_EQ(R"(host 10.0.0.5 OK
├─ Kaldera FC HBA KLDR00A1001 (2000024b4c100000) in service
│  ├─ FC port 10:00:02:4b:4c:10:00:00 8 Gb/s, enabled
│  │  ├─ target 20:00:00:60:16:00:00:01 enabled
│  │  │  ├─ disk LUN_0 ACME Disk Array, naa.6001\x
│  │  │  └─ disk LUN_1 two\nlines
│  │  └─ target 20:00:00:60:16:00:00:02 quiesced
│  │     └─ tape tape_only
│  └─ FC port 10:00:02:4b:4c:10:00:01 disabled
│     └─ target 20:00:00:60:16:00:00:02 quiesced
│        └─ disk LUN_1 two\nlines
└─ Kaldera CNA KLDR00C2001 (00024b4c2000) stopped
   ├─ FC port 10:00:02:4b:4c:20:00:ff 2.5 Gb/s, no contact
   └─ Ethernet port 00:02:4b:4c:20:01 eth4, in service
)",
              run.out);
}

const char* const ascii_tree = R"(host 10.0.0.5 OK
|- Kaldera FC HBA KLDR00A1001 (2000024b4c100000) in service
|  |- driver zst 3.2.1
|  |- BIOS 1.4
|  |- firmware 3.2.0
|  |- card HBA-82 KLDR00A1001, P-82
|  |  `- transceiver SFP01_1_0 ACME, SW-8
|  |- FC port 10:00:02:4b:4c:10:00:00 8 Gb/s, enabled
|  |  |- target 20:00:00:60:16:00:00:01 enabled
|  |  |  |- disk LUN_0 ACME Disk Array, naa.6001\x
|  |  |  `- disk LUN_1 two\nlines
|  |  `- target 20:00:00:60:16:00:00:02 quiesced
|  |     `- tape tape_only
|  `- FC port 10:00:02:4b:4c:10:00:01 disabled
|     `- target 20:00:00:60:16:00:00:02 quiesced
|        `- disk LUN_1 two\nlines
`- Kaldera CNA KLDR00C2001 (00024b4c2000) stopped
   |- driver zst 3.2.1
   |- card CNA-101 KLDR00C2001
   |  `- transceiver SFP02_2_0 ACME "Optics", 10G
   |- FC port 10:00:02:4b:4c:20:00:ff 2.5 Gb/s, no contact
   `- Ethernet port 00:02:4b:4c:20:01 eth4, in service
)";

TEST(Cli_Topology, TreeInAsciiWithAllThatIsOptional)
{
    EXPECT_EQ(ascii_tree, on_fabric("tree --ascii --software --connectors").out);
    // Nobody has to ask for it where boxes would be garbage.
    EXPECT_EQ(ascii_tree, on_fabric("tree --software --connectors", "LC_ALL=C").out);
    EXPECT_EQ(ascii_tree, on_fabric("tree --software --connectors", "LC_ALL=no_SUCH.locale").out);
}

TEST(Cli_Topology, StatesInColorWhereThatIsWanted)
{
    const std::string out = on_fabric("tree --color always").out;
    for (const char* words : {"\n├─ Kaldera FC HBA KLDR00A1001 (2000024b4c100000) \33[32min service\33[0m\n",
                              " 2.5 Gb/s, \33[1;31mno contact\33[0m\n", ":01 \33[90mdisabled\33[0m\n",
                              "disk LUN_0 ACME Disk Array, naa.6001\\x\n"})
        EXPECT_NE(std::string::npos, out.find(words)) << words;
    EXPECT_EQ(std::string::npos, on_fabric("tree").out.find('\33'));
    EXPECT_EQ(on_fabric("tree").out, on_fabric("tree --color=never").out);
    EXPECT_EQ(std::string::npos, on_fabric("tree --color always --format json").out.find('\33'));
}

TEST(Cli_Topology, TreeAsJson)
{
    Outcome run = on_fabric("tree --format json");
    Json::Value tree;
    ASSERT_TRUE(Json::Reader().parse(run.out, tree)) << run.out;
    EXPECT_EQ("system", tree["kind"].asString());
    EXPECT_EQ("root/kaldera:KALDERA_ComputerSystem.Name=\"10.0.0.5\"", tree["path"].asString());
    const Json::Value& port = tree["children"][0]["children"][0];
    EXPECT_EQ("fc_port", port["kind"].asString());
    EXPECT_EQ("10:00:02:4b:4c:10:00:00", port["name"].asString());
    EXPECT_EQ("8 Gb/s", port["facts"][0].asString());
    EXPECT_EQ("target", port["children"][0]["kind"].asString());
    const Json::Value& unit = port["children"][0]["children"][1];
    EXPECT_EQ("LUN_1", unit["name"].asString());
    EXPECT_FALSE(unit.isMember("children"));
}

TEST(Cli_Topology, Graph)
{
    Outcome run = on_fabric("graph --connectors");
    EXPECT_EQ(0, run.status);
    EXPECT_EQ(R"(digraph topology {
  rankdir=LR;
  node [style=filled, fontname="sans-serif"];
  edge [fontname="sans-serif", fontsize=9];
  n1 [label="host\n10.0.0.5\nOK", shape=box3d, fillcolor="#d9d9d9"];
  n2 [label="Kaldera FC HBA\nKLDR00A1001 (2000024b4c100000)\nin service", shape=component, fillcolor="#fdd9a0"];
  n3 [label="card\nHBA-82\nKLDR00A1001, P-82", shape=box, fillcolor="#fbe8c8"];
  n4 [label="transceiver\nSFP01_1_0\nACME, SW-8", shape=cds, fillcolor="#fbe8c8"];
  n5 [label="FC port\n10:00:02:4b:4c:10:00:00\n8 Gb/s, enabled", shape=box, fillcolor="#b5d3ee"];
  n6 [label="initiator\n10:00:02:4b:4c:10:00:00\nenabled", shape=ellipse, fillcolor="#d4e5f5"];
  n7 [label="target\n20:00:00:60:16:00:00:01\nenabled", shape=ellipse, fillcolor="#e2d1ee"];
  n8 [label="disk\nLUN_0\nACME Disk Array, naa.6001\\x", shape=cylinder, fillcolor="#f6d5d5"];
  n9 [label="disk\nLUN_1\ntwo\\nlines", shape=cylinder, fillcolor="#f6d5d5"];
  n10 [label="target\n20:00:00:60:16:00:00:02\nquiesced", shape=ellipse, fillcolor="#e2d1ee", color="#7f7f7f", fontcolor="#5f5f5f"];
  n11 [label="tape\ntape_only", shape=cylinder, fillcolor="#f6d5d5"];
  n12 [label="FC port\n10:00:02:4b:4c:10:00:01\ndisabled", shape=box, fillcolor="#b5d3ee", color="#7f7f7f", fontcolor="#5f5f5f"];
  n13 [label="initiator\n10:00:02:4b:4c:10:00:01\ndisabled", shape=ellipse, fillcolor="#d4e5f5", color="#7f7f7f", fontcolor="#5f5f5f"];
  n14 [label="Kaldera CNA\nKLDR00C2001 (00024b4c2000)\nstopped", shape=component, fillcolor="#fdd9a0", color="#7f7f7f", fontcolor="#5f5f5f"];
  n15 [label="card\nCNA-101\nKLDR00C2001", shape=box, fillcolor="#fbe8c8"];
  n16 [label="transceiver\nSFP02_2_0\nACME \"Optics\", 10G", shape=cds, fillcolor="#fbe8c8"];
  n17 [label="FC port\n10:00:02:4b:4c:20:00:ff\n2.5 Gb/s, no contact", shape=box, fillcolor="#b5d3ee", color="#d0021b", penwidth=3];
  n18 [label="Ethernet port\n00:02:4b:4c:20:01\neth4, in service", shape=box, fillcolor="#bfe3c0"];
  n1 -> n2 [label="KALDERA_PortControllerSystemDevice"];
  n2 -> n3 [label="KALDERA_Realizes"];
  n3 -> n4 [label="KALDERA_PhysicalConnectorContainer"];
  n2 -> n5 [label="KALDERA_ControlledBy"];
  n5 -> n6 [label="KALDERA_DeviceSAPImplementation"];
  n6 -> n7 [label="KALDERA_SCSIInitiatorTargetLogicalUnitPath"];
  n7 -> n8 [label="KALDERA_SCSIInitiatorTargetLogicalUnitPath"];
  n7 -> n9 [label="KALDERA_SCSIInitiatorTargetLogicalUnitPath"];
  n6 -> n10 [label="KALDERA_SCSIInitiatorTargetLogicalUnitPath"];
  n10 -> n11 [label="KALDERA_SCSIInitiatorTargetLogicalUnitPath"];
  n2 -> n12 [label="KALDERA_ControlledBy"];
  n12 -> n13 [label="KALDERA_DeviceSAPImplementation"];
  n13 -> n10 [label="KALDERA_SCSIInitiatorTargetLogicalUnitPath", style=dashed, constraint=false];
  n10 -> n9 [label="KALDERA_SCSIInitiatorTargetLogicalUnitPath", style=dashed, constraint=false];
  n1 -> n14 [label="KALDERA_PortControllerSystemDevice"];
  n14 -> n15 [label="KALDERA_Realizes"];
  n15 -> n16 [label="KALDERA_PhysicalConnectorContainer"];
  n14 -> n17 [label="KALDERA_ControlledBy"];
  n14 -> n18 [label="KALDERA_EthernetPortControlledBy"];
  n18 -> n17 [label="KALDERA_HostedDependency", style=dashed, constraint=false];
  n16 -> n18 [label="KALDERA_EthernetPortRealizes", style=dashed, constraint=false];
}
)",
              run.out);
}

TEST(Cli_Topology, AssociatorsAndReferences)
{
    Outcome names = on_fabric("ain " + system_argument);
    EXPECT_EQ("root/kaldera:KALDERA_PortController.DeviceID=\"2000024b4c100000\"\n"
              "root/kaldera:KALDERA_PortController.DeviceID=\"00024b4c2000\"\n"
              "root/kaldera:KALDERA_FCPort.DeviceID=\"1000024b4c100000\"\n",
              names.out);
    EXPECT_EQ(0, names.status);
    EXPECT_EQ("Name         Caption\n-----------  --------------\nKLDR00A1001  Kaldera FC HBA\n"
              "KLDR00C2001  Kaldera CNA\n",
              on_fabric("ai " + system_argument + "--assoc TOY_Scope --properties Name,Caption").out);
    EXPECT_EQ("root/kaldera:KALDERA_FCPort.DeviceID=\"1000024b4c100000\"\n",
              on_fabric("ain " + system_argument +
                        "--assoc TOY_Component --result TOY_Port --role groupcomponent "
                        "--result-role PartComponent")
                  .out);
    std::string link = "root/kaldera:TOY_PortSystemDevice.GroupComponent="
                       "\"root/kaldera:KALDERA_ComputerSystem.Name=\\\"10.0.0.5\\\"\",PartComponent="
                       "\"root/kaldera:KALDERA_FCPort.DeviceID=\\\"1000024b4c100000\\\"\"\n";
    EXPECT_EQ(link, on_fabric("rin " + system_argument + "--assoc TOY_PortSystemDevice").out);
    EXPECT_EQ("",
              on_fabric("rin " + system_argument + "--assoc TOY_PortSystemDevice --role PartComponent").out);
    Json::Value parsed;
    ASSERT_TRUE(Json::Reader().parse(on_fabric("--format json ri " + system_argument).out, parsed));
    EXPECT_EQ(5u, parsed.size());
}

TEST(Cli_Topology, SomeFailuresAreWarningsAndOnlyFailuresAreFailure)
{
    Outcome some = on_fabric("ain " + tape_argument);
    EXPECT_EQ(0, some.status);
    EXPECT_EQ(std::string(no_library) +
                  "kldrcim: warning: no answer from TOY_Broken: CIM_ERR_FAILED (1): out of order\n",
              some.error);
    EXPECT_FALSE(some.out.empty());
    Outcome all = on_fabric("ain " + tape_argument + "--assoc TOY_Broken");
    EXPECT_EQ(1, all.status);
    EXPECT_EQ(std::string(no_library) + "kldrcim: CIM_ERR_FAILED (1): out of order\n", all.error);
    Outcome unknown = on_fabric("ain " + tape_argument + "--assoc TOY_Unheard");
    EXPECT_EQ(1, unknown.status);
    EXPECT_NE(std::string::npos, unknown.error.find("the module has no class TOY_Unheard;")) << unknown.error;
}

TEST(Cli_Topology, AModuleWithoutASystemHasNoTree)
{
    Outcome run = kldrcim("tree");
    EXPECT_EQ(1, run.status);
    EXPECT_EQ("", run.out);
    EXPECT_EQ("kldrcim: CIM_ERR_INVALID_CLASS (5): no answer from KALDERA_ComputerSystem\n", run.error);
}

TEST(Cli_Topology, OptionsThatMakeNoSense)
{
    const std::pair<std::string, const char*> mistakes[] = {
        {"ri x --result C", "--result makes no sense for ri; it is for ai ain"},
        {"rin x --result-role R", "--result-role makes no sense for rin; it is for ai ain"},
        {"ei x --assoc C", "--assoc makes no sense for ei; it is for ai ain ri rin"},
        {"gi x --role=R", "--role makes no sense for gi; it is for ai ain ri rin"},
        {"ain x --ascii", "--ascii makes no sense for ain; it is for tree profiles"},
        {"ei x --software", "--software makes no sense for ei; it is for tree graph"},
        {"tree --format mof", "--format mof makes no sense for tree"},
        {"graph --format json", "--format json makes no sense for graph"},
        {"tree x", "usage: kldrcim [options] tree"},
        {"ain", "usage: kldrcim [options] ain PATH"},
        {"ain x --role", "--role wants a value"},
        {"tree --ascii=yes", "--ascii takes no value"},
    };
    for (const auto& [arguments, error] : mistakes) {
        Outcome run = kldrcim(arguments);
        EXPECT_EQ(2, run.status) << arguments;
        EXPECT_EQ(std::string("kldrcim: ") + error + "\n", run.error) << arguments;
    }
    Outcome run = on_fabric("ain KALDERA_ComputerSystem");
    EXPECT_EQ(2, run.status);
    EXPECT_EQ(std::string(no_library) +
                  "kldrcim: KALDERA_ComputerSystem is a class; ain wants the path of an instance\n",
              run.error);
}

} // namespace
} // namespace KPRV::kldrcim
