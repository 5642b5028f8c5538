#include "kldrcim/server/Http_Server.h"

#include "kldrcim/server/Connection_Watch.h"
#include "kldrcim/server/Http_Connection.h"

#include <arpa/inet.h>
#include <cerrno>
#include <charconv>
#include <microhttpd.h>
#include <netinet/in.h>
#include <system_error>

namespace KPRV::kldrcim {

namespace {

/// A header block that is larger does not fit.
constexpr std::size_t CONNECTION_MEMORY = std::size_t(48) << 10;
/// Without a byte, in either direction.
constexpr unsigned IDLE_LIMIT = 30;

union Socket_Address
{
    sockaddr any;
    sockaddr_in v4;
    sockaddr_in6 v6;
};

std::string without_brackets(const std::string& address)
{
    return address.starts_with('[') && address.ends_with(']') ? address.substr(1, address.size() - 2)
                                                              : address;
}

bool socket_address(const Http_Options& options, Socket_Address& address)
{
    const std::string text = options.address == "localhost" ? "127.0.0.1" : without_brackets(options.address);
    address = {};
    if (inet_pton(AF_INET, text.c_str(), &address.v4.sin_addr) == 1) {
        address.v4.sin_family = AF_INET;
        address.v4.sin_port = htons(options.port);
        return true;
    }
    if (inet_pton(AF_INET6, text.c_str(), &address.v6.sin6_addr) != 1)
        return false;
    address.v6.sin6_family = AF_INET6;
    address.v6.sin6_port = htons(options.port);
    return true;
}

} // namespace

bool is_loopback(const std::string& address)
{
    const std::string text = without_brackets(address);
    in_addr v4;
    if (inet_pton(AF_INET, text.c_str(), &v4) == 1)
        return ntohl(v4.s_addr) >> 24 == 127;
    return address == "localhost" || text == "::1";
}

bool parse_listen(const std::string& text, Http_Options& options)
{
    const std::size_t colon = text.rfind(':');
    if (colon == std::string::npos || colon == 0)
        return false;
    const char* end = text.data() + text.size();
    const auto [at, error] = std::from_chars(text.data() + colon + 1, end, options.port);
    options.address = text.substr(0, colon);
    Socket_Address address;
    return error == std::errc() && at == end && socket_address(options, address) &&
           (options.address.find(':') == std::string::npos || options.address.starts_with('['));
}

/// What the library calls. It is C: nothing is thrown through it.
struct Http_Server::Callbacks
{
    static void connection(void* data, MHD_Connection* connection, void** context,
                           MHD_ConnectionNotificationCode code)
    {
        auto& server = *static_cast<Http_Server*>(data);
        const MHD_ConnectionInfo* info =
            MHD_get_connection_info(connection, MHD_CONNECTION_INFO_CONNECTION_FD);
        if (code == MHD_CONNECTION_NOTIFY_STARTED) {
            auto* peer = new (std::nothrow) Http_Peer;
            *context = peer;
            if (!peer || !info)
                return;
            peer->socket = info->connect_fd;
            server._watch->limit(peer->socket, Connection_Watch::first_headers);
            return;
        }
        auto* peer = static_cast<Http_Peer*>(*context);
        if (peer && peer->socket >= 0)
            server._watch->release(peer->socket);
        delete peer;
        *context = nullptr;
    }

    static MHD_Result request(void* data, MHD_Connection* connection, const char* path, const char* method,
                              const char* version, const char* upload, std::size_t* upload_size,
                              void** request)
    {
        try {
            return step(*static_cast<Http_Server*>(data), connection, {method, path, version}, upload,
                        *upload_size, *request)
                       ? (*upload_size = 0, MHD_YES)
                       : MHD_NO;
        } catch (const std::exception&) {
            // Out of memory: this connection ends, the others go on.
            return MHD_NO;
        }
    }

