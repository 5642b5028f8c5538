#pragma once

#include "kldrcim/server/Body_Pipe.h"
#include "kldrcim/server/Http_Server.h"
#include "kldrcim/wire/Xml_Reader.h"

#include <thread>

struct MHD_Connection;
struct MHD_Response;

namespace KPRV::kldrcim {

/// What is known of a connection from one request to the next.
struct Http_Peer
{
    int socket = -1;
    /// The Authorization that was accepted, so that its hash is computed once.
    std::string authorization;
    std::string user;
};

/// What a request begins with.
struct Http_Line
{
    std::string method;
    /// Without what follows a question mark.
    std::string path;
    /// "HTTP/1.1".
    std::string version;
};

/// One request on a connection: its headers, its body as it comes, and the answer. Lives until all of the
/// answer has been sent.
class Http_Connection
{
public:
    Http_Connection(Http_Server& server, Http_Peer& peer, MHD_Connection* connection)
        : _server(server), _peer(peer), _connection(connection)
    {
    }
    ~Http_Connection();

    /// After the headers. False to end the connection without a word.
    bool begin(const Http_Line& line);
    /// A piece of the body. False to end the connection.
    bool body(std::string_view piece);
    /// After the body.
    bool finish();

private:
    struct Callbacks;

    /// Null for a field that there is not.
    const char* header(const char* name) const;
    /// Throws `Http_Refusal` at a client that has no business here.
    void check_client() const;
    /// Throws `Http_Refusal` at a request that is no message.
    void check_message(const std::string& method) const;
    /// True for a path that has a page.
    bool has_page(const std::string& path) const;
    /// False if the answer says that a password is needed.
    bool authenticate();
    /// Of the client, from now on; 0 for no limit.
    void limit_silence(unsigned seconds);
    void answer_page();
    void answer_message();
    void answer(const Cim_Message& message);
    /// On a thread of its own, sent while it is being made.
    void answer_in_pieces(const Cim_Message& message);
    bool refuse(const Http_Refusal& refusal);
    bool queue(unsigned status, MHD_Response* response);
    /// An answer to a message.
    bool queue_message(MHD_Response* response);
    bool send(std::string body);
    /// What comes through the pipe, and what is left behind it.
    bool send_stream();
    /// The status behind a stream; false if memory has run out.
    bool add_trailer();

    Http_Server& _server;
    Http_Peer& _peer;
    MHD_Connection* _connection;
    /// Null unless a message is expected.
    std::unique_ptr<Xml_Reader> _reader;
    std::size_t _body_size = 0;
    /// The methods that the path takes.
    const char* _allowed = "POST";
    bool _queued = false;
    /// The client reads fields behind a chunked answer.
    bool _takes_trailers = false;
    /// Of a stream, which the library owns.
    MHD_Response* _stream = nullptr;
    std::optional<std::string> _user;
    Cim_Message _message;
    Body_Pipe _pipe;
    std::string _rest;
    std::exception_ptr _failure;
    std::thread _maker;
};

} // namespace KPRV::kldrcim
