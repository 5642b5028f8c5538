#include "simulator/Event_Feed.h"

#include <cstdio>
#include <cstdlib>
#include <exception>
#include <thread>

namespace KPRV::simulator {

namespace {

constexpr std::size_t most_kept = 1024;

// Calls of the callback that this thread is in.
thread_local unsigned calls_here = 0;

} // namespace

void Event_Feed::want(bool drop_old_events)
{
    const Auto_Lock lock(mutex_);
    if (drop_old_events)
        events_.clear();
    wanted_ = true;
    is_script_due_ = false;
    if (!script_.empty())
        schedule(0, Clock::now());
    if (is_script_due_ || !events_.empty())
        start_thread();
    changed_.notify_all();
}

void Event_Feed::want_no_more()
{
    const Auto_Lock lock(mutex_);
    wanted_ = false;
    is_script_due_ = false;
    changed_.notify_all();
}

void Event_Feed::set_callback(evtProcessCB callback)
{
    const Auto_Lock lock(mutex_);
    callback_ = callback;
    changed_.notify_all();
    while (calls_ > calls_here)
        changed_.wait(mutex_);
}

void Event_Feed::reset()
{
    const Auto_Lock lock(mutex_);
    callback_ = nullptr;
    wanted_ = false;
    is_script_due_ = false;
    events_.clear();
    changed_.notify_all();
}

void Event_Feed::set_script(std::vector<Scripted_Event> script)
{
    const Auto_Lock lock(mutex_);
    script_ = std::move(script);
    is_script_due_ = false;
}

void Event_Feed::occur(std::string text)
{
    const Auto_Lock lock(mutex_);
    events_.push_back(std::move(text));
    if (!wanted_ && events_.size() > most_kept)
        events_.pop_front();
    start_thread();
    changed_.notify_all();
}

bool Event_Feed::tell_here(const char* text)
{
    const Auto_Lock lock(mutex_);
    if (!is_told())
        return false;
    call(text);
    return true;
}

bool Event_Feed::is_wanted()
{
    const Auto_Lock lock(mutex_);
    return wanted_;
}

bool Event_Feed::has_callback()
{
    const Auto_Lock lock(mutex_);
    return callback_ != nullptr;
}

void Event_Feed::start_thread()
{
    if (has_thread_)
        return;
    has_thread_ = true;
    thread_ = std::thread([this] { run(); });
    // The library is never unloaded; its thread ends with the process, before what watches over that looks
    // for threads.
    static Event_Feed* feed;
    feed = this;
    std::atexit([] { feed->end_thread(); });
}

void Event_Feed::end_thread()
{
    if (std::this_thread::get_id() == thread_.get_id())
        return;
    {
        const Auto_Lock lock(mutex_);
        ends_ = true;
    }
    changed_.notify_all();
    thread_.join();
}

void Event_Feed::run()
{
    const Auto_Lock lock(mutex_);
    while (!ends_) {
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
    if (is_told() && !events_.empty()) {
        text = std::move(events_.front());
        events_.pop_front();
        return true;
    }
    if (is_told() && is_script_due_ && Clock::now() >= due_.at)
        return take_scripted(text);
    // A copy: the time may change while this waits.
    if (const Clock::time_point at = due_.at; is_told() && is_script_due_)
        changed_.wait_until(mutex_, at);
    else
        changed_.wait(mutex_);
    return false;
}

bool Event_Feed::take_scripted(std::string& text)
{
    const Scripted_Event& line = script_[due_.line];
    if (due_.told < line.times) {
        text = line.text;
        due_.at += line.every;
        ++due_.told;
    }
    if (due_.told < line.times)
        return true;
    // The pause of a line counts from the last event of the line before.
    const bool is_told_now = !text.empty();
    is_script_due_ = false;
    if (due_.line + 1 < script_.size())
        schedule(due_.line + 1, due_.at - line.every);
    return is_told_now;
}

void Event_Feed::schedule(std::size_t line, Clock::time_point from)
{
    due_ = {from + script_[line].after, line, 0};
    is_script_due_ = true;
}

void Event_Feed::call(const char* text)
{
    // Without the lock, and counted to the end, also when the callback throws.
    struct SCOPED_CAPABILITY In_Call
    {
        explicit In_Call(Event_Feed& owner) RELEASE(owner.mutex_) : feed(owner)
        {
            ++feed.calls_;
            ++calls_here;
            feed.mutex_.unlock();
        }
        ~In_Call() RELEASE() // of the release: it is held again
        {
            feed.mutex_.lock();
            --feed.calls_;
            --calls_here;
            feed.changed_.notify_all();
        }
        In_Call(const In_Call&) = delete;
        In_Call& operator=(const In_Call&) = delete;
        Event_Feed& feed;
    };
    const evtProcessCB callback = callback_;
    const In_Call in_call(*this);
    callback(text);
}

} // namespace KPRV::simulator
