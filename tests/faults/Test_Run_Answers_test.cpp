// Bad answers of the adapter library to hardware tests. Each way has a process of its own: a module that has
// run a test is pinned, and some faults end the process.
#include "tests/faults/Ends_Process.h"
#include "tests/faults/Sweep_Fixture.h"
#include "tests/support/Eventually.h"
#include "tests/support/In_Child.h"

#include <algorithm>

namespace KPRV::test_run_answers {
namespace {

enum Outcome
{
    PASSED,
    FAILED,
    REFUSED,
    LEAVES,
    ENDS,
};

struct Way
{
    const char* entry_point;
    const char* kind;
    const char* test;
    const char* element;
    Outcome unanswered;
    Outcome thrown;
};

constexpr Way ways[] = {
#define TESTED(entry_point, kind, test, element, unanswered, thrown)                                         \
    {#entry_point, kind, test, element, unanswered, thrown},
#include "tests/faults/Ways_In.def"
};

class Test_Run_Answers : public Sweep_Fixture, public testing::TestWithParam<Way>
{
protected:
    broker::Path_Value find(const std::string& class_name, const char* key, const std::string& value)
    {
        for (const broker::Path_Value& path : server->enumerate_instance_names(class_name).paths)
            if (path.key(key)->as_text() == value)
                return path;
        throw std::invalid_argument("no " + class_name + " " + value);
    }
    void open_way()
    {
        open_host();
        const std::string kind = GetParam().element;
        const char* const device = kind == "PortController" ? "2000024b4ccc0000"
                                   : kind == "FCPort"       ? "1000024b4ccc0000"
                                                            : "024b4caa0000";
        element = find("KALDERA_" + kind, "DeviceID", device);
        test = find("KALDERA_" + std::string(GetParam().kind) + "DiagnosticTest", "Name",
                    std::string("Kaldera:") + GetParam().test);
    }

    std::vector<broker::Instance_Value> records()
    {
        return server->enumerate_instances("KALDERA_DiagnosticCompletionRecord").instances;
    }
    /// Starts the test, waits until its thread has left the server, and reads its records.
    Outcome run()
    {
        constexpr unsigned STARTED = 4096;
        constexpr unsigned STATE_FAILED = 5;
        const std::size_t before = records().size();
        const broker::Result result = server->invoke_method(
            test, "RunDiagnostic", {{"ManagedElement", broker::Plain_Value::path(element)}});
        if (thrown_text(result))
            return LEAVES;
        EXPECT_EQ(CMPI_RC_OK, result.rc) << result.message;
        if (result.return_value.as_uint() != STARTED)
            return REFUSED;
        EXPECT_TRUE(eventually([&] { return server->ledger().live() == 0; }));
        const std::vector<broker::Instance_Value> all = records();
        EXPECT_LT(before, all.size());
        bool failed = false;
        for (std::size_t i = before; i < all.size(); i++)
            failed = failed || all[i].property("CompletionState")->as_uint() == STATE_FAILED;
        const broker::Result job = server->enumerate_instances("KALDERA_ConcreteJob");
        EXPECT_EQ(7u, job.instances.at(0).property("JobState")->as_uint());
        return failed ? FAILED : PASSED;
    }

    void expect_outcome(const Bad_Answer& bad)
    {
        const Outcome now = run();
        if (bad.is_failure()) {
            EXPECT_EQ(bad.thrown ? GetParam().thrown : GetParam().unanswered, now);
        } else {
            EXPECT_TRUE(now == PASSED || now == FAILED || now == REFUSED) << now;
        }
    }

    Json::Value good_answer()
    {
        simulator.clear_calls();
        EXPECT_EQ(PASSED, run());
        const std::vector<Json::Value> requests = simulator.requests(GetParam().entry_point);
        EXPECT_FALSE(requests.empty());
        return requests.empty() ? Json::Value() : true_answer(GetParam().entry_point, requests[0]);
    }

    broker::Path_Value element, test;
};

TEST_P(Test_Run_Answers, AreInTheRecordsAndTheNextRunPasses)
{
    in_child([&] {
        open_way();
        const std::vector<Bad_Answer> kinds = bad_json_answers(good_answer());
        restore();
        const std::vector<std::string> ports = lasting_texts(server->enumerate_instances("KALDERA_FCPort"));
        for (const Bad_Answer& bad : kinds) {
            if (bad.thrown && GetParam().thrown == ENDS)
                continue;
            SCOPED_TRACE(bad.name);
            simulator.add_fault(bad.fault(GetParam().entry_point));
            expect_outcome(bad);
            expect_nothing_left();
            restore();
            EXPECT_EQ(ports, lasting_texts(server->enumerate_instances("KALDERA_FCPort")));
            EXPECT_EQ(PASSED, elsewhere([&] { return run(); }));
            expect_nothing_left();
        }
    });
}

class Unguarded_Runs : public Test_Run_Answers
{
public:
    static std::vector<Way> own_ways()
    {
        std::vector<Way> own;
        std::copy_if(std::begin(ways), std::end(ways), std::back_inserter(own),
                     [](const Way& way) { return way.thrown == ENDS; });
        return own;
    }
};

TEST_P(Unguarded_Runs, EndTheProcessIfTheLibraryThrows)
{
    for (const Bad_Answer& bad : bad_answers_of(NONE)) {
        SCOPED_TRACE(bad.name);
        expect_end_of_process([&] {
            open_way();
            simulator.add_fault(bad.fault(GetParam().entry_point));
            run();
        });
    }
}

std::string name_of(const testing::TestParamInfo<Way>& row)
{
    return std::string(row.param.test) + "_" + row.param.entry_point;
}

INSTANTIATE_TEST_SUITE_P(Way, Test_Run_Answers, testing::ValuesIn(ways), name_of);
INSTANTIATE_TEST_SUITE_P(Way, Unguarded_Runs, testing::ValuesIn(Unguarded_Runs::own_ways()), name_of);

} // namespace
} // namespace KPRV::test_run_answers
