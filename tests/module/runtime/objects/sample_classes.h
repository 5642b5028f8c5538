#pragma once

// Classes and metadata written by hand, for tests that need some. What a generator would emit, in small.

#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/Datetime.h"
#include "module/runtime/ground/Property.h"
#include "module/runtime/objects/Instance.h"

#include <cstddef>
#include <iterator>

namespace KPRV {

/// X(C++ type, CIM type code) for each scalar type.
#define SAMPLE_TYPES(X)                                                                                      \
    X(boolean, BOOLEAN)                                                                                      \
    X(uint8, UINT8)                                                                                          \
    X(sint8, SINT8)                                                                                          \
    X(uint16, UINT16)                                                                                        \
    X(sint16, SINT16)                                                                                        \
    X(uint32, UINT32)                                                                                        \
    X(sint32, SINT32)                                                                                        \
    X(uint64, UINT64)                                                                                        \
    X(sint64, SINT64)                                                                                        \
    X(real32, REAL32)                                                                                        \
    X(real64, REAL64)                                                                                        \
    X(char16, CHAR16)                                                                                        \
    X(String, STRING)                                                                                        \
    X(Datetime, DATETIME)

extern const Meta_Repository sample_repository;

// Records of features, told apart by their flags.
#define SAMPLE_PROPERTY(CLASS, NAME, FLAGS, TYPE, SUBSCRIPT, DEFAULT)                                        \
    inline constexpr Meta_Property _##CLASS##_##NAME = {                                                     \
        {{0, FLAG_PROPERTY | (FLAGS), #NAME, nullptr, 0}}, TYPE, SUBSCRIPT, offsetof(CLASS, NAME), DEFAULT};
#define SAMPLE_REFERENCE(CLASS, NAME, FLAGS, SUBSCRIPT, TARGET)                                              \
    inline constexpr Meta_Reference _##CLASS##_##NAME = {{{0, FLAG_REFERENCE | (FLAGS), #NAME, nullptr, 0}}, \
                                                         SUBSCRIPT,                                          \
                                                         &TARGET::static_meta_class,                         \
                                                         offsetof(CLASS, NAME)};
#define SAMPLE_CLASS(CLASS, FLAGS, LOCALS, SUPER, NUM_KEYS)                                                  \
    inline constexpr Meta_Class CLASS::static_meta_class = {{{0, FLAGS, #CLASS, nullptr, 0}},                \
                                                            _##CLASS##_MFA,                                  \
                                                            std::size(_##CLASS##_MFA),                       \
                                                            sizeof(CLASS),                                   \
                                                            LOCALS,                                          \
                                                            SUPER,                                           \
                                                            NUM_KEYS,                                        \
                                                            &sample_repository};

// --- Sample_Types: one key, and a scalar and an array of every type, without defaults

struct Sample_Types : Instance
{
    Property<String> Id;
#define X(TYPE, CODE)                                                                                        \
    Property<TYPE> Scalar_##CODE;                                                                            \
    Property<Array<TYPE>> Array_##CODE;
    SAMPLE_TYPES(X)
#undef X
    static const Meta_Class static_meta_class;
};

SAMPLE_PROPERTY(Sample_Types, Id, FLAG_KEY, STRING, 0, nullptr)
#define X(TYPE, CODE)                                                                                        \
    SAMPLE_PROPERTY(Sample_Types, Scalar_##CODE, FLAG_READ, CODE, 0, nullptr)                                \
    SAMPLE_PROPERTY(Sample_Types, Array_##CODE, FLAG_READ, CODE, -1, nullptr)
SAMPLE_TYPES(X)
#undef X
inline constexpr const Meta_Feature* _Sample_Types_MFA[] = {&_Sample_Types_Id,
#define X(TYPE, CODE) &_Sample_Types_Scalar_##CODE, &_Sample_Types_Array_##CODE,
                                                            SAMPLE_TYPES(X)
#undef X
};
SAMPLE_CLASS(Sample_Types, FLAG_CLASS, nullptr, nullptr, 1)

// --- Sample_Element: a superclass with defaults of every shape, and a method

struct Sample_Element : Instance
{
    Property<String> Name;
    Property<uint16> EnabledState;
    Property<String> Caption;
    Property<Datetime> Timeout;
    Property<Array<uint32>> Codes;
    Property<Array<String>> Words;
    Property<Array<Datetime>> Pauses;
    static const Meta_Class static_meta_class;
};

struct Sample_Element_Reset_method : Instance
{
    Property<boolean> Force;
    Instance* Target;
    Property<uint32> Count;
    Property<String> Message;
    Property<uint32> return_value;
    static const Meta_Method static_meta_class;
};

inline constexpr uint32 sample_codes[] = {2, 3, 5};
inline constexpr const char* sample_words[] = {"OK", "Up"};
inline constexpr const char* sample_pauses[] = {"00000000000001.000000:000", "00000000000002.000000:000"};

inline constexpr Meta_Value _Sample_Element_EnabledState_MV = {.uint16_value = 5};
inline constexpr Meta_Value _Sample_Element_Caption_MV = {.string_value = "An element"};
inline constexpr Meta_Value _Sample_Element_Timeout_MV = {.string_value = "00000000000500.000000:000"};
inline constexpr Meta_Value _Sample_Element_Codes_MV = {.array_value = {sample_codes, 3}};
inline constexpr Meta_Value _Sample_Element_Words_MV = {.array_value = {sample_words, 2}};
inline constexpr Meta_Value _Sample_Element_Pauses_MV = {.array_value = {sample_pauses, 2}};

SAMPLE_PROPERTY(Sample_Element, Name, FLAG_KEY | FLAG_READ, STRING, 0, nullptr)
SAMPLE_PROPERTY(Sample_Element, EnabledState, FLAG_READ, UINT16, 0, &_Sample_Element_EnabledState_MV)
SAMPLE_PROPERTY(Sample_Element, Caption, FLAG_READ, STRING, 0, &_Sample_Element_Caption_MV)
SAMPLE_PROPERTY(Sample_Element, Timeout, FLAG_READ, DATETIME, 0, &_Sample_Element_Timeout_MV)
SAMPLE_PROPERTY(Sample_Element, Codes, FLAG_READ, UINT32, -1, &_Sample_Element_Codes_MV)
SAMPLE_PROPERTY(Sample_Element, Words, FLAG_READ, STRING, -1, &_Sample_Element_Words_MV)
SAMPLE_PROPERTY(Sample_Element, Pauses, FLAG_READ, DATETIME, -1, &_Sample_Element_Pauses_MV)

SAMPLE_PROPERTY(Sample_Element_Reset_method, Force, FLAG_IN, BOOLEAN, 0, nullptr)
SAMPLE_REFERENCE(Sample_Element_Reset_method, Target, FLAG_IN, 0, Sample_Element)
SAMPLE_PROPERTY(Sample_Element_Reset_method, Count, FLAG_IN | FLAG_OUT, UINT32, 0, nullptr)
SAMPLE_PROPERTY(Sample_Element_Reset_method, Message, FLAG_OUT, STRING, 0, nullptr)
SAMPLE_PROPERTY(Sample_Element_Reset_method, return_value, FLAG_OUT, UINT32, 0, nullptr)
inline constexpr const Meta_Feature* _Sample_Element_Reset_method_MFA[] = {
    &_Sample_Element_Reset_method_Force,        &_Sample_Element_Reset_method_Target,
    &_Sample_Element_Reset_method_Count,        &_Sample_Element_Reset_method_Message,
    &_Sample_Element_Reset_method_return_value,
};
inline constexpr Meta_Method Sample_Element_Reset_method::static_meta_class = {
    {{0, FLAG_METHOD, "Reset", nullptr, 0}},
    _Sample_Element_Reset_method_MFA,
    std::size(_Sample_Element_Reset_method_MFA),
    sizeof(Sample_Element_Reset_method),
    UINT32};

inline constexpr const Meta_Feature* _Sample_Element_MFA[] = {
    &_Sample_Element_Name,    &_Sample_Element_EnabledState,
    &_Sample_Element_Caption, &_Sample_Element_Timeout,
    &_Sample_Element_Codes,   &_Sample_Element_Words,
    &_Sample_Element_Pauses,  &Sample_Element_Reset_method::static_meta_class,
};
inline constexpr uint8 _Sample_Element_locals[] = {1, 1, 1, 1, 1, 1, 1, 1};
SAMPLE_CLASS(Sample_Element, FLAG_CLASS, _Sample_Element_locals, nullptr, 1)

// --- Sample_Port: its subclass, with one more key and an own property. The inherited records are shared.

struct Sample_Port : Instance
{
    Property<String> Name;
    Property<uint16> EnabledState;
    Property<String> Caption;
    Property<Datetime> Timeout;
    Property<Array<uint32>> Codes;
    Property<Array<String>> Words;
    Property<Array<Datetime>> Pauses;
    Property<uint64> Number;
    Property<real64> Load;
    static const Meta_Class static_meta_class;
};
static_assert(offsetof(Sample_Port, Pauses) == offsetof(Sample_Element, Pauses));

SAMPLE_PROPERTY(Sample_Port, Number, FLAG_KEY | FLAG_READ, UINT64, 0, nullptr)
SAMPLE_PROPERTY(Sample_Port, Load, FLAG_READ, REAL64, 0, nullptr)
inline constexpr const Meta_Feature* _Sample_Port_MFA[] = {
    &_Sample_Element_Name,    &_Sample_Element_EnabledState,
    &_Sample_Element_Caption, &_Sample_Element_Timeout,
    &_Sample_Element_Codes,   &_Sample_Element_Words,
    &_Sample_Element_Pauses,  &Sample_Element_Reset_method::static_meta_class,
    &_Sample_Port_Number,     &_Sample_Port_Load,
};
inline constexpr uint8 _Sample_Port_locals[] = {0, 0, 0, 0, 0, 0, 0, 0, 1, 1};
SAMPLE_CLASS(Sample_Port, FLAG_CLASS, _Sample_Port_locals, &Sample_Element::static_meta_class, 2)

// --- Sample_Other: no relation, but the same key as Sample_Element

struct Sample_Other : Instance
{
    Property<uint32> Size;
    Property<String> NAME;
    static const Meta_Class static_meta_class;
};

SAMPLE_PROPERTY(Sample_Other, Size, FLAG_READ, UINT32, 0, nullptr)
SAMPLE_PROPERTY(Sample_Other, NAME, FLAG_KEY | FLAG_READ, STRING, 0, nullptr)
inline constexpr const Meta_Feature* _Sample_Other_MFA[] = {&_Sample_Other_Size, &_Sample_Other_NAME};
SAMPLE_CLASS(Sample_Other, FLAG_CLASS, nullptr, nullptr, 1)

// --- Sample_Group: a reference and a reference array that are no keys

struct Sample_Group : Instance
{
    Property<String> Name;
    Instance* Leader;
    Property<Array<Instance*>> Members;
    static const Meta_Class static_meta_class;
};

SAMPLE_PROPERTY(Sample_Group, Name, FLAG_KEY | FLAG_READ, STRING, 0, nullptr)
SAMPLE_REFERENCE(Sample_Group, Leader, FLAG_READ | FLAG_EMBEDDED_INSTANCE, 0, Sample_Element)
SAMPLE_REFERENCE(Sample_Group, Members, FLAG_READ | FLAG_EMBEDDED_INSTANCE, -1, Sample_Port)
inline constexpr const Meta_Feature* _Sample_Group_MFA[] = {&_Sample_Group_Name, &_Sample_Group_Leader,
                                                            &_Sample_Group_Members};
SAMPLE_CLASS(Sample_Group, FLAG_CLASS, nullptr, nullptr, 1)

// --- Sample_Link: an association of two references

struct Sample_Link : Instance
{
    Instance* Antecedent;
    Instance* Dependent;
    static const Meta_Class static_meta_class;
};

SAMPLE_REFERENCE(Sample_Link, Antecedent, FLAG_KEY | FLAG_READ, 0, Sample_Element)
SAMPLE_REFERENCE(Sample_Link, Dependent, FLAG_KEY | FLAG_READ, 0, Sample_Port)
inline constexpr const Meta_Feature* _Sample_Link_MFA[] = {&_Sample_Link_Antecedent, &_Sample_Link_Dependent};
SAMPLE_CLASS(Sample_Link, FLAG_ASSOCIATION, nullptr, nullptr, 2)

// --- All of them

inline constexpr const Meta_Class* sample_meta_classes[] = {
    &Sample_Types::static_meta_class, &Sample_Element::static_meta_class, &Sample_Port::static_meta_class,
    &Sample_Other::static_meta_class, &Sample_Group::static_meta_class,   &Sample_Link::static_meta_class,
};
inline constexpr Meta_Repository sample_repository = {sample_meta_classes, std::size(sample_meta_classes)};

#undef SAMPLE_PROPERTY
#undef SAMPLE_REFERENCE
#undef SAMPLE_CLASS

} // namespace KPRV
