// The module while its delivery thread runs. In processes of their own, since the thread or the module
// outlives the test.
#include "tests/module/exports/Alert_Fixture.h"
#include "tests/support/In_Child.h"

#include <dlfcn.h>

namespace KPRV {
namespace {

class Delivery_Thread : public Alert_Fixture
{
protected:
    /// The server's own reference to the library goes, as at its dlclose; the broker, which the delivery
    /// thread still knows, stays.
    static void let_go_of_the_module()
    {
        void* const handle = dlopen(KLDR_MODULE, RTLD_NOW | RTLD_NOLOAD);
        ASSERT_NE(nullptr, handle);
        EXPECT_EQ(0, dlclose(handle));
        EXPECT_EQ(0, dlclose(handle));
    }
};

TEST_F(Delivery_Thread, GoesOnWhereAServerClosesTheModuleWithoutACleanup)
{
    in_child([&] {
        open();
        take_alerts();
        ASSERT_EQ(CMPI_RC_OK, server->activate_filter(CLASS, "root/kaldera"));
        ASSERT_EQ(CMPI_RC_OK, server->enable_indications(CLASS));
        let_go_of_the_module();
        for (unsigned i = 1; i <= 3; i++) {
            ASSERT_TRUE(simulator.event(event(9, 1)));
            ASSERT_TRUE(wait_for(i));
            let_pass();
        }
        // Nobody can stop it any more, and what a process does at its end to a library with a live thread is
        // not for this test to see.
        fflush(nullptr);
        _exit(testing::Test::HasFailure() ? 1 : 0);
    });
}

TEST_F(Delivery_Thread, PinsTheModuleNoLongerThanItGoesOn)
{
    in_child([&] {
        for (int i = 0; i < 3; i++) {
            open();
            ASSERT_EQ(CMPI_RC_OK, server->activate_filter(CLASS, "root/kaldera"));
            ASSERT_EQ(CMPI_RC_OK, server->enable_indications(CLASS));
            ASSERT_EQ(CMPI_RC_OK, server->enable_indications(CLASS));
            ASSERT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
            ASSERT_EQ(CMPI_RC_OK, server->disable_indications(CLASS));
            close();
            EXPECT_EQ(nullptr, dlopen(KLDR_MODULE, RTLD_NOW | RTLD_NOLOAD));
        }
        // A subscription that does not come about pins nothing.
        open();
        simulator.add_fault(R"({"call": "register_for_events", "do": "null"})");
        EXPECT_EQ(CMPI_RC_ERR_FAILED, server->enable_indications(CLASS));
        close();
        EXPECT_EQ(nullptr, dlopen(KLDR_MODULE, RTLD_NOW | RTLD_NOLOAD));
    });
}

} // namespace
} // namespace KPRV
