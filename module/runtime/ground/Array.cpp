#include "module/runtime/ground/Array.h"

#include "module/runtime/ground/Answer_Blocks.h"
#include "module/runtime/ground/empty_arrays.h"

#include <algorithm>
#include <cstring>
#include <functional>
#include <limits>
#include <new>

namespace KPRV {

namespace {

/// The head, and on either word size what the elements' alignment leaves free behind it.
constexpr size_t BLOCK_EXTRA = 24;
static_assert(__ARRAY_HEAD <= BLOCK_EXTRA);

char* element(__Array_Rep* rep, uint32 i)
{
    return static_cast<char*>(__data(rep)) + size_t(i) * rep->traits->size;
}

const char* element(const __Array_Rep* rep, uint32 i)
{
    return element(const_cast<__Array_Rep*>(rep), i);
}

/// Throws `std::bad_alloc` for a block that no word size can address.
size_t block_size(const __Array_Traits* traits, uint32 capacity)
{
    const uint64 size = uint64(capacity) * traits->size + BLOCK_EXTRA;
    if (size > std::numeric_limits<size_t>::max())
        throw std::bad_alloc();
    return static_cast<size_t>(size);
}

__Array_Rep* allocate(const __Array_Traits* traits, uint32 capacity)
{
    return new (take_block(block_size(traits, capacity))) __Array_Rep{traits, 0, capacity};
}

void construct_elements(const __Array_Traits* traits, void* dest, const void* src, uint32 n)
{
    if (!traits->construct) {
        if (n)
            memcpy(dest, src, size_t(n) * traits->size);
        return;
    }
    char* to = static_cast<char*>(dest);
    const char* from = static_cast<const char*>(src);
    for (uint32 i = 0; i < n; i++, to += traits->size, from += traits->size)
        traits->construct(to, from);
}

void destruct_elements(__Array_Rep* rep, uint32 pos, uint32 n)
{
    if (!rep->traits->destruct)
        return;
    for (uint32 i = 0; i < n; i++)
        rep->traits->destruct(element(rep, pos + i));
}

bool element_equal(const __Array_Traits* traits, const void* a, const void* b)
{
    return traits->equal ? traits->equal(a, b) : memcmp(a, b, traits->size) == 0;
}

/// An array without elements.
__Array_Rep* make_empty(const __Array_Traits* traits, uint32 capacity)
{
    __Array_Rep* shared = empty_array_of(traits, capacity);
    return shared ? shared : allocate(traits, capacity);
}

__Array_Rep* make(const __Array_Traits* traits, const void* data, uint32 n)
{
    if (n == 0)
        return make_empty(traits, 0);
    __Array_Rep* rep = allocate(traits, n);
    construct_elements(traits, __data(rep), data, n);
    rep->size = n;
    return rep;
}

/// Before something is written: a block of the array's own with room for n elements. Exactly n, not a
/// doubled figure: a cell in an instance is filled once and lives long.
void make_room(__Array_Rep*& rep, uint64 wanted)
{
    if (wanted > NPOS)
        throw std::bad_alloc();
    const uint32 n = static_cast<uint32>(wanted);
    if (is_empty_array(rep)) {
        rep = allocate(rep->traits, std::max(n, rep->capacity));
    } else if (is_lasting(rep)) {
        __Array_Rep* const own = allocate(rep->traits, std::max(n, rep->size));
        construct_elements(rep->traits, __data(own), __data(rep), rep->size);
        own->size = rep->size;
        rep = own;
    } else if (rep->capacity < n) {
        rep = static_cast<__Array_Rep*>(
            resize_block(rep, block_size(rep->traits, rep->capacity), block_size(rep->traits, n)));
        rep->capacity = n;
    }
}

/// Elements given to an array may be its own, which a growing block would leave behind.
bool is_own(const __Array_Rep* rep, const void* data)
{
    return !std::less<const void*>()(data, element(rep, 0)) &&
           std::less<const void*>()(data, element(rep, rep->size));
}

} // namespace

void __construct(__Array_Rep*& rep, const __Array_Traits* traits)
{
    rep = make_empty(traits, FIRST_CAPACITY);
}

void __construct(__Array_Rep*& rep, const __Array_Traits* traits, const void* data, uint32 n)
{
    rep = make(traits, data, n);
}

void __destruct(__Array_Rep* rep)
{
    if (is_empty_array(rep) || is_lasting(rep))
        return;
    destruct_elements(rep, 0, rep->size);
    give_block(rep);
}

__Array_Rep* _clone(const __Array_Rep* rep)
{
    if (is_lasting(rep))
        return const_cast<__Array_Rep*>(rep);
    return make(rep->traits, __data(rep), rep->size);
}

void __assign(__Array_Rep*& rep, __Array_Rep* const& other)
{
    // The handles tell, since arrays that never held an element may share a block: the clone of a fresh one
    // has no capacity, and one that is given to itself keeps what it has.
    if (&rep == &other)
        return;
    __Array_Rep* old = rep;
    rep = _clone(other);
    __destruct(old);
}

void __assign(__Array_Rep*& rep, const void* data, uint32 n)
{
    __Array_Rep* old = rep;
    rep = make(old->traits, data, n);
    __destruct(old);
}

void __reserve(__Array_Rep*& rep, uint32 n)
{
    if (rep->capacity < n)
        make_room(rep, n);
}

void __insert(__Array_Rep*& rep, uint32 pos, const void* data, uint32 n)
{
    if (n == 0)
        return;
    if (is_own(rep, data)) {
        __Array_Rep* aside = make(rep->traits, data, n);
        __insert(rep, pos, __data(aside), n);
        __destruct(aside);
        return;
    }
    pos = std::min(pos, rep->size);
    make_room(rep, uint64(rep->size) + n);
    memmove(element(rep, pos + n), element(rep, pos), size_t(rep->size - pos) * rep->traits->size);
    construct_elements(rep->traits, element(rep, pos), data, n);
    rep->size += n;
}

void __append(__Array_Rep*& rep, const void* data, uint32 n)
{
    __insert(rep, rep->size, data, n);
}

void __prepend(__Array_Rep*& rep, const void* data, uint32 n)
{
    __insert(rep, 0, data, n);
}

void __own(__Array_Rep*& rep)
{
    if (is_lasting(rep))
        make_room(rep, rep->size);
}

void __remove(__Array_Rep*& rep, uint32 pos, uint32 n)
{
    if (pos >= rep->size)
        return;
    __own(rep);
    const uint32 tail = rep->size - pos;
    n = std::min(n, tail);
    destruct_elements(rep, pos, n);
    memmove(element(rep, pos), element(rep, pos + n), size_t(tail - n) * rep->traits->size);
    rep->size -= n;
}

void __resize(__Array_Rep*& rep, uint32 n, const void* fill)
{
    if (n <= rep->size) {
        __remove(rep, n, rep->size - n);
        return;
    }
    if (fill && is_own(rep, fill)) {
        __Array_Rep* aside = make(rep->traits, fill, 1);
        __resize(rep, n, __data(aside));
        __destruct(aside);
        return;
    }
    make_room(rep, n);
    if (!fill || !rep->traits->construct)
        memset(element(rep, rep->size), 0, size_t(n - rep->size) * rep->traits->size);
    else
        for (uint32 i = rep->size; i < n; i++)
            rep->traits->construct(element(rep, i), fill);
    rep->size = n;
}

uint32 __find(const __Array_Rep* rep, const void* wanted)
{
    for (uint32 i = 0; i < rep->size; i++) {
        if (element_equal(rep->traits, element(rep, i), wanted))
            // Callers of raw elements rely on a yes, not a place.
            return rep->traits->equal ? i : 1;
    }
    return NPOS;
}

bool __equal(const __Array_Rep* a, const __Array_Rep* b)
{
    if (a->size != b->size)
        return false;
    if (!a->traits->equal)
        return memcmp(__data(a), __data(b), size_t(a->size) * a->traits->size) == 0;
    for (uint32 i = 0; i < a->size; i++) {
        if (!a->traits->equal(element(a, i), element(b, i)))
            return false;
    }
    return true;
}

void __clear(__Array_Rep*& rep)
{
    __remove(rep, 0, rep->size);
}

} // namespace KPRV
