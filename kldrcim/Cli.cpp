#include "kldrcim/Cli.h"

#include "kldrcim/Cli_Serve.h"
#include "kldrcim/client/Open_Server.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/local/Open_Module.h"
#include "kldrcim/verbs/Cli_Arguments.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/verbs/Cli_Help.h"
#include "kldrcim/verbs/Cli_Verbs.h"

#include <cerrno>
#include <cstdlib>
#include <new>
#include <span>
#include <system_error>

namespace KPRV::kldrcim {

namespace {

/// Who is asked, a module or a server. False with a one-line `error` for options that make no sense together.
bool choose(Cli_Options& options, std::string& error)
{
    const char* const usual = std::getenv("KLDRCIM_URL");
    if (usual && options.url.empty() && options.module.empty() && options.verb != "serve")
        options.url = usual;
    const std::pair<const char*, bool> of_a_module[] = {
        {"--module", !options.module.empty()},
        {"--server-instances", !options.server_instances.empty()},
        {"--leaks", options.leaks},
        {"--user", options.user.has_value()},
        {"serve", options.verb == "serve"}};
    const std::pair<const char*, bool> of_a_server[] = {
        {"--password-file", !options.password_file.empty()},
        {"--cacert", !options.ca_file.empty() && options.verb != "serve"},
        {"--insecure", options.insecure}};
    const bool is_remote = !options.url.empty();
    for (const auto& [name, is_given] :
         is_remote ? std::span(of_a_module) : std::span<const std::pair<const char*, bool>>(of_a_server))
        if (is_given)
            error = std::string(name) + " makes no sense " +
                    (is_remote ? "with --url: it is for a module in this process" : "without --url");
    return error.empty();
}

int run_body(const Cli_Verb& verb, const Cli_Options& options, Connection& connection, Local_Server* server)
{
    try {
        return verb.body ? verb.body(options, connection) : serve(options, *server);
    } catch (const Connection_Error& error) {
        flush_output();
        return complain(error.what(), verb.without_module);
    }
}

int run_verb(Cli_Options options)
{
    const Cli_Verb& verb = *find_verb(options.verb);
    if (verb.body_alone)
        return verb.body_alone(options);
    std::string error, warning;
    if (!choose(options, error))
        return complain(error, USAGE_ERROR);
    std::unique_ptr<Connection> connection;
    Local_Server* server = nullptr;
    if (!options.url.empty()) {
        connection = open_server(options, error, warning);
    } else if (auto local = open_module(options, error, warning)) {
        server = &local->server();
        connection = std::move(local);
    }
    if (!connection)
        return complain(error, verb.without_module);
    if (!warning.empty())
        complain("warning: " + warning, 0);
    const int status = run_body(verb, options, *connection, server);
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
