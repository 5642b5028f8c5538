#include "module/runtime/objects/meta_identical.h"

#include "module/runtime/ground/strutil.h"

namespace KPRV {

namespace {

bool same_head(const Meta_Qualified_Object* a, const Meta_Qualified_Object* b)
{
    return a->flags == b->flags && name_eq(a->name, b->name);
}

bool same_feature(const Meta_Feature* a, const Meta_Feature* b);

/// Shared by classes and methods, which both have features.
template <class Record>
bool same_features(const Record* a, const Record* b)
{
    if (a->num_meta_features != b->num_meta_features)
        return false;
    for (uint32 i = 0; i < a->num_meta_features; i++) {
        if (!same_feature(a->meta_features[i], b->meta_features[i]))
            return false;
    }
    return true;
}

bool same(const Meta_Property* a, const Meta_Property* b)
{
    return a->type == b->type && a->subscript == b->subscript && a->offset == b->offset;
}

bool same(const Meta_Reference* a, const Meta_Reference* b)
{
    return a->offset == b->offset && identical(a->meta_class, b->meta_class);
}

bool same(const Meta_Method* a, const Meta_Method* b)
{
    return a->return_type == b->return_type && same_features(a, b);
}

template <class Kind>
bool same_as(const Meta_Feature* a, const Meta_Feature* b)
{
    return same(static_cast<const Kind*>(a), static_cast<const Kind*>(b));
}

bool same_feature(const Meta_Feature* a, const Meta_Feature* b)
{
    // Equal flags tell the same kind.
    if (!same_head(a, b))
        return false;
    if (a->flags & FLAG_PROPERTY)
        return same_as<Meta_Property>(a, b);
    if (a->flags & FLAG_REFERENCE)
        return same_as<Meta_Reference>(a, b);
    return same_as<Meta_Method>(a, b);
}

/// A class without the table has nothing of its own.
bool is_local(const Meta_Class* meta_class, uint32 i)
{
    return meta_class->locals && meta_class->locals[i];
}

bool same_locals(const Meta_Class* a, const Meta_Class* b)
{
    for (uint32 i = 0; i < a->num_meta_features; i++) {
        if (is_local(a, i) != is_local(b, i))
            return false;
    }
    return true;
}

} // namespace

bool identical(const Meta_Class* a, const Meta_Class* b)
{
    // The same record, which also ends the walk where a class refers to itself.
    if (a == b)
        return true;
    if (!a || !b)
        return false;
    return same_head(a, b) && same_features(a, b) && a->size == b->size && same_locals(a, b) &&
           (!a->super_meta_class || !b->super_meta_class ||
            identical(a->super_meta_class, b->super_meta_class)) &&
           a->num_keys == b->num_keys;
}

} // namespace KPRV
