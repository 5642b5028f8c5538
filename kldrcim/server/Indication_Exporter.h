#pragma once

#include "broker/values/Value.h"
#include "module/runtime/Standard_Mutex.h"

#include <chrono>
#include <condition_variable>
#include <deque>
#include <functional>
#include <memory>
#include <thread>

namespace KPRV::kldrcim {

using namespace broker;

/// How an attempt to hand an indication over ended.
enum class Delivery
{
    /// Taken, or refused for good: the listener has seen it.
    DONE,
    /// No answer, or one that says "later".
    AGAIN,
};

/// Sends a message to a listener; gives up soon after `stop` says so.
using Delivery_Function = std::function<Delivery(const std::string& url, const std::string& message,
                                                 const std::function<bool()>& stop)>;

/// By HTTP. Whatever the URL says: no redirects, no proxies, no protocols but http and https.
Delivery deliver_by_http(const std::string& url, const std::string& message,
                         const std::function<bool()>& stop);

/// Pauses between attempts.
struct Delivery_Patience
{
    /// So many attempts in a row, then one at a time with the longer pause.
    unsigned quick = 3;
    std::chrono::milliseconds pause{1000};
    std::chrono::milliseconds long_pause{20000};
};

/// Indications on their way to one listener, in order, on a thread of their own: whoever puts one in never
/// waits. Each gets its number of the sequence when it is put in, so that a listener sees what was lost.
class Indication_Exporter
{
public:
    /// Beyond these the oldest is dropped.
    static constexpr std::size_t most_waiting = 1000;

    using Log = std::function<void(const std::string& text)>;

    /// `context` names the sequence; it is another one after each start.
    Indication_Exporter(std::string url, std::string context, Log log,
                        Delivery_Function deliver = deliver_by_http, Delivery_Patience patience = {});
    /// What still waits is lost.
    ~Indication_Exporter();
    Indication_Exporter(const Indication_Exporter&) = delete;
    Indication_Exporter& operator=(const Indication_Exporter&) = delete;

    void put(Instance_Value indication);

private:
    void run();
    bool pause(std::chrono::milliseconds time) REQUIRES(mutex_);

    const std::string url_;
    const std::string context_;
    const Log log_;
    const Delivery_Function deliver_;
    const Delivery_Patience patience_;
    Standard_Mutex<> mutex_;
    std::condition_variable_any changed_;
    std::deque<std::string> messages_ GUARDED_BY(mutex_);
    std::int64_t number_ GUARDED_BY(mutex_) = 0;
    bool overflowed_ GUARDED_BY(mutex_) = false;
    bool stop_ GUARDED_BY(mutex_) = false;
    std::thread thread_;
};

} // namespace KPRV::kldrcim
