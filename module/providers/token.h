#pragma once

#include "module/runtime/ground/String.h"

namespace KPRV {

/// The first piece of a text between separators, as `strtok` cuts it: leading separators are passed over.
/// Only `room` minus one bytes of the text are looked at. Empty if there is none.
inline String first_token(const String& text, char separator, uint32 room)
{
    const uint32 end = text.size() < room ? text.size() : room - 1;
    uint32 first = 0;
    while (first < end && text[first] == separator)
        first++;
    uint32 last = first;
    while (last < end && text[last] != separator)
        last++;
    return text.substr(first, last - first);
}

} // namespace KPRV
