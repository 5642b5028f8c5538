#pragma once

#include <cmpidt.h>
#include <cmpift.h>

namespace KPRV::bench {

// The rivals: what a CMPI provider in plain C does for the same classes, written by hand in the usual shape
// (new path, new instance, property by property), without a runtime, metadata or log, as fast as its author
// could make it. They ask the library what the module asks, in the same order, since that is part of what
// clients and library see; the host's name they look up once a request.

CMPIStatus plain_enumerate_fc_ports(const CMPIBroker* broker, const CMPIResult* result,
                                    const CMPIObjectPath* cop);
/// Enumerates and compares the keys of the path.
CMPIStatus plain_get_fc_port(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath* cop);

/// Where the object paths of initiators and targets are made.
enum class plain_ends
{
    of_each_path, ///< In the innermost loop, the usual shape.
    once,         ///< As far out as can be.
};

/// The paths from initiators through targets to logical units, by three nested loops over the names.
CMPIStatus plain_enumerate_paths(const CMPIBroker* broker, const CMPIResult* result,
                                 const CMPIObjectPath* cop, plain_ends ends);
/// The names of the paths' ends that one end is joined to, by the same loops.
CMPIStatus plain_path_associator_names(const CMPIBroker* broker, const CMPIResult* result,
                                       const CMPIObjectPath* cop);

} // namespace KPRV::bench
