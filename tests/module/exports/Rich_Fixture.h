#pragma once

#include "tests/module/exports/Golden.h"
#include "tests/module/exports/Module_Fixture.h"
#include "tests/module/exports/Rich_Calls.h"

namespace KPRV {

/// The module over rich.json, a server that has every kind of thing once.
class Rich_Fixture : public Module_Fixture
{
protected:
    void open_rich(const broker::Server_Options& options = {}) { open("rich.json", options); }

    /// Runs a check as two servers with different habits.
    template <class Check>
    void under_both_servers(Check check)
    {
        for (const broker::Server_Options& options :
             {broker::Server_Options::sfcb_like(), broker::Server_Options::pegasus_like()}) {
            open_rich(options);
            check();
            close();
        }
    }

    /// The names are those of the instances, in the same order, and the last instance is found by its name:
    /// both at the cost of one enumeration.
    void expect_named_and_found(const std::string& class_name, const rich::Calls& cost)
    {
        SCOPED_TRACE(class_name);
        const broker::Result instances = enumerate(class_name);
        mark();
        const broker::Result names = server->enumerate_instance_names(class_name);
        EXPECT_EQ(cost, rich::recorded(simulator));
        ASSERT_EQ(CMPI_RC_OK, names.rc) << names.message;
        ASSERT_EQ(instances.instances.size(), names.paths.size());
        ASSERT_FALSE(names.paths.empty());
        for (size_t i = 0; i < names.paths.size(); i++)
            EXPECT_EQ(broker::path_text(instances.instances[i].path), broker::path_text(names.paths[i]));

        mark();
        const broker::Result last = server->get_instance(names.paths.back());
        EXPECT_EQ(cost, rich::recorded(simulator));
        ASSERT_EQ(CMPI_RC_OK, last.rc) << last.message;
        ASSERT_EQ(1u, last.instances.size());
        EXPECT_EQ(broker::mof_instance(instances.instances.back()), broker::mof_instance(last.instances[0]));
    }
};

} // namespace KPRV
