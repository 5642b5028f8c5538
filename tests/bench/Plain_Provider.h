#pragma once

#include <cmpidt.h>
#include <cmpift.h>

namespace KPRV::bench {

// The rivals: what a CMPI provider in plain C does for the same classes, written by hand in the usual shape
// (new path, new instance, property by property), without a runtime, metadata or log, as fast as its author
// could make it. They ask the library what the module asks, in the same order, since that is part of what
// clients and library see; the host's name they look up once a request.

// A `plain_get_...` enumerates and compares the keys of the path.

/// The type of each but those over paths, which come in more than one form.
using plain_operation = CMPIStatus(const CMPIBroker* broker, const CMPIResult* result,
                                   const CMPIObjectPath* cop);

CMPIStatus plain_enumerate_fc_ports(const CMPIBroker* broker, const CMPIResult* result,
                                    const CMPIObjectPath* cop);
CMPIStatus plain_get_fc_port(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath* cop);

CMPIStatus plain_enumerate_extents(const CMPIBroker* broker, const CMPIResult* result,
                                   const CMPIObjectPath* cop);
CMPIStatus plain_get_extent(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath* cop);

CMPIStatus plain_enumerate_adapters(const CMPIBroker* broker, const CMPIResult* result,
                                    const CMPIObjectPath* cop);
CMPIStatus plain_get_adapter(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath* cop);

/// The associations of adapters with their FC ports.
CMPIStatus plain_enumerate_controlled_by(const CMPIBroker* broker, const CMPIResult* result,
                                         const CMPIObjectPath* cop);
/// The names of the ports of the adapter at that path.
CMPIStatus plain_names_of_ports(const CMPIBroker* broker, const CMPIResult* result,
                                const CMPIObjectPath* cop);

/// How initiators, targets and logical units find each other.
enum class plain_join
{
    loops,                 ///< Nested, with all object paths made in the innermost, the usual shape.
    loops_outer_ends_once, ///< Those of initiators and targets are made as far out as can be.
    index,                 ///< Each is looked up by the name of the one before; outer ends are made once.
};

/// The paths from initiators through targets to logical units.
CMPIStatus plain_enumerate_paths(const CMPIBroker* broker, const CMPIResult* result,
                                 const CMPIObjectPath* cop, plain_join join);
/// The names of the paths' ends that a logical unit is joined to: by the loops, or with nothing kept but the
/// target that its name tells.
CMPIStatus plain_path_associator_names(const CMPIBroker* broker, const CMPIResult* result,
                                       const CMPIObjectPath* cop, plain_join join);

} // namespace KPRV::bench
