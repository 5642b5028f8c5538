#include "host/Cli_Verbs.h"

#include "host/Cli_Conform.h"
#include "host/Cli_Diag.h"
#include "host/Cli_Flash.h"
#include "host/Cli_Profiles.h"
#include "host/Cli_Rpc.h"
#include "host/Cli_Watch.h"

#include <algorithm>
#include <iterator>

namespace KPRV::host {

namespace {

constexpr std::size_t any = ~std::size_t(0);

// clang-format off
constexpr Cli_Verb verbs[] = {
    {"ei",      1, 1,   "CLASS",                      nullptr},
    {"ein",     1, 1,   "CLASS",                      nullptr},
    {"gi",      1, 1,   "PATH",                       nullptr},
    {"ci",      2, any, "CLASS NAME=VALUE...",        nullptr},
    {"mi",      2, any, "PATH NAME=VALUE...",         nullptr},
    {"di",      1, 1,   "PATH",                       nullptr},
    {"cm",      2, any, "PATH METHOD [NAME=VALUE...]",nullptr},
    {"ai",      1, 1,   "PATH",                       nullptr},
    {"ain",     1, 1,   "PATH",                       nullptr},
    {"ri",      1, 1,   "PATH",                       nullptr},
    {"rin",     1, 1,   "PATH",                       nullptr},
    {"tree",    0, 0,   "",                           nullptr},
    {"graph",   0, 0,   "",                           nullptr},
    {"conform", 0, 0,   "",                           run_conform},
    {"watch",   0, 1,   "[CLASS]",                    watch},
    {"profiles",0, 0,   "",                           write_profiles},
    {"diag",    1, 3,   "list | run TEST ELEMENT",    diag},
    {"flash",   2, 2,   "ADAPTER URI",                flash},
    {"classes", 0, 1,   "[PATTERN]",                  nullptr},
    {"rpc",     0, any, "METHOD [PARAMETER...]",      run_rpc},
};
// clang-format on

} // namespace

const Cli_Verb* find_verb(const std::string& name)
{
    const auto found = std::find_if(std::begin(verbs), std::end(verbs),
                                    [&](const Cli_Verb& verb) { return name == verb.name; });
    return found == std::end(verbs) ? nullptr : found;
}

} // namespace KPRV::host
