// A topology as a graph.
#include "kldrcim/formats/Node_Label.h"
#include "kldrcim/formats/Topology_Text.h"

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

std::string name_of(std::size_t node)
{
    return "n" + std::to_string(node + 1);
}

} // namespace

std::string graphviz_text(const Topology& topology)
{
    std::string text = "digraph topology {\n"
                       "  rankdir=LR;\n"
                       "  node [style=filled, fontname=\"sans-serif\"];\n"
                       "  edge [fontname=\"sans-serif\", fontsize=9];\n";
    for (std::size_t i = 0; i < topology.nodes.size(); ++i) {
        const Look& look = looks[static_cast<int>(topology.nodes[i].kind)];
        const Node_Label label = node_label(topology.nodes[i]);
        text += "  " + name_of(i) + " [label=\"" + label_lines(label) + "\", shape=" + look.shape +
                ", fillcolor=\"" + look.color + "\"" + outline(label.condition) + "];\n";
    }
    for (const Topology::Edge& edge : topology.edges)
        text += "  " + name_of(edge.from) + " -> " + name_of(edge.to) + " [label=\"" +
                escaped(edge.association) + "\"" + (edge.in_tree ? "" : ", style=dashed, constraint=false") +
                "];\n";
    return text + "}\n";
}

} // namespace KPRV::kldrcim
