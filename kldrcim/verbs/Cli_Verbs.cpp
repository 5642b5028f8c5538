#include "kldrcim/verbs/Cli_Verbs.h"

#include "kldrcim/verbs/Cli_Classes.h"
#include "kldrcim/verbs/Cli_Conform.h"
#include "kldrcim/verbs/Cli_Diag.h"
#include "kldrcim/verbs/Cli_Diff.h"
#include "kldrcim/verbs/Cli_Flash.h"
#include "kldrcim/verbs/Cli_Health.h"
#include "kldrcim/verbs/Cli_Luns.h"
#include "kldrcim/verbs/Cli_Metrics.h"
#include "kldrcim/verbs/Cli_Operations.h"
#include "kldrcim/verbs/Cli_Profiles.h"
#include "kldrcim/verbs/Cli_Rpc.h"
#include "kldrcim/verbs/Cli_Topology.h"
#include "kldrcim/verbs/Cli_Watch.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

constexpr std::size_t ANY = ~std::size_t(0);

constexpr const char* all_formats = "table json mof";
constexpr const char* many_formats = "table json jsonl mof";
constexpr const char* names_options = "--where --sort --count";
constexpr const char* many_options = "--where --sort --count --raw";
constexpr const char* ends_options = "--assoc --role --result --result-role --where --sort --count";
constexpr const char* ends_with_words = "--assoc --role --result --result-role --where --sort --count --raw";
constexpr const char* links_options = "--assoc --role --where --sort --count";
constexpr const char* links_with_words = "--assoc --role --where --sort --count --raw";

using Op = Operation;

