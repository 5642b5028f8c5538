// The tree of a topology, for people and as JSON.
#include "host/Format_Json.h"
#include "host/Node_Label.h"
#include "host/Topology_Text.h"
#include "host/Value_Text.h"

namespace KPRV::host {

namespace {

using Branch = Topology::Branch;

/// What stands before a line: the last child of its parent ends the parent's line of descent.
struct Twigs
{
    const char* child;
    const char* last_child;
    const char* passing;
    const char* nothing;
};

constexpr Twigs boxes = {"├─ ", "└─ ", "│  ", "   "};
constexpr Twigs plain = {"|- ", "`- ", "|  ", "   "};

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

class Tree_Text
{
public:
    Tree_Text(const Topology& topology, const Twigs& twigs) : topology_(topology), twigs_(twigs) {}

    std::string draw()
    {
        for (const Branch* root : shown(topology_, topology_.roots))
            add(*root, "", "");
        return std::move(text_);
    }

private:
    void add(const Branch& branch, const std::string& before, const std::string& before_children)
    {
        text_ += before + label_line(node_label(topology_.nodes[branch.node])) + "\n";
        std::vector<const Branch*> children = shown(topology_, branch.children);
        for (const Branch* child : children) {
            bool last = child == children.back();
            add(*child, before_children + (last ? twigs_.last_child : twigs_.child),
                before_children + (last ? twigs_.nothing : twigs_.passing));
        }
    }

    const Topology& topology_;
    const Twigs& twigs_;
    std::string text_;
};

std::string json_of(const Topology& topology, const Branch& branch, unsigned indent)
{
    const Topology::Node& node = topology.nodes[branch.node];
    Node_Label label = node_label(node);
    std::vector<std::string> facts, children;
    for (const std::string& fact : label.facts)
        facts.push_back(json_string(fact));
    for (const Branch* child : shown(topology, branch.children))
        children.push_back(json_of(topology, *child, indent + 4));
    std::vector<std::pair<std::string, std::string>> members = {
        {"kind", json_string(node_kind_name(node.kind))},
        {"what", json_string(label.what)},
        {"name", json_string(label.name)},
        {"facts", json_array(facts, indent + 2)},
        {"path", json_string(path_text(node.instance.path))},
    };
    if (!children.empty())
        members.emplace_back("children", json_array(children, indent + 2));
    return json_object(members, indent);
}

} // namespace

std::string tree_text(const Topology& topology, bool ascii)
{
    return Tree_Text(topology, ascii ? plain : boxes).draw();
}

std::string tree_json(const Topology& topology)
{
    bool one = topology.roots.size() == 1;
    std::vector<std::string> roots;
    for (const Branch& root : topology.roots)
        roots.push_back(json_of(topology, root, one ? 0 : 2));
    return (one ? roots.front() : json_array(roots)) + "\n";
}

} // namespace KPRV::host
