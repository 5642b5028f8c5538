#pragma once

#include "tests/module/runtime/objects/sample_classes.h"

#include "module/runtime/objects/Ref.h"
#include "module/runtime/objects/features.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <type_traits>

namespace KPRV {

/// Values of each type, different for 0 and 1; the first is not zero either.
template <class T>
T sample_value(int i)
{
    if constexpr (std::is_same_v<T, String>)
        return String(i ? "one" : "none");
    else if constexpr (std::is_same_v<T, Datetime>)
        return Datetime(static_cast<uint64>(100 + i), 60);
    else if constexpr (std::is_same_v<T, boolean>)
        return i != 0;
    else
        return static_cast<T>(100 + i);
}

template <class T>
Array<T> sample_array(int i)
{
    Array<T> result;
    result.append(sample_value<T>(i));
    result.append(sample_value<T>(1));
    return result;
}

inline Ref<Sample_Types> make_types(int i)
{
    Ref<Sample_Types> result(create<Sample_Types>(false));
    result->Id.set(String("id"));
#define X(TYPE, CODE)                                                                                        \
    result->Scalar_##CODE.set(sample_value<TYPE>(i));                                                        \
    result->Array_##CODE.set(sample_array<TYPE>(i));
    SAMPLE_TYPES(X)
#undef X
    return result;
}

inline Sample_Element* make_element(const char* name)
{
    Sample_Element* result = create<Sample_Element>(true);
    result->Name.set(String(name));
    return result;
}

/// A port has its number for a second key.
inline Sample_Port* make_port(const char* name, uint64 number = 0)
{
    Sample_Port* result = create<Sample_Port>(true);
    result->Name.set(String(name));
    result->Number.set(number);
    return result;
}

/// A leader, and two members with a gap between them.
inline Ref<Sample_Group> make_group(const char* name)
{
    Ref<Sample_Group> result(create<Sample_Group>(true));
    result->Name.set(String(name));
    result->Leader = make_element("leader");
    result->Members.value.append(make_port("member", 1));
    result->Members.value.append(nullptr);
    result->Members.value.append(make_port("member", 2));
    return result;
}

/// A bare class as one made at run time, with a count of 1 that belongs to the caller.
inline Meta_Class* make_counted_class(const char* name)
{
    Meta_Class* record = static_cast<Meta_Class*>(calloc(1, sizeof(Meta_Class)));
    record->refs = 1;
    record->flags = FLAG_CLASS;
    record->name = strdup(name);
    record->size = sizeof(Instance);
    return record;
}

/// Every cell holds the zero of its type and the null byte.
inline void expect_zero_cells(const Sample_Types* x, uint8 null)
{
#define X(TYPE, CODE)                                                                                        \
    EXPECT_TRUE(x->Scalar_##CODE.value == TYPE()) << #CODE;                                                  \
    EXPECT_EQ(null, x->Scalar_##CODE.null) << #CODE;                                                         \
    EXPECT_EQ(0u, x->Array_##CODE.value.size()) << #CODE;                                                    \
    EXPECT_EQ(null, x->Array_##CODE.null) << #CODE;
    SAMPLE_TYPES(X)
#undef X
}

/// The null byte of each property with a cell, by a function of (feature, null byte).
template <class Function>
void for_each_null_byte(const Instance* instance, Function function)
{
    for (const Meta_Feature* feature : features_of(instance->__meta_class)) {
        visit_feature(feature, Overloaded{
                                   [](Reference_Feature) {},
                                   [](Method_Feature) {},
                                   [&](auto f) { function(feature, f.null(instance)); },
                               });
    }
}

} // namespace KPRV
