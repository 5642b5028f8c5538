#include "kldrcim/verbs/Cli_Topology.h"

#include "kldrcim/formats/Branch_Text.h"
#include "kldrcim/formats/Node_Label.h"
#include "kldrcim/formats/Terminal.h"
#include "kldrcim/formats/Topology_Text.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/verbs/Walk_Progress.h"

namespace KPRV::kldrcim {

namespace {

/// What is named on the command line and not there; empty if all is.
std::string missing(const Cli_Options& options, const Topology& topology)
{
    if (!options.adapter.empty() && !has_node(topology, {Node_Kind::ADAPTER}))
        return "no adapter \"" + options.adapter + "\"; \"kldrcim tree --depth 1\" shows them";
    if (!options.port.empty() && !has_node(topology, {Node_Kind::FC_PORT, Node_Kind::ETHERNET_PORT}))
        return "no port \"" + options.port + "\"" +
               (options.adapter.empty() ? "" : " of adapter \"" + options.adapter + "\"") +
               "; \"kldrcim tree --depth 2\" shows them";
    return "";
}

/// Walks, keeps what `text_of` makes of each node, and writes.
template <class Text_Of, class Write>
int draw(const Cli_Options& options, Connection& connection, bool cross_links, Text_Of text_of, Write write)
{
    if (!options.port.empty() && options.depth == 1)
        return complain("--port and --depth 1 make no sense together", USAGE_ERROR);
    Walk_Progress progress;
    const Topology topology =
        walk_topology(connection, {.software = options.software,
                                   .connectors = options.connectors,
                                   .cross_links = cross_links,
                                   .count_units = options.luns == Cli_Options::Luns::COUNT,
                                   .merge_units = options.luns == Cli_Options::Luns::MERGED,
                                   .depth = options.depth,
                                   .adapter = options.adapter,
                                   .port = options.port,
                                   .text_of = text_of,
                                   .properties = label_properties(),
                                   .progress = [&](const std::string& class_name, std::size_t count) {
                                       progress.at(class_name, count);
                                   }});
    progress.end();
    const std::vector<Provider_Failure>& failures = topology.failures;
    if (!failures.empty() && same_name(failures.front().provider_class, topology_root_class))
        return complain(
            code_text(failures.front().rc) + ": no answer from " + failures.front().provider_class, 1);
    if (const std::string text = missing(options, topology); !text.empty()) {
        warn_of(failures);
        return complain(text, USAGE_ERROR);
    }
    write(topology);
    warn_of(failures);
    return 0;
}

bool wants_color(const Cli_Options& options)
{
    using Color = Cli_Options::Color;
    return options.color == Color::ALWAYS || (options.color == Color::AUTO && terminal_shows_colors());
}

} // namespace

int draw_tree(const Cli_Options& options, Connection& connection)
{
    if (options.luns == Cli_Options::Luns::MERGED)
        return complain("--luns merged makes no sense for tree; it is for graph", USAGE_ERROR);
    if (options.format == Cli_Options::Format::JSON)
        return draw(options, connection, false, json_node_text, write_tree_json);
    return draw(
        options, connection, false,
        [color = wants_color(options)](Node_Kind kind, const Instance_Value& instance) {
            return tree_node_text(kind, instance, color);
        },
        [&](const Topology& topology) { write_tree(topology, options.ascii || !locale_is_utf8()); });
}

int draw_graph(const Cli_Options& options, Connection& connection)
{
    return draw(options, connection, true, graphviz_node_text, write_graphviz);
}

} // namespace KPRV::kldrcim
