#include "kldrcim/verbs/Listing_Filter.h"

#include "kldrcim/formats/Output.h"
#include "kldrcim/input/Nearest_Word.h"

#include <algorithm>

namespace KPRV::kldrcim {

bool check_listing(const Cli_Options& options, std::span<const char* const> names, std::string& error)
{
    const std::vector<std::string> known(names.begin(), names.end());
    for (const std::string& name : filter_names(options))
        if (!contains_name(known, name)) {
            error = options.verb + " has no \"" + name + "\"" + suggestion(name, known) + "; it has";
            for (const std::string& each : known)
                error += (&each == &known.front() ? " " : ", ") + each;
            return false;
        }
    return true;
}

bool write_total(const Cli_Options& options, std::size_t count)
{
    if (options.total)
        put(std::to_string(count) + "\n");
    return options.total;
}

} // namespace KPRV::kldrcim
