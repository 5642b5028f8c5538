#include "tests/module/diagnostics/Run_Fixture.h"

namespace KPRV {
namespace {

/// What is said of an entry point that did not answer well.
struct Bad_Answer
{
    std::function<void()> set;
    Lines said;
};

class Other_Runner : public Run_Fixture
{
protected:
    /// Every way in which an entry point can fail to answer; `variable` is its name in the log.
    std::vector<Bad_Answer> bad_answers(const char* symbol, const std::string& variable)
    {
        const std::string bad = "ERR " + variable + " response has error";
        const std::string got = "ERR " + variable + " got ";
        return {
            {[=, this] { answer(symbol, Json::Value()); }, {bad}},
            {[=, this] { answer(symbol, json("{'error': {'code': 3}}")); }, {bad}},
            {[=, this] {
                 throws(symbol, HbaAgentError{7, "busy"});
             },
             {got + "User exception 7: busy", bad}},
            {[=, this] { throws(symbol, std::runtime_error("lost")); }, {got + "std exception: lost", bad}},
            {[=, this] { throws(symbol, 42); }, {got + "default exception", bad}},
        };
    }
    static Lines joined(const std::vector<Lines>& parts)
    {
        Lines lines;
        for (const Lines& part : parts)
            lines.insert(lines.end(), part.begin(), part.end());
        return lines;
    }
};

class PCI_Runner : public Other_Runner
{
protected:
    PCI_Runner()
    {
        fc_port(PCI_LOOPBACK_TEST);
        answer("diagPCILoopbackTest", json("{'failed': false, 'output': 'fine'}"));
    }
    Lines tested(const char* index = WWN_INDEX) const
    {
        return {"INFO Running PCI Loopback test for the port",
                std::string(
                    R"(> diagPCILoopbackTest {"dataPattern":3048584629,"frameCount":131072,"portWwn":")") +
                    index + "\"}"};
    }
    const Lines closed = {"the job is closed", "INFO Checking for return codes for PCI Loopback test run"};
    const Lines passed = {"INFO PCI Loopback test run is successful"};
};

TEST_F(PCI_Runner, LeavesThePortInService)
{
    EXPECT_EQ(joined({tested(), closed, passed}), run());
    EXPECT_EQ((Lines{"Running PCI Loopback test for the port",
                     "Checking for return codes for PCI Loopback test run",
                     "2 PCI Loopback test run is successful"}),
              records());
}

TEST_F(PCI_Runner, GoesByTheMacWhereThereIsOne)
{
    eth_port(PCI_LOOPBACK_TEST);
    EXPECT_EQ(joined({tested(MAC_INDEX), closed, passed}), run());
}

TEST_F(PCI_Runner, TellsWhatTheLibrarySaysThenThatItFailed)
{
    answer("diagPCILoopbackTest", json("{'failed': true, 'output': 'parity'}"));
    EXPECT_EQ(joined({tested(),
                      closed,
                      {"ERR PCILoopback test run status : parity", "INFO PCI Loopback test failed"}}),
              run());
    EXPECT_EQ((Lines{"Running PCI Loopback test for the port",
                     "Checking for return codes for PCI Loopback test run",
                     "5 PCILoopback test run status : parity", "5 PCI Loopback test failed"}),
              records());
}

TEST_F(PCI_Runner, PushesOutAsManyOldRecordsAsItAdds)
{
    // Of no element, so that reading them looks none up.
    DiagnosticTestInput earlier;
    earlier.test_id = MEMORY_TEST;
    for (int i = 1; i <= 100; i++)
        for (const bool is_service : {true, false})
            helper.generateDiagnosticRecord(std::to_string(i).c_str(), is_service, &earlier,
                                            COMPLETION_FAILED);
    run();
    const Lines all = records();
    ASSERT_EQ(200u, all.size());
    EXPECT_EQ("3", all[0]) << "two service records came";
    EXPECT_EQ("Running PCI Loopback test for the port", all[98]);
    EXPECT_EQ("5 2", all[100]) << "one completion record came";
    EXPECT_EQ("5 100", all[198]);
    EXPECT_EQ("2 PCI Loopback test run is successful", all[199]);
}

TEST_F(PCI_Runner, TakesABadAnswerForAPassedTest)
{
    for (const Bad_Answer& bad : bad_answers("diagPCILoopbackTest", "libDiagPCILoopbackTest")) {
        SCOPED_TRACE(bad.said[0]);
        restart();
        bad.set();
        EXPECT_EQ(joined({tested(), bad.said, closed, passed}), run());
        EXPECT_EQ("2 PCI Loopback test run is successful", records().back());
    }
}

class Memory_Runner : public Other_Runner
{
protected:
    Memory_Runner()
    {
        adapter();
        answer("diagMemoryTest", json("{'failed': false}"));
    }
    static Lines setting(bool enable)
    {
        return {std::string(R"(> setAdapterState {"enableState":)") + (enable ? "true" : "false") +
                R"(,"indexStr":"20:00:02:4b:4c:10:00:00"})"};
    }
    const Lines asked = {"INFO Checking whether the adapter is disabled for running memory test",
                         R"(> getHbaByWwn {"wwn":"20:00:02:4b:4c:10:00:00"})"};
    const Lines was_enabled = {"INFO getAdapterStatus: adapter status is 1"};
    const Lines disabling = {"INFO Adapter is not disabled",
                             "WARN Disabling the adapter for running memory test"};
    const Lines tested = {"INFO Running memory test on the adapter",
                          "INFO Running memory test may take a few moments",
                          R"(> diagMemoryTest {"hbaWwn":"20:00:02:4b:4c:10:00:00"})"};
    const Lines enabling = {"WARN Enabling the adapter after running memory test"};
    const Lines set = {"INFO setAdapterStatus success"};
    const Lines was_set = {"INFO ret = 0 adapterAddress = 2000024b4c100000"};
    const Lines closed = {"the job is closed", "INFO Checking for return codes for memory test run"};
    const Lines passed = {"INFO Memory test run is successful"};

