#include "runtime/Array_Traits.h"

#include "runtime/Datetime.h"
#include "runtime/String.h"

namespace KPRV {

namespace {

using Raw = __Array_Traits;

constexpr Raw _boolean_traits = {sizeof(boolean), nullptr, nullptr, nullptr};
constexpr Raw _uint8_traits = {sizeof(uint8), nullptr, nullptr, nullptr};
constexpr Raw _uint16_traits = {sizeof(uint16), nullptr, nullptr, nullptr};
constexpr Raw _uint32_traits = {sizeof(uint32), nullptr, nullptr, nullptr};
constexpr Raw _uint64_traits = {sizeof(uint64), nullptr, nullptr, nullptr};

/// Reals have only an equal function, so that a NaN differs from itself and the two zeros are the same.
template <class T>
bool equal_as(const void* a, const void* b)
{
    return *static_cast<const T*>(a) == *static_cast<const T*>(b);
}

constexpr Raw _real32_traits = {sizeof(real32), nullptr, nullptr, equal_as<real32>};
constexpr Raw _real64_traits = {sizeof(real64), nullptr, nullptr, equal_as<real64>};

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

constexpr Raw _String_traits = {sizeof(String), construct_as<String>, destruct_as<String>, equal_as<String>};
constexpr Raw _Datetime_traits = {sizeof(Datetime), construct_as<Datetime>, destruct_as<Datetime>,
                                  equal_as<Datetime>};

} // namespace

constinit const __Array_Traits* const __cim_array_traits[NUM_TYPES] = {
    &_boolean_traits, &_uint8_traits,  &_uint8_traits,  &_uint16_traits,   &_uint16_traits,
    &_uint32_traits,  &_uint32_traits, &_uint64_traits, &_uint64_traits,   &_real32_traits,
    &_real64_traits,  &_uint16_traits, &_String_traits, &_Datetime_traits,
};

} // namespace KPRV
