#pragma once

#include "kldrcim/walks/Association_Index.h"
#include "kldrcim/walks/Topology_Plan.h"

namespace KPRV::kldrcim {

/// What the walk along the steps of the plan finds: every object once as a node, every link once as an edge,
/// and the tree of occurrences. A unit behind two ports is one node that occurs twice.
struct Topology
{
    struct Node
    {
        Node_Kind kind;
        Instance_Value instance;
    };

    struct Edge
    {
        std::size_t from;
        std::size_t to;
        const char* association;
        /// The edge by which the walk first came to its end.
        bool in_tree;
    };

    struct Branch
    {
        std::size_t node;
        std::vector<Branch> children;
    };

    /// In the order in which the walk met them, which is the order of the module's answers.
    std::vector<Node> nodes;
    std::vector<Edge> edges;
    /// Computer systems: one, as long as the module is right.
    std::vector<Branch> roots;
};

struct Topology_Options
{
    bool software = false;
    bool connectors = false;
    /// Also follow what links nodes outside the tree.
    bool cross_links = false;
    /// Logical units with one identifier are one node, whoever sees them.
    bool merge_units = false;
};

/// Walks. Associations that cannot be asked leave their branches out and are told by `index.failures()`.
Topology walk_topology(Association_Index& index, const Topology_Options& options);

} // namespace KPRV::kldrcim
