// HTTP by libmicrohttpd, for what a CIM server sends by itself.
#include "kldrcim/client/Indication_Listener.h"

#include "kldrcim/wire/Instance_Reading.h"
#include "kldrcim/wire/Xml_Reader.h"

#include <arpa/inet.h>
#include <cstring>
#include <microhttpd.h>
#include <netinet/in.h>
#include <random>
#include <system_error>

namespace KPRV::kldrcim {

namespace {

using Tag = Xml_Tag;

constexpr std::size_t LARGEST_BODY = std::size_t(4) << 20;
constexpr unsigned CONNECTIONS = 16, seconds_of_silence = 30;

constexpr const char* taken =
    "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n"
    "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"1\" PROTOCOLVERSION=\"1.0\"><SIMPLEEXPRSP>"
    "<EXPMETHODRESPONSE NAME=\"ExportIndication\"></EXPMETHODRESPONSE></SIMPLEEXPRSP></MESSAGE></CIM>\n";

std::string random_word()
{
    std::random_device random;
    std::string word;
    for (int i = 0; i < 16; ++i)
        word += "abcdefghijklmnopqrstuvwxyz234567"[random() % 32];
    return word;
}

/// The address for `bind`, any port; false for a text that is none.
bool read_address(const std::string& text, sockaddr_storage& address)
{
    address = {};
    auto& v4 = reinterpret_cast<sockaddr_in&>(address);
    auto& v6 = reinterpret_cast<sockaddr_in6&>(address);
    if (inet_pton(AF_INET, text.c_str(), &v4.sin_addr) == 1)
        address.ss_family = AF_INET;
    else if (inet_pton(AF_INET6, text.c_str(), &v6.sin6_addr) == 1)
        address.ss_family = AF_INET6;
    return address.ss_family != 0;
}

} // namespace

struct Indication_Listener::Callbacks
{
    /// The body as it comes.
    static MHD_Result request(void* self, MHD_Connection* connection, const char* url, const char* method,
                              const char*, const char* data, std::size_t* size, void** context)
    {
        try {
            if (!*context) {
                *context = new std::string;
                return MHD_YES;
            }
            auto& body = *static_cast<std::string*>(*context);
            if (*size != 0) {
                // What is too long is read to its end and refused.
                if (body.size() <= LARGEST_BODY)
                    body.append(data, *size);
                *size = 0;
                return MHD_YES;
            }
            const bool is_post = std::strcmp(method, MHD_HTTP_METHOD_POST) == 0;
            return respond(connection, is_post ? static_cast<Indication_Listener*>(self)->take(url, body)
                                               : static_cast<unsigned>(MHD_HTTP_METHOD_NOT_ALLOWED));
        } catch (const std::exception&) {
            return MHD_NO;
        }
    }

    static MHD_Result respond(MHD_Connection* connection, unsigned status)
    {
        const char* const text = status == MHD_HTTP_OK ? taken : "";
        MHD_Response* const response = MHD_create_response_from_buffer(
            std::strlen(text), const_cast<char*>(text), MHD_RESPMEM_PERSISTENT);
        MHD_add_response_header(response, "Content-Type", "application/xml; charset=\"utf-8\"");
        MHD_add_response_header(response, "CIMExport", "MethodResponse");
        const MHD_Result queued = MHD_queue_response(connection, status, response);
        MHD_destroy_response(response);
        return queued;
    }

    static void end(void*, MHD_Connection*, void** context, MHD_RequestTerminationCode)
    {
        delete static_cast<std::string*>(*context);
    }
};

Indication_Listener::Indication_Listener(std::string address, Indication_Sink sink)
    : _address(std::move(address)), _sink(std::move(sink)), _secret(random_word())
{
}

std::unique_ptr<Indication_Listener> Indication_Listener::start(const std::string& address,
                                                                Indication_Sink sink, std::string& error)
{
    std::unique_ptr<Indication_Listener> listener(new Indication_Listener(address, std::move(sink)));
    sockaddr_storage where;
    if (!read_address(address, where)) {
        error = "cannot listen for indications at \"" + address + "\"";
        return nullptr;
    }
    const unsigned flags =
        MHD_USE_INTERNAL_POLLING_THREAD | (where.ss_family == AF_INET6 ? unsigned(MHD_USE_IPv6) : 0U);
    listener->_daemon = MHD_start_daemon(
        flags, 0, nullptr, nullptr, &Callbacks::request, listener.get(), MHD_OPTION_SOCK_ADDR,
        reinterpret_cast<sockaddr*>(&where), MHD_OPTION_CONNECTION_LIMIT, CONNECTIONS,
        MHD_OPTION_CONNECTION_TIMEOUT, seconds_of_silence, MHD_OPTION_NOTIFY_COMPLETED, &Callbacks::end,
        nullptr, MHD_OPTION_END);
    const MHD_DaemonInfo* const info =
        listener->_daemon ? MHD_get_daemon_info(listener->_daemon, MHD_DAEMON_INFO_BIND_PORT) : nullptr;
    if (!info) {
        error = "cannot listen for indications at " + address + ": " + std::generic_category().message(errno);
        return nullptr;
    }
    listener->_port = info->port;
    return listener;
}

Indication_Listener::~Indication_Listener()
{
    if (_daemon)
        MHD_stop_daemon(_daemon);
}

std::string Indication_Listener::add(const std::string& name_space)
{
    const Auto_Lock lock(_mutex);
    _name_spaces.push_back(name_space);
    const bool is_v6 = _address.find(':') != std::string::npos;
    return "http://" + (is_v6 ? "[" + _address + "]" : _address) + ":" + std::to_string(_port) + "/" +
           _secret + "/" + std::to_string(_name_spaces.size() - 1);
}

std::optional<std::string> Indication_Listener::name_space_of(const std::string& path) const
{
    const std::string head = "/" + _secret + "/";
    const Auto_Lock lock(_mutex);
    for (std::size_t i = 0; i < _name_spaces.size(); ++i)
        if (path == head + std::to_string(i))
            return _name_spaces[i];
    return std::nullopt;
}

unsigned Indication_Listener::take(const std::string& path, const std::string& body) const
{
    const auto name_space = name_space_of(path);
    if (!name_space)
        return MHD_HTTP_NOT_FOUND;
    if (body.size() > LARGEST_BODY)
        return MHD_HTTP_CONTENT_TOO_LARGE;
    Xml_Reader reader;
    if (!reader.feed(body) || !reader.finish())
        return MHD_HTTP_BAD_REQUEST;
    const Xml_Node instance = reader.document()
                                  .root()
                                  .child(Tag::MESSAGE)
                                  .child(Tag::SIMPLEEXPREQ)
                                  .child(Tag::EXPMETHODCALL)
                                  .child(Tag::EXPPARAMVALUE)
                                  .child(Tag::INSTANCE);
    if (!instance)
        return MHD_HTTP_BAD_REQUEST;
    try {
        const No_Catalogue no_classes;
        Instance_Value indication = Instance_Reader(no_classes).instance(instance);
        indication.path.name_space = *name_space;
        _sink(*name_space, indication);
    } catch (const Wire_Error&) {
        return MHD_HTTP_BAD_REQUEST;
    }
    return MHD_HTTP_OK;
}

} // namespace KPRV::kldrcim
