// HTTP by libcurl: messages to one server, and why one got no answer, in the user's words.
#include "kldrcim/client/Http_Client.h"

#include "kldrcim/connection/Connection.h"

#include <algorithm>
#include <curl/curl.h>
#include <new>
#include <system_error>

namespace KPRV::kldrcim {

namespace {

constexpr long seconds_to_connect = 10;

struct Free_List
{
    void operator()(curl_slist* list) const { curl_slist_free_all(list); }
};

std::unique_ptr<curl_slist, Free_List> list_of(const std::vector<std::string>& fields)
{
    std::unique_ptr<curl_slist, Free_List> list;
    for (const std::string& field : fields) {
        curl_slist* const longer = curl_slist_append(list.get(), field.c_str());
        if (!longer)
            throw std::bad_alloc();
        // What grows keeps its head.
        if (!list)
            list.reset(longer);
    }
    return list;
}

std::string trimmed(std::string_view text)
{
    const auto from = text.find_first_not_of(" \t\r\n");
    return from == text.npos ? ""
                             : std::string(text.substr(from, text.find_last_not_of(" \t\r\n") - from + 1));
}

} // namespace

/// A message under way.
struct Http_Client::Exchange
{
    const Body& body;
    void* handle;
    Http_Head head = {};
    bool has_enough = false;
    std::exception_ptr thrown = {};

    static std::size_t take_field(const char* data, std::size_t size, std::size_t count, void* self)
    {
        auto& exchange = *static_cast<Exchange*>(self);
        const std::string_view line(data, size * count);
        // Of an answer before the answer, such as 100, nothing counts.
        if (line.starts_with("HTTP/"))
            exchange.head.fields.clear();
        if (const auto colon = line.find(':'); colon != line.npos) {
            std::string name(line.substr(0, colon));
            std::ranges::transform(name, name.begin(), [](unsigned char c) { return std::tolower(c); });
            exchange.head.fields.emplace_back(std::move(name), trimmed(line.substr(colon + 1)));
        }
        return line.size();
    }

