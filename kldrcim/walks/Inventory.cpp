#include "kldrcim/walks/Inventory.h"

#include "kldrcim/walks/Unit_Paths.h"

#include <algorithm>
#include <map>

namespace KPRV::kldrcim {

namespace {

using enum Node_Kind;
using Nodes = std::vector<const Inventory_Node*>;

std::string joined(const std::vector<std::string>& texts)
{
    std::string all;
    for (const std::string& text : texts)
        all += (all.empty() ? "" : ", ") + text;
    return all;
}

std::string last_of(const std::vector<std::string>& facts)
{
    return facts.empty() ? "" : facts.back();
}

/// Of a unit: behind its product. Empty for one that tells none.
std::string identifier_of(const Inventory_Node& node)
{
    return node.facts.size() > 1 && is_unit_identifier(node.facts.back()) ? node.facts.back() : "";
}

/// The fact that is a speed.
std::string speed_of(const Inventory_Node& node)
{
    const auto at =
        std::ranges::find_if(node.facts, [](const std::string& fact) { return fact.ends_with("b/s"); });
    return at == node.facts.end() ? "" : *at;
}

/// Of software that is named by its version, that version.
bool is_named_by_version(const Inventory_Node& node)
{
    return node.kind == SOFTWARE && node.facts.empty();
}

/// What stays while an object is the same, among those that hang from one: an address, mostly.
std::string key_of(const Inventory_Node& node)
{
    if (is_named_by_version(node))
        return node.what;
    const std::size_t open = node.name.rfind('(');
    return node.kind == ADAPTER && open != node.name.npos ? node.name.substr(open)
                                                          : node.what + " " + node.name;
}

struct Attribute
{
    const char* name;
    std::string value;
};

/// What may change of an object.
std::vector<Attribute> attributes_of(const Inventory_Node& node)
{
    switch (node.kind) {
    case SYSTEM:
        return {{"name", node.name}, {"state", last_of(node.facts)}};
    case ADAPTER:
        return {{"name", node.name}, {"state", last_of(node.facts)}};
    case FC_PORT:
        return {{"speed", speed_of(node)}, {"state", last_of(node.facts)}};
    case ETHERNET_PORT:
        return {{"device", node.facts.size() > 1 ? node.facts.front() : ""}, {"state", last_of(node.facts)}};
    case TARGET:
        return {{"state", last_of(node.facts)}};
    case SOFTWARE:
        return {{"version", is_named_by_version(node) ? node.name : joined(node.facts)}};
    case UNIT:
        return {{"unit", joined(node.facts)}};
    default:
        return {{"description", joined(node.facts)}};
    }
}

/// By their keys; a key that comes again is told apart by its number.
std::map<std::string, const Inventory_Node*> by_key(const Nodes& nodes)
{
    std::map<std::string, const Inventory_Node*> found;
    for (const Inventory_Node* node : nodes) {
        std::string key = key_of(*node);
        for (int again = 2; found.contains(key); ++again)
            key = key_of(*node) + "#" + std::to_string(again);
        found.emplace(key, node);
    }
    return found;
}

/// All objects of a kind, wherever they hang.
void collect(const Inventory_Node& node, Node_Kind kind, Nodes& found)
{
    if (node.kind == kind)
        found.push_back(&node);
    for (const Inventory_Node& child : node.children)
        collect(child, kind, found);
}

Nodes all_of(const Inventory_Node& node, Node_Kind kind)
{
    Nodes found;
    collect(node, kind, found);
    return found;
}

class Comparison
{
public:
    Comparison(const Inventory_Node& before, const Inventory_Node& now) : _before(before), _now(now)
    {
        _diff.without_software = is_in_one(SOFTWARE);
        _diff.without_connectors = is_in_one(CARD) || is_in_one(CONNECTOR);
    }

    Inventory_Diff run()
    {
        _diff.two_hosts = has_no_adapter_in_common();
        if (_diff.two_hosts) {
            compare_everywhere(TARGET, [](const Inventory_Node& node) { return node.name; });
            compare_everywhere(UNIT, identifier_of);
        } else {
            compare_attributes(_now, attributes_of(_before), attributes_of(_now));
            compare_children(_before, _now);
        }
        return std::move(_diff);
    }

private:
    bool is_in_one(Node_Kind kind) const
    {
        return count_beneath(_before, kind) == 0 ? count_beneath(_now, kind) != 0
                                                 : count_beneath(_now, kind) == 0;
    }

