#pragma once

#include "simulator/State.h"

namespace KPRV::simulator {

/// What a change of the adapters' state makes the library tell.
enum class Occurrence
{
    FC_PORT_ENABLED,
    FC_PORT_DISABLED,
    ETHERNET_PORT_ENABLED,
    ETHERNET_PORT_DISABLED,
    FIRMWARE_STARTED,
    FIRMWARE_STOPPED,
    LOGICAL_PORT_CREATED,
    LOGICAL_PORT_DELETED,
    AUTHENTICATION_ENABLED,
    AUTHENTICATION_DISABLED,
    FLASH_UPDATED,
};

/// Tells an event about a port, or about a logical port of it.
void occur(State& state, Occurrence what, const Port& port);
void occur(State& state, Occurrence what, const Port& port, const std::string& logical_port);
/// Tells an event about an adapter. Its address is that of its first FC port.
void occur(State& state, Occurrence what, const Adapter& adapter);

} // namespace KPRV::simulator
