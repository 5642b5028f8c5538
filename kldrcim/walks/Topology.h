#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/walks/Text_Pool.h"
#include "kldrcim/walks/Topology_Plan.h"

#include <functional>
#include <map>

namespace KPRV::kldrcim {

using namespace broker;

/// What the walk along the steps of the plan finds: every object once, with what is written of it and no
/// more, and every link once. A unit behind two ports is one node that occurs twice.
struct Topology
{
    /// A node; numbers that are none were met on the way.
    using Number = std::uint32_t;

    struct Node
    {
        Node_Kind kind = Node_Kind::SYSTEM;
        bool is_met = false;
        /// Among `texts`.
        std::string_view text = {};
    };

    /// From a node to one below it. Where the step looks at the node above the start, `above` is that node.
    struct Link
    {
        Number from;
        Number above;
        Number to;
    };

    /// Of one step of the plan; by start, what is above it, and the order in which the links came.
    struct Step_Links
    {
        const Topology_Step* step;
        std::vector<Link> links;
    };

    /// The nodes below one, where it occurs below `above`: by all steps of the tree, or by one.
    std::vector<Number> below(Number node, Number above) const;
    std::vector<Number> below(const Step_Links& step, Number node, Number above) const;

    std::vector<Node> nodes;
    Text_Pool texts;
    /// In the order of the plan.
    std::vector<Step_Links> steps;
    /// Computer systems: one, as long as the module is right.
    std::vector<Number> roots;
    /// Enumerations that failed, in the order in which they were made.
    std::vector<Provider_Failure> failures;
};

struct Topology_Options
{
    bool software = false;
    bool connectors = false;
    /// Also follow what links nodes outside the tree.
    bool cross_links = false;
    /// A target has one node for all units that a port sees there.
    bool count_units = false;
    /// Logical units with one identifier are one node, whoever sees them.
    bool merge_units = false;
    /// Levels below the host; 0 for all.
    unsigned depth = 0;
    /// Only this adapter, and what leads to this port: addresses, with or without what stands between their
    /// digits.
    std::string adapter = {};
    std::string port = {};
    /// What to keep of a node. It may know no more than the keys.
    std::function<std::string(Node_Kind kind, const Instance_Value& instance)> text_of = {};
    /// The properties that `text_of` looks at.
    Property_List properties = {};
    /// Told of each enumeration when it begins, and of how much has come.
    std::function<void(const std::string& class_name, std::size_t count)> progress = {};
};

/// Asks for each class that it needs once, as it comes. Associations that cannot be asked leave their
/// branches out.
Topology walk_topology(Connection& connection, const Topology_Options& options);

/// True if the topology has a node of one of the kinds.
bool has_node(const Topology& topology, std::initializer_list<Node_Kind> kinds);

} // namespace KPRV::kldrcim
