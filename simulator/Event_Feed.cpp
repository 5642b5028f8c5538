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
    const std::lock_guard lock(mutex_);
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
    const std::lock_guard lock(mutex_);
    wanted_ = false;
    is_script_due_ = false;
    changed_.notify_all();
}

void Event_Feed::set_callback(Event_Callback callback)
{
    std::unique_lock lock(mutex_);
    callback_ = callback;
    changed_.notify_all();
    changed_.wait(lock, [this] { return calls_ <= calls_here; });
}

void Event_Feed::reset()
{
    const std::lock_guard lock(mutex_);
    callback_ = nullptr;
    wanted_ = false;
    is_script_due_ = false;
    events_.clear();
    changed_.notify_all();
}

void Event_Feed::set_script(std::vector<Scripted_Event> script)
{
    const std::lock_guard lock(mutex_);
    script_ = std::move(script);
    is_script_due_ = false;
}

void Event_Feed::occur(std::string text)
{
    const std::lock_guard lock(mutex_);
    events_.push_back(std::move(text));
    if (!wanted_ && events_.size() > most_kept)
        events_.pop_front();
    start_thread();
    changed_.notify_all();
}

bool Event_Feed::tell_here(const char* text)
{
    std::unique_lock lock(mutex_);
    if (!is_told())
        return false;
    call(lock, text);
    return true;
}

bool Event_Feed::is_wanted()
{
    const std::lock_guard lock(mutex_);
    return wanted_;
}

bool Event_Feed::has_callback()
{
    const std::lock_guard lock(mutex_);
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
        const std::lock_guard lock(mutex_);
        ends_ = true;
    }
    changed_.notify_all();
    thread_.join();
}

void Event_Feed::run()
{
    std::unique_lock lock(mutex_);
    while (!ends_) {
        std::string text;
        if (!take_event(lock, text))
            continue;
        try {
            call(lock, text.c_str());
        } catch (const std::exception& error) {
            std::fprintf(stderr, "simulator: the receiver of an event threw: %s\n", error.what());
        } catch (...) {
            std::fprintf(stderr, "simulator: the receiver of an event threw\n");
        }
    }
}

// Waits until there may be something to tell.
bool Event_Feed::take_event(std::unique_lock<std::mutex>& lock, std::string& text)
{
    if (is_told() && !events_.empty()) {
        text = std::move(events_.front());
        events_.pop_front();
        return true;
    }
    if (is_told() && is_script_due_ && Clock::now() >= due_.at)
        return take_scripted(text);
    if (is_told() && is_script_due_)
        changed_.wait_until(lock, due_.at);
    else
        changed_.wait(lock);
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

void Event_Feed::call(std::unique_lock<std::mutex>& lock, const char* text)
{
    // Counted to the end, also when the callback throws.
    struct In_Call
    {
        explicit In_Call(Event_Feed& owner, std::unique_lock<std::mutex>& held) : feed(owner), lock(held)
        {
            ++feed.calls_;
            ++calls_here;
            lock.unlock();
        }
        ~In_Call()
        {
            lock.lock();
            --feed.calls_;
            --calls_here;
            feed.changed_.notify_all();
        }
        Event_Feed& feed;
        std::unique_lock<std::mutex>& lock;
    };
    const Event_Callback callback = callback_;
    const In_Call in_call(*this, lock);
    callback(text);
}

} // namespace KPRV::simulator
