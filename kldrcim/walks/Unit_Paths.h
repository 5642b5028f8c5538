#pragma once

#include "kldrcim/walks/Association_Index.h"

namespace KPRV::kldrcim {

/// One way from a port of the host to a logical unit.
struct Unit_Path
{
    /// Addresses, in hexadecimal digits alone.
    std::string port;
    std::string target;
    /// As the module writes it.
    std::string lun;
    /// Identity of the adapter that the port is of; empty if the module does not tell.
    std::string adapter;
    /// The end that is not in service, the host's before the target's; without properties if both are.
    Instance_Value troubled = {};

    bool in_service() const { return troubled.properties.empty(); }
};

/// How much may fail before a unit is lost.
enum class Redundancy
{
    FULL,
    /// All paths that are in service go through one adapter.
    ONE_ADAPTER,
    ONE_PATH,
    NO_PATH,
};

/// A unit of storage with all paths that lead to it.
struct Logical_Unit
{
    /// As its first path sees it.
    Instance_Value unit;
    /// Empty for one that tells none: nobody knows then whether two of them are the same.
    std::string identifier;
    std::vector<Unit_Path> paths;

    /// By the paths that are in service.
    Redundancy redundancy() const;
};

/// Each unit once, in the order in which the paths are enumerated.
std::vector<Logical_Unit> read_units(Association_Index& index);

/// False for an empty name, and for what the module says of a unit whose identifier it could not read.
bool is_unit_identifier(const std::string& name);

/// What makes a unit the same whoever sees it; empty if it tells nothing of the kind.
std::string unit_identifier(const Instance_Value& unit);

} // namespace KPRV::kldrcim
