#pragma once

#include "module/runtime/system/Standard_Mutex.h"
#include "simulator/Entry_Points.h"
#include "simulator/Faults.h"
#include "simulator/Recorder.h"
#include "simulator/State.h"

#include <chrono>
#include <condition_variable>
#include <json/json.h>
#include <string>
#include <vector>

namespace KPRV::simulator {

/// The library that entry points and control functions meet in. Any thread may call anything; no
/// callback is called and no fault is waited for under the lock.
class Simulator
{
public:
    /// The one of this process. Never destroyed: callers say goodbye from static destructors.
    static Simulator& instance();

    /// One call of an entry point. Throws only what a fault says.
    Json::Value answer(Entry entry, const Json::Value& request);

    void set_log_callback(log4cxxMsgCB callback);
    void set_event_callback(evtProcessCB callback);

    /// Puts the inventory and its faults in place of the present ones. Throws Refused, in which
    /// case a host without adapters stands in, and init_hba_lib says why.
    void load(const Json_Text& source);

    /// Forgets what load() gave: the next call reads what the environment names.
    void unload();

    void add_fault(const Json_Text& source);

    /// Also lets go whom they hold.
    void clear_faults();

    /// Lets every recorded call go that a fault holds.
    void release();

    /// Waits until `count` calls of the entry point are recorded. False if that takes too long.
    bool wait_for_calls(const std::string& symbol, std::size_t count, std::chrono::milliseconds limit);

    Json::Value calls();
    void clear_calls();
    /// How many of the latest calls are recorded.
    void keep_calls(std::size_t most);

    /// What a caller has registered, and why the inventory was refused.
    Json::Value status();

    /// Calls the callback on this thread. False if none is registered.
    bool log(int level, const char* file, int line, const char* text);
    bool event(const char* text);

    /// An event occurs: it is told on the library's own thread, now or when somebody wants it.
    void queue_event(const char* text);

private:
    void load_from_environment() REQUIRES(_mutex);
    void put_in_place(const Json_Text& source) REQUIRES(_mutex);
    /// They have a lock of their own.
    Event_Feed& events() UNCHECKED { return _state.events; }

    // The faults that strike a call, and the count of releases when it came in: the next one is its.
    struct Strike
    {
        std::vector<Fault> faults;
        unsigned releases;
    };
    Strike record(const Entry_Row& row, const Json::Value& request);
    void wait_out(const Strike& strike);

    /// Takes the time of a hardware test; other calls go on.
    void run_hardware_test(const Entry_Row& row, const Json::Value& request);

    Standard_Mutex<> _mutex;
    std::condition_variable_any _called;
    std::condition_variable_any _released;
    unsigned _releases GUARDED_BY(_mutex) = 0;
    State _state GUARDED_BY(_mutex);
    std::vector<Fault> _faults GUARDED_BY(_mutex);
    Recorder _recorder GUARDED_BY(_mutex);
};

} // namespace KPRV::simulator
