#pragma once

#include "module/runtime/objects/Meta_Class.h"

namespace KPRV {

// Deep copies of metadata records, static tables among them. A copy owns its name, qualifiers, features and
// values, and a count of the classes that it points at; free it by `destroy` of meta_destroy.h, a class by
// `unref`. Nothing of the copy depends on the source afterwards.

/// A class with a count of 1 and without a repository, so that it finds other classes only among its
/// ancestors.
Meta_Class* clone(const Meta_Class* meta_class);

/// By kind: a property with its default value, a reference or a method. The count is the source's.
Meta_Feature* clone(const Meta_Feature* meta_feature);
/// Without `clone_value` the copy has no default value.
Meta_Property* clone(const Meta_Property* meta_property, bool clone_value = true);
Meta_Reference* clone(const Meta_Reference* meta_reference);
Meta_Method* clone(const Meta_Method* meta_method);

Meta_Qualifier* clone(const Meta_Qualifier* meta_qualifier);
/// The shape of a value is known from its property or qualifier. Null gives null.
Meta_Value* clone(const Meta_Value* meta_value, uint32 type, bool is_array);

} // namespace KPRV
