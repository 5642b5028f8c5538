#pragma once

namespace KPRV::kldrcim {

/// What a node of the topology is.
enum class Node_Kind
{
    SYSTEM,
    ADAPTER,
    SOFTWARE,
    CARD,
    CONNECTOR,
    FC_PORT,
    ETHERNET_PORT,
    INITIATOR,
    TARGET,
    UNIT,
    /// A number of units, in their place.
    UNITS,
};

/// One kind of step from a node to those below it.
struct Topology_Step
{
    /// Which walks take the step.
    enum Taken
    {
        ALWAYS,
        WITH_SOFTWARE,
        WITH_CONNECTORS,
        /// A link between nodes that the tree has already, which only a graph shows.
        CROSS_LINK,
    };

    Node_Kind from;
    const char* association;
    /// Role of the node where the step starts, and of the one where it ends.
    const char* near_role;
    const char* far_role;
    Node_Kind to;
    /// Of an association with three ends: the role that the node above the start must have. Otherwise null.
    const char* above_role;
    Taken taken;
};

/// Where every walk starts.
extern const char* const topology_root_class;

/// The associations that make the tree, in the order in which children are shown; ends with a null
/// association.
extern const Topology_Step topology_steps[];

} // namespace KPRV::kldrcim
