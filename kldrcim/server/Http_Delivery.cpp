// How an indication goes out to one listener, over HTTP.

#include "kldrcim/server/Indication_Exporter.h"

#include <curl/curl.h>
#include <memory>

namespace KPRV::kldrcim {

namespace {

constexpr long connect_seconds = 5, total_seconds = 10;
/// Of an answer; the rest is not read.
constexpr std::size_t MOST_ANSWER = std::size_t(64) << 10;
constexpr long server_error = 500;

struct Exchange
{
    const std::function<bool()>& stop;
    std::size_t received = 0;
};

std::size_t take(const char*, std::size_t size, std::size_t count, void* data)
{
    auto& exchange = *static_cast<Exchange*>(data);
    exchange.received += size * count;
    return exchange.received > MOST_ANSWER ? 0 : size * count;
}

int progress(void* data, curl_off_t, curl_off_t, curl_off_t, curl_off_t)
{
    return static_cast<Exchange*>(data)->stop() ? 1 : 0;
}

struct Free_Curl
{
    void operator()(CURL* curl) const { curl_easy_cleanup(curl); }
    void operator()(curl_slist* list) const { curl_slist_free_all(list); }
};

/// One for each thread, which keeps its connection to the listener.
CURL* own_handle()
{
    thread_local const std::unique_ptr<CURL, Free_Curl> handle(curl_easy_init());
    return handle.get();
}

std::string trouble(CURLcode code, const char* details, const std::string& ca_file)
{
    const std::string why = *details ? details : curl_easy_strerror(code);
    if (code == CURLE_PEER_FAILED_VERIFICATION)
        return "its certificate is not to be trusted: " + why +
               "; --cacert FILE names who may have signed it";
    return code == CURLE_SSL_CACERT_BADFILE ? "--cacert: no certificates in " + ca_file : why;
}

Delivery deliver(const std::string& ca_file, const std::string& url, const std::string& message,
                 const std::function<bool()>& stop)
{
    CURL* const curl = own_handle();
    if (!curl)
        return {.is_done = false, .why = "no memory"};
    std::unique_ptr<curl_slist, Free_Curl> headers;
    for (const char* line : {"Content-Type: application/xml; charset=\"utf-8\"", "CIMProtocolVersion: 1.0",
                             "CIMExport: MethodRequest", "CIMExportMethod: ExportIndication", "Expect:"})
        headers.reset(curl_slist_append(headers.release(), line));
    Exchange exchange{stop};
    char details[CURL_ERROR_SIZE] = {};
    curl_easy_setopt(curl, CURLOPT_ERRORBUFFER, details);
    if (!ca_file.empty())
        curl_easy_setopt(curl, CURLOPT_CAINFO, ca_file.c_str());
    curl_easy_setopt(curl, CURLOPT_URL, url.c_str());
    curl_easy_setopt(curl, CURLOPT_PROTOCOLS_STR, "http,https");
    curl_easy_setopt(curl, CURLOPT_FOLLOWLOCATION, 0L);
    curl_easy_setopt(curl, CURLOPT_PROXY, "");
    curl_easy_setopt(curl, CURLOPT_NOSIGNAL, 1L);
    curl_easy_setopt(curl, CURLOPT_HTTPHEADER, headers.get());
    curl_easy_setopt(curl, CURLOPT_POSTFIELDS, message.c_str());
    curl_easy_setopt(curl, CURLOPT_POSTFIELDSIZE_LARGE, static_cast<curl_off_t>(message.size()));
    curl_easy_setopt(curl, CURLOPT_CONNECTTIMEOUT, connect_seconds);
    curl_easy_setopt(curl, CURLOPT_TIMEOUT, total_seconds);
    curl_easy_setopt(curl, CURLOPT_WRITEFUNCTION, take);
    curl_easy_setopt(curl, CURLOPT_WRITEDATA, &exchange);
    curl_easy_setopt(curl, CURLOPT_NOPROGRESS, 0L);
    curl_easy_setopt(curl, CURLOPT_XFERINFOFUNCTION, progress);
    curl_easy_setopt(curl, CURLOPT_XFERINFODATA, &exchange);
    const CURLcode code = curl_easy_perform(curl);
    long status = 0;
    curl_easy_getinfo(curl, CURLINFO_RESPONSE_CODE, &status);
    const bool answered = code == CURLE_OK || (code == CURLE_WRITE_ERROR && exchange.received > MOST_ANSWER);
    // The handle outlives what it was given.
    curl_easy_reset(curl);
    if (!answered)
        return {.is_done = false, .why = trouble(code, details, ca_file)};
    if (status >= server_error)
        return {.is_done = false, .why = "it answers with status " + std::to_string(status)};
    return {};
}

} // namespace

Delivery_Function http_delivery(std::string ca_file)
{
    return [ca_file = std::move(ca_file)](const std::string& url, const std::string& message,
                                          const std::function<bool()>& stop) {
        return deliver(ca_file, url, message, stop);
    };
}

} // namespace KPRV::kldrcim