    Lines before() const { return joined({asked, was_enabled, disabling, setting(false), set, tested}); }
    Lines after() const { return joined({enabling, setting(true), set, was_set, closed}); }
};

TEST_F(Memory_Runner, TakesTheAdapterOutOfServiceAndBack)
{
    EXPECT_EQ(joined({before(), after(), passed}), run());
    EXPECT_EQ(
        (Lines{"Checking whether the adapter is disabled for running memory test", "Adapter is not disabled",
               "Disabling the adapter for running memory test", "Running memory test on the adapter",
               "Running memory test may take a few moments", "Enabling the adapter after running memory test",
               "Checking for return codes for memory test run", "2 Memory test run is successful"}),
        records());
}

TEST_F(Memory_Runner, LeavesADisabledAdapterDisabled)
{
    answer("getHbaByWwn", json("{'hbaData': {'hbaStatus': false}}"));
    EXPECT_EQ(joined({asked,
                      {"INFO getAdapterStatus: adapter status is 0", "INFO Adapter is already disabled"},
                      tested,
                      closed,
                      passed}),
              run());
    EXPECT_EQ("Adapter is already disabled", records()[1]);
}

TEST_F(Memory_Runner, TakesAnAdapterThatCannotBeAskedForADisabledOne)
{
    const auto expect = [&](const Lines& said) {
        SCOPED_TRACE(said.size());
        restart();
        EXPECT_EQ(joined({asked,
                          said,
                          {"ERR Unable to get adapater status", "INFO Adapter is already disabled"},
                          tested,
                          closed,
                          passed}),
                  run());
        EXPECT_EQ(0u, library.count("setAdapterState"));
    };
    for (const char* bad : {"null", "{'error': 'no', 'hbaData': {'hbaStatus': true}}", "{}",
                            "{'hbaData': {}}", "{'hbaData': 7}", "[]"}) {
        SCOPED_TRACE(bad);
        answer("getHbaByWwn", json(bad));
        expect({});
    }
    throws("getHbaByWwn", HbaAgentError{7, "busy"});
    expect({"ERR libGetHbaByWwn got User exception 7: busy"});
    throws("getHbaByWwn", std::runtime_error("lost"));
    expect({"ERR libGetHbaByWwn got std exception: lost"});
    throws("getHbaByWwn", 42);
    expect({"ERR libGetHbaByWwn got default exception"});
}

TEST_F(Memory_Runner, AsksForAMacByThatName)
{
    adapter(MAC);
    input.adapter_address = MAC;
    const Lines lines = run();
    EXPECT_EQ(R"(> getHbaByWwn {"mac":"02:4b:4c:20:00:00"})", lines[1]);
}

TEST_F(Memory_Runner, RunsOnAnAdapterInServiceWhereItCannotBeDisabled)
{
    const auto expect = [&](const Lines& said) {
        SCOPED_TRACE(said.empty() ? "a bad answer" : said[0]);
        restart();
        EXPECT_EQ(
            joined({asked, was_enabled, disabling, setting(false), said, tested, enabling, setting(true),
                    said, Lines{"INFO ret = -1 adapterAddress = 2000024b4c100000"}, closed, passed}),
            run());
    };
    answer("setAdapterState", Json::Value());
    expect({});
    answer("setAdapterState", json("{'error': 'no'}"));
    expect({});
    throws("setAdapterState", HbaAgentError{7, "busy"});
    expect({"ERR libSetAdapterState got User exception 7: busy"});
    throws("setAdapterState", std::runtime_error("lost"));
    expect({"ERR libSetAdapterState got std exception: lost"});
    throws("setAdapterState", 42);
    expect({"ERR libSetAdapterState got default exception for 2000024b4c100000"});
}

TEST_F(Memory_Runner, TellsTheLogWhereTheMemoryFailed)
{
    answer("diagMemoryTest",
           json("{'failed': true, 'status': 17, 'address': 4096, 'expected value': 3048584629,"
                " 'actual value': 0, 'error status': 1, 'error address': 4100, 'type': 'march', 'output': "
                "'bit 3'}"));
    EXPECT_EQ(
        joined({before(),
                after(),
                {"INFO Memory test failed", "INFO Status         :\t0x11", "INFO Addr           :\t0x1000",
                 "INFO Expected value :\t0xb5b5b5b5", "INFO Actual value   :\t0x0",
                 "INFO Error state    :\t0x1", "INFO Error address  :\t0x1004",
                 "INFO Algorithm      :\tmarch", "INFO Memory test run status : bit 3"}}),
        run());
    const Lines all = records();
    EXPECT_EQ(8u, all.size());
    EXPECT_EQ("5 Memory test failed", all.back());
}

TEST_F(Memory_Runner, TellsLessWithoutAStatus)
{
    answer("diagMemoryTest", json("{'failed': true, 'status': 0, 'address': 4096, 'output': 'no memory'}"));
    EXPECT_EQ(
        joined({before(), after(), {"INFO Memory test run status : no memory", "INFO Memory test failed"}}),
        run());
    const Lines all = records();
    EXPECT_EQ(8u, all.size());
    EXPECT_EQ("5 Memory test failed", all.back());
}

TEST_F(Memory_Runner, TakesABadAnswerForAPassedTest)
{
    for (const Bad_Answer& bad : bad_answers("diagMemoryTest", "libDiagMemoryTest")) {
        SCOPED_TRACE(bad.said[0]);
        restart();
        bad.set();
        EXPECT_EQ(joined({before(), bad.said, after(), passed}), run());
        EXPECT_EQ("2 Memory test run is successful", records().back());
    }
}

} // namespace
} // namespace KPRV
