#pragma once

#include "contracts/adapter/Signatures.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <chrono>
#include <condition_variable>
#include <deque>
#include <string>
#include <thread>
#include <vector>

namespace KPRV::simulator {

/// A line of the script of an inventory: what is told to whoever wants events, and when.
struct Scripted_Event
{
    std::chrono::milliseconds after; // since the line before, or since events are wanted
    unsigned times;
    std::chrono::milliseconds every;
    std::string text;
};

/// The adapters' events on their way to the caller. They are told one at a time on a thread of the library's
/// own, which begins with the first event and ends with the process. Any thread may call anything.
class Event_Feed
{
public:
    /// From now on events are told, while there is a callback; the script begins anew. Those that occurred
    /// before, and that nobody was told, are dropped or told first.
    void want(bool drop_old_events);
    /// From now on events are kept, the latest 1,024 of them.
    void want_no_more();

    /// Waits for a call in progress, unless that is where it is called from: afterwards the callback that was
    /// there is not called any more.
    void set_callback(evtProcessCB callback);

    /// Forgets the caller, its wishes and all events. Waits for nothing.
    void reset();

    /// Takes effect the next time that events are wanted.
    void set_script(std::vector<Scripted_Event> script);

    /// An event occurs: it is told on the library's thread.
    void occur(std::string text);

    /// Tells an event on the calling thread; false if nobody wants it.
    bool tell_here(const char* text);

    bool is_wanted();
    bool has_callback();

private:
    using Clock = std::chrono::steady_clock;
    struct Due
    {
        Clock::time_point at;
        std::size_t line;
        unsigned told;
    };

    bool is_told() const REQUIRES(_mutex) { return _wanted && _callback; }
    void start_thread() REQUIRES(_mutex);
    void end_thread();
    void run();
    bool take_event(std::string& text) REQUIRES(_mutex);
    bool take_scripted(std::string& text) REQUIRES(_mutex);
    void schedule(std::size_t line, Clock::time_point from) REQUIRES(_mutex);
    void call(const char* text) REQUIRES(_mutex);

    Standard_Mutex<> _mutex;
    std::condition_variable_any _changed;
    evtProcessCB _callback GUARDED_BY(_mutex) = nullptr;
    bool _wanted GUARDED_BY(_mutex) = false;
    bool _is_script_due GUARDED_BY(_mutex) = false;
    unsigned _calls GUARDED_BY(_mutex) = 0;
    bool _has_thread GUARDED_BY(_mutex) = false;
    bool _ends GUARDED_BY(_mutex) = false;
    /// Set before the process can ask for its end.
    std::thread _thread;
    std::deque<std::string> _events GUARDED_BY(_mutex);
    std::vector<Scripted_Event> _script GUARDED_BY(_mutex);
    Due _due GUARDED_BY(_mutex) = {};
};

} // namespace KPRV::simulator