// clang-format off
constexpr Cli_Verb verbs[] = {
//   name        arguments                                          body             operation                    formats       options
    {"ei",       1, 1,   "CLASS",                                   run_operation,   Op::ENUMERATE_INSTANCES,     many_formats,  many_options,
     "enumerate instances", nullptr},
    {"ein",      1, 1,   "CLASS",                                   run_operation,   Op::ENUMERATE_INSTANCE_NAMES, many_formats, names_options,
     "enumerate instance names", nullptr},
    {"gi",       1, 1,   "PATH",                                    run_operation,   Op::GET_INSTANCE,            many_formats,  "--raw",
     "get one instance", nullptr},
    {"ci",       2, ANY, "CLASS NAME=VALUE...",                     run_operation,   Op::CREATE_INSTANCE,         all_formats,  "",
     "create an instance", nullptr},
    {"mi",       2, ANY, "PATH NAME=VALUE...",                      run_operation,   Op::MODIFY_INSTANCE,         all_formats,  "",
     "modify the named properties of an instance", nullptr},
    {"di",       1, 1,   "PATH",                                    run_operation,   Op::DELETE_INSTANCE,         all_formats,  "",
     "delete an instance", nullptr},
    {"cm",       2, ANY, "PATH METHOD [NAME=VALUE...]",             run_operation,   Op::INVOKE_METHOD,           all_formats,  "--raw",
     "call a method; PATH may name a class alone for a static one", nullptr},
    {"ai",       1, 1,   "PATH",                                    run_operation,   Op::ASSOCIATORS,             many_formats,  ends_with_words,
     "instances associated with one (associators)", nullptr},
    {"ain",      1, 1,   "PATH",                                    run_operation,   Op::ASSOCIATOR_NAMES,        many_formats,  ends_options,
     "their names", nullptr},
    {"ri",       1, 1,   "PATH",                                    run_operation,   Op::REFERENCES,              many_formats,  links_with_words,
     "associations that refer to an instance (references)", nullptr},
    {"rin",      1, 1,   "PATH",                                    run_operation,   Op::REFERENCE_NAMES,         many_formats,  links_options,
     "their names", nullptr},
    {"tree",     0, 0,   "",                                        draw_tree,       Op{},                        "table json", "--adapter --port --depth --luns --software --connectors --ascii --color",
     "the host with its adapters, ports, targets and logical units, as a tree", nullptr},
    {"graph",    0, 0,   "",                                        draw_graph,      Op{},                        "table",      "--adapter --port --depth --luns --software --connectors",
     "the same as Graphviz text: kldrcim graph | dot -Tsvg >host.svg", nullptr},
    {"luns",     0, 0,   "",                                        list_units,      Op{},                        "table json jsonl", names_options,
     "each logical unit once, by its identifier, with the paths that lead to it", nullptr},
    {"diff",     2, 2,   "OLD NEW",                                 nullptr,         Op{},                        "table json", "",
     "what came, went and changed between two files that \"tree --format json\" wrote; \"-\" is standard input",
     "0 they are equal, 1 they differ, 2 one cannot be read.", 2, diff_inventories},
    {"health",   0, 0,   "",                                        run_health,      Op{},                        "table json plugin", "--interval --ignore",
     "what is wrong with the host's adapters, ports and targets, the worst first",
     "as of a monitoring plugin: 0 nothing is wrong, 1 warnings, 2 something critical, 3 what nobody can tell, or no module; "
     "wrong usage is 2 as everywhere.", 3},
    {"metrics",  0, 0,   "",                                        run_metrics,     Op{},                        "prometheus openmetrics", "--output",
     "the host in numbers, for Prometheus and other collectors of metrics", nullptr},
    {"profiles", 0, 0,   "",                                        write_profiles,  Op{},                        "table json", "--ascii",
     "the registered profiles and what conforms to each, as a tree", nullptr},
    {"conform",  0, 0,   "",                                        run_conform,     Op{},                        all_formats,  "",
     "what a client of the Storage HBA profile expects, beside what it finds", "1 something mandatory is missing."},
    {"watch",    0, 1,   "[CLASS]",                                 watch,           Op{},                        many_formats,  "--filter --where --count= --raw",
     "subscribe to indications (default: KALDERA_AlertIndication) and write each as it comes, until interrupted", nullptr},
    {"diag",     1, 3,   "list\nrun TEST ELEMENT",                  diag,            Op{},                        many_formats,  "--wait --where --sort --count --raw",
     "the hardware tests, and the ports and adapters that they can be run on\n"
     "run a test, by its name, on a port or adapter, by its address or PATH; the test takes the element out of service while it runs",
     "run: 3 the test was refused; 128 and its number after a signal. With --wait: 0 the test passed, 1 it failed."},
    {"rpc",      0, ANY, "METHOD [PARAMETER...]\n--list [PATTERN]\n--raw TEXT", run_rpc, Op{},                    "table json", "--list --raw=",
     "call a method of the agent's JSON-RPC protocol; \"+\" stands before a further call\n"
     "list its methods with their parameters\n"
     "send TEXT, or with \"-\" standard input, as it is; write the reply as it is", nullptr},
    {"flash",    2, 2,   "ADAPTER URI",                             flash,           Op{},                        "table json", "--yes",
     "update an adapter's firmware from file://PATH or tftp://HOST/FILE, through the module's installation service; "
     "ADAPTER is its DeviceID, with or without colons, or a PATH", "1 the update failed, or was not wanted."},
    {"serve",    0, 0,   "",                                        nullptr,         Op{},                        "table",      "--listen --tls --tls-cert --tls-key --users --state",
     "a CIM server on the module, for any WBEM client (CIM-XML), until interrupted", nullptr},
    {"classes",  0, 1,   "[PATTERN]",                               list_classes,    Op{},                        "table json jsonl", names_options,
     "list the classes that have a provider; * and ? match as in file names", nullptr},
};
// clang-format on

} // namespace

std::span<const Cli_Verb> cli_verbs()
{
    return verbs;
}

bool takes_option(const Cli_Verb& verb, const Cli_Option& option)
{
    const std::string name = option.name;
    const bool has_twin = std::ranges::count(cli_options(), name, &Cli_Option::name) > 1;
    return contains_word(verb.options, has_twin && option.value ? name + "=" : name);
}

const Cli_Verb* find_verb(const std::string& name)
{
    const auto found = std::ranges::find_if(verbs, [&](const Cli_Verb& verb) { return name == verb.name; });
    return found == std::end(verbs) ? nullptr : &*found;
}

} // namespace KPRV::kldrcim
