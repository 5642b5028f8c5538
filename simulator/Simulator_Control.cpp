#include "simulator/Simulator_Control.h"

#include "simulator/control.h"

#include <dlfcn.h>
#include <memory>
#include <stdexcept>

// The function of control.h, with its own type, from the library that was opened.
#define CONTROL(name) symbol<decltype(::name)>(#name)

namespace KPRV::simulator {

namespace {

void throw_refusal(const char* reason)
{
    if (reason)
        throw std::runtime_error(reason);
}

Json::Value parsed(const std::string& text)
{
    const std::unique_ptr<Json::CharReader> reader(Json::CharReaderBuilder().newCharReader());
    Json::Value value;
    std::string errors;
    if (!reader->parse(text.data(), text.data() + text.size(), &value, &errors))
        throw std::runtime_error(errors);
    return value;
}

} // namespace

Simulator_Control::Simulator_Control(const std::string& library) : _library(dlopen(library.c_str(), RTLD_NOW))
{
    if (!_library)
        throw std::runtime_error(dlerror());
}

void* Simulator_Control::address(const std::string& name)
{
    void* found = dlsym(_library, name.c_str());
    if (!found)
        throw std::runtime_error("the adapter library has no " + name);
    return found;
}

void Simulator_Control::load_text(const std::string& inventory)
{
    throw_refusal(CONTROL(simulator_load_text)("inventory", inventory.c_str()));
}

void Simulator_Control::load(const Json::Value& inventory)
{
    load_text(Json::writeString(Json::StreamWriterBuilder(), inventory));
}

void Simulator_Control::load_file(const std::string& path)
{
    throw_refusal(CONTROL(simulator_load_file)(path.c_str()));
}

void Simulator_Control::reset()
{
    CONTROL(simulator_unload)();
    clear_faults();
    clear_calls();
}

void Simulator_Control::add_fault(const std::string& fault)
{
    throw_refusal(CONTROL(simulator_add_fault)(fault.c_str()));
}

void Simulator_Control::clear_faults()
{
    CONTROL(simulator_clear_faults)();
}

void Simulator_Control::release()
{
    CONTROL(simulator_release)();
}

bool Simulator_Control::wait_for_calls(const std::string& name, unsigned count, unsigned milliseconds)
{
    return CONTROL(simulator_wait_for_calls)(name.c_str(), count, milliseconds);
}

std::vector<Simulator_Call> Simulator_Control::calls()
{
    std::vector<Simulator_Call> calls;
    for (const Json::Value& call : parsed(CONTROL(simulator_calls)()))
        calls.push_back({call["call"].asString(), call["request"]});
    return calls;
}

std::vector<std::string> Simulator_Control::call_names()
{
    std::vector<std::string> names;
    for (const Simulator_Call& call : calls())
        names.push_back(call.name);
    return names;
}

std::vector<Json::Value> Simulator_Control::requests(const std::string& name)
{
    std::vector<Json::Value> requests;
    for (const Simulator_Call& call : calls())
        if (call.name == name)
            requests.push_back(call.request);
    return requests;
}

void Simulator_Control::clear_calls()
{
    CONTROL(simulator_clear_calls)();
}

void Simulator_Control::keep_calls(unsigned most)
{
    CONTROL(simulator_keep_calls)(most);
}

Json::Value Simulator_Control::status()
{
    return parsed(CONTROL(simulator_status)());
}

bool Simulator_Control::log(int level, const std::string& file, int line, const std::string& text)
{
    return CONTROL(simulator_log)(level, file.c_str(), line, text.c_str());
}

bool Simulator_Control::event(const std::string& text)
{
    return CONTROL(simulator_event)(text.c_str());
}

void Simulator_Control::queue_event(const std::string& text)
{
    CONTROL(simulator_queue_event)(text.c_str());
}

} // namespace KPRV::simulator
