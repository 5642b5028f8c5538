#include "module/runtime/objects/meta_build.h"

#include "module/runtime/ground/strutil.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/features.h"
#include "module/runtime/objects/meta_clone.h"
#include "module/runtime/objects/meta_destroy.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

namespace KPRV {

namespace {

template <class T>
T* zeroed()
{
    return static_cast<T*>(calloc(1, sizeof(T))); // Either way (constant): room for more shows nowhere.
}

/// A view of what a record made at run time owns, and may therefore be written.
template <class T>
T* owned(const T* part)
{
    return const_cast<T*>(part);
}

template <class T>
void append_ptr_array(const T* const*& array, uint32& count, T* element)
{
    void* const larger = realloc(const_cast<const T**>(array), (size_t(count) + 1) * sizeof(T*));
    const T** const elements = static_cast<const T**>(larger);
    elements[count++] = element;
    array = elements;
}

template <class Features>
void filter_features(Features* owner, const char* const* names, size_t count);

void filter_feature(const Meta_Feature* feature, const char* const* names, size_t count)
{
    filter_qualifiers(static_cast<Meta_Qualified_Object*>(owned(feature)), names, count);
    if (feature->flags & FLAG_METHOD)
        filter_features(static_cast<const Meta_Method*>(feature), names, count);
}

template <class Features>
void filter_features(Features* owner, const char* const* names, size_t count)
{
    for (uint32 i = 0; i < owner->num_meta_features; i++)
        filter_feature(owner->meta_features[i], names, count);
}

} // namespace

Meta_Class* create_meta_class(const char* name, const Meta_Class* super, uint32 flags)
{
    if (!super) {
        Meta_Class* const root = zeroed<Meta_Class>();
        root->refs = 1;
        root->flags = flags;
        root->name = strdup(name);
        root->size = Instance::static_meta_class.size;
        return root;
    }
    Meta_Class* const derived = clone(super);
    static const char* const abstract[] = {flag_names[4]};
    derived->flags &= ~FLAG_ABSTRACT;
    filter_qualifiers(static_cast<Meta_Qualified_Object*>(derived), abstract, 1);
    free(owned(derived->name));
    derived->name = strdup(name);
    if (derived->locals)
        memset(owned(derived->locals), 0, derived->num_meta_features);
    unref(derived->super_meta_class);
    derived->super_meta_class = super;
    ref(super);
    return derived;
}

Meta_Property* create_meta_property(const char* name, Type type, sint16 subscript, uint32 offset, bool key)
{
    Meta_Property* const property = zeroed<Meta_Property>();
    property->flags = FLAG_PROPERTY | FLAG_READ | (key ? uint32(FLAG_KEY) : 0);
    property->name = strdup(name);
    property->type = type;
    property->subscript = subscript;
    property->offset = offset;
    return property;
}

void append(const Meta_Feature* const*& features, uint32& count, Meta_Feature* feature)
{
    append_ptr_array(features, count, feature);
}

void append(const Meta_Qualifier* const*& qualifiers, uint32& count, Meta_Qualifier* qualifier)
{
    append_ptr_array(qualifiers, count, qualifier);
}

void append(Meta_Class* meta_class, Meta_Feature* feature)
{
    const uint32 before = meta_class->num_meta_features;
    append(meta_class->meta_features, meta_class->num_meta_features, feature);
    const bool had_locals = meta_class->locals != nullptr;
    uint8* const locals = static_cast<uint8*>(realloc(owned(meta_class->locals), size_t(before) + 1));
    if (!had_locals)
        memset(locals, 0, before);
    locals[before] = 1;
    meta_class->locals = locals;
    meta_class->num_keys += is_key(feature);
}

void filter_qualifiers(Meta_Qualified_Object* object, const char* const* names, size_t count)
{
    const auto is_named = [=](const Meta_Qualifier* qualifier) {
        return !names || std::any_of(names, names + count,
                                     [=](const char* name) { return name_eq(name, qualifier->name); });
    };
    const Meta_Qualifier** const qualifiers = const_cast<const Meta_Qualifier**>(object->meta_qualifiers);
    uint32 kept = 0;
    for (uint32 i = 0; i < object->num_meta_qualifiers; i++) {
        if (is_named(qualifiers[i]))
            destroy(owned(qualifiers[i]));
        else
            qualifiers[kept++] = qualifiers[i];
    }
    object->num_meta_qualifiers = kept;
    if (kept == 0) {
        free(qualifiers);
        object->meta_qualifiers = nullptr;
    }
}

void filter_qualifiers(Meta_Class* meta_class, const char* const* names, size_t count)
{
    filter_qualifiers(static_cast<Meta_Qualified_Object*>(meta_class), names, count);
    filter_features(meta_class, names, count);
}

} // namespace KPRV
