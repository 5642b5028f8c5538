#pragma once

#include "module/runtime/ground/String.h"
#include "module/runtime/objects/Meta_Class.h"

namespace KPRV {

inline constexpr uint32 INSTANCE_MAGIC = 0xF00DFACE;

/// Header of every record: classes, method invocations, indications. Records are made by `create` and freed
/// by `unref` or `destroy`, never by constructors: everything walks the metadata.
struct Instance
{
    uint32 __magic;
    sint32 __refs;
    const Meta_Class* __meta_class;
    String __name_space;

    /// The root of all classes: the header and nothing else.
    static const Meta_Class static_meta_class;

    Instance() = delete;
    Instance(const Instance&) = delete;
    Instance& operator=(const Instance&) = delete;
};

/// A fresh instance with a count of 1. With defaults, properties are null but for those with a default value;
/// without, all cells are zero and not null.
Instance* create(const Meta_Class* meta_class, bool defaults);
/// A fresh invocation record; all cells zero and not null.
Instance* create(const Meta_Method* meta_method);
/// A fresh instance, or record of a method, with a count of 1 whose null flags are all set, also where the
/// schema has a default. References are as ever.
Instance* create_null(const Meta_Class* meta_class);
/// Builds in place in `meta_class->size` bytes; `clear` zeroes them first.
void __default_construct(const Meta_Class* meta_class, Instance* instance, bool clear, bool defaults);
/// Writes what stands before the cells: a count of 1, no name space. The class is not counted.
void write_head(Instance* instance, const Meta_Class* meta_class);
/// Releases what the cells hold; the block itself stays.
void __destruct(Instance* instance);

void ref(const Instance* instance);
/// The last one destructs and deletes. Null is ignored.
void unref(const Instance* instance);
/// Destructs and deletes whatever the count.
void destroy(Instance* instance);
/// As `destroy`; null is ignored.
void destroyer(Instance* instance);

/// A deep copy with a count of 1, owned by the caller.
Instance* clone(const Instance* instance);
/// True if no cell holds a text, a moment, an element or an instance: such a record can be copied by its
/// bytes.
bool holds_nothing(const Instance* instance);
/// A clone of an instance that holds nothing.
Instance* clone_of_blank(const Instance* instance);
/// A new instance that holds only the keys, owned by the caller.
Instance* key_clone(const Instance* instance);

/// The three below do nothing unless both instances have the very same class.
void copy(Instance* dest, const Instance* src);
/// Only what is not null in the model, which has the class of the two. Reference arrays are copied whatever
/// the model says.
void copy(Instance* dest, const Instance* src, const Instance* model);
void copy_keys(Instance* dest, const Instance* src);

/// Resets name space, values and references; every null byte 1.
void clear(Instance* instance);
/// Sets the null byte of the chosen properties; references are untouched.
void __set_null_flags(Instance* instance, bool include_keys, bool include_non_keys, uint8 null_value);
/// All key properties have values and all scalar key references are set.
bool keys_non_null(const Instance* instance);

/// Equality of the keys of `a` with those of `b`; the classes may differ. True for a class without features.
bool key_eq(const Instance* a, const Instance* b);
/// Same class, same name space, same cells.
bool identical(const Instance* a, const Instance* b);

/// Marks in the null bytes what a CIM property list (null-terminated; null for all) selects. Unknown names
/// are skipped, and keys follow `keep_keys` alone. A named reference that is null is created. -1 if a name is
/// a method, else 0.
int filter_properties(Instance* instance, const char* const* names, bool keep_keys);

/// Calls the function on the instance, then on each instance that it refers to, depth first.
void __visit(Instance* instance, void (*function)(Instance* instance, void* data), void* data);
/// Gives a name space to the instance and all that it refers to: to those without one, or to all with force.
/// They share the text.
void __set_name_space_recursive(Instance* instance, const String& name_space, bool force);
/// Creates missing scalar references, with defaults.
void __create_refs(Instance* instance);

template <class T>
bool is_instance_of(const Instance* instance)
{
    const Meta_Class* const wanted = &T::static_meta_class;
    return instance->__meta_class == wanted || is_subclass(wanted, instance->__meta_class);
}

/// Tested down-cast: null if the instance (which may be null) is not a T.
template <class T>
T* cast(Instance* instance)
{
    return instance && is_instance_of<T>(instance) ? static_cast<T*>(instance) : nullptr;
}
template <class T>
const T* cast(const Instance* instance)
{
    return instance && is_instance_of<T>(instance) ? static_cast<const T*>(instance) : nullptr;
}

/// Typed forms, for generated classes and for method records.
template <class T>
T* create(bool defaults)
{
    return static_cast<T*>(create(&T::static_meta_class, defaults));
}
template <class T>
T* create_null()
{
    return static_cast<T*>(create_null(&T::static_meta_class));
}
template <class T>
T* clone_of(const T* instance)
{
    return static_cast<T*>(clone(instance));
}

} // namespace KPRV
