#pragma once

#include "module/runtime/objects/Instance.h"

namespace KPRV {

// The name of an object as text: `Class.Key="value",Number=5,Other="Class.Key=\"nested\""`.

/// Writes the name of an instance into `text`, which is cleared first: the class, then each key in the
/// order of the class. 0; or -1, with part of the text written, if the class has no keys, a key is null or
/// an array of values. An array of references leaves its name and "=". A string value stands as it is, so a
/// value with a double quote or a backslash in it gives a text that names the object for a reader and cannot
/// be read back, and neither can a name in a name in a name.
int instance_to_model_path(const Instance* instance, String& text);

/// The instance that a text names: its keys set, all else null, with a count of 1 that belongs to the
/// caller. The class is looked up by name in `meta_class`, its ancestors and its repository. Null for an
/// unknown class, a text that does not follow the form, and a number of keys that is not the class's.
/// Real, char16 and datetime keys are written and cannot be read.
Instance* model_path_to_instance(const Meta_Class* meta_class, const char* text);

} // namespace KPRV
