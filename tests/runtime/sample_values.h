#pragma once

#include "tests/runtime/sample_classes.h"

#include "runtime/Ref.h"
#include "runtime/features.h"

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

inline Sample_Port* make_port(const char* name, uint64 number)
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
