#include "kldrcim/Cli_Serve.h"

#include "kldrcim/verbs/Cli_Complaints.h"

#ifndef KLDR_SERVE

namespace KPRV::kldrcim {

int serve(const Cli_Options&, Local_Server&)
{
    return complain("this kldrcim was built without serve: libmicrohttpd, expat or libcurl was missing",
                    USAGE_ERROR);
}

} // namespace KPRV::kldrcim

#else

#include "kldrcim/formats/Metrics_Text.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/local/Local_Connection.h"
#include "kldrcim/server/Http_Server.h"
#include "kldrcim/server/Subscriptions.h"
#include "kldrcim/verbs/Interruption.h"
#include "kldrcim/verbs/Running_Jobs.h"

#include <cerrno>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <system_error>
#include <unistd.h>

namespace KPRV::kldrcim {

namespace {

std::string own_host_name()
{
    char name[256] = {};
    return gethostname(name, sizeof name - 1) == 0 && name[0] ? name : "localhost";
}

bool read_file(const std::string& file, std::string& text, std::string& error)
{
    std::ifstream in(file, std::ios::binary);
    text.assign(std::istreambuf_iterator<char>(in), {});
    if (in.bad() || text.empty())
        error = file + ": " + (errno != 0 ? std::generic_category().message(errno) : "empty");
    return error.empty();
}

/// They are read anew for each listener: a mistake is told at once.
bool has_certificates(const std::string& file, std::string& error)
{
    std::string text;
    if (read_file(file, text, error) && text.find("CERTIFICATE-----") == std::string::npos)
        error = "--cacert: no certificates in " + file;
    return error.empty();
}

/// What stands on the command line, as the server takes it; false with `error`.
bool read_options(const Cli_Options& options, Http_Options& http, Users_File& users, std::string& error)
{
    if (!options.listen.empty() && !parse_listen(options.listen, http))
        error = "--listen takes ADDRESS:PORT, such as 127.0.0.1:5988 or [::1]:0";
    else if (options.tls_certificate.empty() != options.tls_key.empty())
        error = "--tls-cert and --tls-key go together";
    else if (!options.tls_certificate.empty() &&
             (!read_file(options.tls_certificate, http.certificate, error) ||
              !read_file(options.tls_key, http.key, error)))
        return false;
    else if (!options.ca_file.empty() && !has_certificates(options.ca_file, error))
        return false;
    else if (!options.users.empty() && users.read(options.users, error))
        http.users = &users;
    if (error.empty() && !is_loopback(http.address) && (http.certificate.empty() || !http.users))
        error = http.address + " can be reached from outside: that takes --tls and --users";
    return error.empty();
}

/// Clients look for the one or the other.
const std::vector<std::string> interop_names = {"interop", "root/interop"};

/// What the module finds when it asks its server who it is.
void tell_module(Local_Server& local, Instance_Value manager)
{
    for (const char* name_space : {"root/PG_InterOp", "root/interop"}) {
        manager.path.name_space = name_space;
        local.store().add(name_space, manager);
    }
}

/// The host in numbers, for a collector.
Http_Page metrics_page(Local_Server& local, const std::string& accept)
{
    Local_Connection connection(local);
    const Host_Readings readings = read_host(connection);
    if (readings.host.system.properties.empty())
        throw Http_Refusal{503, nullptr, "the module does not answer"};
    const Metrics_Notation notation =
        lower_name(accept).find("application/openmetrics-text") != std::string::npos
            ? Metrics_Notation::OPENMETRICS
            : Metrics_Notation::PROMETHEUS;
    return {media_type(notation), metrics_text(readings, notation)};
}

/// Enumerations that their clients have left are looked for so often.
constexpr auto SWEEP = std::chrono::seconds(5);

/// Until a signal comes; what clients have asked for is then answered.
int serve_until(Interruption& interruption, const Cli_Options& options, const Http_Options& http_options,
                Local_Server& local)
{
    std::string error;
    const std::string host_name = own_host_name();
    Broker_Space model(local);
    const Interop_Classes classes(local.catalogue());
    Server_Objects objects(host_name, KLDR_VERSION, {interop_names[0], interop_names[1], model.name()});
    tell_module(local, objects.object_manager());
    Subscriptions subscriptions(local, classes,
                                {.system_name = host_name,
                                 .interop_names = interop_names,
                                 .state_file = options.state,
                                 .log = [](const std::string& text) { complain(text, 0); },
                                 .deliver = http_delivery(options.ca_file)});
    if (!subscriptions.restore(error))
        return complain(error, FAILURE);
    Interop_Space interop(interop_names[0], classes, {&objects, &subscriptions}, model);
    Interop_Space root_interop(interop_names[1], classes, {&objects, &subscriptions}, model);
    Cim_Server server(host_name);
    server.add(model.name(), model);
    server.add(interop.name(), interop);
    server.add(root_interop.name(), root_interop);
    const auto http = Http_Server::start(server, http_options, error);
    if (!http)
        return complain(error, FAILURE);
    put("serving " + model.name() + " at " + http->url() + "\n");
    flush_output();
    while (interruption.count() == 0) {
        interruption.wait(SWEEP);
        server.pull_contexts().sweep();
    }
    return 0;
}

/// A hardware test may have taken a port out of service: this process ends when it has been brought back, or
/// with the next signal.
void wait_for_jobs(Interruption& interruption, Local_Server& local)
{
    constexpr auto MOMENT = std::chrono::milliseconds(100);
    Local_Connection connection(local);
    if (!connection.is_at_work())
        return;
    complain("waiting for the end of " + running_jobs(connection) + "; the next signal ends it as it is", 0);
    const unsigned signals = interruption.count();
    while (connection.is_at_work()) {
        interruption.wait(MOMENT);
        if (interruption.count() == signals)
            continue;
        complain("left as it is: " + running_jobs(connection), 0);
        // Not by the usual end, which would wait for the provider.
        std::_Exit(status_of_signal(interruption.latest()));
    }
}

} // namespace

int serve(const Cli_Options& options, Local_Server& local)
{
    Http_Options http_options;
    Users_File users;
    std::string error;
    if (!read_options(options, http_options, users, error))
        return complain(error, USAGE_ERROR);
    http_options.metrics = [&local](const std::string& accept) { return metrics_page(local, accept); };
    Interruption interruption;
    const int status = serve_until(interruption, options, http_options, local);
    wait_for_jobs(interruption, local);
    return status;
}

} // namespace KPRV::kldrcim

#endif
