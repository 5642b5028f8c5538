#include "kldrcim/server/Http_Connection.h"

#include "broker/Call_Frame.h"
#include "kldrcim/server/Connection_Watch.h"

#include <algorithm>
#include <cstring>
#include <microhttpd.h>

namespace KPRV::kldrcim {

namespace {

constexpr std::size_t STREAMED_PIECE = std::size_t(64) << 10;
constexpr std::size_t MOST_HEADER_BYTES = std::size_t(16) << 10;
constexpr unsigned MOST_HEADERS = 100;
/// Of a client that sends on after it has been refused.
constexpr std::size_t MOST_IGNORED = std::size_t(1) << 20;
/// Of a text that stands in a trailer.
constexpr std::size_t LONGEST_STATUS = 2000;
constexpr std::chrono::seconds failed_login_pause{1};
constexpr unsigned IDLE_SECONDS = 30;
constexpr const char* metrics_path = "/metrics";

std::string percent_encoded(const std::string& text)
{
    static constexpr char digits[] = "0123456789ABCDEF";
    std::string result;
    for (const char c : text) {
        const auto byte = static_cast<unsigned char>(c);
        if (byte > 0x20 && byte < 0x7F && c != '%')
            result += c;
        else
            (((result += '%') += digits[byte >> 4]) += digits[byte & 15]);
    }
    return result;
}

struct Header_Size
{
    std::size_t bytes = 0;
    unsigned count = 0;
};

MHD_Result add_size(void* data, MHD_ValueKind, const char* name, const char* value)
{
    auto& size = *static_cast<Header_Size*>(data);
    size.bytes += std::strlen(name) + (value ? std::strlen(value) : 0) + 4;
    ++size.count;
    return MHD_YES;
}

/// Without port.
std::string host_of(std::string_view header)
{
    if (header.starts_with('['))
        return std::string(header.substr(0, header.find(']') + 1));
    return std::string(header.substr(0, header.find(':')));
}

/// Of a list with commas; null is an empty one.
bool has_word(const char* list, std::string_view wanted)
{
    for (std::string_view rest = list ? list : ""; !rest.empty();) {
        std::string_view word = rest.substr(0, rest.find(','));
        rest.remove_prefix(std::min(rest.size(), word.size() + 1));
        word.remove_prefix(std::min(word.size(), word.find_first_not_of(" \t")));
        if (same_name(word.substr(0, word.find_first_of(" \t;")), wanted))
            return true;
    }
    return false;
}

bool is_xml_in_utf8(std::string_view type)
{
    const std::string lower = lower_name(type);
    const std::string media = lower.substr(0, lower.find_first_of("; "));
    const std::size_t charset = lower.find("charset=");
    return (media == "application/xml" || media == "text/xml") &&
           (charset == std::string::npos || lower.find("utf-8", charset) != std::string::npos);
}

} // namespace

struct Http_Connection::Callbacks
{
    static ssize_t read(void* data, std::uint64_t, char* buffer, std::size_t size)
    {
        auto& self = *static_cast<Http_Connection*>(data);
        // A provider may be silent between two objects for longer than a client may be.
        self.limit_silence(0);
        const std::size_t count = self._pipe.read(buffer, size);
        self.limit_silence(IDLE_SECONDS);
        if (count != 0)
            return static_cast<ssize_t>(count);
        if (self._pipe.is_broken())
            return MHD_CONTENT_READER_END_WITH_ERROR;
        const std::size_t rest = self._rest.copy(buffer, size);
        self._rest.erase(0, rest);
        if (rest != 0)
            return static_cast<ssize_t>(rest);
        return self.add_trailer() ? MHD_CONTENT_READER_END_OF_STREAM : MHD_CONTENT_READER_END_WITH_ERROR;
    }
};

Http_Connection::~Http_Connection()
{
    _pipe.close();
    if (_maker.joinable())
        _maker.join();
    _server._watch->limit(_peer.socket, Connection_Watch::idle);
}

const char* Http_Connection::header(const char* name) const
{
    return MHD_lookup_connection_value(_connection, MHD_HEADER_KIND, name);
}

void Http_Connection::check_client() const
{
    Header_Size size;
    MHD_get_connection_values(_connection, MHD_HEADER_KIND, add_size, &size);
    if (size.bytes > MOST_HEADER_BYTES || size.count > MOST_HEADERS)
        throw Http_Refusal{431, nullptr, "too many header fields"};
    // A page in a browser, which can reach what is on its own host.
    if (header("Origin"))
        throw Http_Refusal{403, nullptr, "not for web pages"};
    const std::string host = host_of(header("Host") ? header("Host") : "localhost");
    if (is_loopback(_server._options.address) && !is_loopback(host) && !same_name(host, "localhost") &&
        !same_name(host, _server._server.host_name()))
        throw Http_Refusal{403, nullptr, "the header Host names another host"};
}

bool Http_Connection::has_page(const std::string& path) const
{
    return _server._options.metrics && path == metrics_path;
}

void Http_Connection::check_message(const std::string& method) const
{
    if (method == "M-POST")
        throw Http_Refusal{501, nullptr, "POST alone is known"};
    if (method != "POST")
        throw Http_Refusal{405, nullptr, "the header Allow names the methods that are known here"};
    const char* length = header("Content-Length");
    if (length && header("Transfer-Encoding"))
        throw Http_Refusal{400, nullptr, "two ways to tell the length"};
    if (length && std::strtoull(length, nullptr, 10) > _server._options.body_bytes)
        throw Http_Refusal{413, nullptr, "the body is too long"};
    if (const char* encoding = header("Content-Encoding"); encoding && !same_name(encoding, "identity"))
        throw Http_Refusal{415, nullptr, "no encoding of the body is known"};
    if (const char* type = header("Content-Type"); type && !is_xml_in_utf8(type))
        throw Http_Refusal{415, nullptr, "application/xml in UTF-8 is expected"};
}

bool Http_Connection::authenticate()
{
    if (!_server._options.users)
        return true;
    const char* authorization = header("Authorization");
    if (authorization && _peer.authorization == authorization) {
        _user = _peer.user;
        return true;
    }
    char* password = nullptr;
    char* user = authorization ? MHD_basic_auth_get_username_password(_connection, &password) : nullptr;
    const bool accepted = user && _server._options.users->accepts(user, password ? password : "");
    if (accepted) {
        _peer.authorization = authorization;
        _peer.user = user;
        _user = user;
    }
    if (user)
        MHD_free(user);
    if (password)
        MHD_free(password);
    // Who tries passwords waits for each.
    if (!accepted && authorization)
        std::this_thread::sleep_for(failed_login_pause);
    return accepted;
}

bool Http_Connection::begin(const Http_Line& line)
{
    _takes_trailers = line.version == MHD_HTTP_VERSION_1_1 && has_word(header("TE"), "trailers");
    _server._watch->limit(_peer.socket, Connection_Watch::body);
    const bool is_message = !has_page(line.path) || (line.method != "GET" && line.method != "HEAD");
    _allowed = has_page(line.path) ? "GET, HEAD, POST" : "POST";
    try {
        check_client();
        if (is_message)
            check_message(line.method);
    } catch (const Http_Refusal& refusal) {
        return refuse(refusal);
    }
    if (!authenticate())
        return refuse({401, nullptr, ""});
    if (is_message)
        _reader = std::make_unique<Xml_Reader>(Xml_Limits{.bytes = _server._options.body_bytes});
    return true;
}

bool Http_Connection::body(std::string_view piece)
{
    _body_size += piece.size();
    if (!_queued && _reader && _reader->fault() == Xml_Fault::NONE)
        _reader->feed(piece);
    else if (_body_size > _server._options.body_bytes + MOST_IGNORED)
        return false;
    return true;
}

bool Http_Connection::finish()
{
    if (_queued)
        return true;
    // From here on it is us who take time.
    _server._watch->release(_peer.socket);
    limit_silence(0);
    try {
        if (_reader)
            answer_message();
        else
            answer_page();
    } catch (const Http_Refusal& refusal) {
        refuse(refusal);
    }
    limit_silence(IDLE_SECONDS);
    return _queued;
}

void Http_Connection::limit_silence(unsigned seconds)
{
    MHD_set_connection_option(_connection, MHD_CONNECTION_OPTION_TIMEOUT, seconds);
}

void Http_Connection::answer_page()
{
    const char* const accept = header("Accept");
    Http_Page page = _server._options.metrics(accept ? accept : "");
    MHD_Response* const response =
        MHD_create_response_from_buffer(page.text.size(), page.text.data(), MHD_RESPMEM_MUST_COPY);
    if (response)
        MHD_add_response_header(response, "Content-Type", page.media_type.c_str());
    queue(MHD_HTTP_OK, response);
}

void Http_Connection::answer_message()
{
    if (!_reader->finish())
        throw Http_Refusal{_reader->fault() == Xml_Fault::TOO_LARGE ? 413U : 400U,
                           _reader->fault() == Xml_Fault::NOT_VALID ? "request-not-valid"
                                                                    : "request-not-well-formed",
                           _reader->fault_text()};
    _message = read_message(_reader->document());
    check_headers({.operation = header("CIMOperation"),
                   .method = header("CIMMethod"),
                   .object = header("CIMObject"),
                   .protocol_version = header("CIMProtocolVersion"),
                   .batch = header("CIMBatch")},
                  _message);
    answer(_message);
}

void Http_Connection::answer(const Cim_Message& message)
{
    if (_takes_trailers)
        _pipe.allow_status();
    if (Cim_Server::may_be_long(message))
        return answer_in_pieces(message);
    Cim_Server::Reply reply = _server._server.answer(message, _user, _pipe);
    // A short operation that has become long after all.
    _pipe.finish(reply.broken);
    _rest = std::move(reply.body);
    if (_pipe.wait())
        send_stream();
    else
        send(std::move(_rest));
}

void Http_Connection::answer_in_pieces(const Cim_Message& message)
{
    _maker = std::thread([this, &message] {
        // Nobody waits until what a large enumeration has left is freed.
        const Late_Freeing later;
        bool broken = true;
        try {
            Cim_Server::Reply reply = _server._server.answer(message, _user, _pipe);
            _rest = std::move(reply.body);
            broken = reply.broken;
        } catch (...) {
            _failure = std::current_exception();
        }
        _pipe.finish(broken);
    });
    if (_pipe.wait()) {
        send_stream();
        return;
    }
    _maker.join();
    if (_failure)
        std::rethrow_exception(_failure);
    send(std::move(_rest));
}

bool Http_Connection::queue(unsigned status, MHD_Response* response)
{
    if (!response)
        return false;
    _queued = MHD_queue_response(_connection, status, response) == MHD_YES;
    MHD_destroy_response(response);
    return _queued;
}

bool Http_Connection::queue_message(MHD_Response* response)
{
    if (response) {
        MHD_add_response_header(response, "Content-Type", "application/xml; charset=\"utf-8\"");
        MHD_add_response_header(response, "CIMOperation", "MethodResponse");
    }
    return queue(MHD_HTTP_OK, response);
}

bool Http_Connection::send(std::string body)
{
    return queue_message(MHD_create_response_from_buffer(body.size(), body.data(), MHD_RESPMEM_MUST_COPY));
}

bool Http_Connection::send_stream()
{
    _stream =
        MHD_create_response_from_callback(MHD_SIZE_UNKNOWN, STREAMED_PIECE, Callbacks::read, this, nullptr);
    if (_stream && _takes_trailers)
        MHD_add_response_header(_stream, "Trailer", "CIMStatusCode, CIMStatusCodeDescription");
    return queue_message(_stream);
}

bool Http_Connection::add_trailer()
{
    const Body_Pipe::Status status = _pipe.status();
    if (status.rc == CMPI_RC_OK)
        return true;
    return MHD_add_response_footer(_stream, "CIMStatusCode", std::to_string(status.rc).c_str()) == MHD_YES &&
           MHD_add_response_footer(_stream, "CIMStatusCodeDescription",
                                   percent_encoded(status.text.substr(0, LONGEST_STATUS)).c_str()) == MHD_YES;
}

bool Http_Connection::refuse(const Http_Refusal& refusal)
{
    MHD_Response* response = MHD_create_response_from_buffer(0, nullptr, MHD_RESPMEM_PERSISTENT);
    if (!response)
        return false;
    if (refusal.cim_error)
        MHD_add_response_header(response, "CIMError", refusal.cim_error);
    if (!refusal.text.empty())
        MHD_add_response_header(response, "PGErrorDetail", percent_encoded(refusal.text).c_str());
    if (refusal.status == MHD_HTTP_METHOD_NOT_ALLOWED)
        MHD_add_response_header(response, "Allow", _allowed);
    if (refusal.status == MHD_HTTP_UNAUTHORIZED)
        MHD_add_response_header(response, "WWW-Authenticate", "Basic realm=\"kldrcim\", charset=\"UTF-8\"");
    MHD_add_response_header(response, "Connection", "close");
    return queue(refusal.status, response);
}

} // namespace KPRV::kldrcim
