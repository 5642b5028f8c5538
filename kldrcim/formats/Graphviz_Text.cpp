// A topology as a graph.
#include "kldrcim/formats/Node_Label.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/formats/Topology_Text.h"

#include <algorithm>
#include <unordered_set>

namespace KPRV::kldrcim {

namespace {

struct Look
{
    Node_Kind kind;
    const char* shape;
    const char* color;
};

constexpr Look looks[] = {
    {Node_Kind::SYSTEM, "box3d", "#d9d9d9"},      {Node_Kind::ADAPTER, "component", "#fdd9a0"},
    {Node_Kind::SOFTWARE, "note", "#f2f2f2"},     {Node_Kind::CARD, "box", "#fbe8c8"},
    {Node_Kind::CONNECTOR, "cds", "#fbe8c8"},     {Node_Kind::FC_PORT, "box", "#b5d3ee"},
    {Node_Kind::ETHERNET_PORT, "box", "#bfe3c0"}, {Node_Kind::INITIATOR, "ellipse", "#d4e5f5"},
    {Node_Kind::TARGET, "ellipse", "#e2d1ee"},    {Node_Kind::UNIT, "cylinder", "#f6d5d5"},
    {Node_Kind::UNITS, "cylinder", "#f6d5d5"},
};

constexpr bool in_order()
{
    for (std::size_t i = 0; i < std::size(looks); ++i)
        if (looks[i].kind != static_cast<Node_Kind>(i))
            return false;
    return true;
}
static_assert(in_order());

/// Around a node that does not do what it is there for.
const char* outline(Condition condition)
{
    switch (condition) {
    case Condition::IDLE:
        return ", color=\"#7f7f7f\", fontcolor=\"#5f5f5f\"";
    case Condition::DOUBTFUL:
        return ", color=\"#e69500\", penwidth=3";
    case Condition::BAD:
        return ", color=\"#d0021b\", penwidth=3";
    default:
        return "";
    }
}

/// A text inside double quotes; what could end them or begin an escape is escaped.
std::string escaped(const std::string& text)
{
    std::string result;
    for (char c : text) {
        if (c == '"' || c == '\\')
            result += '\\';
        result += c;
    }
    return result;
}

/// What, name and facts on a line each.
std::string label_lines(const Node_Label& label)
{
    std::string text = escaped(label.what);
    if (!label.name.empty())
        text += "\\n" + escaped(label.name);
    for (std::size_t i = 0; i < label.facts.size(); ++i)
        text += (i ? ", " : "\\n") + escaped(label.facts[i]);
    return text;
}

/// Numbers the nodes as a walk from the roots meets them, and writes the links along which it goes.
class Graph_Writer
{
public:
    explicit Graph_Writer(const Topology& topology) : _topology(topology), _order(topology.nodes.size(), 0) {}

    void write()
    {
        for (const Number root : _topology.roots)
            walk(root, 0);
        for (const Number node : _met)
            put("  " + name_of(node) + " [" + std::string(_topology.nodes[node].text) + "];\n");
        for (const Edge& edge : _edges)
            put_edge(edge);
        for (const Topology::Step_Links& each : _topology.steps)
            if (each.step->taken == Topology_Step::CROSS_LINK)
                for (const Topology::Link& link : in_order(each.links))
                    put_edge({link.from, link.to, each.step, false});
    }

private:
    using Number = Topology::Number;

    struct Edge
    {
        Number from;
        Number to;
        const Topology_Step* step;
        /// The edge by which the walk first came to its end.
        bool in_tree;
    };

    std::string name_of(Number node) const { return "n" + std::to_string(_order[node]); }

    void put_edge(const Edge& edge) const
    {
        put("  " + name_of(edge.from) + " -> " + name_of(edge.to) + " [label=\"" +
            escaped(edge.step->association) + "\"" +
            (edge.in_tree ? "" : ", style=dashed, constraint=false") + "];\n");
    }

    /// A node that the walk meets again has been gone through, but for what it shows below another one.
    void walk(Number node, Number above)
    {
        if (_order[node] == 0) {
            _met.push_back(node);
            _order[node] = _met.size();
        }
        for (const Topology::Step_Links& each : _topology.steps)
            for (const Number child : _topology.below(each, node, above)) {
                const bool is_new = _order[child] == 0;
                if (_known.insert(std::uint64_t(node) << 32 | child).second)
                    _edges.push_back({node, child, each.step, is_new});
                walk(child, node);
            }
    }

    /// Between what is drawn anyway.
    std::vector<Topology::Link> in_order(const std::vector<Topology::Link>& links) const
    {
        std::vector<Topology::Link> drawn;
        for (const Topology::Link& link : links)
            if (_order[link.from] != 0 && _order[link.to] != 0)
                drawn.push_back(link);
        std::ranges::stable_sort(drawn, {}, [&](const Topology::Link& link) { return _order[link.from]; });
        return drawn;
    }

    const Topology& _topology;
    /// From 1 on; 0 for what was not met.
    std::vector<std::size_t> _order;
    std::vector<Number> _met;
    std::vector<Edge> _edges;
    std::unordered_set<std::uint64_t> _known;
};

} // namespace

std::string graphviz_node_text(Node_Kind kind, const Instance_Value& instance)
{
    const Look& look = looks[static_cast<int>(kind)];
    const Node_Label label = node_label({kind, instance});
    return "label=\"" + label_lines(label) + "\", shape=" + look.shape + ", fillcolor=\"" + look.color +
           "\"" + outline(label.condition);
}

void write_graphviz(const Topology& topology)
{
    put("digraph topology {\n"
        "  rankdir=LR;\n"
        "  node [style=filled, fontname=\"sans-serif\"];\n"
        "  edge [fontname=\"sans-serif\", fontsize=9];\n");
    Graph_Writer(topology).write();
    put("}\n");
}

} // namespace KPRV::kldrcim
