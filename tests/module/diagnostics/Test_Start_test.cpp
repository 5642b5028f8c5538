#include "module/diagnostics/DiagnosticHelper.h"
#include "module/schema/KALDERA_DiagnosticCompletionRecord.h"
#include "tests/module/diagnostics/Settle_Pause_Override.h"
#include "tests/support/Eventually.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/Fixed_Host.h"
#include "tests/support/In_Child.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

#include <future>
#include <memory>
#include <pthread.h>
#include <utility>

namespace KPRV {
namespace {

constexpr const char* WWN = "1000024b4c100000";
constexpr const char* MAC = "024b4c200000";
constexpr const char* INTERNAL = "Kaldera:InternalLoopbackTest";
constexpr const char* EXTERNAL = "Kaldera:ExternalLoopbackTest";

/// Starts as a client does. Every thread is waited for before its helper goes.
class Test_Start : public testing::Test
{
protected:
    Test_Start()
    {
        library.answers("getPortByWwn", json("{'portStatus': true}"));
        library.answers("setPortByWwn", json("{'status': 0}"));
        library.answers("getAdapterId", json("{'adapterId': 1}"));
        for (const char* test :
             {"diagLoopbackTest", "diagEthLoopbackTest", "diagPCILoopbackTest", "diagMemoryTest"})
            library.answers(test, json("{'failed': false}"));
    }
    ~Test_Start() override { wait(); }

    /// Code of a start; its job is released.
    uint32 code(const Run_Result& result)
    {
        EXPECT_EQ(result.code == RUN_JOB_STARTED, result.job != nullptr);
        started += result.job != nullptr;
        last_job = result.job ? result.job->InstanceID.value.c_str() : "";
        unref(result.job);
        return result.code;
    }
    /// Until every started thread has said its last line.
    void wait()
    {
        const auto over = [&] {
            size_t count = 0;
            for (const std::string& line : log.traces())
                count += line.starts_with("DBG Returning: run") && line.ends_with("Thread");
            return count >= started;
        };
        EXPECT_TRUE(eventually(over));
        // Takes the locks that the threads have used.
        helper.isAnyJobRunning();
        for (Instance* instance : helper.getDiagnosticCompletionRecordInstances())
            destroy(instance);
        for (Instance* instance : helper.getDiagnosticServiceRecordInstances())
            destroy(instance);
    }
    Lines jobs()
    {
        Lines result;
        for (Instance* instance : helper.getDiagnosticJobInstances()) {
            const auto* job = cast<KALDERA_ConcreteJob>(instance);
            result.push_back(std::string(job->InstanceID.value.c_str()) + " " +
                             std::to_string(job->JobState.value));
            destroy(instance);
        }
        return result;
    }
    /// Lets the calls of a test wait until the promise is kept.
    std::shared_ptr<std::promise<void>> hold(const char* symbol)
    {
        auto released = std::make_shared<std::promise<void>>();
        const std::shared_future<void> future = released->get_future().share();
        library.answers(symbol, [future](const Json::Value&) {
            future.wait();
            return json("{'failed': false}");
        });
        return released;
    }
    Json::Value request_of(const char* symbol)
    {
        wait();
        for (const Fake_Library::Call& call : library.calls)
            if (call.name == symbol)
                return call.request;
        return {};
    }

