#pragma once

#include "module/runtime/ground/String.h"

#include <algorithm>
#include <cstdlib>
#include <limits>

namespace KPRV {

/// Where a connector sits, read from its `Tag`: first field, "_", adapter id, "_", port number.
struct Connector_Place
{
    explicit Connector_Place(const String& tag)
    {
        const String rest = behind(tag);
        adapter_id = number(rest);
        port_number = static_cast<uint32>(number(behind(rest)));
    }

    /// Counted from 1; 0 when the tag names none.
    int adapter_id;
    /// Counted from 0.
    uint32 port_number;

private:
    /// As `strtol` reads where a long has 32 bits, on either word size: what lies beyond is clamped, and no
    /// adapter and no port has such a number.
    static sint32 number(const String& text)
    {
        using Limits = std::numeric_limits<sint32>;
        const long long wide = std::strtoll(text.c_str(), nullptr, 10);
        return static_cast<sint32>(std::clamp<long long>(wide, Limits::min(), Limits::max()));
    }

    static String behind(const String& text)
    {
        const uint32 pos = text.find('_');
        return pos == NPOS ? String() : text.substr(pos + 1);
    }
};

} // namespace KPRV
