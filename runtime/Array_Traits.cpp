#include "runtime/Array_Traits.h"

#include "runtime/Datetime.h"
#include "runtime/String.h"
#include "runtime/empty_arrays.h"

#include <cstdint>

namespace KPRV {

namespace {

struct Empty_Block
{
    __Array_Rep head;
    /// So that the place of the elements still lies within it.
    char rest[__ARRAY_HEAD - sizeof(__Array_Rep) + 8];
};

/// Traits of a CIM type, and its arrays of no element: a fresh one and a clone of one.
struct Record
{
    __Array_Traits traits;
    Empty_Block fresh;
    Empty_Block none;
};

/// Reals have only an equal function, so that a NaN differs from itself and the two zeros are the same.
template <class T>
bool equal_as(const void* a, const void* b)
{
    return *static_cast<const T*>(a) == *static_cast<const T*>(b);
}

template <class T>
void construct_as(void* element, const void* from)
{
    new (element) T(*static_cast<const T*>(from));
}

template <class T>
void destruct_as(void* element)
{
    static_cast<T*>(element)->~T();
}

enum Index
{
    _boolean_traits,
    _uint8_traits,
    _uint16_traits,
    _uint32_traits,
    _uint64_traits,
    _real32_traits,
    _real64_traits,
    _String_traits,
    _Datetime_traits,
    NUM_RECORDS,
};

extern const Record records[NUM_RECORDS];

constexpr Record make(Index index, __Array_Traits traits)
{
    return {traits, {{&records[index].traits, 0, FIRST_CAPACITY}, {}}, {{&records[index].traits, 0, 0}, {}}};
}

template <class T>
constexpr Record bytes(Index index)
{
    return make(index, {sizeof(T), nullptr, nullptr, nullptr});
}

template <class T>
constexpr Record reals(Index index)
{
    return make(index, {sizeof(T), nullptr, nullptr, equal_as<T>});
}

template <class T>
constexpr Record handles(Index index)
{
    return make(index, {sizeof(T), construct_as<T>, destruct_as<T>, equal_as<T>});
}

constinit const Record records[NUM_RECORDS] = {
    bytes<boolean>(_boolean_traits), bytes<uint8>(_uint8_traits),     bytes<uint16>(_uint16_traits),
    bytes<uint32>(_uint32_traits),   bytes<uint64>(_uint64_traits),   reals<real32>(_real32_traits),
    reals<real64>(_real64_traits),   handles<String>(_String_traits), handles<Datetime>(_Datetime_traits),
};

bool is_within_records(const void* address)
{
    return reinterpret_cast<uintptr_t>(address) - reinterpret_cast<uintptr_t>(records) < sizeof(records);
}

} // namespace

constinit const __Array_Traits* const __cim_array_traits[NUM_TYPES] = {
    &records[_boolean_traits].traits, &records[_uint8_traits].traits,    &records[_uint8_traits].traits,
    &records[_uint16_traits].traits,  &records[_uint16_traits].traits,   &records[_uint32_traits].traits,
    &records[_uint32_traits].traits,  &records[_uint64_traits].traits,   &records[_uint64_traits].traits,
    &records[_real32_traits].traits,  &records[_real64_traits].traits,   &records[_uint16_traits].traits,
    &records[_String_traits].traits,  &records[_Datetime_traits].traits,
};

__Array_Rep* empty_array_of(const __Array_Traits* traits, uint32 capacity)
{
    if (!is_within_records(traits) || (capacity != 0 && capacity != FIRST_CAPACITY))
        return nullptr;
    const Record* record = reinterpret_cast<const Record*>(traits);
    return const_cast<__Array_Rep*>(capacity == 0 ? &record->none.head : &record->fresh.head);
}

bool is_empty_array(const __Array_Rep* rep)
{
    return is_within_records(rep);
}

} // namespace KPRV
