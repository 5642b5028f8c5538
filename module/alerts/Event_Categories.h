#pragma once

#include "module/alerts/Adapter_Event.h"

#include <array>

namespace KPRV {

/// A set of event ids from 0 to 31.
using Event_Ids = uint32;

/// What a category of events is about, and which of its events are published.
struct Category_Row
{
    sint32 category;
    /// `Category` and `OtherAlertType` of its alerts.
    const char* name;
    /// Gives the object path of the element that the alerts are about.
    String (*element_path)(const Adapter_Event& event);
    Event_Ids accepted;
    /// Whether accepted events give a standard alert. A proprietary one they always give.
    bool is_standard;
    /// What the log says of any event of the category, and of one that is not accepted; null for nothing.
    const char* remark;
    const char* refusal;

    bool accepts(sint32 id) const { return id >= 0 && id < 32 && (accepted >> id & 1) != 0; }
};

/// The row of a category; null if there is none.
const Category_Row* category_row(sint32 category);

/// Categories that are not published at all. Any other without a row is published without details: nobody
/// knows what it is about.
bool is_dropped_category(sint32 category);

/// A word that goes into the arguments of a message.
using Message_Argument = std::optional<String> (*)(const Adapter_Event& event);

/// What an accepted event adds to what its category says.
struct Detail_Row
{
    sint32 category;
    sint32 id;
    /// Those that the event has are given, in this order. Null for none.
    std::array<Message_Argument, 2> arguments;
    /// Of the standard alert, whatever the library says; 0 leaves it.
    uint16 severity;
    /// What has become of an Ethernet port, for events that the standard message registry knows; null for all
    /// others.
    const char* port_state;
};

/// For the event, or for all events of its category; null if nothing is added.
const Detail_Row* detail_row(sint32 category, sint32 id);

} // namespace KPRV
