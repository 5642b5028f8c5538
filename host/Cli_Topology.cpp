#include "host/Cli_Topology.h"

#include "host/Topology_Text.h"

#include <clocale>
#include <cstring>
#include <langinfo.h>
#include <locale.h>

namespace KPRV::host {

namespace {

/// Asked of the environment's locale without making it the process's: the module should not notice.
bool locale_is_utf8()
{
    locale_t locale = newlocale(LC_CTYPE_MASK, "", nullptr);
    if (!locale)
        return false;
    bool utf8 = std::strcmp(nl_langinfo_l(CODESET, locale), "UTF-8") == 0;
    freelocale(locale);
    return utf8;
}

} // namespace

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
