// The first test of its program, since only the first call of a loaded module enters the agent's methods.
#include "tests/faults/Failing_Allocator.h"
#include "tests/faults/Fault_Fixture.h"
#include "tests/support/In_Child.h"

#include <dlfcn.h>

namespace KPRV::agent_memory {
namespace {

using Agent_Memory = Fault_Fixture;

broker::Result call(broker::Local_Server& server)
{
    const broker::Path_Value service = {
        {},
        "root/kaldera",
        "KALDERA_AgentService",
        {{"Name", broker::Plain_Value::text("Kaldera Agent Service Provider")}}};
    // The last method that is entered.
    return server.invoke_method(
        service, "executeMethod",
        {{"request",
          broker::Plain_Value::text(R"({"method": "diagnostics.getDPortTestResults", "params": []})")}});
}

TEST_F(Agent_Memory, OfTheFirstCallIsNoMatterOfTheNext)
{
    ASSERT_EQ(nullptr, dlopen(module_under_test(), RTLD_NOW | RTLD_NOLOAD));
    in_child([&] {
        open("one_cna.json");
        watch_library("libkldrprovider_Module", true);
        unsigned long nth = 0, asked = 0;
        do {
            fail_allocation(++nth);
            const broker::Result result = call(*server);
            asked = mend_memory();
            EXPECT_EQ(asked >= nth, thrown_text(result).has_value()) << nth;
            expect_nothing_left();
        } while (asked >= nth);
        // All methods have been entered on the way.
        EXPECT_LT(300u, nth);
        // Found, since it complains of its parameters.
        const broker::Result whole = call(*server);
        const broker::Plain_Value* const response = broker::find_value(whole.out, "response");
        ASSERT_TRUE(response);
        EXPECT_NE(std::string::npos, response->as_text().find("Mismatch in number of parameters"));
    });
}

} // namespace
} // namespace KPRV::agent_memory
