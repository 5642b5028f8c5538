#pragma once

#include "module/runtime/ground/String.h"

#include <optional>

namespace KPRV {

/// An event as the adapter library tells it. What the library leaves out is empty, or 0.
struct Adapter_Event
{
    sint32 category = 0;  ///< "eventCategory"
    sint32 id = 0;        ///< "eventId", within the category
    sint32 severity = 0;  ///< "eventSeverity", 1 (worst) to 4
    String port_index;    ///< "portIndexString", the address of a port
    String base_port_wwn; ///< "basePortWWN", colon form
    String message;       ///< "eventMsg"
    String symbol;        ///< "eventIdValue", a symbolic name; empty if it does not begin with "ZNT_"

    // Further words of single events; whether they are there at all matters.
    std::optional<String> pom_level;  ///< "pomLevel"
    std::optional<String> fabric_wwn; ///< "fWwn"
    std::optional<String> cee_state;  ///< "cee_state"
};

/// Reads an event from JSON text. False, with one line in the log at WARN, for a text that does not parse or
/// that lacks its category or id. A member that does not convert to its type throws `Not_Convertible`.
bool read_adapter_event(const char* text, Adapter_Event& event);

/// The index of an event in the catalogue.
constexpr sint32 event_key(sint32 category, sint32 id)
{
    return static_cast<sint32>(static_cast<uint32>(category) << 16 | static_cast<uint32>(id));
}

} // namespace KPRV
