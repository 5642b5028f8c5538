#pragma once

#include "module/runtime/objects/Instance.h"

#include <cstdio>

namespace KPRV {

/// Dump for debugging: class, name space, then a line per feature. keys_only limits the top level to keys;
/// nested instances show their keys and embedded objects.
void fprint(FILE* file, const Instance* instance, bool keys_only = false);
/// To standard output.
void print(const Instance* instance, bool keys_only = false);

/// As an element of something that stands at the level above: indented by 4 blanks a level, without the name
/// of a field.
void fprint_nested(FILE* file, const Instance* instance, uint32 level);

} // namespace KPRV
