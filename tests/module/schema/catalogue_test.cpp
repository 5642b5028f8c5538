#include "tests/module/schema/Catalogue_View.h"

#include <fstream>
#include <gtest/gtest.h>
#include <sstream>

using namespace KPRV;
using namespace KPRV::catalogue_view;

namespace {

std::string contents(const std::string& path)
{
    std::ifstream stream(path);
    std::ostringstream text;
    text << stream.rdbuf();
    return text.str();
}

/// One golden file: what of the catalogue it holds. Together they hold every class and every method once.
struct Golden
{
    const char* file;
    std::string text;
};

std::vector<Golden> goldens()
{
    std::vector<Golden> all = {{"devices.txt", ""},
                               {"elements.txt", ""},
                               {"associations.txt", ""},
                               {"product.txt", ""},
                               {"methods.txt", ""}};
    const Meta_Class& enabled = find("CIM_EnabledLogicalElement");
    for (const Meta_Class* meta_class : classes()) {
        const bool product = std::string(meta_class->name).starts_with("KALDERA_");
        const bool association = meta_class->flags & FLAG_ASSOCIATION;
        const size_t index = product ? 3 : association ? 2 : is_subclass(&enabled, meta_class) ? 0 : 1;
        all[index].text += describe(*meta_class);
        for (const Meta_Feature* feature : own_features(*meta_class))
            if (feature->flags & FLAG_METHOD)
                all[4].text += describe(meta_class->name, as_method(*feature));
    }
    return all;
}

uint64 digest(const std::string& text)
{
    uint64 hash = 14695981039346656037u;
    for (const unsigned char c : text)
        hash = (hash ^ c) * 1099511628211u;
    return hash;
}

// A changed schema has to be seen in a review: its text form is kept beside this test. On a difference the
// new form is left in the folder where the test runs.
TEST(Catalogue, ReadsAsTheGoldenFilesSay)
{
    for (const Golden& golden : goldens()) {
        SCOPED_TRACE(golden.file);
        const bool same = contents(std::string(KLDR_CATALOGUE_DIR "/") + golden.file) == golden.text;
        EXPECT_TRUE(same) << "the catalogue as it is now: " << golden.file << " in the current folder";
        if (!same)
            std::ofstream(golden.file) << golden.text;
    }
}

TEST(Catalogue, HasTheKnownDigest)
{
    std::string whole;
    for (const Golden& golden : goldens())
        whole += golden.text;
    EXPECT_EQ(digest(whole), 2637277150267183230u);
}

} // namespace
