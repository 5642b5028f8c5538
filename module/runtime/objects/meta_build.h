#pragma once

#include "module/runtime/objects/Meta_Class.h"

namespace KPRV {

// Metadata records made at run time. Names are copied.

/// A class with a count of 1, to be released by `unref`. Without a super class it has the flags, no feature,
/// and the size of the header. With one it is the super class's copy under a new name: not abstract, nothing
/// of it local, and the flags are ignored.
Meta_Class* create_meta_class(const char* name, const Meta_Class* super, uint32 flags);

/// A readable property without a default, owned by the caller until it is appended.
Meta_Property* create_meta_property(const char* name, Type type, sint16 subscript, uint32 offset, bool key);

/// Grow an array of a record by one element, which it then owns. A class needs more than its array: see
/// below.
void append(const Meta_Feature* const*& features, uint32& count, Meta_Feature* feature);
void append(const Meta_Qualifier* const*& qualifiers, uint32& count, Meta_Qualifier* qualifier);

/// Gives a class made at run time one more feature, local to it, and one more key if it is one. The size of
/// an instance stays the builder's business.
void append(Meta_Class* meta_class, Meta_Feature* feature);

/// Removes and frees every qualifier whose name is among the names, in any case; null names remove all. The
/// others keep their order. Of records made at run time only.
void filter_qualifiers(Meta_Qualified_Object* object, const char* const* names, size_t count);
/// The same for the class, its features and their parameters.
void filter_qualifiers(Meta_Class* meta_class, const char* const* names, size_t count);

} // namespace KPRV
