#include "kldrcim/verbs/Cli_Topology.h"

#include "kldrcim/formats/Branch_Text.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/formats/Terminal.h"
#include "kldrcim/formats/Topology_Text.h"
#include "kldrcim/verbs/Cli_Complaints.h"

namespace KPRV::kldrcim {

namespace {

/// Walks, and writes what `text_of` makes of it.
template <class Text_Of>
int draw(const Cli_Options& options, Connection& connection, bool cross_links, Text_Of text_of)
{
    Association_Index index(connection);
    const Topology topology =
        walk_topology(index, {.software = options.software,
                              .connectors = options.connectors,
                              .cross_links = cross_links,
                              .merge_units = options.luns == Cli_Options::Luns::MERGED});
    const std::vector<Provider_Failure>& failures = index.failures();
    if (!failures.empty() && same_name(failures.front().provider_class, topology_root_class))
        return complain(
            code_text(failures.front().rc) + ": no answer from " + failures.front().provider_class, 1);
    put(text_of(topology));
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
    return draw(options, connection, false, [&](const Topology& topology) {
        return options.format == Cli_Options::Format::JSON
                   ? tree_json(topology)
                   : tree_text(topology, options.ascii || !locale_is_utf8(), wants_color(options));
    });
}

int draw_graph(const Cli_Options& options, Connection& connection)
{
    return draw(options, connection, true, graphviz_text);
}

} // namespace KPRV::kldrcim
