#include "tests/module/diagnostics/Run_Fixture.h"

namespace KPRV {
namespace {

constexpr const char* PAUSE = "pause of 2000000 us";

/// The two loopback tests: what differs is the words, the pauses, and what the library is asked for.
struct Words
{
    diag_test_id_t test;
    const char* symbol;
    const char* index;
    const char* flat;
    const char* checking;
    const char* running;
    const char* request;
    const char* checking_result;
    const char* passed;
    const char* failed;
    const char* status;
    bool pauses;
};

constexpr Words FC = {INTERNAL_LOOPBACK_TEST,
                      "diagLoopbackTest",
                      WWN_INDEX,
                      WWN,
                      "Checking whether the port is disabled for running loopback test",
                      "Running loopback test for the port",
                      R"({"dataPattern":3048584629,"frameCount":131072,"mode":1,)"
                      R"("portWwn":"10:00:02:4b:4c:10:00:00","speed":4})",
                      "Checking for return codes for loopback test run",
                      "Loopback test run is successful",
                      "Loopback test failed",
                      "Loopback test run status : ",
                      true};
constexpr Words ETH = {SERDES_ETH_LOOPBACK_TEST,
                       "diagEthLoopbackTest",
                       MAC_INDEX,
                       MAC,
                       "Checking whether the port is disabled for running eth loopback test",
                       "Running eth loopback test for the port",
                       R"({"dataPattern":3048584629,"frameCount":65536,"mode":4,)"
                       R"("portWwn":"02:4b:4c:20:00:00"})",
                       "Checking for return codes for eth loopback test run",
                       "Eth loopback test run is successful",
                       "Eth loopback test failed",
                       "EthLoopback test run status : ",
                       false};

class Loopback_Runner : public Run_Fixture, public testing::WithParamInterface<const Words*>
{
protected:
    Loopback_Runner()
    {
        if (words.test == SERDES_ETH_LOOPBACK_TEST)
            eth_port(words.test);
        else
            fc_port(words.test);
        input.speed = 4;
        answer(words.symbol, json("{'failed': false, 'output': 'fine'}"));
    }

    std::string symbol_call() const { return std::string("> ") + words.symbol + " " + words.request; }
    std::string variable() const { return std::string("libD") + (words.symbol + 1); }
    std::string info(const char* text) const { return std::string("INFO ") + text; }
    std::string query() const
    {
        const bool mac = words.test == SERDES_ETH_LOOPBACK_TEST;
        return std::string("> getPortByWwn {\"") + (mac ? "mac" : "wwn") + "\":\"" + words.index + "\"}";
    }
    std::string setting(bool enable) const
    {
        return std::string("> setPortByWwn {\"indexStr\":\"") + words.index +
               "\",\"port\":{\"portStatus\":" + (enable ? "true" : "false") +
               "},\"propArray\":[\"portStatus\"]}";
    }
    std::string was_set() const { return std::string("INFO setPortState - ") + words.index + " 1"; }

    using Parts = std::vector<Lines>;
    /// One transcript of its parts, without the pauses where the test has none.
    Lines all(const Parts& parts) const
    {
        Lines lines;
        for (const Lines& part : parts)
            for (const std::string& line : part)
                if (words.pauses || line != PAUSE)
                    lines.push_back(line);
        return lines;
    }
    Lines ask_port() const
    {
        return {info(words.checking), query(), std::string("INFO getPortDetails success - ") + words.flat};
    }
    Lines disable() const
    {
        return {"INFO Port is not disabled", "INFO Disabling the port", setting(false), was_set(), PAUSE};
    }
    Lines test() const { return {info(words.running), symbol_call()}; }
    Lines enable() const { return {PAUSE, "INFO Enabling the port", setting(true), was_set(), PAUSE}; }
    Lines close() const { return {"the job is closed", info(words.checking_result)}; }
    Lines passed() const { return {info(words.passed)}; }

    Lines service_records(bool was_enabled = true) const
    {
        if (was_enabled)
            return {words.checking, "Port is not disabled", "Disabling the port",
                    words.running,  "Enabling the port",    words.checking_result};
        return {words.checking, "Port is already disabled", words.running, words.checking_result};
    }
    Lines with(Lines records, const Lines& results) const
    {
        records.insert(records.end(), results.begin(), results.end());
        return records;
    }

