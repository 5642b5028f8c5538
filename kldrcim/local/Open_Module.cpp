#include "kldrcim/local/Open_Module.h"

#include "kldrcim/local/Module_Search.h"
#include "kldrcim/local/Server_Instances_File.h"

#include <dlfcn.h>

namespace KPRV::kldrcim {

namespace {

bool is_loaded(const char* library)
{
    void* const handle = dlopen(library, RTLD_NOW | RTLD_NOLOAD);
    if (handle)
        dlclose(handle);
    return handle;
}

} // namespace

std::unique_ptr<Local_Connection> open_module(const Cli_Options& options, std::string& error,
                                              std::string& warning)
{
    Server_Options server_options;
    server_options.user = options.user;
    server_options.name_space = options.name_space;
    // A large answer should not be outweighed by what remembers its objects, nor should what runs for months.
    server_options.most_shells = options.verb == "serve" ? 1 << 10 : 1 << 14;
    server_options.most_object_memory = std::size_t(options.verb == "serve" ? 16 : 4) << 20;
    std::unique_ptr<Local_Server> server =
        Local_Server::open(options.module.empty() ? default_module() : options.module, server_options, error);
    if (!server) {
        error = "cannot load the provider module: " + error;
        return nullptr;
    }
    if (!options.server_instances.empty() &&
        !read_server_instances(options.server_instances, server->catalogue(), server->store(), error))
        return nullptr;
    auto connection = std::make_unique<Local_Connection>(std::move(server));
    if (!connection->serves(options.name_space, error))
        return nullptr;
    // Without its adapter library the module loads and finds nothing, which should not look like "no
    // adapters".
    if (connection->is_own_module() && !is_loaded("libdzntj.so"))
        warning = "the adapter library libdzntj.so is not loaded; no adapters will be seen";
    return connection;
}

} // namespace KPRV::kldrcim
