#include "module/runtime/ground/Array_Traits.h"

#include "module/runtime/ground/Datetime.h"
#include "module/runtime/ground/String.h"
#include "module/runtime/ground/empty_arrays.h"

namespace KPRV {

namespace {

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
    _pointer_traits,
    NUM_KINDS,
};
static_assert(NUM_KINDS == ELEMENT_KINDS);

constexpr Empty_Arrays make(Index index, __Array_Traits traits)
{
    return {traits,
            {{&empty_arrays[index].traits, 0, FIRST_CAPACITY}, {}},
            {{&empty_arrays[index].traits, 0, 0}, {}}};
}

template <class T>
constexpr Empty_Arrays bytes(Index index)
{
    return make(index, {sizeof(T), nullptr, nullptr, nullptr});
}

template <class T>
constexpr Empty_Arrays reals(Index index)
{
    return make(index, {sizeof(T), nullptr, nullptr, equal_as<T>});
}

template <class T>
constexpr Empty_Arrays handles(Index index)
{
    return make(index, {sizeof(T), construct_as<T>, destruct_as<T>, equal_as<T>});
}

} // namespace

constinit const Empty_Arrays empty_arrays[ELEMENT_KINDS] = {
    bytes<boolean>(_boolean_traits), bytes<uint8>(_uint8_traits),     bytes<uint16>(_uint16_traits),
    bytes<uint32>(_uint32_traits),   bytes<uint64>(_uint64_traits),   reals<real32>(_real32_traits),
    reals<real64>(_real64_traits),   handles<String>(_String_traits), handles<Datetime>(_Datetime_traits),
    bytes<void*>(_pointer_traits),
};

constinit const __Array_Traits* const __pointer_array_traits = &empty_arrays[_pointer_traits].traits;

constinit const __Array_Traits* const __cim_array_traits[NUM_TYPES] = {
    &empty_arrays[_boolean_traits].traits, &empty_arrays[_uint8_traits].traits,
    &empty_arrays[_uint8_traits].traits,   &empty_arrays[_uint16_traits].traits,
    &empty_arrays[_uint16_traits].traits,  &empty_arrays[_uint32_traits].traits,
    &empty_arrays[_uint32_traits].traits,  &empty_arrays[_uint64_traits].traits,
    &empty_arrays[_uint64_traits].traits,  &empty_arrays[_real32_traits].traits,
    &empty_arrays[_real64_traits].traits,  &empty_arrays[_uint16_traits].traits,
    &empty_arrays[_String_traits].traits,  &empty_arrays[_Datetime_traits].traits,
};

__Array_Rep* empty_array_of(const __Array_Traits* traits, uint32 capacity)
{
    if (!is_of_empty_arrays(traits) || (capacity != 0 && capacity != FIRST_CAPACITY))
        return nullptr;
    const Empty_Arrays* record = reinterpret_cast<const Empty_Arrays*>(traits);
    return const_cast<__Array_Rep*>(capacity == 0 ? &record->none.head : &record->fresh.head);
}

} // namespace KPRV
