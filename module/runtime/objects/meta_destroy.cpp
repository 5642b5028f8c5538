#include "module/runtime/objects/meta_destroy.h"

#include <algorithm>
#include <cstdlib>

namespace KPRV {

namespace {

void free_const(const void* block)
{
    free(const_cast<void*>(block));
}

/// A use after this shows at once.
template <class Record>
void overwrite_and_free(Record* record)
{
    static_assert(sizeof(Record) % sizeof(uint32) == 0);
    volatile uint32* words = reinterpret_cast<volatile uint32*>(record);
    std::fill_n(words, sizeof(Record) / sizeof(uint32), 0xDDDDDDDDu);
    free(record);
}

void free_head(Meta_Qualified_Object* object)
{
    free_const(object->name);
    for (uint32 i = 0; i < object->num_meta_qualifiers; i++)
        destroy(const_cast<Meta_Qualifier*>(object->meta_qualifiers[i]));
    free_const(object->meta_qualifiers);
}

/// Shared by classes and methods, which both have features.
template <class Record>
void free_features(Record* record)
{
    for (uint32 i = 0; i < record->num_meta_features; i++)
        destroy(const_cast<Meta_Feature*>(record->meta_features[i]));
    free_const(record->meta_features);
}

} // namespace

void destroy(Meta_Class* meta_class)
{
    free_head(meta_class);
    free_features(meta_class);
    free_const(meta_class->locals);
    unref(meta_class->super_meta_class);
    overwrite_and_free(meta_class);
}

void destroy(Meta_Feature* meta_feature)
{
    free_head(meta_feature);
    if (meta_feature->flags & FLAG_PROPERTY) {
        Meta_Property* property = static_cast<Meta_Property*>(meta_feature);
        destroy(const_cast<Meta_Value*>(property->value), property->type, property->subscript != 0);
        overwrite_and_free(property);
    } else if (meta_feature->flags & FLAG_REFERENCE) {
        Meta_Reference* reference = static_cast<Meta_Reference*>(meta_feature);
        unref(reference->meta_class);
        overwrite_and_free(reference);
    } else {
        Meta_Method* method = static_cast<Meta_Method*>(meta_feature);
        free_features(method);
        overwrite_and_free(method);
    }
}

void destroy(Meta_Qualifier* meta_qualifier)
{
    free_const(meta_qualifier->name);
    destroy(const_cast<Meta_Value*>(meta_qualifier->value), meta_qualifier->type,
            meta_qualifier->subscript != 0);
    overwrite_and_free(meta_qualifier);
}

void destroy(Meta_Value* meta_value, uint32 type, bool is_array)
{
    if (!meta_value)
        return;
    const bool is_text = type == STRING || type == DATETIME;
    if (is_array) {
        if (is_text) {
            const char* const* texts = static_cast<const char* const*>(meta_value->array_value.elements);
            for (uint32 i = 0; i < meta_value->array_value.num_elements; i++)
                free_const(texts[i]);
        }
        free_const(meta_value->array_value.elements);
    } else if (is_text) {
        free_const(meta_value->string_value);
    }
    free(meta_value);
}

} // namespace KPRV
