#include "kldrcim/verbs/Cli_Luns.h"

#include "kldrcim/formats/Output.h"
#include "kldrcim/formats/Unit_Text.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/verbs/Listing_Filter.h"

namespace KPRV::kldrcim {

int list_units(const Cli_Options& options, Connection& connection)
{
    std::string error;
    if (!check_listing(options, unit_value_names(), error))
        return complain(error, USAGE_ERROR);
    Association_Index index(connection);
    std::vector<Logical_Unit> units = read_units(index);
    const std::vector<Provider_Failure>& failures = index.failures();
    // The paths are asked for first.
    if (units.empty() && !failures.empty())
        return complain(
            code_text(failures.front().rc) + ": no answer from " + failures.front().provider_class, FAILURE);
    filter_listing(options, units, unit_values);
    if (!write_total(options, units.size()))
        put(options.format == Cli_Options::Format::JSON    ? units_json(units)
            : options.format == Cli_Options::Format::JSONL ? units_json_lines(units)
                                                           : units_text(units));
    warn_of(failures);
    return 0;
}

} // namespace KPRV::kldrcim
