#include "simulator/Simulator.h"

#include "simulator/Answers.h"
#include "simulator/Event_Reader.h"
#include "simulator/Hardware_Tests.h"

#include <cstdio>
#include <cstdlib>
#include <thread>

namespace KPRV::simulator {

namespace {

constexpr const char* inventory_variable = "KLDR_SIMULATOR_INVENTORY";
constexpr const char* events_variable = "KLDR_SIMULATOR_EVENTS";

} // namespace

Simulator& Simulator::instance()
{
    static Simulator& simulator = *new Simulator;
    return simulator;
}

Json::Value Simulator::answer(Entry entry, const Json::Value& request)
{
    const Entry_Row& row = row_of(entry);
    const Strike strike = record(row, request);
    wait_out(strike);
    for (const Fault& fault : strike.faults)
        if (replaces_answer(fault.kind))
            return replaced_answer(fault);
    run_hardware_test(row, request);
    Json::Value answer;
    {
        const Auto_Lock lock(mutex_);
        answer = answer_by_row(state_, row, request);
    }
    for (const Fault& fault : strike.faults)
        if (fault.kind == Fault_Kind::REMOVE || fault.kind == Fault_Kind::SET)
            edit_answer(fault, answer);
    return answer;
}

Simulator::Strike Simulator::record(const Entry_Row& row, const Json::Value& request)
{
    const Auto_Lock lock(mutex_);
    load_from_environment();
    recorder_.add(row.symbol, request);
    called_.notify_all();
    Strike strike{{}, releases_};
    for (Fault& fault : faults_)
        if (strikes(fault, row.symbol, request))
            strike.faults.push_back(fault);
    return strike;
}

void Simulator::wait_out(const Strike& strike)
{
    for (const Fault& fault : strike.faults) {
        if (fault.kind == Fault_Kind::DELAY)
            std::this_thread::sleep_for(std::chrono::milliseconds(fault.words["milliseconds"].asUInt()));
        if (fault.kind != Fault_Kind::HOLD)
            continue;
        const Auto_Lock lock(mutex_);
        while (releases_ == strike.releases)
            released_.wait(mutex_);
    }
}

void Simulator::run_hardware_test(const Entry_Row& row, const Json::Value& request)
{
    std::chrono::milliseconds duration;
    {
        const Auto_Lock lock(mutex_);
        duration = hardware_test_duration(state_, row, request);
    }
    std::this_thread::sleep_for(duration);
}

void Simulator::load_from_environment()
{
    if (state_.loaded)
        return;
    state_.loaded = true;
    state_.problem.clear();
    state_.inventory = {};
    faults_.clear();
    events().set_script({});
    try {
        if (const char* path = std::getenv(inventory_variable))
            put_in_place(Json_Text::of_file(path));
        if (const char* path = std::getenv(events_variable)) {
            const Json_Text source = Json_Text::of_file(path);
            events().set_script(read_events(source, source.parse()));
        }
    } catch (const Refused& refused) {
        state_.problem = refused.what();
        std::fprintf(stderr, "simulator: %s\n", refused.what());
    }
}

void Simulator::put_in_place(const Json_Text& source)
{
    Inventory inventory(source);
    faults_ = read_faults(source, inventory.faults);
    events().set_script(std::move(inventory.events));
    state_.inventory = std::move(inventory);
}

void Simulator::load(const Json_Text& source)
{
    const Auto_Lock lock(mutex_);
    state_.loaded = true;
    state_.from_environment = false;
    state_.problem.clear();
    try {
        put_in_place(source);
    } catch (const Refused& refused) {
        state_.problem = refused.what();
        state_.inventory = {};
        events().set_script({});
        faults_.clear();
        throw;
    }
}

void Simulator::unload()
{
    const Auto_Lock lock(mutex_);
    state_.loaded = false;
    state_.from_environment = true;
}

void Simulator::set_log_callback(log4cxxMsgCB callback)
{
    const Auto_Lock lock(mutex_);
    state_.session.log_callback = callback;
}

void Simulator::set_event_callback(evtProcessCB callback)
{
    // Not under the lock: this may wait for a receiver that calls the library.
    events().set_callback(callback);
}

void Simulator::add_fault(const Json_Text& source)
{
    Fault fault = read_fault(source, source.parse());
    const Auto_Lock lock(mutex_);
    load_from_environment();
    faults_.push_back(std::move(fault));
}

void Simulator::clear_faults()
{
    {
        const Auto_Lock lock(mutex_);
        faults_.clear();
    }
    release();
}

void Simulator::release()
{
    const Auto_Lock lock(mutex_);
    ++releases_;
    released_.notify_all();
}

bool Simulator::wait_for_calls(const std::string& symbol, std::size_t count, std::chrono::milliseconds limit)
{
    const auto end = std::chrono::steady_clock::now() + limit;
    const Auto_Lock lock(mutex_);
    while (recorder_.count(symbol) < count)
        if (called_.wait_until(mutex_, end) == std::cv_status::timeout)
            return recorder_.count(symbol) >= count;
    return true;
}

Json::Value Simulator::calls()
{
    const Auto_Lock lock(mutex_);
    return recorder_.calls();
}

void Simulator::clear_calls()
{
    const Auto_Lock lock(mutex_);
    recorder_.clear();
}

void Simulator::keep_calls(std::size_t most)
{
    const Auto_Lock lock(mutex_);
    recorder_.keep(most);
}

Json::Value Simulator::status()
{
    const Auto_Lock lock(mutex_);
    load_from_environment();
    Json::Value status;
    status["initialised"] = state_.session.initialised;
    status["wantsEvents"] = events().is_wanted();
    status["logCallback"] = state_.session.log_callback != nullptr;
    status["eventCallback"] = events().has_callback();
    status["problem"] = state_.problem;
    return status;
}

bool Simulator::log(int level, const char* file, int line, const char* text)
{
    log4cxxMsgCB callback = nullptr;
    {
        const Auto_Lock lock(mutex_);
        callback = state_.session.log_callback;
    }
    if (callback)
        callback(level, file, line, text);
    return callback != nullptr;
}

bool Simulator::event(const char* text)
{
    return events().tell_here(text);
}

void Simulator::queue_event(const char* text)
{
    events().occur(text);
}

} // namespace KPRV::simulator
