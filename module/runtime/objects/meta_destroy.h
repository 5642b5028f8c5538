#pragma once

#include "module/runtime/objects/Meta_Class.h"

namespace KPRV {

// Frees records that were built at run time, with all that they own: every part of one was allocated by
// `malloc` or `strdup`. Never for static tables. A class is freed by its last `unref`.

void destroy(Meta_Class* meta_class);
/// By kind: a property, a reference or a method.
void destroy(Meta_Feature* meta_feature);
void destroy(Meta_Qualifier* meta_qualifier);
/// The shape of a value is known from its property or qualifier. Null is ignored.
void destroy(Meta_Value* meta_value, uint32 type, bool is_array);

} // namespace KPRV
