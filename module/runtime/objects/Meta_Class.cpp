#include "module/runtime/objects/Meta_Class.h"

#include "module/runtime/ground/Atomic.h"
#include "module/runtime/ground/strutil.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/features.h"
#include "module/runtime/objects/meta_destroy.h"

namespace KPRV {

/// A method's record ends before these members of a class.
static const Meta_Class* super_of(const Meta_Class* meta_class)
{
    return meta_class->flags & FLAG_METHOD ? nullptr : meta_class->super_meta_class;
}

const Meta_Class* find_meta_class(const Meta_Class* meta_class, const char* name)
{
    if (!meta_class || !name)
        return nullptr;
    for (const Meta_Class* p = meta_class; p; p = super_of(p)) {
        if (name_eq(p->name, name))
            return p;
    }
    return meta_class->flags & FLAG_METHOD ? nullptr : find_meta_class(meta_class->meta_repository, name);
}

bool is_subclass(const Meta_Class* ancestor, const Meta_Class* descendant)
{
    // Mostly the very record is found, for which no name need be compared.
    for (const Meta_Class* p = descendant; p; p = super_of(p)) {
        if (p == ancestor)
            return true;
    }
    // Other records of that name count as the root too: copies made at run time.
    if (ancestor == &Instance::static_meta_class || name_eq(ancestor->name, Instance::static_meta_class.name))
        return true;
    for (const Meta_Class* p = descendant; p; p = super_of(p)) {
        if (name_eq(p->name, ancestor->name))
            return true;
    }
    return false;
}

const Meta_Feature* find_feature(const Meta_Class* meta_class, const char* name, uint32 mask)
{
    for (const Meta_Feature* feature : features_of(meta_class)) {
        if ((feature->flags & mask) && name_eq(feature->name, name))
            return feature;
    }
    return nullptr;
}

const Meta_Feature* find_feature(const Meta_Method* method, const char* name, uint32 mask)
{
    return find_feature(as_class(method), name, mask);
}

const Meta_Reference* find_reference(const Meta_Method* method, const char* name)
{
    return static_cast<const Meta_Reference*>(find_feature(method, name, FLAG_REFERENCE));
}

const Meta_Property* find_parameter(const Meta_Method* method, const char* name)
{
    return static_cast<const Meta_Property*>(find_feature(method, name, FLAG_PROPERTY));
}

bool __has_feature_mask(const Meta_Class* meta_class, uint32 mask)
{
    for (const Meta_Feature* feature : features_of(meta_class)) {
        if (feature->flags & mask)
            return true;
    }
    return false;
}

void ref(const Meta_Class* meta_class)
{
    if (meta_class && atomic_get(meta_class->refs) != 0)
        atomic_inc(const_cast<Meta_Class*>(meta_class)->refs);
}

void unref(const Meta_Class* meta_class)
{
    if (!meta_class || atomic_get(meta_class->refs) == 0)
        return;
    Meta_Class* counted = const_cast<Meta_Class*>(meta_class);
    if (atomic_dec_and_test(counted->refs))
        destroy(counted);
}

} // namespace KPRV
