#pragma once

#include "module/runtime/objects/meta_build.h"
#include "module/runtime/objects/meta_clone.h"
#include "tests/module/runtime/objects/sample_classes.h"

#include <cstdlib>
#include <cstring>
#include <initializer_list>
#include <memory>
#include <string>

namespace KPRV {

// Metadata records built at run time, for tests of what works on such.

inline constexpr const Meta_Class* ELEMENT = &Sample_Element::static_meta_class;
inline constexpr const Meta_Class* PORT = &Sample_Port::static_meta_class;
inline constexpr const Meta_Class* LINK = &Sample_Link::static_meta_class;

/// A value for a qualifier or a default: a text, a number of 32 bits, or a list of texts.
inline Meta_Value* text_value(const char* text)
{
    const Meta_Value source = {.string_value = text};
    return clone(&source, STRING, false);
}
inline Meta_Value* uint32_value(uint32 number)
{
    const Meta_Value source = {.uint32_value = number};
    return clone(&source, UINT32, false);
}
inline Meta_Value* boolean_value(bool flag)
{
    const Meta_Value source = {.boolean_value = flag};
    return clone(&source, BOOLEAN, false);
}
inline Meta_Value* texts_value(std::initializer_list<const char*> texts)
{
    const Meta_Value source = {.array_value = {texts.begin(), static_cast<uint32>(texts.size())}};
    return clone(&source, STRING, true);
}

inline Meta_Qualifier* qualifier(const char* name, Type type = BOOLEAN, Meta_Value* value = nullptr,
                                 bool is_array = false)
{
    Meta_Qualifier* result = static_cast<Meta_Qualifier*>(calloc(1, sizeof(Meta_Qualifier)));
    result->name = strdup(name);
    result->type = static_cast<uint8>(type);
    result->subscript = is_array;
    result->value = value;
    return result;
}

inline void add_qualifier(Meta_Qualified_Object* object, Meta_Qualifier* added)
{
    append(object->meta_qualifiers, object->num_meta_qualifiers, added);
}

inline std::string qualifier_names(const Meta_Qualified_Object* object)
{
    std::string result;
    for (uint32 i = 0; i < object->num_meta_qualifiers; i++)
        result += std::string(i ? " " : "") + object->meta_qualifiers[i]->name;
    return result;
}

/// A releaser of what `create_meta_class` and `clone` give.
struct Class_Release
{
    void operator()(Meta_Class* meta_class) const { unref(meta_class); }
};
using Owned_Class = std::unique_ptr<Meta_Class, Class_Release>;

inline Owned_Class cloned(const Meta_Class* meta_class)
{
    return Owned_Class(clone(meta_class));
}

/// A feature of a class that was made at run time.
template <class Feature>
Feature* own_feature(const Owned_Class& owner, const char* name)
{
    const Meta_Feature* found = find_feature(owner.get(), name, ANY_FEATURE);
    return static_cast<Feature*>(const_cast<Meta_Feature*>(found));
}

} // namespace KPRV