    Fixed_Host host;
    Fake_Library library;
    Log_Capture log;
    Settle_Pause_Override pause{[](uint64) {}};
    DiagnosticHelper helper;
    size_t started = 0;
    std::string last_job;
};

TEST_F(Test_Start, AnswersWithTheJob)
{
    EXPECT_EQ(4096u, code(helper.runLoopbackTest(WWN, INTERNAL)));
    EXPECT_EQ("Kaldera:InternalLoopbackTest-1", last_job);
    wait();
    EXPECT_EQ(Lines{"Kaldera:InternalLoopbackTest-1 7"}, jobs());
    EXPECT_TRUE(log.has("INFO Given Port WWN : 1000024b4c100000"));
    EXPECT_TRUE(log.has("INFO Speed chosen : 4 GBS"));
    EXPECT_TRUE(log.has("INFO Loopback test mode : internal"));
    EXPECT_TRUE(log.has("INFO Creating the Job instance."));
}

TEST_F(Test_Start, GivesEachTestItsOwnValues)
{
    struct Case
    {
        const char* name;
        unsigned mode;
        const char* said;
    };
    for (const Case& each : {Case{INTERNAL, 1, "INFO Loopback test mode : internal"},
                             {"kaldera:EXTERNALloopbackTest", 8, "INFO Loopback test mode : external"},
                             {"Kaldera:SerdesLoopbackTest", 4, "INFO Loopback test mode : serdes"}}) {
        library.calls.clear();
        EXPECT_EQ(4096u, code(helper.runLoopbackTest(WWN, each.name)));
        const Json::Value request = request_of("diagLoopbackTest");
        EXPECT_EQ(each.mode, request["mode"].asUInt());
        EXPECT_EQ(4u, request["speed"].asUInt());
        EXPECT_TRUE(log.has(each.said));
    }
    for (const Case& each :
         {Case{"Kaldera:ExternalEthLoopbackTest", 8, "INFO Eth Loopback test mode : external"},
          {"Kaldera:SerdesEthLoopbackTest", 4, "INFO Eth Loopback test mode : serdes"}}) {
        library.calls.clear();
        EXPECT_EQ(4096u, code(helper.runEthLoopbackTest(MAC, each.name)));
        EXPECT_EQ(each.mode, request_of("diagEthLoopbackTest")["mode"].asUInt());
        EXPECT_TRUE(log.has(each.said));
    }
    EXPECT_EQ(4096u, code(helper.runPCILoopbackTest(MAC)));
    EXPECT_EQ("02:4b:4c:20:00:00", request_of("diagPCILoopbackTest")["portWwn"].asString());
    EXPECT_EQ("Kaldera:PCILoopbackTest-6", last_job);
    EXPECT_EQ(4096u, code(helper.runMemoryTest(MAC)));
    EXPECT_EQ("02:4b:4c:20:00:00", request_of("diagMemoryTest")["hbaWwn"].asString());
    EXPECT_TRUE(log.has("INFO Adapter Address : 024b4c200000"));
    EXPECT_TRUE(log.has("INFO Adapter ID  : 1"));
}

TEST_F(Test_Start, RunsAPortThatIsNamedByItsMacAtFullSpeed)
{
    EXPECT_EQ(4096u, code(helper.runLoopbackTest(MAC, INTERNAL)));
    const Json::Value request = request_of("diagLoopbackTest");
    EXPECT_EQ("02:4b:4c:20:00:00", request["portWwn"].asString());
    EXPECT_EQ(10u, request["speed"].asUInt());
    EXPECT_TRUE(log.has("INFO Speed chosen : 10 GBS"));
}

// The member's presence counts, not its value.
TEST_F(Test_Start, RefusesTheInternalTestOfAPortThatSaysAnythingOfFCoE)
{
    for (const char* port : {"{'isFCoE': true}", "{'isFCoE': false}", "{'isFCoE': null}"}) {
        library.answers("getPortByWwn", json(port));
        EXPECT_EQ(1u, code(helper.runLoopbackTest(WWN, INTERNAL)));
        EXPECT_EQ("DBG Returning: runLoopbackTest - RUN_DIAG_RETURN_UNSUPPORTED", log.traces().back());
        EXPECT_TRUE(jobs().empty());
    }
    EXPECT_EQ(4096u, code(helper.runLoopbackTest(WWN, EXTERNAL)));
    EXPECT_EQ(10u, request_of("diagLoopbackTest")["speed"].asUInt());
}

TEST_F(Test_Start, RefusesWhatIsNoAddress)
{
    for (const char* address : {"", "1", "1000024b4c1000", "1000024b4c10000000"}) {
        log.clear();
        EXPECT_EQ(5u, code(helper.runLoopbackTest(address, INTERNAL)));
        EXPECT_EQ(Lines{"ERR Invalid port WWN or MAC value"}, log.said("ERR"));
        log.clear();
        EXPECT_EQ(5u, code(helper.runEthLoopbackTest(address, "Kaldera:SerdesEthLoopbackTest")));
        EXPECT_EQ(Lines{"ERR Invalid port MAC value"}, log.said("ERR"));
        log.clear();
        EXPECT_EQ(5u, code(helper.runPCILoopbackTest(address)));
        EXPECT_EQ(Lines{std::string("ERR ") + address + " - Invalid port WWN or MAC value"}, log.said("ERR"));
        log.clear();
        EXPECT_EQ(5u, code(helper.runMemoryTest(address)));
        EXPECT_EQ(Lines{"ERR The address passed is not MAC or WWN"}, log.said("ERR"));
    }
    EXPECT_EQ(5u, code(helper.runEthLoopbackTest(WWN, "Kaldera:SerdesEthLoopbackTest")));
    EXPECT_TRUE(jobs().empty());
    EXPECT_TRUE(library.calls.empty());
}

TEST_F(Test_Start, RefusesATestThatIsNone)
{
    EXPECT_EQ(5u, code(helper.runLoopbackTest(WWN, "Kaldera:SerdesEthLoopbackTest")));
    EXPECT_EQ(5u, code(helper.runLoopbackTest(WWN, "")));
    EXPECT_EQ(5u, code(helper.runEthLoopbackTest(MAC, INTERNAL)));
    EXPECT_TRUE(jobs().empty());
}

TEST_F(Test_Start, RefusesAPortThatCannotBeRead)
{
    for (const char* bad : {"null", "{'error': 'no'}"}) {
        library.answers("getPortByWwn", json(bad));
        EXPECT_EQ(4u, code(helper.runLoopbackTest(WWN, INTERNAL)));
        EXPECT_TRUE(log.has("ERR Unable get Port INFO for 1000024b4c100000"));
    }
    EXPECT_TRUE(jobs().empty());
}

// The other tests do not look: their threads find out.
TEST_F(Test_Start, RefusesNoOtherPortForThat)
{
    library.answers("getPortByWwn", Json::Value());
    EXPECT_EQ(4096u, code(helper.runEthLoopbackTest(MAC, "Kaldera:SerdesEthLoopbackTest")));
    wait();
    EXPECT_EQ(4096u, code(helper.runPCILoopbackTest(WWN)));
}

// An adapter that the library does not know has the id -1, and only 0 is refused.
TEST_F(Test_Start, RefusesAnAdapterForItsIdZeroAlone)
{
    library.answers("getAdapterId", json("{'adapterId': 0}"));
    EXPECT_EQ(5u, code(helper.runMemoryTest(WWN)));
    EXPECT_TRUE(jobs().empty());
    library.answers("getAdapterId", Json::Value());
    EXPECT_EQ(4096u, code(helper.runMemoryTest(WWN)));
    EXPECT_TRUE(log.has("INFO Adapter ID  : -1"));
}

TEST_F(Test_Start, RefusesEverythingWhileATestRuns)
{
    const auto released = hold("diagPCILoopbackTest");
    EXPECT_EQ(4096u, code(helper.runPCILoopbackTest(WWN)));
    const Lines running = {"Kaldera:PCILoopbackTest-1 4"};
    EXPECT_EQ(running, jobs());
    EXPECT_EQ(4u, code(helper.runPCILoopbackTest(MAC)));
    EXPECT_EQ(4u, code(helper.runMemoryTest("2000024b4c300000")));
    EXPECT_EQ(4u, code(helper.runLoopbackTest(WWN, INTERNAL)));
    EXPECT_EQ(4u, code(helper.runEthLoopbackTest(MAC, "Kaldera:SerdesEthLoopbackTest")));
    // The running test comes before all that is wrong with a request.
    EXPECT_EQ(4u, code(helper.runEthLoopbackTest("1", "")));
    EXPECT_EQ(running, jobs());
    released->set_value();
    wait();
    EXPECT_EQ(Lines{"Kaldera:PCILoopbackTest-1 7"}, jobs());
    EXPECT_EQ(4096u, code(helper.runMemoryTest(WWN)));
    wait();
    EXPECT_EQ(Lines{"Kaldera:MemoryTest-2 7"}, jobs()) << "the new job takes the place of the old one";
}

/// Two starts at the same moment: between the check of the first and its job the second one goes all the way.
TEST_F(Test_Start, OfTwoAtTheSameMomentBothRunAndTheLaterJobStays)
{
    const auto released = hold("diagPCILoopbackTest");
    bool first = true;
    library.answers("getPortByWwn", [&](const Json::Value&) {
        if (std::exchange(first, false)) {
            EXPECT_EQ(4096u, code(helper.runPCILoopbackTest(WWN)));
        }
        return json("{'portStatus': true}");
    });
    const auto loopback_released = hold("diagLoopbackTest");
    EXPECT_EQ(4096u, code(helper.runLoopbackTest(WWN, INTERNAL)));
    EXPECT_EQ(2u, started);
    EXPECT_EQ(Lines{"Kaldera:InternalLoopbackTest-2 4"}, jobs());
    // The end of the run whose job is gone changes nothing.
    released->set_value();
    EXPECT_TRUE(eventually([&] { return log.has("INFO PCI Loopback test run is successful"); }));
    EXPECT_EQ(Lines{"Kaldera:InternalLoopbackTest-2 4"}, jobs());
    loopback_released->set_value();
    wait();
    EXPECT_EQ(Lines{"Kaldera:InternalLoopbackTest-2 7"}, jobs());
}

TEST_F(Test_Start, OfTwoAtTheSameMomentTheOtherOrder)
{
    const auto released = hold("diagMemoryTest");
    bool first = true;
    library.answers("getAdapterId", [&](const Json::Value&) {
        if (std::exchange(first, false)) {
            EXPECT_EQ(4096u, code(helper.runLoopbackTest(WWN, EXTERNAL)));
        }
        return json("{'adapterId': 1}");
    });
    const auto loopback_released = hold("diagLoopbackTest");
    EXPECT_EQ(4096u, code(helper.runMemoryTest(WWN)));
    EXPECT_EQ(Lines{"Kaldera:MemoryTest-2 4"}, jobs());
    released->set_value();
    EXPECT_TRUE(eventually([&] { return !helper.isAnyJobRunning(); }));
    EXPECT_EQ(Lines{"Kaldera:MemoryTest-2 7"}, jobs());
    loopback_released->set_value();
}

TEST_F(Test_Start, IsReadWhileItRuns)
{
    library.answers("diagPCILoopbackTest", [](const Json::Value&) { return json("{'failed': true}"); });
    for (int i = 0; i < 10; i++) {
        EXPECT_EQ(4096u, code(helper.runPCILoopbackTest(WWN)));
        while (helper.isAnyJobRunning())
            for (Instance* instance : helper.getDiagnosticServiceRecordInstances())
                destroy(instance);
    }
}

// Nobody waits for its end, which must give back its stack.
TEST_F(Test_Start, RunsADetachedThread)
{
    int state = PTHREAD_CREATE_JOINABLE;
    library.answers("diagPCILoopbackTest", [&state](const Json::Value&) {
        pthread_attr_t attributes;
        EXPECT_EQ(0, pthread_getattr_np(pthread_self(), &attributes));
        pthread_attr_getdetachstate(&attributes, &state);
        pthread_attr_destroy(&attributes);
        return json("{'failed': false}");
    });
    EXPECT_EQ(4096u, code(helper.runPCILoopbackTest(WWN)));
    wait();
    EXPECT_EQ(PTHREAD_CREATE_DETACHED, state);
}

TEST_F(Test_Start, DoesNotNoticeThatThereIsNoThread)
{
    in_child([&] {
        pthread_attr_t attributes;
        pthread_attr_init(&attributes);
        // More than there is in one piece.
        pthread_attr_setstacksize(&attributes, size_t(3) << (sizeof(void*) == 8 ? 58 : 30));
        ASSERT_EQ(0, pthread_setattr_default_np(&attributes));
        const Run_Result result = helper.runPCILoopbackTest(WWN);
        EXPECT_EQ(RUN_JOB_STARTED, result.code);
        unref(result.job);
        EXPECT_EQ(Lines{"Kaldera:PCILoopbackTest-1 4"}, jobs());
        EXPECT_EQ(RUN_FAILED, helper.runMemoryTest(WWN).code);
    });
}

} // namespace
} // namespace KPRV
