#include "simulator/Event_Feed.h"

#include <cstdio>
#include <cstdlib>
#include <exception>
#include <thread>

namespace KPRV::simulator {

namespace {

constexpr std::size_t MOST_KEPT = 1024;

// Calls of the callback that this thread is in.
thread_local unsigned calls_here = 0;

} // namespace

void Event_Feed::want(bool drop_old_events)
{
    const Auto_Lock lock(_mutex);
    if (drop_old_events)
        _events.clear();
    _wanted = true;
    _is_script_due = false;
    if (!_script.empty())
        schedule(0, Clock::now());
    if (_is_script_due || !_events.empty())
        start_thread();
    _changed.notify_all();
}

void Event_Feed::want_no_more()
{
    const Auto_Lock lock(_mutex);
    _wanted = false;
    _is_script_due = false;
    _changed.notify_all();
}

void Event_Feed::set_callback(evtProcessCB callback)
{
    const Auto_Lock lock(_mutex);
    _callback = callback;
    _changed.notify_all();
    while (_calls > calls_here)
        _changed.wait(_mutex);
}

void Event_Feed::reset()
{
    const Auto_Lock lock(_mutex);
    _callback = nullptr;
    _wanted = false;
    _is_script_due = false;
    _events.clear();
    _changed.notify_all();
}

void Event_Feed::set_script(std::vector<Scripted_Event> script)
{
    const Auto_Lock lock(_mutex);
    _script = std::move(script);
    _is_script_due = false;
}

void Event_Feed::occur(std::string text)
{
    const Auto_Lock lock(_mutex);
    _events.push_back(std::move(text));
    if (!_wanted && _events.size() > MOST_KEPT)
        _events.pop_front();
    start_thread();
    _changed.notify_all();
}

bool Event_Feed::tell_here(const char* text)
{
    const Auto_Lock lock(_mutex);
    if (!is_told())
        return false;
    call(text);
    return true;
}

bool Event_Feed::is_wanted()
{
    const Auto_Lock lock(_mutex);
    return _wanted;
}

bool Event_Feed::has_callback()
{
    const Auto_Lock lock(_mutex);
    return _callback != nullptr;
}

void Event_Feed::start_thread()
{
    if (_has_thread)
        return;
    _has_thread = true;
    _thread = std::thread([this] { run(); });
    // The library is never unloaded; its thread ends with the process, before what watches over that looks
    // for threads.
    static Event_Feed* feed;
    feed = this;
    std::atexit([] { feed->end_thread(); });
}

void Event_Feed::end_thread()
{
    if (std::this_thread::get_id() == _thread.get_id())
        return;
    {
        const Auto_Lock lock(_mutex);
        _ends = true;
    }
    _changed.notify_all();
    _thread.join();
}

void Event_Feed::run()
{
    const Auto_Lock lock(_mutex);
    while (!_ends) {
        std::string text;
        if (!take_event(text))
            continue;
        try {
            call(text.c_str());
        } catch (const std::exception& error) {
            std::fprintf(stderr, "simulator: the receiver of an event threw: %s\n", error.what());
        } catch (...) {
            std::fprintf(stderr, "simulator: the receiver of an event threw\n");
        }
    }
}

// Waits until there may be something to tell.
bool Event_Feed::take_event(std::string& text)
{
    if (is_told() && !_events.empty()) {
        text = std::move(_events.front());
        _events.pop_front();
        return true;
    }
    if (is_told() && _is_script_due && Clock::now() >= _due.at)
        return take_scripted(text);
    // A copy: the time may change while this waits.
    if (const Clock::time_point at = _due.at; is_told() && _is_script_due)
        _changed.wait_until(_mutex, at);
    else
        _changed.wait(_mutex);
    return false;
}

bool Event_Feed::take_scripted(std::string& text)
{
    const Scripted_Event& line = _script[_due.line];
    if (_due.told < line.times) {
        text = line.text;
        _due.at += line.every;
        ++_due.told;
    }
    if (_due.told < line.times)
        return true;
    // The pause of a line counts from the last event of the line before.
    const bool is_told_now = !text.empty();
    _is_script_due = false;
    if (_due.line + 1 < _script.size())
        schedule(_due.line + 1, _due.at - line.every);
    return is_told_now;
}

void Event_Feed::schedule(std::size_t line, Clock::time_point from)
{
    _due = {from + _script[line].after, line, 0};
    _is_script_due = true;
}

void Event_Feed::call(const char* text)
{
    // Without the lock, and counted to the end, also when the callback throws.
    struct SCOPED_CAPABILITY In_Call
    {
        explicit In_Call(Event_Feed& owner) RELEASE(owner._mutex) : feed(owner)
        {
            ++feed._calls;
            ++calls_here;
            feed._mutex.unlock();
        }
        ~In_Call() RELEASE() // of the release: it is held again
        {
            feed._mutex.lock();
            --feed._calls;
            --calls_here;
            feed._changed.notify_all();
        }
        In_Call(const In_Call&) = delete;
        In_Call& operator=(const In_Call&) = delete;
        Event_Feed& feed;
    };
    const evtProcessCB callback = _callback;
    const In_Call in_call(*this);
    callback(text);
}

} // namespace KPRV::simulator
