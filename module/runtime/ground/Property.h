#pragma once

#include "module/runtime/ground/Types.h"

#include <utility>

namespace KPRV {

/// Cell of a property in a generated class: the value, then the null byte right behind it.
template <class T>
struct Property
{
    T value;
    /// 1: no value; 0: a value.
    uint8 null;

    void set(const T& x)
    {
        value = x;
        null = 0;
    }
    void set(T&& x)
    {
        value = std::move(x);
        null = 0;
    }
};

} // namespace KPRV
