#include "broker/Call_Log.h"

#include <stdexcept>

namespace KPRV::broker {

std::vector<std::string> Call_Log::calls() const
{
    const Auto_Lock lock(_mutex);
    return _calls;
}

std::vector<std::string> Call_Log::calls(std::string_view name) const
{
    std::vector<std::string> found;
    for (std::string& call : calls())
        if (std::string_view(call).substr(0, call.find(' ')) == name)
            found.push_back(std::move(call));
    return found;
}

void Call_Log::clear()
{
    const Auto_Lock lock(_mutex);
    _calls.clear();
}

void Call_Log::fail(const std::string& call, unsigned nth, CMPIrc rc)
{
    const Auto_Lock lock(_mutex);
    _faults.insert({call, {nth, rc, false}});
    _faulty = true;
}

void Call_Log::throw_at(const std::string& call, unsigned nth)
{
    const Auto_Lock lock(_mutex);
    _faults.insert({call, {nth, CMPI_RC_ERR_FAILED, true}});
    _faulty = true;
}

void Call_Log::mend()
{
    const Auto_Lock lock(_mutex);
    _faults.clear();
    _faulty = false;
}

CMPIrc Call_Log::enter(const char* call, std::string_view argument)
{
    if (!_recording && !_faulty)
        return CMPI_RC_OK;
    const Auto_Lock lock(_mutex);
    if (_recording) {
        std::string text = call;
        if (!argument.empty())
            text.append(" ").append(argument);
        _calls.push_back(std::move(text));
    }
    auto [from, to] = _faults.equal_range(std::string_view(call));
    for (auto at = from; at != to; ++at) {
        if (--at->second.countdown != 0)
            continue;
        Fault fault = at->second;
        _faults.erase(at);
        if (fault.throws)
            throw std::runtime_error(std::string(call) + " was told to throw");
        return fault.rc;
    }
    return CMPI_RC_OK;
}

} // namespace KPRV::broker
