#include "module/model/Fresh_Instances.h"

#include "module/model/Instance_Building.h"
#include "module/runtime/objects/Ref.h"
#include "module/schema/KALDERA_PortController.h"
#include "tests/support/Instance_Text.h"

#include <gtest/gtest.h>

using namespace KPRV;

TEST(Fresh_Instances, OwnsUntilRelease)
{
    Ref<Instance> kept(create_null<KALDERA_PortController>());
    {
        Fresh_Instances instances;
        ref(kept.ptr());
        instances.append(kept.ptr());
        EXPECT_EQ(instances.size(), 1u);
        const Array<Instance*> released = instances.release();
        EXPECT_EQ(instances.size(), 0u);
        ASSERT_EQ(released.size(), 1u);
        EXPECT_EQ(released[0], kept.ptr());
        unref(released[0]);
    }
    EXPECT_EQ(kept->__refs, 1);
    // What is not released is freed; a leak here is a report of the address sanitizer.
    Fresh_Instances dropped;
    dropped.append(create_null<KALDERA_PortController>());
}

TEST(Fresh_Instances, JoinsListsInOrder)
{
    Array<Instance*> two;
    two.append(create_null<KALDERA_PortController>());
    two.append(create_null<KALDERA_PortController>());
    Fresh_Instances instances;
    Instance* first = create_null<KALDERA_PortController>();
    instances.append(first);
    instances.append(two);
    const Array<Instance*> all = instances.release();
    ASSERT_EQ(all.size(), 3u);
    EXPECT_EQ(all[0], first);
    EXPECT_EQ(all[1], two[0]);
    EXPECT_EQ(all[2], two[1]);
    for (Instance* instance : all)
        destroy(instance);
}

TEST(Instance_Building, AFreshInstanceIsNullThroughout)
{
    const Ref<Instance> defaults(create<KALDERA_PortController>(true));
    EXPECT_EQ(set_properties(defaults.ptr()).size(), 5u);
    const Ref<Instance> nothing(create_null<KALDERA_PortController>());
    EXPECT_EQ(set_properties(nothing.ptr()), Set_Properties{});
    EXPECT_EQ(nothing->__refs, 1);
}
