// kldrcim diag, as users run it: over the built module and the simulator.
#include "tests/module/exports/Kldrcim_Fixture.h"

#include <algorithm>

namespace KPRV {
namespace {

class Diag_Verb : public Kldrcim_Fixture
{
protected:
    void with_outcome(const std::string& outcome)
    {
        with(R"({"adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00"},
            "fcPorts": [{"wwn": "10:00:02:4b:4c:10:00:00", "diagnostics": {"diagPCILoopbackTest": )" +
             outcome + "}}]}]}");
    }
};

TEST_F(Diag_Verb, ListsTestsAndElements)
{
    const Outcome run = kldrcim("diag list");
    EXPECT_EQ(0, run.status);
    EXPECT_EQ("", run.error);
    for (const char* words :
         {"Kaldera:ExternalLoopbackTest     FC port                 takes it out of service, needs a "
          "loopback plug\n",
          "Kaldera:PCILoopbackTest          FC port, Ethernet port\n",
          "024b4c200000      Ethernet port  eth2\n", "2000024b4c100000  adapter        KLDR00A1001\n"})
        EXPECT_TRUE(has(run.out, words)) << words << run.out;
    EXPECT_TRUE(has(kldrcim("diag list --format json").out, "\"Kaldera:MemoryTest\""));
}

TEST_F(Diag_Verb, FiltersAndSortsTheTests)
{
    const Outcome loopback = kldrcim("diag list --where Name~*PCI*");
    EXPECT_EQ(0u, loopback.out.find("Test                     On                      Remarks\n"))
        << loopback.out;
    EXPECT_TRUE(has(loopback.out, "Kaldera:PCILoopbackTest  FC port, Ethernet port\n\nElement "))
        << loopback.out;
    EXPECT_EQ("7\n", kldrcim("diag list --count").out);
    const std::string plug =
        kldrcim("diag list --where Characteristics=10 --format jsonl --properties Name").out;
    EXPECT_EQ(std::to_string(std::ranges::count(plug, '\n')) + "\n",
              kldrcim("diag list --where Characteristics=10 --count").out);
    EXPECT_TRUE(has(plug, "Kaldera:ExternalLoopbackTest")) << plug;
    EXPECT_FALSE(has(plug, "Kaldera:MemoryTest") || has(plug, "Characteristics")) << plug;
    const std::string sorted = kldrcim("diag list --sort -Name").out;
    EXPECT_LT(sorted.find("Kaldera:PCILoopbackTest"), sorted.find("Kaldera:MemoryTest"));
    EXPECT_LT(sorted.find("Kaldera:MemoryTest"), sorted.find("Kaldera:ExternalEthLoopbackTest"));
    const Outcome nothing = kldrcim("diag list --where Nmae=x");
    EXPECT_EQ(2, nothing.status);
    EXPECT_TRUE(has(nothing.error, "\"Nmae\"")) << nothing.error;
    EXPECT_EQ(2, kldrcim("diag run MemoryTest 1000024b4c100000 --where Name=x").status);
    EXPECT_EQ(2, kldrcim("diag run MemoryTest 1000024b4c100000 --count").status);
}

TEST_F(Diag_Verb, FollowsATestThatPasses)
{
    for (const char* words :
         {"PCILoopbackTest 10:00:02:4b:4c:10:00:00", "kaldera:pciloopbacktest 1000024B4C100000",
          "PCILoopbackTest 02-4b-4c-20-00-00"}) {
        const Outcome run = kldrcim(std::string("diag run --wait ") + words);
        EXPECT_EQ(0, run.status) << words << run.error;
        EXPECT_TRUE(has(run.out, "KALDERA_ConcreteJob.InstanceID=\"Kaldera:PCILoopbackTest-1\"\n"))
            << run.out;
        EXPECT_TRUE(has(run.out, "Running PCI Loopback test for the port\n")) << run.out;
        EXPECT_TRUE(has(run.out, "passed   PCI Loopback test run is successful\npassed\n")) << run.out;
        EXPECT_TRUE(has(run.error, "completed, 0 s\n")) << run.error;
    }
}

TEST_F(Diag_Verb, FollowsATestThatFails)
{
    with_outcome(R"({"outcome": "fail", "milliseconds": 250, "output": "parity"})");
    const Outcome run = kldrcim("diag run PCILoopbackTest 1000024b4c100000 --wait");
    EXPECT_EQ(1, run.status);
    EXPECT_TRUE(has(run.out, "failed   PCILoopback test run status : parity\n")) << run.out;
    EXPECT_TRUE(has(run.out, "failed   PCI Loopback test failed\nfailed\n")) << run.out;
    EXPECT_TRUE(has(run.error, "running, 0 s\n")) << run.error;
}

TEST_F(Diag_Verb, TellsWhyATestIsRefused)
{
    const Outcome fcoe = kldrcim("diag run InternalLoopbackTest 10:00:02:4b:4c:20:00:00 --wait");
    EXPECT_EQ(3, fcoe.status);
    EXPECT_EQ("kldrcim: refused, RunDiagnostic returned 1: not supported: an FCoE port has no internal "
              "loopback test\n",
              fcoe.error);
    const Outcome port = kldrcim("diag run MemoryTest 10:00:02:4b:4c:10:00:00");
    EXPECT_EQ(3, port.status);
    EXPECT_TRUE(has(port.error, "returned 5: invalid parameter")) << port.error;
}

TEST_F(Diag_Verb, SaysWhatItMeansNotToWait)
{
    const Outcome run = kldrcim("diag run MemoryTest 02:4b:4c:20:00:00 --leaks");
    EXPECT_EQ(0, run.status);
    EXPECT_TRUE(has(run.error, "live in this process, which waits for the end of the test")) << run.error;
    EXPECT_TRUE(has(run.error, "Objects lost: 0\n")) << run.error;
    EXPECT_FALSE(has(run.out, "Record")) << run.out;
}

TEST_F(Diag_Verb, KnowsWhatItIsNotTold)
{
    EXPECT_EQ(2, kldrcim("diag").status);
    EXPECT_EQ(2, kldrcim("diag run MemoryTest").status);
    EXPECT_EQ(2, kldrcim("diag list --wait").status);
    EXPECT_EQ("kldrcim: no test EchoTest; \"kldrcim diag list\" lists them\n",
              kldrcim("diag run EchoTest 1000024b4c100000").error);
    EXPECT_EQ("kldrcim: no port or adapter 1; \"kldrcim diag list\" lists them\n",
              kldrcim("diag run MemoryTest 1").error);
}

} // namespace
} // namespace KPRV
