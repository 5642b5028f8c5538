#pragma once

#include "module/runtime/ground/String.h"

#include <atomic>
#include <map>
#include <span>
#include <string>

namespace KPRV {

/// What is known of one event.
struct Event_Row
{
    sint32 key;
    const char* cause;
    const char* action;
};

/// The known events, by category and id.
std::span<const Event_Row> event_rows();

/// "KLDR" and the key in decimal. What the proprietary alert of every event bears.
std::string proprietary_message_id(sint32 key);

/// The message id of the standard alert: that of the standard message registry where it knows the event, else
/// the proprietary one.
std::string message_id_of(sint32 key);

/// One text of each known event, by its key. Filled and cleared by the thread that subscribes and
/// unsubscribes, looked up by the library's threads without a lock: these see all texts or none.
class Event_Texts
{
public:
    /// Takes the texts that `text_of` gives for the catalogue's rows. A second filling changes nothing.
    void fill(std::string (*text_of)(const Event_Row& row));
    void clear() { _filled = false; }
    /// "Unknown" for a key that is not there.
    String find(sint32 key) const;

private:
    /// Written before `_filled` is first set, never changed afterwards.
    std::map<sint32, std::string> _texts;
    std::atomic<bool> _filled = false;
};

} // namespace KPRV
