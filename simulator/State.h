#pragma once

#include "contracts/adapter/Signatures.h"
#include "simulator/Event_Feed.h"
#include "simulator/Inventory.h"

#include <cstdint>

namespace KPRV::simulator {

/// What a caller has told the library about itself.
struct Session
{
    bool initialised = false;
    log4cxxMsgCB log_callback = nullptr;
};

/// All that answers depend on.
struct State
{
    Inventory inventory;
    Session session;
    Event_Feed events;
    std::string problem;          // why the inventory was refused; empty if it was not
    bool loaded = false;          // the inventory is the one to answer from
    bool from_environment = true; // false once a test has given an inventory of its own
    std::int32_t last_request_id = 0;
};

} // namespace KPRV::simulator
