#include "host/Cli_Topology.h"

#include "host/Branch_Text.h"
#include "host/Topology_Text.h"

#include <cstdio>

namespace KPRV::host {

bool write_topology(const Cli_Options& options, Host& host, std::vector<Provider_Failure>& failures)
{
    bool is_graph = options.verb == "graph";
    Association_Index index(host);
    Topology topology = walk_topology(
        index, {.software = options.software, .connectors = options.connectors, .cross_links = is_graph});
    failures = index.failures();
    if (!failures.empty() && same_name(failures.front().provider_class, topology_root_class))
        return false;
    std::string text = is_graph ? graphviz_text(topology)
                       : options.format == Cli_Options::Format::JSON
                           ? tree_json(topology)
                           : tree_text(topology, options.ascii || !locale_is_utf8());
    std::fwrite(text.data(), 1, text.size(), stdout);
    return true;
}

} // namespace KPRV::host
