#include "kldrcim/verbs/Cli_Metrics.h"

#include "kldrcim/formats/Metrics_Text.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/formats/Whole_File.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/walks/Topology_Plan.h"

#include <system_error>

namespace KPRV::kldrcim {

int run_metrics(const Cli_Options& options, Connection& connection)
{
    const Host_Readings readings = read_host(connection);
    warn_of(readings.failures);
    if (readings.host.system.properties.empty())
        return complain(std::string("no answer from ") + topology_root_class, FAILURE);
    const std::string text = metrics_text(readings, options.format == Cli_Options::Format::OPENMETRICS
                                                        ? Metrics_Notation::OPENMETRICS
                                                        : Metrics_Notation::PROMETHEUS);
    if (options.output.empty())
        put(text);
    else if (const int error = write_whole_file(options.output, text))
        return complain("cannot write " + options.output + ": " + std::generic_category().message(error),
                        FAILURE);
    return 0;
}

} // namespace KPRV::kldrcim
