#include "simulator/Simulator.h"

#include "simulator/Answers.h"
#include "simulator/Event_Reader.h"
#include "simulator/Hardware_Tests.h"

#include <charconv>
#include <cstdio>
#include <cstdlib>
#include <thread>

namespace KPRV::simulator {

namespace {

constexpr const char* inventory_variable = "KLDR_SIMULATOR_INVENTORY";
constexpr const char* events_variable = "KLDR_SIMULATOR_EVENTS";
constexpr const char* calls_variable = "KLDR_SIMULATOR_CALLS";

std::size_t number_of(const char* variable, const std::string& text)
{
    std::size_t number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc() || end != text.data() + text.size())
        throw Refused(std::string(variable) + ": \"" + text + "\" is no number");
    return number;
}

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
        const Auto_Lock lock(_mutex);
        answer = answer_by_row(_state, row, request);
    }
    for (const Fault& fault : strike.faults)
        if (fault.kind == Fault_Kind::REMOVE || fault.kind == Fault_Kind::SET)
            edit_answer(fault, answer);
    return answer;
}

Simulator::Strike Simulator::record(const Entry_Row& row, const Json::Value& request)
{
    const Auto_Lock lock(_mutex);
    load_from_environment();
    _recorder.add(row.symbol, request);
    _called.notify_all();
    Strike strike{{}, _releases};
    for (Fault& fault : _faults)
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
        const Auto_Lock lock(_mutex);
        while (_releases == strike.releases)
            _released.wait(_mutex);
    }
}

void Simulator::run_hardware_test(const Entry_Row& row, const Json::Value& request)
{
    std::chrono::milliseconds duration;
    {
        const Auto_Lock lock(_mutex);
        duration = hardware_test_duration(_state, row, request);
    }
    std::this_thread::sleep_for(duration);
}

void Simulator::load_from_environment()
{
    if (_state.loaded)
        return;
    _state.loaded = true;
    _state.problem.clear();
    _state.inventory = {};
    _faults.clear();
    events().set_script({});
    try {
        if (const char* most = std::getenv(calls_variable))
            _recorder.keep(number_of(calls_variable, most));
        if (const char* path = std::getenv(inventory_variable))
            put_in_place(Json_Text::of_file(path));
        if (const char* path = std::getenv(events_variable)) {
            const Json_Text source = Json_Text::of_file(path);
            events().set_script(read_events(source, source.parse()));
        }
    } catch (const Refused& refused) {
        _state.problem = refused.what();
        std::fprintf(stderr, "simulator: %s\n", refused.what());
    }
}

void Simulator::put_in_place(const Json_Text& source)
{
    Inventory inventory(source);
    _faults = read_faults(source, inventory.faults);
    events().set_script(std::move(inventory.events));
    _state.inventory = std::move(inventory);
}

void Simulator::load(const Json_Text& source)
{
    const Auto_Lock lock(_mutex);
    _state.loaded = true;
    _state.from_environment = false;
    _state.problem.clear();
    try {
        put_in_place(source);
    } catch (const Refused& refused) {
        _state.problem = refused.what();
        _state.inventory = {};
        events().set_script({});
        _faults.clear();
        throw;
    }
}

void Simulator::unload()
{
    const Auto_Lock lock(_mutex);
    _state.loaded = false;
    _state.from_environment = true;
}

void Simulator::set_log_callback(log4cxxMsgCB callback)
{
    const Auto_Lock lock(_mutex);
    _state.session.log_callback = callback;
}

void Simulator::set_event_callback(evtProcessCB callback)
{
    // Not under the lock: this may wait for a receiver that calls the library.
    events().set_callback(callback);
}

void Simulator::add_fault(const Json_Text& source)
{
    Fault fault = read_fault(source, source.parse());
    const Auto_Lock lock(_mutex);
    load_from_environment();
    _faults.push_back(std::move(fault));
}

void Simulator::clear_faults()
{
    {
        const Auto_Lock lock(_mutex);
        _faults.clear();
    }
    release();
}

void Simulator::release()
{
    const Auto_Lock lock(_mutex);
    ++_releases;
    _released.notify_all();
}

bool Simulator::wait_for_calls(const std::string& symbol, std::size_t count, std::chrono::milliseconds limit)
{
    const auto end = std::chrono::steady_clock::now() + limit;
    const Auto_Lock lock(_mutex);
    while (_recorder.count(symbol) < count)
        if (_called.wait_until(_mutex, end) == std::cv_status::timeout)
            return _recorder.count(symbol) >= count;
    return true;
}

Json::Value Simulator::calls()
{
    const Auto_Lock lock(_mutex);
    return _recorder.calls();
}

void Simulator::clear_calls()
{
    const Auto_Lock lock(_mutex);
    _recorder.clear();
}

void Simulator::keep_calls(std::size_t most)
{
    const Auto_Lock lock(_mutex);
    _recorder.keep(most);
}

Json::Value Simulator::status()
{
    const Auto_Lock lock(_mutex);
    load_from_environment();
    Json::Value status;
    status["initialised"] = _state.session.initialised;
    status["wantsEvents"] = events().is_wanted();
    status["logCallback"] = _state.session.log_callback != nullptr;
    status["eventCallback"] = events().has_callback();
    status["problem"] = _state.problem;
    return status;
}

bool Simulator::log(int level, const char* file, int line, const char* text)
{
    log4cxxMsgCB callback = nullptr;
    {
        const Auto_Lock lock(_mutex);
        callback = _state.session.log_callback;
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
