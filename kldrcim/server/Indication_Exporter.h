#pragma once

#include "broker/values/Plain_Value.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <chrono>
#include <condition_variable>
#include <deque>
#include <functional>
#include <memory>
#include <thread>

namespace KPRV::kldrcim {

using namespace broker;

/// How an attempt to hand an indication over ended.
struct Delivery
{
    /// Taken, or refused for good: the listener has seen it. Else it is tried again.
    bool is_done = true;
    /// Why there was no answer, or none that counts.
    std::string why = {};
};

/// Sends a message to a listener; gives up soon after `stop` says so.
using Delivery_Function = std::function<Delivery(const std::string& url, const std::string& message,
                                                 const std::function<bool()>& stop)>;

/// By HTTP. Whatever the URL says: no redirects, no proxies, no protocols but http and https. `ca_file` has
/// the certificates by which those of listeners may be signed, empty for the system's.
Delivery_Function http_delivery(std::string ca_file = {});

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
    static constexpr std::size_t MOST_WAITING = 1000;

    using Log = std::function<void(const std::string& text)>;

    /// `context` names the sequence; it is another one after each start.
    Indication_Exporter(std::string url, std::string context, Log log,
                        Delivery_Function deliver = http_delivery(), Delivery_Patience patience = {});
    /// What still waits is lost.
    ~Indication_Exporter();
    Indication_Exporter(const Indication_Exporter&) = delete;
    Indication_Exporter& operator=(const Indication_Exporter&) = delete;

    void put(Instance_Value indication);

private:
    void run();
    bool pause(std::chrono::milliseconds time) REQUIRES(_mutex);

    const std::string _url;
    const std::string _context;
    const Log _log;
    const Delivery_Function _deliver;
    const Delivery_Patience _patience;
    Standard_Mutex<> _mutex;
    std::condition_variable_any _changed;
    std::deque<std::string> _messages GUARDED_BY(_mutex);
    std::int64_t _number GUARDED_BY(_mutex) = 0;
    bool _overflowed GUARDED_BY(_mutex) = false;
    bool _stop GUARDED_BY(_mutex) = false;
    std::thread _thread;
};

} // namespace KPRV::kldrcim
