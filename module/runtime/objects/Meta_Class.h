#pragma once

#include "module/runtime/objects/Meta_Feature.h"
#include "module/runtime/objects/Meta_Property.h"
#include "module/runtime/objects/Meta_Reference.h"
#include "module/runtime/objects/Meta_Repository.h"

namespace KPRV {

/// The record of a class. The feature array is flat: the superclass's features in their order, then the
/// class's own.
struct Meta_Class : Meta_Feature
{
    const Meta_Feature* const* meta_features;
    uint32 num_meta_features;
    /// Bytes of an instance, the `Instance` header included.
    uint32 size;
    /// Per feature: 1 where this class itself defines or overrides it.
    const uint8* locals;
    /// Null for a root class.
    const Meta_Class* super_meta_class;
    uint32 num_keys;
    const Meta_Repository* meta_repository;
};

/// The record of a method: its features are the parameters in declared order, then "return_value". It begins
/// like a `Meta_Class`, so that an invocation can be an instance of it.
struct Meta_Method : Meta_Feature
{
    const Meta_Feature* const* meta_features;
    uint32 num_meta_features;
    uint32 size;
    /// `Type` code.
    uint16 return_type;
};

/// The method record as the class of its invocations.
inline const Meta_Class* as_class(const Meta_Method* method)
{
    return reinterpret_cast<const Meta_Class*>(method);
}

/// By name in the class and its ancestors, then in the class's repository, if it has one.
const Meta_Class* find_meta_class(const Meta_Class* meta_class, const char* name);

/// True if `ancestor` is the root record (or is named "Instance"), or if the chain of `descendant` reaches
/// it.
bool is_subclass(const Meta_Class* ancestor, const Meta_Class* descendant);

/// First feature of that name, whatever its case, with any flag of the mask (7: any feature). Null if none.
const Meta_Feature* find_feature(const Meta_Class* meta_class, const char* name, uint32 mask);
const Meta_Feature* find_feature(const Meta_Method* method, const char* name, uint32 mask);
const Meta_Reference* find_reference(const Meta_Method* method, const char* name);
const Meta_Property* find_parameter(const Meta_Method* method, const char* name);

/// True if any feature has a flag of the mask.
bool __has_feature_mask(const Meta_Class* meta_class, uint32 mask);

/// Counts of records built at run time; no effect on null or on static tables.
void ref(const Meta_Class* meta_class);
void unref(const Meta_Class* meta_class);

} // namespace KPRV
