#include "tests/faults/Failing_Allocator.h"
#include "tests/faults/Fault_Fixture.h"

#include <dlfcn.h>

namespace KPRV {
namespace {

class Allocation_Failures : public Fault_Fixture
{
protected:
    void SetUp() override
    {
        // Kept in memory, so that a report of what was lost can name its places.
        ASSERT_TRUE(dlopen(KLDR_MODULE, RTLD_NOW | RTLD_NODELETE));
        open("one_cna.json");
        watch_library("libkldrprovider_Module");
    }

    /// Where the module guards a call of the adapter library, the failure costs no more than the element at
    /// hand.
    static bool is_less(const host::Result& result, const host::Result& whole)
    {
        return result.instances.size() < whole.instances.size() ||
               !(result.return_value == whole.return_value);
    }

    /// The operation with each allocation of the module failing in turn, where they are few, or with a spread
    /// of them. A failure leaves the provider as an exception, which takes all that was half made with it.
    template <class Operation>
    void starve(const std::string& what, Operation&& operation)
    {
        fail_allocation(~0ul);
        const host::Result whole = operation();
        const unsigned long count = mend_memory();
        ASSERT_LT(0u, count) << what;
        const unsigned long step = 1 + count / 400;
        for (unsigned long nth = 1; nth <= count; nth += step) {
            SCOPED_TRACE(what + ": allocation " + std::to_string(nth) + " of " + std::to_string(count));
            fail_allocation(nth);
            const host::Result result = operation();
            const unsigned long asked = mend_memory();
            EXPECT_LE(nth, asked);
            EXPECT_TRUE(!result.ok() || is_less(result, whole));
            expect_nothing_left();
        }
        const host::Result after = operation();
        EXPECT_TRUE(after.ok()) << what << ": " << after.rc << " " << after.exception.value_or("");
    }
};

TEST_F(Allocation_Failures, OfEnumerations)
{
    for (const char* name :
         {"KALDERA_ComputerSystem", "KALDERA_PortController", "KALDERA_FCPort", "KALDERA_EthernetPort",
          "KALDERA_FCPortSystemDevice", "KALDERA_ControlledBy", "KALDERA_RegisteredProfile"})
        starve(name, [&] { return server->enumerate_instances(name); });
}

TEST_F(Allocation_Failures, OfAMethod)
{
    const host::Path_Value alarm = server->enumerate_instances("KALDERA_AlarmDevice").instances.at(0).path;
    starve("SetAlarmState", [&] {
        return server->invoke_method(alarm, "SetAlarmState",
                                     {{"RequestedAlarmState", host::Value::unsigned_number(CMPI_uint16, 2)}});
    });
}

TEST_F(Allocation_Failures, OfAssociations)
{
    const host::Path_Value port = server->enumerate_instances("KALDERA_FCPort").instances.at(0).path;
    starve("associators", [&] { return server->associators("KALDERA_FCPortSystemDevice", port, {}); });
}

} // namespace
} // namespace KPRV
