#pragma once

#include "module/runtime/ground/Types.h"

namespace KPRV {

struct Meta_Class;

/// All classes of the module, in generated order. Method records are not in it.
struct Meta_Repository
{
    const Meta_Class* const* meta_classes;
    uint32 num_meta_classes;
};

/// The class of that name, whatever its case; null for an unknown name, a null repository or an empty one.
const Meta_Class* find_meta_class(const Meta_Repository* repository, const char* name);

/// 0 if class a is b or an ancestor of it, 1 if not, -1 for a null argument or an unknown class.
int is_subclass(const Meta_Repository* repository, const char* name_a, const char* name_b);

} // namespace KPRV