    const Words& words = *GetParam();
};

INSTANTIATE_TEST_SUITE_P(Tests, Loopback_Runner, testing::Values(&FC, &ETH),
                         [](const auto& each) { return each.param == &FC ? "FC" : "Eth"; });

TEST_P(Loopback_Runner, PassesAndPutsThePortBack)
{
    EXPECT_EQ(all({ask_port(), disable(), test(), enable(), close(), passed()}), run());
    EXPECT_EQ(with(service_records(), {std::string("2 ") + words.passed}), records());
}

TEST_P(Loopback_Runner, LeavesADisabledPortDisabled)
{
    answer("getPortByWwn", json("{'portStatus': false}"));
    EXPECT_EQ(all({ask_port(), {"INFO Port is already disabled"}, test(), {PAUSE}, close(), passed()}),
              run());
    EXPECT_EQ(with(service_records(false), {std::string("2 ") + words.passed}), records());
    EXPECT_EQ(0u, library.count("setPortByWwn"));
}

TEST_P(Loopback_Runner, TakesAPortThatTellsNothingForAnEnabledOne)
{
    answer("getPortByWwn", json("{}"));
    Lines asked = ask_port();
    asked.push_back("ERR Unable to get port status");
    EXPECT_EQ(all({asked, disable(), test(), enable(), close(), passed()}), run());
    restart();
    answer("getPortByWwn", Json::Value());
    asked = {asked[0], asked[1], "ERR Port Info is NOT available", "ERR Unable to get port status"};
    EXPECT_EQ(all({asked, disable(), test(), enable(), close(), passed()}), run());
}

TEST_P(Loopback_Runner, TakesAPortThatCannotBeAskedForAnEnabledOne)
{
    throws("getPortByWwn", HbaAgentError{7, "busy"});
    Lines asked = ask_port();
    asked[2] = std::string("ERR ") + words.flat + " - libGetPortByWwn got User exception 7: busy";
    asked.push_back("ERR Unable to get port status");
    EXPECT_EQ(all({asked, disable(), test(), enable(), close(), passed()}), run());
}

TEST_P(Loopback_Runner, EndsWhereThePortCannotBeDisabled)
{
    const auto expect = [&](const Lines& said) {
        SCOPED_TRACE(said.empty() ? "a bad answer" : said[0]);
        restart();
        const Lines disabling = {"INFO Port is not disabled", "INFO Disabling the port", setting(false)};
        const Lines end = {"the job is closed", "ERR Failed to disable the port"};
        EXPECT_EQ(all({ask_port(), disabling, said, end}), run());
        EXPECT_EQ(0u, library.count(words.symbol));
        EXPECT_EQ("5 Failed to disable the port", records().back());
    };
    answer("setPortByWwn", Json::Value());
    expect({});
    answer("setPortByWwn", json("{'error': 'no'}"));
    expect({});
    throws("setPortByWwn", HbaAgentError{7, "busy"});
    expect({"ERR libSetPortByWwn got User exception 7: busy"});
    throws("setPortByWwn", std::runtime_error("lost"));
    expect({"ERR libSetPortByWwn got std exception: lost"});
    throws("setPortByWwn", 42);
    expect({"ERR libSetPortByWwn got default exception"});
}

TEST_P(Loopback_Runner, IgnoresWhetherThePortCanBeEnabledAgain)
{
    answers("setPortByWwn", [](const Json::Value& request) {
        return request["port"]["portStatus"].asBool() ? Json::Value() : json("{}");
    });
    // Any good answer is a success; one without a status is told as such.
    Lines disabling = disable();
    disabling[3].back() = '0';
    Lines enabling = enable();
    enabling.erase(enabling.begin() + 3);
    EXPECT_EQ(all({ask_port(), disabling, test(), enabling, close(), passed()}), run());
}

TEST_P(Loopback_Runner, TellsOfEveryFrameThatWentWrong)
{
    struct Case
    {
        const char* answer;
        Lines frames;
    };
    const Case cases[] = {
        {"{'failed': true, 'transmitFrames': 131072, 'GoodFrameRcv': 131000, 'outstandingFrames': 72,"
         " 'BadFrameNo': 0, 'BadFrameInfo': 0, 'output': 'bad cable'}",
         {"Tx frames = 131072, Rx frames = 131000, OSF frames = 72"}},
        {"{'failed': true, 'transmitFrames': 1, 'GoodFrameRcv': 2, 'outstandingFrames': 4294967295,"
         " 'BadFrameNo': 3, 'BadFrameInfo': 0, 'output': 'bad cable'}",
         {"Tx frames = 1, Rx frames = 2, OSF frames = 4294967295",
          "Mis-match frame number = 3; Mis-match frame info = 0"}},
        {"{'failed': true, 'BadFrameInfo': 9, 'output': 'bad cable'}",
         {"Tx frames = 0, Rx frames = 0, OSF frames = 0",
          "Mis-match frame number = 0; Mis-match frame info = 9"}},
        {"{'failed': true, 'BadFrameNo': 3, 'BadFrameInfo': 9, 'output': 'bad cable'}",
         {"Tx frames = 0, Rx frames = 0, OSF frames = 0",
          "Mis-match frame number = 3; Mis-match frame info = 9"}},
    };
    Lines results;
    for (const Case& each : cases) {
        SCOPED_TRACE(each.answer);
        restart();
        answer(words.symbol, json(each.answer));
        const std::string status = std::string(words.status) + "bad cable";
        Lines failed = {std::string("ERR ") + words.failed};
        results.push_back(std::string("5 ") + words.failed);
        for (const std::string& frames : each.frames) {
            failed.push_back("INFO " + frames);
            results.push_back("5 " + frames);
        }
        failed.push_back("ERR " + status);
        results.push_back("5 " + status);
        EXPECT_EQ(all({ask_port(), disable(), test(), enable(), close(), failed}), run());
    }
    const Lines all_records = records();
    EXPECT_EQ(results,
              Lines(all_records.end() - static_cast<std::ptrdiff_t>(results.size()), all_records.end()));
}

// A caller can tell from the log alone.
TEST_P(Loopback_Runner, TakesABadAnswerForAPassedTest)
{
    for (const char* bad : {"null", "{'error': 'no'}", "{'error': null}"}) {
        SCOPED_TRACE(bad);
        restart();
        answer(words.symbol, json(bad));
        Lines tested = test();
        tested.push_back("ERR " + variable() + " response has error");
        EXPECT_EQ(all({ask_port(), disable(), tested, enable(), close(), passed()}), run());
    }
}

TEST_P(Loopback_Runner, ReadsMembersOfTheWrongTypeAsNone)
{
    answer(words.symbol, json("{'failed': 1, 'transmitFrames': 'many', 'GoodFrameRcv': -1, 'output': 5}"));
    run();
    const Lines said = log.said("ERR");
    EXPECT_EQ((Lines{std::string("ERR ") + words.failed,
                     "ERR " + variable() + " got std exception: Type is not convertible to uint"}),
              Lines(said.begin(), said.begin() + 2));
    EXPECT_EQ(std::string("ERR ") + words.status, said.back());
    EXPECT_EQ("5 Tx frames = 0, Rx frames = 0, OSF frames = 0", records()[7]);
}

TEST_P(Loopback_Runner, CutsWhatTheLibrarySays)
{
    Json::Value answered = json("{'failed': true}");
    answered["output"] = std::string(300, 'x');
    answer(words.symbol, answered);
    run();
    const std::string status = words.status;
    EXPECT_EQ("5 " + status + std::string(199 - status.size(), 'x'), records().back());
}

// A guard would make a bad answer of it, which reads as success: a test that blew up would be recorded as
// passed. So the exception ends the thread as one that nobody catches does, and with it the process.
TEST_P(Loopback_Runner, IsEndedByAnExceptionOfTheTest)
{
    GTEST_FLAG_SET(death_test_style, "fast");
    throws(words.symbol, HbaAgentError{7, "busy"});
    EXPECT_DEATH(start_thread_and_wait(),
                 "terminate called after throwing an instance of 'KPRV::HbaAgentError'");
    throws(words.symbol, std::runtime_error("lost"));
    EXPECT_DEATH(start_thread_and_wait(), "terminate called after throwing(.|\n)*lost");
    throws(words.symbol, 42);
    EXPECT_DEATH(start_thread_and_wait(), "terminate called after throwing an instance of 'int'");
}

} // namespace
} // namespace KPRV
