// The tree of a topology, for people and as JSON.
#include "broker/values/Value_Text.h"
#include "kldrcim/formats/Branch_Text.h"
#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Node_Label.h"
#include "kldrcim/formats/Topology_Text.h"

namespace KPRV::kldrcim {

namespace {

using Branch = Topology::Branch;

/// The branches that have a line, those of initiators in the place of the initiators.
std::vector<const Branch*> shown(const Topology& topology, const std::vector<Branch>& branches)
{
    std::vector<const Branch*> result;
    for (const Branch& branch : branches) {
        if (topology.nodes[branch.node].kind != Node_Kind::INITIATOR) {
            result.push_back(&branch);
            continue;
        }
        std::vector<const Branch*> behind = shown(topology, branch.children);
        result.insert(result.end(), behind.begin(), behind.end());
    }
    return result;
}

std::vector<Text_Branch> lines_of(const Topology& topology, const std::vector<Branch>& branches, bool color)
{
    std::vector<Text_Branch> lines;
    for (const Branch* branch : shown(topology, branches))
        lines.push_back({label_line(node_label(topology.nodes[branch->node]), color),
                         lines_of(topology, branch->children, color)});
    return lines;
}

std::string json_of(const Topology& topology, const Branch& branch, unsigned indent)
{
    const Topology::Node& node = topology.nodes[branch.node];
    Node_Label label = node_label(node);
    std::vector<std::string> children;
    for (const Branch* child : shown(topology, branch.children))
        children.push_back(json_of(topology, *child, indent + 4));
    return json_branch({node_kind_name(node.kind), label.what, label.name, label.facts,
                        path_text(node.instance.path), std::move(children)},
                       indent);
}

} // namespace

std::string tree_text(const Topology& topology, bool ascii, bool color)
{
    return branch_text(lines_of(topology, topology.roots, color), ascii);
}

std::string tree_json(const Topology& topology)
{
    bool one = topology.roots.size() == 1;
    std::vector<std::string> roots;
    for (const Branch& root : topology.roots)
        roots.push_back(json_of(topology, root, one ? 0 : 2));
    return (one ? roots.front() : json_array(roots)) + "\n";
}

} // namespace KPRV::kldrcim
