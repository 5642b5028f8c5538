#pragma once

#include "module/runtime/objects/Meta_Class.h"

#include <cstdio>

namespace KPRV {

// Dumps of metadata records for debugging, in the manner of MOF. A record's qualifiers, if asked for, stand
// in brackets on a line of their own in front of it: the flags that differ from CIM's defaults, then
// qualifiers with a value.

/// `local_only` leaves out what is inherited unchanged.
void fprint(FILE* file, const Meta_Class* meta_class, bool print_qualifiers, bool local_only);
/// One feature at a level of indentation (4 blanks each), without what ends its line: "string Name = NULL",
/// "Class ref Name", "uint32 Name(...)". A method must have a feature at least, its return value, which is
/// not shown: otherwise the process is aborted.
void fprint(FILE* file, const Meta_Feature* meta_feature, size_t level, bool print_qualifiers);
/// "Name", "Name(value)", "Name{ values }", or "Name(False)".
void fprint(FILE* file, const Meta_Qualifier* meta_qualifier);

// The same on standard output.
void print(const Meta_Class* meta_class, bool print_qualifiers, bool local_only);
void print(const Meta_Feature* meta_feature, size_t level, bool print_qualifiers);
void print(const Meta_Qualifier* meta_qualifier);

/// All classes of a repository with their qualifiers and all features, in order, on standard output.
void dump(const Meta_Repository* repository);

} // namespace KPRV
