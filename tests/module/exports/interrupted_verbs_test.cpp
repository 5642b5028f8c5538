// kldrcim under signals, and asked on a terminal: over the built module and the simulator, as users run it.
#include "tests/support/Eventually.h"
#include "tests/support/Kldrcim_Process.h"

namespace KPRV {
namespace {

constexpr const char* ADAPTER = "2000024b4c100000";
constexpr const char* PORT = "1000024b4c100000";

class Interrupted_Verbs : public ::testing::Test
{
protected:
    Interrupted_Verbs()
    {
        _folder.write(".cimplerc", "LOG_LEVEL=DBG\n");
        _folder.write("fw.bin", "firmware-version=3.2.2.0\n");
        host("{}");
    }
    /// The simulated host: one adapter with one port, and what tests and calls are told to do.
    void host(const std::string& diagnostics, const std::string& more = "") const
    {
        _folder.write("host.json", R"({"adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00"},
                                       "diagnostics": )" +
                                       diagnostics +
                                       R"(, "fcPorts": [{"wwn": "10:00:02:4b:4c:10:00:00", "diagnostics": )" +
                                       diagnostics + "}]}]" + more + "}");
    }
    static Kldrcim_Process diag(const char* test, const char* element, bool wait = true)
    {
        std::vector<std::string> words = {"diag", "run", test, element};
        if (wait)
            words.push_back("--wait");
        return Kldrcim_Process(KLDRCIM, words);
    }
    std::string image() const { return "file://" + _folder.path("fw.bin"); }
    /// How often the module told its log of it.
    size_t logged(const std::string& words) const
    {
        const std::string log = _folder.read(".cimple/messages");
        size_t count = 0;
        for (size_t at = 0; (at = log.find(words, at)) != std::string::npos; at += words.size())
            count++;
        return count;
    }

private:
    Temp_Folder _folder;
    Environment_Override _home{"HOME", _folder.path()};
    Environment_Override _library{"LD_LIBRARY_PATH", KLDR_SIMULATOR_FOLDER};
    Environment_Override _inventory{"KLDR_SIMULATOR_INVENTORY", _folder.path("host.json")};
};

/// What the log tells each time that an adapter is taken out of service or put back.
const char* const SWITCHED = "setAdapterStatus success";

TEST_F(Interrupted_Verbs, ATestBringsItsAdapterBackFirst)
{
    host(R"({"diagMemoryTest": {"milliseconds": 500}})");
    for (const int number : {SIGINT, SIGTERM, SIGHUP})
        for (const bool wait : {true, false}) {
            SCOPED_TRACE(std::to_string(number) + (wait ? " --wait" : ""));
            const size_t before = logged(SWITCHED);
            Kldrcim_Process run = diag("MemoryTest", ADAPTER, wait);
            ASSERT_TRUE(run.says("KALDERA_ConcreteJob.InstanceID="));
            run.send(number);
            EXPECT_TRUE(run.says("kldrcim: interrupted: waiting until the test has brought " +
                                 std::string(ADAPTER) +
                                 " back into service; a second signal leaves it as it is\n"));
            EXPECT_EQ(128 + number, run.status());
            EXPECT_EQ(wait, run.out().ends_with("\npassed\n")) << run.out();
            EXPECT_EQ(before + 2, logged(SWITCHED)) << "taken out of service, and put back";
        }
}

TEST_F(Interrupted_Verbs, ASecondSignalSaysWhatIsLeft)
{
    host(R"({"diagMemoryTest": {"milliseconds": 60000}})");
    Kldrcim_Process run = diag("MemoryTest", ADAPTER);
    ASSERT_TRUE(run.says("running, "));
    ASSERT_TRUE(eventually([&] { return logged(SWITCHED) == 1; }));
    run.send(SIGINT);
    ASSERT_TRUE(run.says("interrupted: waiting"));
    run.send(SIGTERM);
    EXPECT_TRUE(
        run.says("kldrcim: 2000024b4c100000 is left out of service: the test was ended while it ran\n"));
    EXPECT_EQ(128 + SIGTERM, run.status());
    EXPECT_EQ(1u, logged(SWITCHED));
}

TEST_F(Interrupted_Verbs, ATestThatTakesNothingOutOfServiceSaysNothingOfThat)
{
    host(R"({"diagPCILoopbackTest": {"milliseconds": 60000}})");
    Kldrcim_Process run = diag("PCILoopbackTest", PORT);
    ASSERT_TRUE(run.says("running, "));
    run.send(SIGINT);
    ASSERT_TRUE(run.says("kldrcim: interrupted: waiting for the end of the test; a second signal ends it\n"));
    run.send(SIGINT);
    EXPECT_TRUE(run.says("kldrcim: the test of 1000024b4c100000 was ended while it ran\n"));
    EXPECT_EQ(128 + SIGINT, run.status());
}

TEST_F(Interrupted_Verbs, AReaderThatGoesLeavesNothingOutOfService)
{
    host(R"({"diagMemoryTest": {"milliseconds": 500}})");
    const std::string command =
        std::string("sh -c '" KLDRCIM " diag run MemoryTest ") + ADAPTER + " --wait 2>/dev/null | true'";
    EXPECT_EQ(0, std::system(command.c_str()));
    EXPECT_TRUE(eventually([&] { return logged(SWITCHED) == 2; }));
}

const char* const SLOW_FLASH =
    R"(, "faults": [{"call": "adapterUpdateFlash", "do": "delay", "milliseconds": 700}])";

TEST_F(Interrupted_Verbs, AnUpdateGoesToItsEnd)
{
    host("{}", SLOW_FLASH);
    for (const int number : {SIGINT, SIGTERM, SIGHUP}) {
        Kldrcim_Process run(KLDRCIM, {"flash", ADAPTER, image()});
        ASSERT_TRUE(
            run.says("kldrcim: 2000024b4c100000: updating; SIGINT, SIGTERM and SIGHUP wait for the end "
                     "of it\n"));
        run.send(number);
        EXPECT_EQ(-number, run.status()) << "the signal has its effect, behind the end";
        EXPECT_EQ("2000024b4c100000: firmware updated from 3.2.1.0 to 3.2.2.0\n", run.out());
    }
    EXPECT_EQ(3u, logged("Software update is success"));
}

TEST_F(Interrupted_Verbs, AnUpdateIsAskedForOnATerminal)
{
    for (const auto& [answer, is_wanted] : {std::pair{"y", true},
                                            {"yes", true},
                                            {"Y", true},
                                            {"", false},
                                            {"n", false},
                                            {"yesterday", false}}) {
        SCOPED_TRACE(answer);
        Kldrcim_Process run(KLDRCIM, {"flash", ADAPTER, image()}, Kldrcim_Process::TERMINAL);
        ASSERT_TRUE(run.says("Update the firmware of adapter 2000024b4c100000, now 3.2.1.0, from " + image() +
                             "? [y/N] "));
        run.answer(answer);
        EXPECT_EQ(is_wanted ? 0 : 1, run.status());
        EXPECT_EQ(is_wanted, run.error().find("updating") != std::string::npos);
        EXPECT_EQ(!is_wanted,
                  run.error().find("kldrcim: 2000024b4c100000: not updated\n") != std::string::npos);
    }
    EXPECT_EQ(3u, logged("Software update is success"));
}

TEST_F(Interrupted_Verbs, AnUpdateThatNeedNotBeAskedFor)
{
    Kldrcim_Process sure(KLDRCIM, {"flash", "--yes", ADAPTER, image()}, Kldrcim_Process::TERMINAL);
    EXPECT_EQ(0, sure.status());
    EXPECT_EQ(std::string::npos, sure.error().find("[y/N]"));
    // Until it is asked, nothing is in the way of a signal.
    Kldrcim_Process asked(KLDRCIM, {"flash", ADAPTER, image()}, Kldrcim_Process::TERMINAL);
    ASSERT_TRUE(asked.says("[y/N]"));
    asked.send(SIGINT);
    EXPECT_EQ(-SIGINT, asked.status());
    EXPECT_EQ(1u, logged("Software update is success"));
}

} // namespace
} // namespace KPRV
