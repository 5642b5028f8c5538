#include "tests/module/providers/Association_Fixture.h"

namespace KPRV {
namespace {

struct Pair_Row
{
    const char* association;
    const char* first_role;
    const char* first_class;
    const char* second_role;
    const char* second_class;
};

// clang-format off
constexpr Pair_Row pair_rows[] = {
//   association                         first role         its class                      second role         its class
    {"AffectedJobElement",               "AffectedElement", "FCPort",                      "AffectingElement", "ConcreteJob"},
    {"ServiceRecordAppliesToElement",    "Antecedent",      "DiagnosticServiceRecord",     "Dependent",        "FCPort"},
    {"CompletionRecordAppliesToElement", "Antecedent",      "DiagnosticCompletionRecord",  "Dependent",        "FCPort"},
};
// clang-format on

class Paired_Lists : public Association_Fixture
{
protected:
    static void set_end(Instance* association, const char* role, Instance* end)
    {
        const Meta_Feature* feature = find_feature(association->__meta_class, role, FLAG_REFERENCE);
        cell_at<Instance*>(association, static_cast<const Meta_Reference*>(feature)->offset) = end;
    }
    /// One more association in its list, and its ends in a list of their own.
    static void add(const Pair_Row& row, const std::string& first, const std::string& second)
    {
        Instance* const association = create(class_named(row.association), true);
        for (const auto& [role, name, label] : {std::tuple(row.first_role, row.first_class, first),
                                                std::tuple(row.second_role, row.second_class, second)}) {
            Instance* const end = scripted_instance(class_named(name), label);
            managers_script.lists["ends"].push_back(end);
            set_end(association, role, clone(end));
        }
        managers_script.lists[row.association].push_back(association);
    }
};

TEST_F(Paired_Lists, ArriveAndGoAsTheyAre)
{
    for (const Pair_Row& row : pair_rows) {
        SCOPED_TRACE(row.association);
        managers_script.clear();
        add(row, "b", "x");
        add(row, "a", "y");
        add(row, "b", "x");
        const std::string roles = std::string(row.first_role) + " " + row.second_role;
        expect(row.association, roles, "b x, a y, b x", {"DBG Returning instances"});
        EXPECT_EQ(Lines{row.association}, enumerate(row.association, roles).fetched);
    }
}

} // namespace
} // namespace KPRV
