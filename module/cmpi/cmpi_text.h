#pragma once

#include <cmpidt.h>
#include <cmpift.h>
#include <cmpimacs.h>

namespace KPRV {

/// The characters of a server's text; empty for a null object and for an object without characters, which
/// servers use for absent name spaces and users. They live as long as the object.
inline const char* text_of(const CMPIString* string)
{
    const char* const text = string ? CMGetCharPtr(string) : nullptr;
    return text ? text : "";
}

inline const char* name_space_of(const CMPIObjectPath* path)
{
    return text_of(CMGetNameSpace(path, nullptr));
}

inline const char* class_name_of(const CMPIObjectPath* path)
{
    return text_of(CMGetClassName(path, nullptr));
}

} // namespace KPRV
