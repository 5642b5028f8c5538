#pragma once

#include "simulator/Inventory.h"

#include <cstdint>

namespace KPRV::simulator {

/// Receives the library's log lines: level 1 to 5, file, line, text.
using Log_Callback = void (*)(int level, const char* file, int line, const char* text);

/// Receives an adapter event as JSON text.
using Event_Callback = void (*)(const char* text);

/// What a caller has told the library about itself.
struct Session
{
    bool initialised = false;
    bool wants_events = false;
    Log_Callback log_callback = nullptr;
    Event_Callback event_callback = nullptr;
};

/// All that answers depend on.
struct State
{
    Inventory inventory;
    Session session;
    std::string problem;          // why the inventory was refused; empty if it was not
    bool loaded = false;          // the inventory is the one to answer from
    bool from_environment = true; // false once a test has given an inventory of its own
    std::int32_t last_request_id = 0;
};

} // namespace KPRV::simulator
