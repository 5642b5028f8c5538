// kldrcim luns, and graph --luns merged.
#include "tests/module/exports/Kldrcim_Fixture.h"

#include <json/json.h>

#include <algorithm>

namespace KPRV {
namespace {

/// Two adapters with a port each, more ports and targets where a test puts them.
class Luns_Verb : public Kldrcim_Fixture
{
protected:
    static std::string target(const std::string& address, const std::string& luns,
                              const std::string& more = "")
    {
        return R"({"remotePortWwn": ")" + address + R"(", "lunList": [)" + luns + "]" + more + "}";
    }
    static std::string port(const char* address, const std::string& targets, const std::string& more = "")
    {
        return R"({"wwn": ")" + std::string(address) + R"(", "remotePorts": [)" + targets + "]" + more + "}";
    }
    void with_ports(const std::string& first, const std::string& second)
    {
        with(R"({"adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00"}, "fcPorts": [)" + first +
             R"(]}, {"hbaData": {"wwn": "20:00:02:4b:4c:20:00:00"}, "fcPorts": [)" + second + "]}]}");
    }
    Json::Value units()
    {
        Json::Value found;
        const Outcome run = kldrcim("luns --format json");
        EXPECT_EQ(0, run.status);
        EXPECT_TRUE(Json::Reader().parse(run.out, found)) << run.out << run.error;
        return found;
    }
    /// The last line: what is counted.
    std::string counted()
    {
        const std::string out = kldrcim("luns").out;
        return out.substr(out.rfind('\n', out.size() - 2) + 1);
    }
    static long count(const std::string& text, const std::string& words)
    {
        long found = 0;
        for (std::size_t at = 0; (at = text.find(words, at)) != text.npos; ++at)
            ++found;
        return found;
    }
    static constexpr const char* unit_one = R"({"lunDescription": "6024b4c0000000000000000000000001"})";
};

TEST_F(Luns_Verb, SomeOfTheUnits)
{
    const auto found = [&](const std::string& options) { return kldrcim("luns " + options).out; };
    EXPECT_EQ("5\n", found("--count"));
    EXPECT_EQ("2\n", found("--count --where redundancy=one_path"));
    EXPECT_EQ("2\n", found("--count --where what=tape --where paths=1"));
    // An address with colons or without; of several paths any.
    EXPECT_EQ("3\n", found("--count --where port=1000024b4c300000"));
    EXPECT_EQ("3\n", found("--count --where port=10:00:02:4b:4c:30:00:00"));
    EXPECT_EQ("2\n", found("--count --where port!=1000024b4c300000"));
    EXPECT_EQ("1\n", found("--count --where identifier~*0001 --where what=disk"));
    EXPECT_NE(std::string::npos,
              found("--where what=tape").find("\n2 logical units, 2 paths; no path: 0; one path: 2;"));
    const std::string lines = found("--format jsonl --sort paths");
    EXPECT_EQ(5, count(lines, "\n"));
    EXPECT_EQ(0U, lines.find("{\"identifier\": \"5024b4c000500001\", \"what\": \"tape\", "));
    const Outcome wrong = kldrcim("luns --where unit=x");
    EXPECT_EQ(2, wrong.status);
    EXPECT_EQ("kldrcim: luns has no \"unit\"; it has identifier, what, product, redundancy, path, port, "
              "target, lun, "
              "state, paths\n",
              wrong.error);
}

TEST_F(Luns_Verb, EachUnitOnceWithItsPaths)
{
    const Outcome run = kldrcim("luns");
    EXPECT_EQ(0, run.status);
    EXPECT_EQ("", run.error);
    EXPECT_EQ(R"(6024b4c0000400000000000000000001  disk KLDR ARRAY 4000
  10:00:02:4b:4c:10:00:00  50:24:b4:c0:00:40:00:01  LUN 0      in service
  10:00:02:4b:4c:30:00:00  50:24:b4:c0:00:40:00:01  LUN 0      in service
6024b4c0000400000000000000000002  disk KLDR ARRAY 4000
  10:00:02:4b:4c:10:00:00  50:24:b4:c0:00:40:00:01  LUN 1      in service
  10:00:02:4b:4c:30:00:00  50:24:b4:c0:00:40:00:01  LUN 1      in service
6024b4c0000400000000000000000003  disk KLDR ARRAY 4000
  10:00:02:4b:4c:10:00:00  50:24:b4:c0:00:40:00:01  LUN 2      in service
  10:00:02:4b:4c:30:00:00  50:24:b4:c0:00:40:00:01  LUN 2      in service
5024b4c000500001  tape KLDR ULTRA TD5  ! one path
  10:00:02:4b:4c:10:00:00  50:24:b4:c0:00:50:00:01  LUN 0      in service
5024b4c000500002  tape KLDR TAPE LIBRARY 24  ! one path
  10:00:02:4b:4c:10:00:00  50:24:b4:c0:00:50:00:02  LUN 0      in service

5 logical units, 8 paths; no path: 0; one path: 2; one adapter: 0
)",
              run.out);
    const Json::Value found = units();
    EXPECT_EQ(8, found["paths"].asInt());
    EXPECT_EQ(2, found["one_path"].asInt());
    EXPECT_EQ("full", found["units"][0]["redundancy"].asString());
    EXPECT_EQ("one_path", found["units"][4]["redundancy"].asString());
    EXPECT_EQ("KLDR ARRAY 4000", found["units"][1]["product"].asString());
    EXPECT_EQ("10:00:02:4b:4c:30:00:00", found["units"][1]["paths"][1]["port"].asString());
    EXPECT_EQ("1", found["units"][1]["paths"][1]["lun"].asString());
}

TEST_F(Luns_Verb, AllPathsThroughOneAdapterAreMarked)
{
    const std::string array = target("50:24:b4:c0:00:40:00:01", unit_one);
    with_ports(port("10:00:02:4b:4c:10:00:00", array) + "," + port("10:00:02:4b:4c:10:00:01", array),
               port("10:00:02:4b:4c:20:00:00", ""));
    EXPECT_EQ("1 logical unit, 2 paths; no path: 0; one path: 0; one adapter: 1\n", counted());
    EXPECT_TRUE(has(kldrcim("luns").out, "  ! one adapter\n"));
    with_ports(port("10:00:02:4b:4c:10:00:00", array), port("10:00:02:4b:4c:20:00:00", array));
    EXPECT_EQ("1 logical unit, 2 paths; no path: 0; one path: 0; one adapter: 0\n", counted());
}

TEST_F(Luns_Verb, OnlyPathsInServiceCount)
{
    const std::string array = target("50:24:b4:c0:00:40:00:01", unit_one);
    const std::string lost =
        target("50:24:b4:c0:00:40:00:02", unit_one, R"(, "deviceData": {"stateMofValue": 12})");
    with_ports(port("10:00:02:4b:4c:10:00:00", array), port("10:00:02:4b:4c:20:00:00", lost));
    EXPECT_EQ("1 logical unit, 2 paths; no path: 0; one path: 1; one adapter: 0\n", counted());
    EXPECT_EQ("no contact", units()["units"][0]["paths"][1]["state"].asString());
    with_ports(port("10:00:02:4b:4c:10:00:00", array, ", \"portStatusValue\": 13"),
               port("10:00:02:4b:4c:20:00:00", lost));
    EXPECT_EQ("1 logical unit, 2 paths; no path: 1; one path: 0; one adapter: 0\n", counted());
    // The host's end is told before the target's.
    EXPECT_EQ("link down", units()["units"][0]["paths"][0]["state"].asString());
}

TEST_F(Luns_Verb, WhatHasNoIdentifierIsNeverTakenForTheSame)
{
    const std::string nameless = target("50:24:b4:c0:00:40:00:01", R"({"vendor": "KLDR"})");
    with_ports(port("10:00:02:4b:4c:10:00:00", nameless), port("10:00:02:4b:4c:20:00:00", nameless));
    EXPECT_EQ("2 logical units, 2 paths; no path: 0; one path: 2; one adapter: 0; without identifier: 2\n",
              counted());
    EXPECT_TRUE(kldrcim("luns").out.starts_with("without identifier  disk KLDR Simulated LUN  ! one path\n"));
    EXPECT_TRUE(units()["units"][0]["identifier"].isNull());
    EXPECT_EQ(2, count(kldrcim("graph --luns merged").out, "shape=cylinder"));
    // With a serial number there is one to be made.
    const std::string serial = target("50:24:b4:c0:00:40:00:01", R"({"productSerialNumber": "S1"})");
    with_ports(port("10:00:02:4b:4c:10:00:00", serial), port("10:00:02:4b:4c:20:00:00", serial));
    EXPECT_EQ("KLDR+Simulated LUN+S1", units()["units"][0]["identifier"].asString());
    EXPECT_EQ("1 logical unit, 2 paths; no path: 0; one path: 0; one adapter: 0\n", counted());
}

TEST_F(Luns_Verb, AHostWithoutUnits)
{
    with_ports(port("10:00:02:4b:4c:10:00:00", ""), port("10:00:02:4b:4c:20:00:00", ""));
    EXPECT_EQ("0 logical units, 0 paths; no path: 0; one path: 0; one adapter: 0\n", kldrcim("luns").out);
    EXPECT_EQ(0u, units()["units"].size());
}

TEST_F(Luns_Verb, PathsThatCannotBeEnumeratedAreAFailure)
{
    with(R"({"faults": [{"call": "getAllAdaptersIndexString", "do": "throw"}]})");
    const Outcome run = kldrcim("luns");
    EXPECT_EQ(1, run.status);
    EXPECT_EQ("", run.out);
    EXPECT_TRUE(has(run.error, "no answer from KALDERA_SCSIInitiatorTargetLogicalUnitPath")) << run.error;
}

TEST_F(Luns_Verb, AGraphDrawsEachUnitOrEachOnce)
{
    const std::string each = kldrcim("graph").out, merged = kldrcim("graph --luns merged").out;
    EXPECT_EQ(8, count(each, "shape=cylinder"));
    EXPECT_EQ(5, count(merged, "shape=cylinder"));
    // The same links, also to what is drawn already.
    EXPECT_EQ(count(each, " -> "), count(merged, " -> "));
    EXPECT_EQ(each, kldrcim("graph --luns each").out);
}

TEST_F(Luns_Verb, BadInputIsNamed)
{
    expect_mistake("graph --luns twice", "--luns takes each, count or merged, not \"twice\"");
    expect_mistake("tree --luns merged", "--luns merged makes no sense for tree; it is for graph");
    expect_mistake("luns --format mof", "--format mof makes no sense for luns");
    expect_mistake("luns 6024", "usage: kldrcim [options] luns");
}

} // namespace
} // namespace KPRV
