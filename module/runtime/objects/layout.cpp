// Pins the layouts that generated tables, generated classes and other builds of this module rely on.

#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/Datetime.h"
#include "module/runtime/ground/Property.h"
#include "module/runtime/objects/Container.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/objects/Value.h"
#include "module/runtime/text/Buffer.h"

namespace KPRV {

namespace {

constexpr size_t WORD = sizeof(void*);

/// The figure of the word size in hand.
constexpr size_t at(size_t on_32, size_t on_64)
{
    return WORD == 4 ? on_32 : on_64;
}

} // namespace

#define PIN(RECORD, FIELD, ON_32, ON_64) static_assert(offsetof(RECORD, FIELD) == at(ON_32, ON_64))
#define PIN_SIZE(RECORD, ON_32, ON_64) static_assert(sizeof(RECORD) == at(ON_32, ON_64))

// clang-format off
PIN(String_Rep, refs, 0, 0);
PIN(String_Rep, size, 4, 4);
PIN(String_Rep, cap,  8, 8);
PIN(String_Rep, data, 12, 12);
PIN_SIZE(String,   4, 8);
PIN_SIZE(Datetime, 4, 8);
PIN_SIZE(Array<String>, 4, 8);
PIN_SIZE(Ref<Instance>, 4, 8);

PIN(__Array_Traits, size,      0,  0);
PIN(__Array_Traits, construct, 4,  8);
PIN(__Array_Traits, destruct,  8,  16);
PIN(__Array_Traits, equal,     12, 24);
PIN(__Array_Rep, traits,   0, 0);
PIN(__Array_Rep, size,     4, 8);
PIN(__Array_Rep, capacity, 8, 12);
static_assert(__ARRAY_HEAD == at(16, 24));
PIN_SIZE(Buffer, 12, 16);

PIN(Datetime_Rep, refs,         0,  0);
PIN(Datetime_Rep, usec,         4,  8);
PIN(Datetime_Rep, offset,       12, 16);
PIN(Datetime_Rep, is_timestamp, 16, 20);
PIN_SIZE(Datetime_Rep, 20, 24);

PIN(Meta_Feature, refs,                0,  0);
PIN(Meta_Feature, flags,               4,  4);
PIN(Meta_Feature, name,                8,  8);
PIN(Meta_Feature, meta_qualifiers,     12, 16);
PIN(Meta_Feature, num_meta_qualifiers, 16, 24);

PIN(Meta_Property, type,      20, 32);
PIN(Meta_Property, subscript, 22, 34);
PIN(Meta_Property, offset,    24, 36);
PIN(Meta_Property, value,     28, 40);
PIN_SIZE(Meta_Property, 32, 48);

PIN(Meta_Reference, subscript,  20, 32);
PIN(Meta_Reference, meta_class, 24, 40);
PIN(Meta_Reference, offset,     28, 48);
PIN_SIZE(Meta_Reference, 32, 56);

PIN(Meta_Class, meta_features,     20, 32);
PIN(Meta_Class, num_meta_features, 24, 40);
PIN(Meta_Class, size,              28, 44);
PIN(Meta_Class, locals,            32, 48);
PIN(Meta_Class, super_meta_class,  36, 56);
PIN(Meta_Class, num_keys,          40, 64);
PIN(Meta_Class, meta_repository,   44, 72);
PIN_SIZE(Meta_Class, 48, 80);

PIN(Meta_Method, meta_features,     20, 32);
PIN(Meta_Method, num_meta_features, 24, 40);
PIN(Meta_Method, size,              28, 44);
PIN(Meta_Method, return_type,       32, 48);
PIN_SIZE(Meta_Method, 36, 56);

PIN(Meta_Qualifier, refs,      0,  0);
PIN(Meta_Qualifier, name,      4,  8);
PIN(Meta_Qualifier, type,      8,  16);
PIN(Meta_Qualifier, subscript, 9,  17);
PIN(Meta_Qualifier, value,     12, 24);
PIN_SIZE(Meta_Qualifier, 16, 32);

static_assert(offsetof(decltype(Meta_Value::array_value), elements)     == 0);
static_assert(offsetof(decltype(Meta_Value::array_value), num_elements) == WORD);
PIN_SIZE(Meta_Value, 8, 16);

PIN(Meta_Repository, meta_classes,     0, 0);
PIN(Meta_Repository, num_meta_classes, 4, 8);

PIN(Instance, __magic,      0,  0);
PIN(Instance, __refs,       4,  4);
PIN(Instance, __meta_class, 8,  8);
PIN(Instance, __name_space, 12, 16);
PIN_SIZE(Instance, 16, 24);

PIN(Value, type, 0, 0);
PIN(Value, null, 4, 4);
PIN_SIZE(Value, 16, 16);

/// The table of functions, then the repository.
PIN_SIZE(Container, 8, 16);

// The null byte stands right behind the value.
template <class T, Type CODE>
constexpr bool null_follows = offsetof(Property<T>, null) == sizeof(T) && sizeof(T) == at(
    CODE == STRING || CODE == DATETIME ? 4 : sizeof(T), CODE == STRING || CODE == DATETIME ? 8 : sizeof(T));
static_assert(null_follows<boolean, BOOLEAN> && null_follows<uint8, UINT8>   && null_follows<sint8, SINT8>);
static_assert(null_follows<uint16, UINT16>   && null_follows<sint16, SINT16> && null_follows<char16, CHAR16>);
static_assert(null_follows<uint32, UINT32>   && null_follows<sint32, SINT32> && null_follows<real32, REAL32>);
static_assert(null_follows<uint64, UINT64>   && null_follows<sint64, SINT64> && null_follows<real64, REAL64>);
static_assert(null_follows<String, STRING>   && null_follows<Datetime, DATETIME>);
static_assert(offsetof(Property<Array<uint64>>, null) == WORD);
// clang-format on

} // namespace KPRV
