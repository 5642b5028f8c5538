#include "simulator/control.h"

#include "simulator/Simulator.h"

namespace {

using KPRV::simulator::Json_Text;
using KPRV::simulator::Simulator;

// Owns the text that this thread was given last.
const char* given(std::string text)
{
    thread_local std::string last;
    last = std::move(text);
    return last.c_str();
}

// Runs what may be refused, and tells the reason if it was.
template <typename Action>
const char* refusal_of(Action action)
{
    try {
        action(Simulator::instance());
        return nullptr;
    } catch (const KPRV::simulator::Refused& refused) {
        return given(refused.what());
    }
}

} // namespace

const char* simulator_load_text(const char* name, const char* text)
{
    return refusal_of([&](Simulator& simulator) { simulator.load(Json_Text(name, text)); });
}

const char* simulator_load_file(const char* path)
{
    return refusal_of([&](Simulator& simulator) { simulator.load(Json_Text::of_file(path)); });
}

void simulator_unload(void)
{
    Simulator::instance().unload();
}

const char* simulator_add_fault(const char* json)
{
    return refusal_of([&](Simulator& simulator) { simulator.add_fault(Json_Text("fault", json)); });
}

void simulator_clear_faults(void)
{
    Simulator::instance().clear_faults();
}

void simulator_release(void)
{
    Simulator::instance().release();
}

int simulator_wait_for_calls(const char* symbol, unsigned count, unsigned milliseconds)
{
    return Simulator::instance().wait_for_calls(symbol, count, std::chrono::milliseconds(milliseconds));
}

const char* simulator_calls(void)
{
    return given(KPRV::simulator::compact_text(Simulator::instance().calls()));
}

void simulator_clear_calls(void)
{
    Simulator::instance().clear_calls();
}

void simulator_keep_calls(unsigned most)
{
    Simulator::instance().keep_calls(most);
}

const char* simulator_status(void)
{
    return given(KPRV::simulator::compact_text(Simulator::instance().status()));
}

int simulator_log(int level, const char* file, int line, const char* text)
{
    return Simulator::instance().log(level, file, line, text);
}

int simulator_event(const char* text)
{
    return Simulator::instance().event(text);
}

void simulator_queue_event(const char* text)
{
    Simulator::instance().queue_event(text);
}
