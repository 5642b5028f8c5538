#pragma once

#include "module/runtime/system/Standard_Mutex.h"

#include <chrono>
#include <condition_variable>
#include <map>
#include <thread>

namespace KPRV::kldrcim {

/// Cuts the connections whose client takes too long with a request: the library below counts from the last
/// byte, and a byte a second would hold a connection for ever.
class Connection_Watch
{
public:
    using Clock = std::chrono::steady_clock;

    static constexpr std::chrono::seconds first_headers{10};
    static constexpr std::chrono::seconds body{120};
    /// Until the headers of the next request.
    static constexpr std::chrono::seconds idle{15};

    Connection_Watch();
    ~Connection_Watch();
    Connection_Watch(const Connection_Watch&) = delete;
    Connection_Watch& operator=(const Connection_Watch&) = delete;

    /// From now on the socket has so long; what was said before is forgotten.
    void limit(int socket, std::chrono::seconds time);
    /// As long as it takes: the next move is ours.
    void release(int socket);

private:
    void run();

    Standard_Mutex<> _mutex;
    std::condition_variable_any _changed;
    std::map<int, Clock::time_point> _ends GUARDED_BY(_mutex);
    bool _stop GUARDED_BY(_mutex) = false;
    std::thread _thread;
};

} // namespace KPRV::kldrcim
