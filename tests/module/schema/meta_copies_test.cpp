// The catalogue's tables as data: every class can be copied, compared and shown.
#include "tests/module/schema/Catalogue_View.h"

#include "module/runtime/objects/meta_clone.h"
#include "module/runtime/objects/meta_identical.h"
#include "module/runtime/objects/print_meta_class.h"

#include <cstdlib>
#include <gtest/gtest.h>

using namespace KPRV;
using namespace KPRV::catalogue_view;

namespace {

std::string shown(const Meta_Class* meta_class, bool local_only)
{
    char* text = nullptr;
    size_t size = 0;
    FILE* file = open_memstream(&text, &size);
    fprint(file, meta_class, true, local_only);
    fclose(file);
    const std::string result(text, size);
    free(text);
    return result;
}

} // namespace

TEST(meta_copies, EveryClassIsIdenticalToItsCopyAndToNoOtherClass)
{
    const Meta_Class* before = nullptr;
    for (const Meta_Class* each : classes()) {
        SCOPED_TRACE(each->name);
        Meta_Class* const copy = clone(each);
        EXPECT_TRUE(identical(each, copy));
        EXPECT_EQ(describe(*each), describe(*copy));
        EXPECT_EQ(shown(each, false), shown(copy, false));
        EXPECT_FALSE(identical(before, copy));
        unref(copy);
        before = each;
    }
}

TEST(meta_copies, EveryClassShowsAllItsFeatures)
{
    for (const Meta_Class* each : classes()) {
        SCOPED_TRACE(each->name);
        const std::string all = shown(each, false);
        const std::string local = shown(each, true);
        EXPECT_TRUE(all.ends_with("};\n"));
        EXPECT_LE(local.size(), all.size());
        for (uint32 i = 0; i < each->num_meta_features; i++)
            EXPECT_NE(std::string::npos, all.find(std::string(" ") + each->meta_features[i]->name));
        for (const Meta_Feature* own : own_features(*each))
            EXPECT_NE(std::string::npos, local.find(std::string(" ") + own->name));
    }
}
