#pragma once

#include "module/diagnostics/DiagnosticHelper.h"
#include "module/schema/KALDERA_DiagnosticCompletionRecord.h"
#include "module/schema/KALDERA_DiagnosticServiceRecord.h"
#include "tests/module/diagnostics/Settle_Pause_Override.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/Fixed_Host.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

#include <string>

namespace KPRV {

inline constexpr const char* WWN = "1000024b4c100000";
inline constexpr const char* WWN_INDEX = "10:00:02:4b:4c:10:00:00";
inline constexpr const char* MAC = "024b4c200000";
inline constexpr const char* MAC_INDEX = "02:4b:4c:20:00:00";
inline constexpr const char* ADAPTER_WWN = "2000024b4c100000";

/// Runs a test's thread function on the thread of the test, and keeps all that can be seen of it in one
/// transcript: what the log says, which entry point is called with what request ("> name request"), where the
/// run pauses, and where it closes its job. No call may find the job closed.
class Run_Fixture : public testing::Test
{
protected:
    Run_Fixture()
    {
        current = this;
        answer("getPortByWwn", json("{'portStatus': true}"));
        answer("setPortByWwn", json("{'status': 0}"));
        answer("setAdapterState", json("{'status': 0}"));
        answer("getHbaByWwn", json("{'hbaData': {'hbaStatus': true}}"));
    }

    void answer(const char* symbol, const Json::Value& with)
    {
        answers(symbol, [with](const Json::Value&) { return with; });
    }
    template <class Error>
    void throws(const char* symbol, const Error& error)
    {
        answers(symbol, [error](const Json::Value&) -> Json::Value { throw error; });
    }
    void answers(const char* symbol, Fake_Library::Answer with)
    {
        library.answers(symbol, [this, symbol, with](const Json::Value& request) {
            note_log();
            transcript.push_back(std::string("> ") + symbol + " " + compact(request));
            EXPECT_TRUE(helper.isAnyJobRunning());
            return with(request);
        });
    }

    // What is tested, with a job of its own.
    DiagnosticTestInput& fc_port(diag_test_id_t test)
    {
        input.class_id = FCPORT;
        input.port_wwn = WWN;
        return prepare(test);
    }
    DiagnosticTestInput& eth_port(diag_test_id_t test)
    {
        input.class_id = ETHERNETPORT;
        input.port_mac = MAC;
        return prepare(test);
    }
    DiagnosticTestInput& adapter(const char* address = ADAPTER_WWN)
    {
        input.class_id = PORTCONTROLLER;
        input.adapter_address = address;
        return prepare(MEMORY_TEST);
    }

    /// A new job for another run of the same test.
    void restart() { prepare(input.test_id); }

    /// The thread's function on a thread, as a start runs it.
    void start_thread_and_wait()
    {
        Thread thread;
        Thread::create_joinable(thread, find_diagnostic_test(input.test_id)->run, &input);
        void* result = nullptr;
        Thread::join(thread, result);
    }

    Lines run()
    {
        log.clear();
        _noted = 0;
        transcript.clear();
        EXPECT_EQ(nullptr, find_diagnostic_test(input.test_id)->run(&input));
        note_log();
        EXPECT_FALSE(helper.isAnyJobRunning());
        return transcript;
    }

    /// Record data of the run's service records, then of its completion records, each with its state.
    Lines records()
    {
        Lines result;
        for (Instance* instance : helper.getDiagnosticServiceRecordInstances()) {
            result.push_back(cast<KALDERA_DiagnosticServiceRecord>(instance)->RecordData.value.c_str());
            destroy(instance);
        }
        for (Instance* instance : helper.getDiagnosticCompletionRecordInstances()) {
            const auto* record = cast<KALDERA_DiagnosticCompletionRecord>(instance);
            result.push_back(std::to_string(record->CompletionState.value) + " " +
                             record->RecordData.value.c_str());
            destroy(instance);
        }
        return result;
    }

    Fixed_Host host;
    Fake_Library library;
    Log_Capture log;
    DiagnosticHelper helper;
    DiagnosticTestInput input;
    Lines transcript;

private:
    DiagnosticTestInput& prepare(diag_test_id_t test)
    {
        const Diagnostic_Test& row = *find_diagnostic_test(test);
        input.test_id = test;
        input.frame_count = row.frame_count;
        input.data_pattern = row.data_pattern;
        input.mode = row.mode;
        input.helper = &helper;
        const DiagnosticJob job = helper.createDiagnosticJob(&input);
        input.job_id = job.instance_id;
        helper.addDiagnosticJob(job);
        return input;
    }
    void note_log()
    {
        const std::vector<Log_Line> lines = log.lines();
        for (; _noted < lines.size(); _noted++) {
            const Log_Line& line = lines[_noted];
            if (line.text == "Entering: updateJobState")
                transcript.push_back("the job is closed");
            else if (!line.is_trace())
                transcript.push_back(line.level + " " + line.text);
        }
    }
    static void note_pause(uint64 microseconds)
    {
        current->note_log();
        current->transcript.push_back("pause of " + std::to_string(microseconds) + " us");
    }

    static inline Run_Fixture* current = nullptr;
    Settle_Pause_Override _pause{note_pause};
    size_t _noted = 0;
};

} // namespace KPRV
