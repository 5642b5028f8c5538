#include "module/runtime/objects/meta_clone.h"

#include <cstdlib>
#include <cstring>

namespace KPRV {

namespace {

// Every part comes from `malloc`, as meta_destroy.cpp frees it.

template <class T>
T* copy_of(const T* source, size_t count = 1)
{
    if (count == 0 || !source)
        return nullptr;
    void* const block = malloc(count * sizeof(T));
    memcpy(block, source, count * sizeof(T));
    return static_cast<T*>(block);
}

const char* copy_of_text(const char* text)
{
    return text ? strdup(text) : nullptr;
}

/// A new array with a clone of each element.
template <class T>
const T* const* cloned_elements(const T* const* elements, uint32 count)
{
    const T** const copies = copy_of(const_cast<const T**>(elements), count);
    for (uint32 i = 0; i < count; i++)
        copies[i] = clone(elements[i]);
    return copies;
}

/// A copy of the record that owns its name and qualifiers; what else it points at is still the source's.
template <class Record>
Record* copy_with_head(const Record* source)
{
    Record* const record = copy_of(source);
    record->name = copy_of_text(source->name);
    record->meta_qualifiers = cloned_elements(source->meta_qualifiers, source->num_meta_qualifiers);
    return record;
}

/// Shared by classes and methods, which both have features.
template <class Record>
Record* copy_with_features(const Record* source)
{
    Record* const record = copy_with_head(source);
    record->meta_features = cloned_elements(source->meta_features, source->num_meta_features);
    return record;
}

bool is_text(uint32 type)
{
    return type == STRING || type == DATETIME;
}

const void* cloned_literals(const void* elements, uint32 count, uint32 type)
{
    if (!is_text(type))
        return copy_of(static_cast<const char*>(elements), size_t(count) * literal_type_size[type]);
    const char** const texts = copy_of(static_cast<const char**>(const_cast<void*>(elements)), count);
    for (uint32 i = 0; i < count; i++)
        texts[i] = copy_of_text(texts[i]);
    return texts;
}

} // namespace

Meta_Class* clone(const Meta_Class* meta_class)
{
    Meta_Class* const copy = copy_with_features(meta_class);
    copy->refs = 1;
    copy->locals = copy_of(meta_class->locals, meta_class->num_meta_features);
    ref(copy->super_meta_class);
    copy->meta_repository = nullptr;
    return copy;
}

Meta_Feature* clone(const Meta_Feature* meta_feature)
{
    if (meta_feature->flags & FLAG_PROPERTY)
        return clone(static_cast<const Meta_Property*>(meta_feature));
    if (meta_feature->flags & FLAG_REFERENCE)
        return clone(static_cast<const Meta_Reference*>(meta_feature));
    return clone(static_cast<const Meta_Method*>(meta_feature));
}

Meta_Property* clone(const Meta_Property* meta_property, bool clone_value)
{
    Meta_Property* const copy = copy_with_head(meta_property);
    copy->value = clone_value
                      ? clone(meta_property->value, meta_property->type, meta_property->subscript != 0)
                      : nullptr;
    return copy;
}

Meta_Reference* clone(const Meta_Reference* meta_reference)
{
    Meta_Reference* const copy = copy_with_head(meta_reference);
    ref(copy->meta_class);
    return copy;
}

Meta_Method* clone(const Meta_Method* meta_method)
{
    return copy_with_features(meta_method);
}

Meta_Qualifier* clone(const Meta_Qualifier* meta_qualifier)
{
    Meta_Qualifier* const copy = copy_of(meta_qualifier);
    copy->name = copy_of_text(meta_qualifier->name);
    copy->value = clone(meta_qualifier->value, meta_qualifier->type, meta_qualifier->subscript != 0);
    return copy;
}

Meta_Value* clone(const Meta_Value* meta_value, uint32 type, bool is_array)
{
    Meta_Value* const copy = copy_of(meta_value);
    if (!copy)
        return nullptr;
    if (is_array)
        copy->array_value.elements =
            cloned_literals(meta_value->array_value.elements, meta_value->array_value.num_elements, type);
    else if (is_text(type))
        copy->string_value = copy_of_text(meta_value->string_value);
    return copy;
}

} // namespace KPRV
