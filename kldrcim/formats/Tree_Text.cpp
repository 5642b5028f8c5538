// The tree of a topology, for people and as JSON. Both write as they go.
#include "broker/values/Value_Text.h"
#include "kldrcim/formats/Branch_Text.h"
#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Node_Label.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/formats/Topology_Text.h"

namespace KPRV::kldrcim {

namespace {

using Number = Topology::Number;

/// A node where the tree shows it.
struct Occurrence
{
    Number node;
    Number above;
};

/// What has a line below a node, what is below initiators in their place.
std::vector<Occurrence> shown_below(const Topology& topology, const Occurrence& occurrence)
{
    std::vector<Occurrence> result;
    for (const Number node : topology.below(occurrence.node, occurrence.above)) {
        const Occurrence child = {node, occurrence.node};
        if (topology.nodes[node].kind != Node_Kind::INITIATOR) {
            result.push_back(child);
            continue;
        }
        const std::vector<Occurrence> behind = shown_below(topology, child);
        result.insert(result.end(), behind.begin(), behind.end());
    }
    return result;
}

class Tree_Writer
{
public:
    Tree_Writer(const Topology& topology, const Twigs& twigs) : _topology(topology), _twigs(twigs) {}

    /// `_before` is what stands before the lines below.
    void write(const Occurrence& occurrence)
    {
        put(_topology.nodes[occurrence.node].text);
        put("\n");
        const std::vector<Occurrence> below = shown_below(_topology, occurrence);
        for (std::size_t i = 0; i < below.size(); ++i) {
            const bool is_last = i + 1 == below.size();
            const std::size_t size = _before.size();
            put(_before);
            put(is_last ? _twigs.last_child : _twigs.child);
            _before += is_last ? _twigs.nothing : _twigs.passing;
            write(below[i]);
            _before.resize(size);
        }
    }

private:
    const Topology& _topology;
    const Twigs& _twigs;
    std::string _before;
};

/// The lines behind the first moved to the right.
std::string moved(std::string_view lines, unsigned indent)
{
    std::string text;
    for (const char c : lines) {
        text += c;
        if (c == '\n')
            text.append(indent, ' ');
    }
    return text;
}

void write_json(const Topology& topology, const Occurrence& occurrence, unsigned indent)
{
    const std::vector<Occurrence> below = shown_below(topology, occurrence);
    const std::string text = moved(topology.nodes[occurrence.node].text, indent);
    if (below.empty())
        return put(text);
    // Before the line that closes the object.
    put(text.substr(0, text.rfind('\n')));
    const std::string line = "\n" + std::string(indent + 2, ' ');
    put("," + line + "\"children\": [");
    for (std::size_t i = 0; i < below.size(); ++i) {
        put((i ? "," : "") + line + "  ");
        write_json(topology, below[i], indent + 4);
    }
    put(line + "]\n" + std::string(indent, ' ') + "}");
}

} // namespace

std::string tree_node_text(Node_Kind kind, const Instance_Value& instance, bool color)
{
    return label_line(node_label({kind, instance}), color);
}

std::string json_node_text(Node_Kind kind, const Instance_Value& instance)
{
    const Node_Label label = node_label({kind, instance});
    const std::string path = kind == Node_Kind::UNITS ? "" : path_text(instance.path);
    return json_branch({node_kind_name(kind), label.what, label.name, label.facts, path, {}});
}

void write_tree(const Topology& topology, bool ascii)
{
    for (const Number root : topology.roots)
        Tree_Writer(topology, twigs(ascii)).write({root, 0});
}

void write_tree_json(const Topology& topology)
{
    if (topology.roots.size() == 1) {
        write_json(topology, {topology.roots.front(), 0}, 0);
        return put("\n");
    }
    put("[");
    for (const Number root : topology.roots) {
        put(root == topology.roots.front() ? "\n  " : ",\n  ");
        write_json(topology, {root, 0}, 2);
    }
    put(topology.roots.empty() ? "]\n" : "\n]\n");
}

} // namespace KPRV::kldrcim
