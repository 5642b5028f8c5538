#pragma once

#include "simulator/Target.h"

namespace KPRV::simulator {

/// What is counted beside the counters of a port, as an index of the table.
enum class Statistics
{
    FIRMWARE,
    TRUNKING,
    FCOE,
    FCPIM_MOD,
    VHBA,
    FABRIC,
    IOC,
    PORT_AUTH,
    QOS,
    ETHERNET_PORT,
    ETHERNET_IOC,
    LLDP,
    VNIC,
    LOGICAL_PORT,
    VIRTUAL_PORT,
    REMOTE_PORT,
    FCPIM,
    FCPIM_IOP,
    ADVANCED_IO,
};

struct Statistics_Kind
{
    const char* group; // those of one group are reset together
    Scope scope;
    const char* counters; // "name=figure", separated by blanks
};

const Statistics_Kind& statistics_kind(Statistics kind);

/// The counters of one thing: an object of decimal texts, since they are of 64 bits.
Json::Value counters_at(const Inventory& inventory, Statistics kind, const std::string& path);

} // namespace KPRV::simulator
