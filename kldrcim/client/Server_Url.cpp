// The address of a CIM server, as users write it.
#include "kldrcim/client/Server_Url.h"

#include <charconv>
#include <string_view>

namespace KPRV::kldrcim {

namespace {

constexpr std::uint16_t PLAIN_PORT = 5988, tls_port = 5989;

int hex_digit(char c)
{
    const std::string_view digits = "0123456789abcdef";
    const auto at = digits.find(c >= 'A' && c <= 'F' ? static_cast<char>(c - 'A' + 'a') : c);
    return at == digits.npos ? -1 : static_cast<int>(at);
}

/// With %XX as the bytes that they stand for.
std::string decoded(std::string_view text)
{
    std::string result;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool is_escape = text[i] == '%' && i + 2 < text.size() && hex_digit(text[i + 1]) >= 0 &&
                               hex_digit(text[i + 2]) >= 0;
        result +=
            is_escape ? static_cast<char>(hex_digit(text[i + 1]) * 16 + hex_digit(text[i + 2])) : text[i];
        i += is_escape ? 2 : 0;
    }
    return result;
}

bool read_port(std::string_view text, std::uint16_t& port)
{
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), port);
    return error == std::errc() && end == text.data() + text.size() && port != 0;
}

bool is_host(std::string_view text)
{
    if (text.starts_with('['))
        return text.size() > 2 && text.ends_with(']') &&
               text.find_first_not_of("0123456789abcdefABCDEF:.%", 1) == text.size() - 1;
    return !text.empty() && text.find_first_of(" /:@[]?#\\\"") == text.npos;
}

} // namespace

std::string Server_Url::text() const
{
    return (is_tls ? "https://" : "http://") + host + ":" + std::to_string(port);
}

bool Server_Url::is_loopback() const
{
    return host == "localhost" || host == "[::1]" || host.starts_with("127.");
}

bool parse_server_url(const std::string& text, Server_Url& url, std::string& error)
{
    const auto refuse = [&] {
        error = "no server address \"" + text + "\": it is http[s]://[USER@]HOST[:PORT]";
        return false;
    };
    std::string_view rest = text;
    url = {};
    url.is_tls = rest.starts_with("https://");
    if (!url.is_tls && !rest.starts_with("http://"))
        return refuse();
    rest.remove_prefix(url.is_tls ? 8 : 7);
    if (rest.ends_with('/'))
        rest.remove_suffix(1);
    if (const auto at = rest.rfind('@'); at != rest.npos) {
        const std::string_view user = rest.substr(0, at);
        if (user.find(':') != user.npos) {
            error = "a password in the server's address could be read by everybody; --password-file names a "
                    "file that holds it";
            return false;
        }
        url.user = decoded(user);
        rest.remove_prefix(at + 1);
    }
    url.port = url.is_tls ? tls_port : PLAIN_PORT;
    const auto colon = rest.rfind(':');
    if (colon != rest.npos && rest.find(']', colon) == rest.npos) {
        if (!read_port(rest.substr(colon + 1), url.port))
            return refuse();
        rest = rest.substr(0, colon);
    }
    url.host = rest;
    return is_host(rest) && (!url.user || !url.user->empty()) ? true : refuse();
}

} // namespace KPRV::kldrcim