    static std::size_t take_body(const char* data, std::size_t size, std::size_t count, void* self)
    {
        auto& exchange = *static_cast<Exchange*>(self);
        long status = 0;
        curl_easy_getinfo(exchange.handle, CURLINFO_RESPONSE_CODE, &status);
        exchange.head.status = static_cast<int>(status);
        try {
            exchange.has_enough = !exchange.body(exchange.head, {data, size * count});
        } catch (...) {
            exchange.thrown = std::current_exception();
        }
        return exchange.has_enough || exchange.thrown ? CURL_WRITEFUNC_ERROR : size * count;
    }
};

std::string Http_Head::field(std::string_view name) const
{
    const auto at = std::ranges::find_if(fields, [&](const auto& field) { return field.first == name; });
    return at == fields.end() ? "" : at->second;
}

Http_Client::Http_Client(Http_Settings settings) : _settings(std::move(settings)), _handle(curl_easy_init())
{
    if (!_handle)
        throw std::bad_alloc();
    set_up();
}

Http_Client::~Http_Client()
{
    curl_easy_cleanup(_handle);
}

void Http_Client::set_up()
{
    const Server_Url& url = _settings.url;
    const auto set = [&](auto option, auto value) { curl_easy_setopt(_handle, option, value); };
    set(CURLOPT_URL, (url.text() + "/cimom").c_str());
    set(CURLOPT_PROTOCOLS_STR, "http,https");
    set(CURLOPT_HTTP_VERSION, static_cast<long>(CURL_HTTP_VERSION_1_1));
    set(CURLOPT_FOLLOWLOCATION, 0L);
    // Threads that deliver indications live beside it.
    set(CURLOPT_NOSIGNAL, 1L);
    set(CURLOPT_CONNECTTIMEOUT, seconds_to_connect);
    set(CURLOPT_LOW_SPEED_LIMIT, 1L);
    if (url.is_loopback())
        set(CURLOPT_PROXY, "");
    if (url.user) {
        set(CURLOPT_HTTPAUTH, static_cast<long>(CURLAUTH_BASIC));
        set(CURLOPT_USERNAME, url.user->c_str());
        set(CURLOPT_PASSWORD, _settings.password.c_str());
    }
    if (!_settings.ca_file.empty())
        set(CURLOPT_CAINFO, _settings.ca_file.c_str());
    if (_settings.is_insecure) {
        set(CURLOPT_SSL_VERIFYPEER, 0L);
        set(CURLOPT_SSL_VERIFYHOST, 0L);
    }
    set(CURLOPT_SSLVERSION, static_cast<long>(CURL_SSLVERSION_TLSv1_2));
    set(CURLOPT_HEADERFUNCTION, &Exchange::take_field);
    set(CURLOPT_WRITEFUNCTION, &Exchange::take_body);
}

Http_Head Http_Client::post(const Http_Message& message, const Body& body, std::chrono::seconds patience)
{
    Exchange exchange = {body, _handle};
    // Some servers refuse to be asked first, and some wait for it. Most send an answer while they make it
    // only to who reads trailers.
    std::vector<std::string> fields = {"Content-Type: application/xml; charset=\"utf-8\"",
                                       "Accept:",
                                       "Expect:",
                                       "User-Agent: kldrcim",
                                       "TE: trailers",
                                       "Connection: TE"};
    fields.insert(fields.end(), message.fields.begin(), message.fields.end());
    const auto list = list_of(fields);
    char details[CURL_ERROR_SIZE] = {};
    const auto set = [&](auto option, auto value) { curl_easy_setopt(_handle, option, value); };
    set(CURLOPT_HTTPHEADER, list.get());
    set(CURLOPT_POSTFIELDSIZE_LARGE, static_cast<curl_off_t>(message.body.size()));
    set(CURLOPT_POSTFIELDS, message.body.data());
    set(CURLOPT_FRESH_CONNECT, message.may_be_repeated ? 0L : 1L);
    set(CURLOPT_LOW_SPEED_TIME, static_cast<long>(patience.count()));
    set(CURLOPT_HEADERDATA, &exchange);
    set(CURLOPT_WRITEDATA, &exchange);
    set(CURLOPT_ERRORBUFFER, details);
    const CURLcode code = curl_easy_perform(_handle);
    if (exchange.thrown)
        std::rethrow_exception(exchange.thrown);
    if (code != CURLE_OK && !exchange.has_enough)
        fail(code, details, patience);
    long status = 0;
    curl_easy_getinfo(_handle, CURLINFO_RESPONSE_CODE, &status);
    exchange.head.status = static_cast<int>(status);
    return std::move(exchange.head);
}

std::string Http_Client::own_address() const
{
    const char* address = nullptr;
    curl_easy_getinfo(_handle, CURLINFO_LOCAL_IP, &address);
    return address ? address : "";
}

void Http_Client::fail(int code, const char* details, std::chrono::seconds patience) const
{
    const std::string where = _settings.url.text();
    long number = 0;
    curl_easy_getinfo(_handle, CURLINFO_OS_ERRNO, &number);
    const std::string why = code == CURLE_COULDNT_CONNECT && number != 0
                                ? std::generic_category().message(static_cast<int>(number))
                            : *details ? details
                                       : curl_easy_strerror(static_cast<CURLcode>(code));
    switch (code) {
    case CURLE_OUT_OF_MEMORY:
        throw std::bad_alloc();
    case CURLE_COULDNT_RESOLVE_HOST:
        throw Connection_Error("there is no host " + _settings.url.host);
    case CURLE_COULDNT_CONNECT:
        throw Connection_Error("nobody listens at " + where + ": " + why);
    case CURLE_OPERATION_TIMEDOUT:
        throw Connection_Error("no answer from " + where + " for " + std::to_string(patience.count()) +
                               " seconds; --timeout waits longer");
    case CURLE_PEER_FAILED_VERIFICATION:
        throw Connection_Error("the certificate of " + where + " is not to be trusted: " + why +
                               "; --cacert FILE names who may have signed it");
    case CURLE_SSL_CACERT_BADFILE:
        throw Connection_Error("--cacert: no certificates in " + _settings.ca_file);
    case CURLE_SSL_CONNECT_ERROR:
        throw Connection_Error("no TLS with " + where + ": " + why);
    case CURLE_WEIRD_SERVER_REPLY:
    case CURLE_UNSUPPORTED_PROTOCOL:
        throw Connection_Error(where + " is no CIM server: it does not speak HTTP");
    default:
        throw Connection_Error("the connection to " + where + " broke: " + why);
    }
}

} // namespace KPRV::kldrcim
