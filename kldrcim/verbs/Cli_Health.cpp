#include "kldrcim/verbs/Cli_Health.h"

#include "kldrcim/formats/Health_Text.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/input/Address_Words.h"
#include "kldrcim/input/Nearest_Word.h"
#include "kldrcim/verbs/Cli_Complaints.h"

#include <chrono>
#include <thread>

namespace KPRV::kldrcim {

namespace {

std::vector<std::string> finding_names()
{
    std::vector<std::string> names;
    for (const Finding_Kind& kind : finding_kinds())
        names.push_back(kind.name);
    return names;
}

} // namespace

bool check_health_options(const Cli_Options& options, std::string& error)
{
    for (const std::string& word : options.ignored)
        if (!find_finding(word.c_str()) && !is_address(address_digits(word))) {
            error = "--ignore takes a finding or an address, not \"" + word + "\"" +
                    suggestion(word, finding_names());
            return false;
        }
    return true;
}

int run_health(const Cli_Options& options, Connection& connection)
try {
    Health_Options health;
    for (const std::string& word : options.ignored)
        health.ignored.push_back(find_finding(word.c_str()) ? word : address_digits(word));
    if (options.interval)
        health.pause = [&] { std::this_thread::sleep_for(std::chrono::seconds(options.interval)); };
    const Health_Report report = check_health(connection, health);
    using Format = Cli_Options::Format;
    put(options.format == Format::JSON     ? health_json(report)
        : options.format == Format::PLUGIN ? health_plugin_line(report)
                                           : health_lines(report));
    return static_cast<int>(report.rank);
} catch (const Connection_Error& error) {
    return complain(error.what(), static_cast<int>(Rank::UNKNOWN));
}

} // namespace KPRV::kldrcim