    bool is_left_out(Node_Kind kind) const
    {
        return (kind == SOFTWARE && _diff.without_software) ||
               ((kind == CARD || kind == CONNECTOR) && _diff.without_connectors);
    }

    bool has_no_adapter_in_common() const
    {
        const auto before = by_key(all_of(_before, ADAPTER)), now = by_key(all_of(_now, ADAPTER));
        return !before.empty() && !now.empty() &&
               std::ranges::none_of(before, [&](const auto& each) { return now.contains(each.first); });
    }

    void note(Inventory_Change::Kind kind, const Inventory_Node& node,
              std::vector<Attribute_Change> attributes = {})
    {
        _diff.changes.push_back({kind, &node, {_above.rbegin(), _above.rend()}, std::move(attributes)});
    }

    void compare_attributes(const Inventory_Node& now, const std::vector<Attribute>& before_values,
                            const std::vector<Attribute>& now_values)
    {
        std::vector<Attribute_Change> changes;
        for (std::size_t i = 0; i < std::min(before_values.size(), now_values.size()); ++i)
            if (before_values[i].value != now_values[i].value)
                changes.push_back({now_values[i].name, before_values[i].value, now_values[i].value});
        if (!changes.empty())
            note(Inventory_Change::Kind::CHANGED, now, std::move(changes));
    }

    Nodes children_of(const Inventory_Node& node) const
    {
        Nodes children;
        for (const Inventory_Node& child : node.children)
            if (!is_left_out(child.kind))
                children.push_back(&child);
        return children;
    }

    /// What went and changed in the order of the older one, then what came in that of the newer one.
    void compare_children(const Inventory_Node& before, const Inventory_Node& now)
    {
        const Nodes olds = children_of(before), news = children_of(now);
        const auto old_keys = by_key(olds), new_keys = by_key(news);
        std::map<const Inventory_Node*, const Inventory_Node*> partner;
        for (const auto& [key, node] : old_keys)
            if (const auto same = new_keys.find(key); same != new_keys.end())
                partner[node] = same->second, partner[same->second] = node;
        for (const Inventory_Node* old : olds)
            if (const auto same = partner.find(old); same == partner.end())
                note(Inventory_Change::Kind::WENT, *old);
            else
                compare(*old, *same->second);
        for (const Inventory_Node* each : news)
            if (!partner.contains(each))
                note(Inventory_Change::Kind::CAME, *each);
    }

    void compare(const Inventory_Node& before, const Inventory_Node& now)
    {
        compare_attributes(now, attributes_of(before), attributes_of(now));
        _above.push_back(&now);
        compare_children(before, now);
        _above.pop_back();
    }

    /// Without regard to where they hang, each once; those without a key are left out.
    template <class Key>
    void compare_everywhere(Node_Kind kind, Key key)
    {
        const auto keyed = [&](const Inventory_Node& root) {
            std::map<std::string, const Inventory_Node*> found;
            for (const Inventory_Node* node : all_of(root, kind))
                if (const std::string name = key(*node); !name.empty())
                    found.try_emplace(name, node);
            return found;
        };
        const auto olds = keyed(_before), news = keyed(_now);
        for (const auto& [name, node] : olds)
            if (!news.contains(name))
                note(Inventory_Change::Kind::WENT, *node);
            else if (kind == UNIT)
                compare_attributes(*news.at(name), {{"number", node->name}},
                                   {{"number", news.at(name)->name}});
        for (const auto& [name, node] : news)
            if (!olds.contains(name))
                note(Inventory_Change::Kind::CAME, *node);
    }

    const Inventory_Node& _before;
    const Inventory_Node& _now;
    Inventory_Diff _diff;
    Nodes _above;
};

} // namespace

Inventory_Diff compare_inventories(const Inventory_Node& before, const Inventory_Node& now)
{
    return Comparison(before, now).run();
}

std::size_t count_beneath(const Inventory_Node& node, Node_Kind kind)
{
    std::size_t count = 0;
    for (const Inventory_Node& child : node.children)
        count += (child.kind == kind) + count_beneath(child, kind);
    return count;
}

} // namespace KPRV::kldrcim
