#pragma once

#include "contracts/adapter/Signatures.h"
#include "module/runtime/Standard_Mutex.h"

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

    bool is_told() const REQUIRES(mutex_) { return wanted_ && callback_; }
    void start_thread() REQUIRES(mutex_);
    void end_thread();
    void run();
    bool take_event(std::string& text) REQUIRES(mutex_);
    bool take_scripted(std::string& text) REQUIRES(mutex_);
    void schedule(std::size_t line, Clock::time_point from) REQUIRES(mutex_);
    void call(const char* text) REQUIRES(mutex_);

    Standard_Mutex<> mutex_;
    std::condition_variable_any changed_;
    evtProcessCB callback_ GUARDED_BY(mutex_) = nullptr;
    bool wanted_ GUARDED_BY(mutex_) = false;
    bool is_script_due_ GUARDED_BY(mutex_) = false;
    unsigned calls_ GUARDED_BY(mutex_) = 0;
    bool has_thread_ GUARDED_BY(mutex_) = false;
    bool ends_ GUARDED_BY(mutex_) = false;
    /// Set before the process can ask for its end.
    std::thread thread_;
    std::deque<std::string> events_ GUARDED_BY(mutex_);
    std::vector<Scripted_Event> script_ GUARDED_BY(mutex_);
    Due due_ GUARDED_BY(mutex_) = {};
};

} // namespace KPRV::simulator
