#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace KPRV::kldrcim {

/// Where a CIM server listens.
struct Server_Url
{
    bool is_tls = false;
    /// Decoded; nothing without one.
    std::optional<std::string> user = {};
    /// A name or an address, IPv6 in brackets.
    std::string host = {};
    std::uint16_t port = 0;

    /// "https://host:5989", without the user.
    std::string text() const;
    /// True for the addresses that do not leave this machine.
    bool is_loopback() const;
};

/// Reads http[s]://[user@]host[:port], with a slash at the end or without; the port is 5988 or 5989 where it
/// is not given. False with a one-line `error`, also for a password, which everybody could read there.
bool parse_server_url(const std::string& text, Server_Url& url, std::string& error);

} // namespace KPRV::kldrcim