    static bool step(Http_Server& server, MHD_Connection* connection, const Http_Line& line,
                     const char* upload, std::size_t size, void*& request)
    {
        auto* current = static_cast<Http_Connection*>(request);
        if (current)
            return size != 0 ? current->body({upload, size}) : current->finish();
        const MHD_ConnectionInfo* info =
            MHD_get_connection_info(connection, MHD_CONNECTION_INFO_SOCKET_CONTEXT);
        if (!info || !info->socket_context)
            return false;
        current = new Http_Connection(server, *static_cast<Http_Peer*>(info->socket_context), connection);
        request = current;
        return current->begin(line);
    }

    static void completed(void*, MHD_Connection*, void** request, MHD_RequestTerminationCode)
    {
        delete static_cast<Http_Connection*>(*request);
        *request = nullptr;
    }
};

Http_Server::Http_Server(Cim_Server& server, const Http_Options& options)
    : _server(server), _options(options), _watch(std::make_unique<Connection_Watch>())
{
}

Http_Server::~Http_Server()
{
    if (_daemon)
        MHD_stop_daemon(_daemon);
}

bool Http_Server::listen(std::string& error)
{
    Socket_Address address;
    if (!socket_address(_options, address)) {
        error = "no address: " + _options.address;
        return false;
    }
    unsigned flags = MHD_USE_INTERNAL_POLLING_THREAD | MHD_USE_THREAD_PER_CONNECTION | MHD_USE_POLL;
    if (address.any.sa_family == AF_INET6)
        flags |= MHD_USE_IPv6;
    std::vector<MHD_OptionItem> more;
    if (!_options.certificate.empty()) {
        flags |= MHD_USE_TLS;
        more.push_back({MHD_OPTION_HTTPS_MEM_CERT, 0, _options.certificate.data()});
        more.push_back({MHD_OPTION_HTTPS_MEM_KEY, 0, _options.key.data()});
        static char priorities[] = "NORMAL:-VERS-ALL:+VERS-TLS1.3:+VERS-TLS1.2";
        more.push_back({MHD_OPTION_HTTPS_PRIORITIES, 0, priorities});
    }
    if (!is_loopback(_options.address))
        more.push_back({MHD_OPTION_PER_IP_CONNECTION_LIMIT,
                        static_cast<intptr_t>(_options.connections_per_address), nullptr});
    more.push_back({MHD_OPTION_END, 0, nullptr});
    errno = 0;
    _daemon = MHD_start_daemon(
        flags, _options.port, nullptr, nullptr, Callbacks::request, this, MHD_OPTION_SOCK_ADDR, &address.any,
        MHD_OPTION_CONNECTION_LIMIT, _options.connections, MHD_OPTION_CONNECTION_TIMEOUT, IDLE_LIMIT,
        MHD_OPTION_CONNECTION_MEMORY_LIMIT, CONNECTION_MEMORY, MHD_OPTION_LISTENING_ADDRESS_REUSE, 1U,
        MHD_OPTION_NOTIFY_CONNECTION, Callbacks::connection, this, MHD_OPTION_NOTIFY_COMPLETED,
        Callbacks::completed, nullptr, MHD_OPTION_ARRAY, more.data(), MHD_OPTION_END);
    if (!_daemon) {
        error =
            "cannot listen on " + _options.address + ":" + std::to_string(_options.port) + ": " +
            (errno != 0 ? std::generic_category().message(errno) : "the certificate or key cannot be used");
        return false;
    }
    _port = MHD_get_daemon_info(_daemon, MHD_DAEMON_INFO_BIND_PORT)->port;
    return true;
}

std::unique_ptr<Http_Server> Http_Server::start(Cim_Server& server, const Http_Options& options,
                                                std::string& error)
{
    std::unique_ptr<Http_Server> http(new Http_Server(server, options));
    return http->listen(error) ? std::move(http) : nullptr;
}

std::string Http_Server::url() const
{
    return (_options.certificate.empty() ? "http://" : "https://") + _options.address + ":" +
           std::to_string(_port);
}

} // namespace KPRV::kldrcim
