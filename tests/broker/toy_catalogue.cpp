// The toy's classes as metadata tables. Only one of the two toy libraries has them.
#include "module/runtime/dispatch/Registration.h"
#include "module/runtime/objects/Meta_Value.h"
#include "tests/broker/toy.h"

namespace {

using namespace KPRV;

constexpr uint32 PLAIN = FLAG_PROPERTY | FLAG_READ;
constexpr uint32 KEY = PLAIN | FLAG_KEY;

constexpr Meta_Property property(const char* name, uint32 flags, uint16 type, sint16 subscript = 0,
                                 const Meta_Value* value = nullptr)
{
    return {{{0, flags, name, nullptr, 0}}, type, subscript, 0, value};
}

const uint16 default_numbers[] = {5, 7};
const Meta_Value flag_default = {.boolean_value = true};
const Meta_Value numbers_default = {.array_value = {default_numbers, 2}};

const Meta_Property id = property("Id", KEY, UINT32), name = property("Name", KEY, STRING),
                    flag = property("Flag", PLAIN, BOOLEAN, 0, &flag_default),
                    u8 = property("U8", PLAIN, UINT8), u16 = property("U16", PLAIN, UINT16),
                    u32 = property("U32", PLAIN, UINT32), u64 = property("U64", PLAIN, UINT64),
                    s8 = property("S8", PLAIN, SINT8), s16 = property("S16", PLAIN, SINT16),
                    s32 = property("S32", PLAIN, SINT32), s64 = property("S64", PLAIN, SINT64),
                    r32 = property("R32", PLAIN, REAL32), r64 = property("R64", PLAIN, REAL64),
                    c16 = property("C16", PLAIN, CHAR16), nothing = property("Nothing", PLAIN, STRING),
                    numbers = property("Numbers", PLAIN, UINT16, -1, &numbers_default),
                    texts = property("Texts", PLAIN, STRING, -1),
                    empty = property("Empty", PLAIN, BOOLEAN, -1), when = property("When", PLAIN, DATETIME);

const Meta_Reference other = {{{0, FLAG_REFERENCE | FLAG_READ, "Other", nullptr, 0}}, 0, nullptr, 0};

const Meta_Property echo_text = property("Text", FLAG_PROPERTY | FLAG_IN | FLAG_OUT, STRING),
                    echo_return = property("return_value", FLAG_PROPERTY | FLAG_OUT, UINT32);
const Meta_Feature* const echo_features[] = {&echo_text, &echo_return};
const Meta_Method echo = {{{0, FLAG_METHOD | FLAG_STATIC, "Echo", nullptr, 0}}, echo_features, 2, 0, UINT32};

const Meta_Feature* const base_features[] = {&id, &name};
const Meta_Feature* const item_features[] = {&id,      &name,    &flag,  &u8,    &u16,  &u32,   &u64,
                                             &s8,      &s16,     &s32,   &s64,   &r32,  &r64,   &c16,
                                             &nothing, &numbers, &texts, &empty, &when, &other, &echo};

extern const Meta_Repository repository;

const Meta_Class toy_base = {{{0, FLAG_CLASS | FLAG_ABSTRACT, "TOY_Base", nullptr, 0}},
                             base_features,
                             2,
                             0,
                             nullptr,
                             nullptr,
                             2,
                             &repository};
const Meta_Class toy_item = {
    {{0, FLAG_CLASS, "TOY_Item", nullptr, 0}}, item_features, 21, 0, nullptr, &toy_base, 2, &repository};

const Meta_Class* const classes[] = {&toy_base, &toy_item};
const Meta_Repository repository = {classes, 2};

const Registration registration = {"toy", "TOY_Item_Provider", nullptr, &toy_item, nullptr};

} // namespace

TOY_EXPORT const Registration* cimple_module()
{
    return &registration;
}
