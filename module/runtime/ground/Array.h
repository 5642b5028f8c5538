#pragma once

#include "module/runtime/ground/Array_Traits.h"

#include <utility>

namespace KPRV {

/// Head of an array block. The elements follow at `__ARRAY_HEAD`.
struct __Array_Rep
{
    const __Array_Traits* traits;
    uint32 size;
    uint32 capacity;
};

/// True for the block of a `Lasting_Array`, which has less room than elements, so that nothing fits into it:
/// copies share it, nobody but its owner frees it, and whatever would write takes a block of its own first.
inline bool is_lasting(const __Array_Rep* rep)
{
    return rep->capacity < rep->size;
}

/// Where the elements begin: 16 on 32-bit platforms, 24 on 64-bit ones (a word behind the head stays free).
inline constexpr size_t __ARRAY_HEAD = sizeof(void*) == 4 ? 16 : 24;

// The type-erased functions behind every array. They take the address of the handle where the block may
// move. Positions and counts beyond the end are cut to it.
void __construct(__Array_Rep*& rep, const __Array_Traits* traits);
void __construct(__Array_Rep*& rep, const __Array_Traits* traits, const void* data, uint32 n);
void __destruct(__Array_Rep* rep);
__Array_Rep* _clone(const __Array_Rep* rep);
void __assign(__Array_Rep*& rep, __Array_Rep* const& other);
void __assign(__Array_Rep*& rep, const void* data, uint32 n);
/// Room for exactly n elements. Repeated appends reallocate each time beyond the first 8: memory before
/// speed.
void __reserve(__Array_Rep*& rep, uint32 n);
void __insert(__Array_Rep*& rep, uint32 pos, const void* data, uint32 n);
void __append(__Array_Rep*& rep, const void* data, uint32 n);
void __prepend(__Array_Rep*& rep, const void* data, uint32 n);
void __remove(__Array_Rep*& rep, uint32 pos, uint32 n);
/// A null fill, or traits without construct, zeroes new elements.
void __resize(__Array_Rep*& rep, uint32 n, const void* fill);
/// Index of the first equal element, `NPOS` if absent. Without an equal function a match answers 1, whatever
/// its index: callers rely on the answer being a yes, not a place.
uint32 __find(const __Array_Rep* rep, const void* element);
bool __equal(const __Array_Rep* a, const __Array_Rep* b);
void __clear(__Array_Rep*& rep);
/// Gives a handle on a lasting block a block of its own.
void __own(__Array_Rep*& rep);

inline void* __data(__Array_Rep* rep)
{
    return reinterpret_cast<char*>(rep) + __ARRAY_HEAD;
}
inline const void* __data(const __Array_Rep* rep)
{
    return reinterpret_cast<const char*>(rep) + __ARRAY_HEAD;
}

/// The untyped handle as it lies in an instance: generic code works on this.
struct __Array
{
    __Array_Rep* rep;
};

/// Vector of T over one pointer. Copies clone the elements; nothing that can be written is shared. Elements
/// move by their bytes when a block grows. An array may be given its own elements.
template <class T>
class Array
{
public:
    Array() { __construct(_rep, __Array_Traits_Factory<T>::traits()); }
    Array(const Array& x) : _rep(_clone(x._rep)) {}
    /// Where no empty block is shared, one is made, and the move fails without memory.
    Array(Array&& x) noexcept(__Array_Traits_Factory<T>::SHARES_EMPTY) : Array() { std::swap(_rep, x._rep); }
    Array(const T* data, uint32 n) { __construct(_rep, __Array_Traits_Factory<T>::traits(), data, n); }
    ~Array() { __destruct(_rep); }

    Array& operator=(const Array& x)
    {
        __assign(_rep, x._rep);
        return *this;
    }
    Array& operator=(Array&& x) noexcept
    {
        std::swap(_rep, x._rep);
        return *this;
    }
    void assign(const T* data, uint32 n) { __assign(_rep, data, n); }

    uint32 size() const { return _rep->size; }
    uint32 capacity() const { return _rep->capacity; }
    bool empty() const { return _rep->size == 0; }
    T* data()
    {
        if (is_lasting(_rep)) [[unlikely]]
            __own(_rep);
        return static_cast<T*>(__data(_rep));
    }
    const T* data() const { return static_cast<const T*>(__data(const_cast<const __Array_Rep*>(_rep))); }
    /// No bounds test.
    T& operator[](uint32 i) { return data()[i]; }
    const T& operator[](uint32 i) const { return data()[i]; }
    T* begin() { return data(); }
    T* end() { return data() + size(); }
    const T* begin() const { return data(); }
    const T* end() const { return data() + size(); }

    void reserve(uint32 n) { __reserve(_rep, n); }
    void append(const T& x) { __append(_rep, &x, 1); }
    void append(const T* data, uint32 n) { __append(_rep, data, n); }
    void prepend(const T& x) { __prepend(_rep, &x, 1); }
    void insert(uint32 pos, const T& x) { __insert(_rep, pos, &x, 1); }
    void remove(uint32 pos, uint32 n = 1) { __remove(_rep, pos, n); }
    /// New elements are copies of the fill only if T has a constructor; plain bytes become zero.
    void resize(uint32 n, const T& fill) { __resize(_rep, n, &fill); }
    void clear() { __clear(_rep); }
    /// See `__find`.
    uint32 find(const T& x) const { return __find(_rep, &x); }
    bool equal(const Array& x) const { return __equal(_rep, x._rep); }

private:
    __Array_Rep* _rep;
};

template <class T>
bool operator==(const Array<T>& a, const Array<T>& b)
{
    return a.equal(b);
}

} // namespace KPRV
