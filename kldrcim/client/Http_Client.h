#pragma once

#include "kldrcim/client/Server_Url.h"

#include <chrono>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace KPRV::kldrcim {

/// How a server is asked.
struct Http_Settings
{
    Server_Url url;
    std::string password = {};
    /// File of certificates that are trusted besides the system's; empty for none.
    std::string ca_file = {};
    /// Whoever answers is believed to be the server.
    bool is_insecure = false;
    /// How long a server may be silent.
    std::chrono::seconds patience = std::chrono::seconds(60);
};

/// What stands around an answer's body.
struct Http_Head
{
    int status = 0;
    /// Names in lower case; those of a trailer, too.
    std::vector<std::pair<std::string, std::string>> fields = {};

    /// Empty if it is not there.
    std::string field(std::string_view name) const;
};

struct Http_Message
{
    std::vector<std::string> fields;
    std::string body;
    /// It may be sent again on a new connection where a kept one has been closed meanwhile.
    bool may_be_repeated = true;
};

/// Who takes messages to a server.
class Http_Sender
{
public:
    /// Gets the body in pieces; false for enough. What it throws comes out of `post`.
    using Body = std::function<bool(const Http_Head& head, std::string_view piece)>;

    virtual ~Http_Sender() = default;

    /// The answer's head, whatever its status. Throws `Connection_Error` if there is no whole answer.
    virtual Http_Head post(const Http_Message& message, const Body& body, std::chrono::seconds patience) = 0;
    virtual const Http_Settings& settings() const = 0;
};

/// One connection to a server, kept from one message to the next.
class Http_Client final : public Http_Sender
{
public:
    explicit Http_Client(Http_Settings settings);
    ~Http_Client() override;
    Http_Client(const Http_Client&) = delete;
    Http_Client& operator=(const Http_Client&) = delete;

    Http_Head post(const Http_Message& message, const Body& body, std::chrono::seconds patience) override;
    const Http_Settings& settings() const override { return _settings; }
    /// The address by which this machine speaks to the server; empty before the first message.
    std::string own_address() const;

private:
    struct Exchange;

    void set_up();
    [[noreturn]] void fail(int code, const char* details, std::chrono::seconds patience) const;

    const Http_Settings _settings;
    void* const _handle;
};

} // namespace KPRV::kldrcim
