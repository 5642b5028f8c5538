#include "tests/module/schema/Catalogue_View.h"

#include <gtest/gtest.h>

using namespace KPRV;
using namespace KPRV::catalogue_view;

namespace {

struct Association_Row
{
    const char* name;
    std::string marks;
    std::string references;
};

const Association_Row association_rows[] = {
#include "tests/module/schema/associations.inc"
};

TEST(Associations, ReferToTheirTargets)
{
    ASSERT_EQ(std::size(association_rows), 41u);
    for (const Association_Row& row : association_rows) {
        SCOPED_TRACE(row.name);
        const Meta_Class& meta_class = find(row.name);
        EXPECT_TRUE(meta_class.flags & FLAG_ASSOCIATION);
        EXPECT_EQ(flags(meta_class.flags & ~FLAG_ASSOCIATION, " "), row.marks);
        std::string references;
        for (uint32 i = 0; i < meta_class.num_meta_features; i++) {
            const Meta_Feature& feature = *meta_class.meta_features[i];
            if (!(feature.flags & FLAG_REFERENCE))
                continue;
            EXPECT_TRUE(feature.flags & FLAG_KEY) << feature.name;
            const uint32 marks = feature.flags & ~(FLAG_REFERENCE | FLAG_KEY);
            references += (references.empty() ? "" : "; ") + std::string(feature.name) + " to " +
                          type(feature) + (marks ? " " + flags(marks) : "");
        }
        EXPECT_EQ(references, row.references);
    }
}

TEST(Associations, AllProductAssociationsAreListed)
{
    size_t count = 0;
    for (const Meta_Class* meta_class : classes())
        count +=
            std::string(meta_class->name).starts_with("KALDERA_") && (meta_class->flags & FLAG_ASSOCIATION);
    EXPECT_EQ(count, std::size(association_rows));
}

TEST(Associations, HostedAccessPointDeclaresNothingItself)
{
    EXPECT_TRUE(own_features(find("KALDERA_HostedAccessPoint")).empty());
}

} // namespace
