// Names of the instances of every class of the catalogue, there and back.
#include "module/runtime/objects/Model_Path.h"

#include "module/runtime/ground/type_dispatch.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/objects/features.h"
#include "tests/module/schema/Catalogue_View.h"

#include <gtest/gtest.h>

#include <random>
#include <set>
#include <type_traits>

using namespace KPRV;
using namespace KPRV::catalogue_view;

namespace {

std::mt19937_64 dice(20261121);

/// Any bytes but those that a written text does not tell apart.
String random_text()
{
    String text;
    for (size_t length = dice() % 24; length > 0; length--) {
        const char c = static_cast<char>(1 + dice() % 255);
        text.append(c == '"' || c == '\\' ? '.' : c);
    }
    return text;
}

template <class T>
void roll(T& cell)
{
    if constexpr (std::is_same_v<T, String>)
        cell = random_text();
    else if constexpr (std::is_same_v<T, boolean>)
        cell = dice() % 2 != 0;
    else if constexpr (std::is_integral_v<T>)
        // What is read is signed, so that the upper half of 64 bits does not come back.
        cell = static_cast<T>(std::is_same_v<T, uint64> ? dice() >> 1 : dice());
}

/// Why the name of an instance of the class does not come back, or null if it does.
const char* what_is_in_the_way(const Meta_Class* meta_class, int nesting = 0)
{
    if (meta_class->num_keys == 0)
        return "no keys";
    for (const Meta_Feature* feature : features_of(meta_class)) {
        if (!is_key(feature))
            continue;
        const char* reason =
            visit_feature(feature, Overloaded{
                                       [](Scalar_Feature f) -> const char* {
                                           return f.type() == REAL32 || f.type() == REAL64 ||
                                                          f.type() == CHAR16 || f.type() == DATETIME
                                                      ? "a type without a form"
                                                      : nullptr;
                                       },
                                       [&](Reference_Feature f) -> const char* {
                                           // The quotes of a name within a name within a name are not told
                                           // apart.
                                           return nesting > 0
                                                      ? "nested twice"
                                                      : what_is_in_the_way(f.meta->meta_class, nesting + 1);
                                       },
                                       [](auto) -> const char* { return "an array"; },
                                   });
        if (reason)
            return reason;
    }
    return nullptr;
}

Ref<Instance> random_instance(const Meta_Class* meta_class)
{
    Ref<Instance> instance(create(meta_class, false));
    for (const Meta_Feature* feature : features_of(meta_class)) {
        if (!is_key(feature))
            continue;
        visit_feature(feature, Overloaded{
                                   [&](Scalar_Feature f) {
                                       visit_type(f.type(), [&](auto tag) {
                                           using T = typename decltype(tag)::type;
                                           roll(*static_cast<T*>(f.value(instance.ptr())));
                                       });
                                   },
                                   [&](Reference_Feature f) {
                                       f.target(instance.ptr()) = random_instance(f.meta->meta_class).steal();
                                   },
                                   [](auto) {},
                               });
    }
    return instance;
}

TEST(Model_Paths, OfEveryClassComeBackAsTheyWere)
{
    std::set<std::string> one_way;
    size_t classes_that_do = 0;
    for (const Meta_Class* meta_class : classes()) {
        if (const char* reason = what_is_in_the_way(meta_class)) {
            one_way.insert(reason);
            continue;
        }
        classes_that_do++;
        for (int i = 0; i < 50; i++) {
            const Ref<Instance> instance = random_instance(meta_class);
            String text, again;
            ASSERT_EQ(0, instance_to_model_path(instance.ptr(), text)) << meta_class->name;
            const Ref<Instance> back(model_path_to_instance(classes()[0], text.c_str()));
            ASSERT_TRUE(back) << text.c_str();
            ASSERT_EQ(0, instance_to_model_path(back.ptr(), again));
            ASSERT_EQ(std::string(text.c_str()), again.c_str());
            EXPECT_EQ(instance->__meta_class, back->__meta_class);
            EXPECT_TRUE(key_eq(instance.ptr(), back.ptr())) << text.c_str();
        }
    }
    // Abstract classes have no keys; every other one has a name that comes back.
    EXPECT_EQ(std::set<std::string>{"no keys"}, one_way);
    EXPECT_GT(classes_that_do, 100u);
}

TEST(Model_Paths, OfClassesWithoutKeysAreNone)
{
    for (const Meta_Class* meta_class : classes()) {
        if (meta_class->num_keys != 0)
            continue;
        const Ref<Instance> instance(create(meta_class, true));
        String text;
        EXPECT_EQ(-1, instance_to_model_path(instance.ptr(), text)) << meta_class->name;
        EXPECT_TRUE(text.empty());
    }
}

} // namespace
