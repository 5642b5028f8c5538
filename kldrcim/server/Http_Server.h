#pragma once

#include "kldrcim/server/Cim_Server.h"
#include "kldrcim/server/Users_File.h"

#include <atomic>
#include <functional>

struct MHD_Daemon;

namespace KPRV::kldrcim {

class Http_Connection;
class Connection_Watch;

/// What a plain GET answers.
struct Http_Page
{
    std::string media_type;
    std::string text;
};

/// Makes a page anew, on the thread of the connection that asks; several may ask at once. `accept` is the
/// field Accept, empty if there is none. Throws `Http_Refusal` if there is nothing to show.
using Http_Page_Source = std::function<Http_Page(const std::string& accept)>;

struct Http_Options
{
    /// "127.0.0.1", "[::1]" or any other; port 0 is any free one.
    std::string address = "127.0.0.1";
    std::uint16_t port = 5988;
    /// PEM texts; empty for plain HTTP.
    std::string certificate = {};
    std::string key = {};
    /// Null: nobody is asked for a password.
    const Users_File* users = nullptr;
    /// What GET /metrics answers; empty for nothing.
    Http_Page_Source metrics = {};

    unsigned connections = 64;
    /// Of one other host.
    unsigned connections_per_address = 16;
    std::size_t body_bytes = std::size_t(16) << 20;
};

/// "ADDRESS:PORT" apart, with brackets around an IPv6 address; false if it is none.
bool parse_listen(const std::string& text, Http_Options& options);
/// True for the addresses that no other host reaches.
bool is_loopback(const std::string& address);

/// The connections of a CIM server: CIM operations over HTTP, a thread a connection. What is too large, too
/// slow, or comes from a web page is refused before it is looked at.
class Http_Server
{
public:
    /// Null if it cannot listen; `error` then says why.
    static std::unique_ptr<Http_Server> start(Cim_Server& server, const Http_Options& options,
                                              std::string& error);
    /// Ends all connections; calls into providers that are under way are waited for.
    ~Http_Server();

    std::uint16_t port() const { return _port; }
    /// "http://127.0.0.1:5988".
    std::string url() const;

private:
    friend class Http_Connection;
    struct Callbacks;

    Http_Server(Cim_Server& server, const Http_Options& options);
    bool listen(std::string& error);

    Cim_Server& _server;
    Http_Options _options;
    std::uint16_t _port = 0;
    std::unique_ptr<Connection_Watch> _watch;
    MHD_Daemon* _daemon = nullptr;
};

} // namespace KPRV::kldrcim
