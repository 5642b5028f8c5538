#include "simulator/State_Events.h"

#include <algorithm>

namespace KPRV::simulator {

namespace {

struct Occurrence_Row
{
    Occurrence what;
    int category;
    int id;
    int severity;
    const char* symbol;
    const char* message;
};

// clang-format off
constexpr Occurrence_Row rows[] = {
//   what                                  category  id  severity  symbol                  message
    {Occurrence::FC_PORT_ENABLED,          2,        7,  4,        "ZNT_PORT_ENABLE",      "Base port enabled: "},
    {Occurrence::FC_PORT_DISABLED,         2,        8,  3,        "ZNT_PORT_DISABLE",     "Base port disabled: "},
    {Occurrence::ETHERNET_PORT_ENABLED,    10,       3,  4,        "ZNT_ETH_PORT_ENABLE",  "Ethernet port enabled: "},
    {Occurrence::ETHERNET_PORT_DISABLED,   10,       4,  3,        "ZNT_ETH_PORT_DISABLE", "Ethernet port disabled: "},
    {Occurrence::FIRMWARE_STARTED,         9,        3,  4,        "ZNT_IOC_ENABLE",       "Adapter enabled: "},
    {Occurrence::FIRMWARE_STOPPED,         9,        4,  3,        "ZNT_IOC_DISABLE",      "Adapter disabled: "},
    {Occurrence::LOGICAL_PORT_CREATED,     3,        1,  4,        "ZNT_LPORT_CREATE",     "Logical port created: "},
    {Occurrence::LOGICAL_PORT_DELETED,     3,        2,  4,        "ZNT_LPORT_DELETE",     "Logical port deleted: "},
    {Occurrence::AUTHENTICATION_ENABLED,   8,        1,  4,        "ZNT_AUTH_ENABLE",      "Authentication enabled: "},
    {Occurrence::AUTHENTICATION_DISABLED,  8,        2,  4,        "ZNT_AUTH_DISABLE",     "Authentication disabled: "},
    {Occurrence::FLASH_UPDATED,            8,        4,  4,        "ZNT_FLASH_UPDATE",     "Adapter flash updated: "},
};
// clang-format on

const Occurrence_Row& row_of(Occurrence what)
{
    return *std::find_if(std::begin(rows), std::end(rows),
                         [&](const Occurrence_Row& row) { return row.what == what; });
}

Json::Value event_of(Occurrence what, const std::string& address)
{
    const Occurrence_Row& row = row_of(what);
    Json::Value event;
    event["eventCategory"] = row.category;
    event["eventId"] = row.id;
    event["eventSeverity"] = row.severity;
    event["eventIdValue"] = row.symbol;
    event["eventMsg"] = row.message + address;
    return event;
}

// The library writes this one address without colons, as clients' keys have it.
std::string flat(std::string address)
{
    std::erase(address, ':');
    return address;
}

void occur_at(State& state, Json::Value event, const Port& port)
{
    if (port.kind == Port_Kind::FC)
        event["basePortWWN"] = port.address;
    event["portIndexString"] = flat(port.address);
    state.events.occur(compact_text(event));
}

} // namespace

void occur(State& state, Occurrence what, const Port& port)
{
    occur_at(state, event_of(what, port.address), port);
}

void occur(State& state, Occurrence what, const Port& port, const std::string& logical_port)
{
    occur_at(state, event_of(what, logical_port), port);
}

void occur(State& state, Occurrence what, const Adapter& adapter)
{
    const Json::Value event = event_of(what, adapter.address);
    if (adapter.fc_ports.empty())
        state.events.occur(compact_text(event));
    else
        occur_at(state, event, adapter.fc_ports.front());
}

} // namespace KPRV::simulator
