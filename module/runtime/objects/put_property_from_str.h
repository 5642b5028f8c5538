#pragma once

#include "module/runtime/objects/Instance.h"

namespace KPRV {

/// Gives a property of the instance its value from a text in the grammar of number_text.h; a datetime has its
/// 25 characters, a char16 is the first byte of the text, sign-extended, and a string the text itself. The
/// property of an array type gets one more element. 0; or -1 for a text that does not parse, the value then
/// as it was. The property is not null afterwards in either case.
int __put_property_from_str(Instance* instance, const Meta_Property* meta_property, const char* text);

} // namespace KPRV
