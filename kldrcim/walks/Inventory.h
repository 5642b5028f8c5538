#pragma once

#include "kldrcim/walks/Topology_Plan.h"

#include <optional>
#include <string>
#include <vector>

namespace KPRV::kldrcim {

/// An object of an inventory: what a tree shows of it, and what hangs from it.
struct Inventory_Node
{
    Node_Kind kind;
    std::string what;
    std::string name;
    std::vector<std::string> facts;
    std::string path;
    std::vector<Inventory_Node> children;
};

/// A fact of an object that is not the same in two inventories.
struct Attribute_Change
{
    /// "state", "speed", "version"...
    std::string name;
    /// Empty for none.
    std::string before;
    std::string now;
};

struct Inventory_Change
{
    enum class Kind
    {
        CAME,
        WENT,
        CHANGED,
    };

    Kind kind;
    /// Of the newer inventory, or of the older one if it went.
    const Inventory_Node* node;
    /// Where it hangs, the nearest first, without the host.
    std::vector<const Inventory_Node*> above;
    /// Of one that changed.
    std::vector<Attribute_Change> attributes = {};
};

struct Inventory_Diff
{
    /// They have no adapter in common. Then targets and units are compared, without the ports that see them.
    bool two_hosts = false;
    /// One has it and the other was made without it, so that it was not compared.
    bool without_software = false;
    bool without_connectors = false;
    std::vector<Inventory_Change> changes;
};

/// What came, went and changed. An object that came or went stands for all that hangs from it. The result
/// refers to both inventories.
Inventory_Diff compare_inventories(const Inventory_Node& before, const Inventory_Node& now);

/// How many objects of a kind hang from one.
std::size_t count_beneath(const Inventory_Node& node, Node_Kind kind);

} // namespace KPRV::kldrcim
