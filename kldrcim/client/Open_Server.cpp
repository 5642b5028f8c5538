// Opens a connection as the command line says; the only file of this folder that every build has.
#include "kldrcim/client/Open_Server.h"

#ifndef KLDR_CLIENT

namespace KPRV::kldrcim {

std::unique_ptr<Connection> open_server(const Cli_Options&, std::string& error, std::string&)
{
    error = "this kldrcim was built without --url: libcurl, expat or libmicrohttpd was missing";
    return nullptr;
}

} // namespace KPRV::kldrcim

#else

#include "kldrcim/client/Password.h"
#include "kldrcim/client/Remote_Connection.h"

namespace KPRV::kldrcim {

std::unique_ptr<Connection> open_server(const Cli_Options& options, std::string& error, std::string& warning)
{
    Http_Settings settings;
    if (!parse_server_url(options.url, settings.url, error))
        return nullptr;
    const std::string where = settings.url.text();
    if (settings.url.user) {
        const auto password =
            options.password_file.empty()
                ? password_of_terminal("Password of " + *settings.url.user + " at " + where + ": ", error)
                : password_of_file(options.password_file, error);
        if (!password)
            return nullptr;
        settings.password = *password;
        if (!settings.url.is_tls && !settings.url.is_loopback())
            warning = "the password goes to " + where + " for everybody on the way to read; https keeps it";
    } else if (!options.password_file.empty()) {
        error = "--password-file without a user: http[s]://USER@HOST";
        return nullptr;
    }
    if (options.insecure)
        warning = "--insecure: whoever answers at " + where +
                  " is taken for the server, and so may read the password and change what goes through";
    settings.ca_file = options.ca_file;
    settings.is_insecure = options.insecure;
    settings.patience = std::chrono::seconds(options.timeout);
    return std::make_unique<Remote_Connection>(settings, options.name_space);
}

} // namespace KPRV::kldrcim

#endif
