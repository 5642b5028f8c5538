#include "kldrcim/Cli.h"

#include "kldrcim/Cli_Serve.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/local/Open_Module.h"
#include "kldrcim/verbs/Cli_Arguments.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/verbs/Cli_Help.h"
#include "kldrcim/verbs/Cli_Verbs.h"

#include <cerrno>
#include <new>
#include <system_error>

namespace KPRV::kldrcim {

namespace {

int run_verb(const Cli_Options& options)
{
    std::string error, warning;
    const std::unique_ptr<Local_Connection> connection = open_module(options, error, warning);
    const Cli_Verb& verb = *find_verb(options.verb);
    if (!connection)
        return complain(error, verb.without_module);
    if (!warning.empty())
        complain("warning: " + warning, 0);
    const int status = verb.body ? verb.body(options, *connection) : serve(options, connection->host());
    for (const std::string& breach : connection->breaches())
        complain("warning: the provider broke the CMPI contract: " + breach, 0);
    if (options.leaks)
        connection->report_leaks(stderr);
    return status;
}

int run(const std::vector<std::string>& arguments)
{
    Cli_Options options;
    std::string error;
    if (!parse_options(arguments, options, error))
        return complain(error, USAGE_ERROR);
    int status = 0;
    if (options.version)
        put("kldrcim " KLDR_VERSION "\n");
    else if (options.help)
        put(options.verb.empty() ? program_help() : verb_help(*find_verb(options.verb)));
    else
        status = run_verb(options);
    flush_output();
    return status;
}

} // namespace

int run_cli(const std::vector<std::string>& arguments)
{
    try {
        return run(arguments);
    } catch (const Output_Error& failure) {
        // A reader that has had enough is no failure.
        return failure.error == EPIPE
                   ? 0
                   : complain(std::string("write error: ") + std::generic_category().message(failure.error),
                              FAILURE);
    } catch (const std::bad_alloc&) {
        return complain("out of memory", FAILURE);
    } catch (const std::exception& error) {
        return complain(error.what(), FAILURE);
    }
}

} // namespace KPRV::kldrcim
