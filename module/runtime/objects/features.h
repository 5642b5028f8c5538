#pragma once

#include "module/runtime/ground/Array.h"
#include "module/runtime/objects/Instance.h"

#include <span>
#include <utility>

namespace KPRV {

/// The features of a class or method record.
inline std::span<const Meta_Feature* const> features_of(const Meta_Class* meta_class)
{
    return {meta_class->meta_features, meta_class->num_meta_features};
}

/// What stands at an offset of an instance.
template <class T>
T& cell_at(const Instance* instance, uint32 offset)
{
    return *reinterpret_cast<T*>(reinterpret_cast<char*>(const_cast<Instance*>(instance)) + offset);
}

/// Where the null byte stands behind the beginning of a property's cell: right behind the value.
inline uint32 null_offset(const Meta_Property* meta)
{
    return meta->subscript ? sizeof(__Array_Rep*) : type_size[meta->type];
}

// The four kinds of cell. Each knows its record and finds its parts in an instance.

struct Scalar_Feature
{
    const Meta_Property* meta;
    Type type() const { return static_cast<Type>(meta->type); }
    void* value(const Instance* x) const { return &cell_at<char>(x, meta->offset); }
    uint8& null(const Instance* x) const { return cell_at<uint8>(x, meta->offset + type_size[meta->type]); }
};

struct Array_Feature
{
    const Meta_Property* meta;
    Type type() const { return static_cast<Type>(meta->type); }
    __Array_Rep*& array(const Instance* x) const { return cell_at<__Array_Rep*>(x, meta->offset); }
    uint8& null(const Instance* x) const { return cell_at<uint8>(x, meta->offset + sizeof(__Array_Rep*)); }
};

struct Reference_Feature
{
    const Meta_Reference* meta;
    Instance*& target(const Instance* x) const { return cell_at<Instance*>(x, meta->offset); }
};

struct Reference_Array_Feature
{
    const Meta_Reference* meta;
    using Targets = Array<Instance*>;
    Targets& targets(const Instance* x) const { return cell_at<Targets>(x, meta->offset); }
    uint8& null(const Instance* x) const { return cell_at<uint8>(x, meta->offset + sizeof(Targets)); }
};

/// A method among the features of a class: it has no cell.
struct Method_Feature
{
    const Meta_Method* meta;
};

/// Joins lambdas, one per kind of feature, into a visitor.
template <class... Lambdas>
struct Overloaded : Lambdas...
{
    using Lambdas::operator()...;
};
template <class... Lambdas>
Overloaded(Lambdas...) -> Overloaded<Lambdas...>;

/// Calls the visitor with the kind of the feature.
template <class Visitor>
inline decltype(auto) visit_feature(const Meta_Feature* feature, Visitor&& visitor)
{
    if (feature->flags & FLAG_PROPERTY) {
        const Meta_Property* meta = static_cast<const Meta_Property*>(feature);
        if (meta->subscript)
            return visitor(Array_Feature{meta});
        return visitor(Scalar_Feature{meta});
    }
    if (feature->flags & FLAG_REFERENCE) {
        const Meta_Reference* meta = static_cast<const Meta_Reference*>(feature);
        if (meta->subscript)
            return visitor(Reference_Array_Feature{meta});
        return visitor(Reference_Feature{meta});
    }
    return visitor(Method_Feature{static_cast<const Meta_Method*>(feature)});
}

inline bool is_key(const Meta_Feature* feature)
{
    return (feature->flags & FLAG_KEY) != 0;
}

} // namespace KPRV
