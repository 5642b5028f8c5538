#pragma once

#include "runtime/String.h"

#include <cstdlib>

namespace KPRV {

/// Where a connector sits, read from its `Tag`: first field, "_", adapter id, "_", port number.
struct Connector_Place
{
    explicit Connector_Place(const String& tag)
    {
        const String rest = behind(tag);
        adapter_id = static_cast<int>(std::strtol(rest.c_str(), nullptr, 10));
        port_number = static_cast<uint32>(std::strtol(behind(rest).c_str(), nullptr, 10));
    }

    /// Counted from 1; 0 when the tag names none.
    int adapter_id;
    /// Counted from 0.
    uint32 port_number;

private:
    static String behind(const String& text)
    {
        const uint32 pos = text.find('_');
        return pos == NPOS ? String() : text.substr(pos + 1);
    }
};

} // namespace KPRV
