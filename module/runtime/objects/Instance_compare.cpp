// Of `Instance`, whether two name the same object, and whether two are the same in all that they hold.
#include "module/runtime/objects/Instance.h"

#include "module/runtime/objects/Class_Plan.h"
#include "module/runtime/objects/features.h"

namespace KPRV {

namespace {

/// The feature of b's class that answers to a key of a; null if there is none of that kind.
template <class Record>
const Record* key_counterpart(const Record* key, const Instance* a, const Instance* b, uint32 kind)
{
    if (a->__meta_class == b->__meta_class)
        return key;
    const Meta_Feature* feature = find_feature(b->__meta_class, key->name, kind);
    return feature && is_key(feature) ? static_cast<const Record*>(feature) : nullptr;
}

bool are_related(const Meta_Class* a, const Meta_Class* b)
{
    return a == b || is_subclass(a, b) || is_subclass(b, a);
}

struct Key_Comparer
{
    const Instance* a;
    const Instance* b;

    bool property(const Meta_Property* key) const
    {
        const Meta_Property* other = key_counterpart(key, a, b, FLAG_PROPERTY);
        return other && other->type == key->type && other->subscript == key->subscript &&
               property_eq(key, &cell_at<char>(a, key->offset), &cell_at<char>(b, other->offset));
    }
    bool operator()(Scalar_Feature f) const { return property(f.meta); }
    bool operator()(Array_Feature f) const { return property(f.meta); }
    bool operator()(Reference_Feature f) const
    {
        const Meta_Reference* other = key_counterpart(f.meta, a, b, FLAG_REFERENCE);
        return other && other->subscript == 0 && are_related(f.meta->meta_class, other->meta_class) &&
               key_eq(f.target(a), Reference_Feature{other}.target(b));
    }
    bool operator()(Reference_Array_Feature) const { return true; }
    bool operator()(Method_Feature) const { return true; }
};

struct Comparer
{
    const Instance* a;
    const Instance* b;

    bool property(const Meta_Property* meta) const
    {
        return property_eq(meta, &cell_at<char>(a, meta->offset), &cell_at<char>(b, meta->offset));
    }
    bool operator()(Scalar_Feature f) const { return property(f.meta); }
    bool operator()(Array_Feature f) const { return property(f.meta); }
    bool operator()(Reference_Feature f) const { return identical(f.target(a), f.target(b)); }
    bool operator()(Reference_Array_Feature f) const
    {
        const Array<Instance*>& x = f.targets(a);
        const Array<Instance*>& y = f.targets(b);
        if (x.size() != y.size() || f.null(a) != f.null(b))
            return false;
        for (uint32 i = 0; i < x.size(); i++) {
            if (!identical(x[i], y[i]))
                return false;
        }
        return true;
    }
    bool operator()(Method_Feature) const { return true; }
};

} // namespace

bool keys_non_null(const Instance* instance)
{
    for (const Meta_Feature* feature : features_of(instance->__meta_class)) {
        const bool has_value =
            !is_key(feature) ||
            visit_feature(feature, Overloaded{
                                       [=](Scalar_Feature f) { return !f.null(instance); },
                                       [=](Array_Feature f) { return !f.null(instance); },
                                       [=](Reference_Feature f) { return f.target(instance) != nullptr; },
                                       [](auto) { return true; },
                                   });
        if (!has_value)
            return false;
    }
    return true;
}

bool key_eq(const Instance* a, const Instance* b)
{
    if (!a || !b)
        return a == b;
    const bool same_class = a->__meta_class == b->__meta_class;
    return all_cells(a->__meta_class, Cells::KEYS, [=](const Cell& cell) {
        // Nearly all keys are texts.
        if (same_class && cell.kind == Cell_Kind::TEXT)
            return cell.null(a) == cell.null(b) && cell.in<String>(a) == cell.in<String>(b);
        return visit_feature(cell.feature, Key_Comparer{a, b});
    });
}

bool identical(const Instance* a, const Instance* b)
{
    if (!a || !b)
        return a == b;
    if (a->__meta_class != b->__meta_class || !(a->__name_space == b->__name_space))
        return false;
    for (const Meta_Feature* feature : features_of(a->__meta_class)) {
        if (!visit_feature(feature, Comparer{a, b}))
            return false;
    }
    return true;
}

} // namespace KPRV
