#include "kldrcim/verbs/Cli_Luns.h"

#include "kldrcim/formats/Output.h"
#include "kldrcim/formats/Unit_Text.h"
#include "kldrcim/verbs/Cli_Complaints.h"

namespace KPRV::kldrcim {

int list_units(const Cli_Options& options, Connection& connection)
{
    Association_Index index(connection);
    const std::vector<Logical_Unit> units = read_units(index);
    const std::vector<Provider_Failure>& failures = index.failures();
    // The paths are asked for first.
    if (units.empty() && !failures.empty())
        return complain(
            code_text(failures.front().rc) + ": no answer from " + failures.front().provider_class, FAILURE);
    put(options.format == Cli_Options::Format::JSON ? units_json(units) : units_text(units));
    warn_of(failures);
    return 0;
}

} // namespace KPRV::kldrcim
