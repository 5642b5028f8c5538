#include "module/runtime/objects/Instance.h"

#include "tests/module/runtime/objects/sample_values.h"

#include <gtest/gtest.h>

#include <vector>

namespace KPRV {

TEST(Instance_visit, GoesToTheInstanceFirstAndThenToItsReferences)
{
    const Ref<Sample_Group> x = make_group("g");
    std::vector<Instance*> seen;
    __visit(
        x.ptr(),
        [](Instance* each, void* data) { static_cast<std::vector<Instance*>*>(data)->push_back(each); },
        &seen);
    EXPECT_EQ((std::vector<Instance*>{x.ptr(), x->Leader, x->Members.value[0], x->Members.value[2]}), seen);
    __visit(
        nullptr, [](Instance*, void*) { FAIL(); }, nullptr);
}

TEST(Instance_set_name_space, IsGivenToThoseWithoutOne)
{
    const Ref<Sample_Group> x = make_group("g");
    x->Leader->__name_space = "own";
    __set_name_space_recursive(x.ptr(), "root", false);
    EXPECT_STREQ("root", x->__name_space.c_str());
    EXPECT_STREQ("own", x->Leader->__name_space.c_str());
    EXPECT_STREQ("root", x->Members.value[2]->__name_space.c_str());
    __set_name_space_recursive(x.ptr(), "other", true);
    EXPECT_STREQ("other", x->__name_space.c_str());
    EXPECT_STREQ("other", x->Leader->__name_space.c_str());
}

TEST(Instance_create_refs, CreatesTheMissingWithDefaults)
{
    const Ref<Sample_Link> x(create<Sample_Link>(true));
    x->Antecedent = make_port("p", 1);
    const Instance* before = x->Antecedent;
    __create_refs(x.ptr());
    EXPECT_EQ(before, x->Antecedent);
    ASSERT_NE(nullptr, x->Dependent);
    EXPECT_EQ(&Sample_Port::static_meta_class, x->Dependent->__meta_class);
    EXPECT_EQ(5, static_cast<Sample_Port*>(x->Dependent)->EnabledState.value);
    EXPECT_EQ(1, static_cast<Sample_Port*>(x->Dependent)->Name.null);
    const Ref<Sample_Group> group(create<Sample_Group>(true));
    __create_refs(group.ptr());
    EXPECT_NE(nullptr, group->Leader);
    EXPECT_EQ(0u, group->Members.value.size());
}

} // namespace KPRV
