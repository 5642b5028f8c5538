#pragma once

#include "module/runtime/ground/Array.h"

#include <initializer_list>

namespace KPRV {

/// Elements that never change, for arrays of many instances: to set one costs no allocation. It outlives
/// them, as a static of whoever builds them does.
template <class T>
class Lasting_Array
{
public:
    Lasting_Array(std::initializer_list<T> elements)
        : _array(elements.begin(), static_cast<uint32>(elements.size()))
    {
        rep()->capacity = 0;
    }
    ~Lasting_Array() { rep()->capacity = rep()->size; }
    Lasting_Array(const Lasting_Array&) = delete;
    Lasting_Array& operator=(const Lasting_Array&) = delete;

    operator const Array<T>&() const { return _array; }

private:
    __Array_Rep* rep() { return reinterpret_cast<__Array&>(_array).rep; }

    Array<T> _array;
};

} // namespace KPRV
