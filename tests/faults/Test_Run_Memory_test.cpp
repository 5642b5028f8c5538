// Hardware tests whose start runs out of memory, and those whose own thread does. The process ends without
// unloading the module, which a test thread has pinned.
#include "tests/faults/Failing_Allocator.h"
#include "tests/faults/Fault_Fixture.h"
#include "tests/support/Eventually.h"
#include "tests/support/In_Child.h"

#include <thread>

namespace KPRV::test_run_memory {
namespace {

constexpr unsigned STARTED = 4096;

/// A test of each class, and what it is run on.
struct Way
{
    const char* test;
    const char* element;
};

class Test_Run_Memory : public Fault_Fixture
{
protected:
    void start_host(const std::string& test_class, const std::string& element_class)
    {
        open("one_cna.json");
        element = server->enumerate_instance_names("KALDERA_" + element_class).paths.at(0);
        test = server->enumerate_instance_names("KALDERA_" + test_class + "DiagnosticTest").paths.back();
        watch_library("libkldrprovider_Module", true);
    }

    broker::Result start()
    {
        return server->invoke_method(test, "RunDiagnostic",
                                     {{"ManagedElement", broker::Plain_Value::path(element)}});
    }
    /// Until the thread of a test has left the server.
    void wait_for_the_end()
    {
        EXPECT_TRUE(eventually([&] { return server->ledger().live() == 0; }));
    }
    /// A run that nothing disturbs.
    void expect_a_good_run()
    {
        constexpr unsigned OVER = 7;
        const broker::Result result = start();
        ASSERT_EQ(CMPI_RC_OK, result.rc) << thrown_text(result).value_or("");
        ASSERT_EQ(STARTED, result.return_value.as_uint());
        wait_for_the_end();
        const broker::Result jobs = server->enumerate_instances("KALDERA_ConcreteJob");
        ASSERT_EQ(1u, jobs.instances.size());
        EXPECT_EQ(*jobs.instances[0].property("InstanceID"),
                  *result.out.at(0).value.as_path()->key("InstanceID"));
        EXPECT_EQ(OVER, jobs.instances[0].property("JobState")->as_uint());
    }

    broker::Path_Value element, test;
};

class Test_Start_Memory : public Test_Run_Memory, public testing::WithParamInterface<Way>
{
};

TEST_P(Test_Start_Memory, AStartThatFailsKeepsNoTestFromStarting)
{
    in_child([&] {
        start_host(GetParam().test, GetParam().element);
        expect_a_good_run();
        fail_allocation(~0ul);
        start();
        const unsigned long count = mend_memory();
        wait_for_the_end();
        ASSERT_LT(0u, count);
        for (const bool once : {false, true}) {
            for (unsigned long nth = 1; nth <= count; nth++) {
                SCOPED_TRACE("allocation " + std::to_string(nth) + " of " + std::to_string(count));
                fail_allocation(nth, once);
                const broker::Result result = start();
                mend_memory();
                EXPECT_EQ(result.ok(), !thrown_text(result));
                wait_for_the_end();
                expect_nothing_left();
                expect_a_good_run();
            }
        }
    });
}

class Test_Thread_Memory : public Test_Run_Memory, public testing::WithParamInterface<Way>
{
};

// What fails on the thread costs records or the run, and nothing that comes after it.
TEST_P(Test_Thread_Memory, EndsTheRunAlone)
{
    in_child([&] {
        start_host(GetParam().test, GetParam().element);
        expect_a_good_run();
        const auto records = [this] {
            return server->enumerate_instances("KALDERA_DiagnosticCompletionRecord").instances.size();
        };
        const size_t before = records();
        fail_allocation_of_new_threads(1);
        start();
        wait_for_the_end();
        fail_allocation_of_new_threads(0);
        EXPECT_EQ(before, records()) << "memory did not fail";
        fail_allocation_of_new_threads(~0ul);
        start();
        wait_for_the_end();
        const unsigned long count = fail_allocation_of_new_threads(0);
        ASSERT_LT(0u, count);
        for (const bool once : {false, true}) {
            for (unsigned long nth = 1; nth <= count; nth++) {
                SCOPED_TRACE("allocation " + std::to_string(nth));
                fail_allocation_of_new_threads(nth, once);
                const broker::Result result = start();
                EXPECT_EQ(STARTED, result.return_value.as_uint());
                wait_for_the_end();
                fail_allocation_of_new_threads(0);
                expect_nothing_left();
            }
            expect_a_good_run();
        }
    });
}

constexpr Way ways[] = {
    {"Memory", "PortController"},
    {"PCILoopback", "FCPort"},
    {"Loopback", "FCPort"},
    {"EthLoopback", "EthernetPort"},
};
const auto name_of = [](const testing::TestParamInfo<Way>& info) { return info.param.test; };
INSTANTIATE_TEST_SUITE_P(Of, Test_Start_Memory, testing::ValuesIn(ways), name_of);
INSTANTIATE_TEST_SUITE_P(Of, Test_Thread_Memory, testing::ValuesIn(ways), name_of);

} // namespace
} // namespace KPRV::test_run_memory
