#include "kldrcim/verbs/Cli.h"

#include "broker/Host.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/input/Module_Search.h"
#include "kldrcim/input/Name_Spaces.h"
#include "kldrcim/input/Server_Instances_File.h"
#include "kldrcim/verbs/Cli_Arguments.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/verbs/Cli_Help.h"
#include "kldrcim/verbs/Cli_Verbs.h"

#include <cerrno>
#include <cstring>
#include <dlfcn.h>
#include <new>

namespace KPRV::kldrcim {

namespace {

/// Without its adapter library the module loads and finds nothing, which should not look like "no adapters".
void warn_without_adapter_library(const Host& host)
{
    if (!is_own_module(host))
        return;
    if (void* library = dlopen("libdzntj.so", RTLD_NOW | RTLD_NOLOAD))
        dlclose(library);
    else
        complain("warning: the adapter library libdzntj.so is not loaded; no adapters will be seen", 0);
}

int run_verb(const Cli_Options& options)
{
    std::string error;
    Host_Options host_options;
    host_options.user = options.user;
    host_options.name_space = options.name_space;
    auto host = Host::open(options.module.empty() ? default_module() : options.module, host_options, error);
    if (!host)
        return complain("cannot load the provider module: " + error, USAGE_ERROR);
    if (!options.server_instances.empty() &&
        !read_server_instances(options.server_instances, host->catalogue(), host->store(), error))
        return complain(error, USAGE_ERROR);
    if (!is_served(*host, options.name_space, error))
        return complain(error, USAGE_ERROR);
    warn_without_adapter_library(*host);
    const int status = find_verb(options.verb)->body(options, *host);
    for (const std::string& violation : host->violations().list())
        complain("warning: the provider broke the CMPI contract: " + violation, 0);
    if (options.leaks)
        host->ledger().report(stderr);
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
                   : complain(std::string("write error: ") + std::strerror(failure.error), FAILURE);
    } catch (const std::bad_alloc&) {
        return complain("out of memory", FAILURE);
    } catch (const std::exception& error) {
        return complain(error.what(), FAILURE);
    }
}

} // namespace KPRV::kldrcim
