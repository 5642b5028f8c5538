// kldrcim ei, ein, ai and watch with --where, --sort, --count and --format jsonl.
#include "tests/module/exports/Kldrcim_Fixture.h"

#include <json/json.h>

#include <sstream>

namespace KPRV {
namespace {

class Enumerate_Verb : public Kldrcim_Fixture
{
protected:
    /// The one value that each result has, in their order.
    std::string column(const std::string& arguments)
    {
        const Outcome run = kldrcim(arguments + " --format jsonl --properties DeviceID");
        EXPECT_EQ(0, run.status) << run.error;
        std::string values;
        std::istringstream lines(run.out);
        for (std::string line; std::getline(lines, line);) {
            Json::Value parsed;
            EXPECT_TRUE(Json::Reader().parse(line, parsed)) << line;
            EXPECT_EQ(1u, parsed["properties"].size()) << "what is looked at is not shown";
            values += parsed["properties"]["DeviceID"].asString().substr(8) + " ";
        }
        return values;
    }
    std::string system()
    {
        return "\"$(LD_LIBRARY_PATH=" KLDR_SIMULATOR_FOLDER " " KLDRCIM " ein KALDERA_ComputerSystem)\"";
    }
};

TEST_F(Enumerate_Verb, ShowsWhatHasAWordANumberOrAText)
{
    EXPECT_EQ("4c100001 ", column("ei KALDERA_FCPort --where OperationalStatus=12"));
    EXPECT_EQ("4c100001 ", column("ei KALDERA_FCPort --where 'operationalstatus=no contact'"));
    EXPECT_EQ("4c100001 ", column("ei KALDERA_FCPort --where 'OperationalStatus!=In Service'"));
    EXPECT_EQ("4c100001 ", column("ei KALDERA_FCPort --where 'OperationalStatus~no*'"));
    EXPECT_EQ("4c200000 4c200001 ", column("ei KALDERA_FCPort --where Speed=10000000000"));
    EXPECT_EQ("4c200001 ", column("ei KALDERA_FCPort --where Speed=0x2540be400 --where PortNumber=1"));
    EXPECT_EQ("", column("ei KALDERA_FCPort --where DeviceID~nobody*"));
    // As with --raw: what is shown does not decide what is found.
    EXPECT_EQ("4c100001 ", column("ei KALDERA_FCPort --raw --where 'OperationalStatus=No Contact'"));
}

TEST_F(Enumerate_Verb, SortsByAProperty)
{
    EXPECT_EQ("4c300000 4c200000 4c200001 4c100000 4c100001 ", column("ei KALDERA_FCPort --sort -Speed"));
    EXPECT_EQ("4c100001 4c100000 4c200000 4c200001 4c300000 ", column("ei KALDERA_FCPort --sort speed"));
    EXPECT_EQ("4c200001 4c200000 ", column("ei KALDERA_FCPort --where Speed~100* --sort -PortNumber"));
}

TEST_F(Enumerate_Verb, Counts)
{
    EXPECT_EQ("5\n", kldrcim("ei KALDERA_FCPort --count").out);
    EXPECT_EQ("5\n", kldrcim("ein KALDERA_FCPort --count").out);
    EXPECT_EQ("4\n", kldrcim("ei KALDERA_FCPort --count --where 'OperationalStatus=In Service'").out);
    EXPECT_EQ("1\n", kldrcim("ein KALDERA_FCPort --count --where 'DeviceID=1000024b4c300000'").out);
}

TEST_F(Enumerate_Verb, LooksAtResultsOfSeveralClasses)
{
    EXPECT_EQ("5\n", kldrcim("ai " + system() + " --where PortType=N --count").out);
    EXPECT_EQ("5\n", kldrcim("ain " + system() + " --where CreationClassName=KALDERA_FCPort --count").out);
    EXPECT_EQ("5\n", kldrcim("rin " + system() + " --where PartComponent~*KALDERA_FCPort.* --count").out);
    const Outcome missed = kldrcim("ai " + system() + " --where Portype=N");
    EXPECT_EQ(2, missed.status);
    EXPECT_EQ("", missed.out);
    EXPECT_EQ("kldrcim: no result has a property \"Portype\"\n", missed.error);
    const Outcome no_key = kldrcim("ain " + system() + " --where PortType=N");
    EXPECT_EQ(2, no_key.status);
    EXPECT_EQ("kldrcim: no result has a key \"PortType\"\n", no_key.error);
}

TEST_F(Enumerate_Verb, NamesTheCulprit)
{
    expect_mistake("ei KALDERA_FCPort --where Portype=N", "KALDERA_FCPort has no property \"Portype\"");
    expect_mistake("ei KALDERA_FCPort --where PortType=Q",
                   "KALDERA_FCPort.PortType is a uint16, which \"Q\" is not, nor is it one of its words");
    expect_mistake("ei KALDERA_FCPort --where Speed=fast",
                   "KALDERA_FCPort.Speed is a uint64, which \"fast\" is not");
    expect_mistake("ein KALDERA_FCPort --where Speed=0",
                   "KALDERA_FCPort.Speed is no key, and ein brings keys only");
}

TEST_F(Enumerate_Verb, WatchWritesALineForEachAlert)
{
    // A delivered alert is never released, and once the module has been closed nobody can tell that it was
    // one.
    const Environment_Override leaks("LSAN_OPTIONS", "detect_leaks=0");
    const Environment_Override events("KLDR_SIMULATOR_EVENTS", KLDR_INVENTORIES "/../events/demo.json");
    const Outcome run =
        kldrcim("watch --count 2 --format jsonl --properties SequenceNumber,PerceivedSeverity");
    EXPECT_EQ(0, run.status) << run.error;
    std::istringstream lines(run.out);
    unsigned number = 0;
    for (std::string line; std::getline(lines, line);) {
        Json::Value parsed;
        ASSERT_TRUE(Json::Reader().parse(line, parsed)) << line;
        EXPECT_EQ(++number, parsed["properties"]["SequenceNumber"].asUInt());
        EXPECT_EQ(number == 1 ? "Critical" : "Major", parsed["words"]["PerceivedSeverity"].asString());
    }
    EXPECT_EQ(2u, number);
}

} // namespace
} // namespace KPRV
