#include "broker/Call_Log.h"

#include <stdexcept>

namespace KPRV::broker {

std::vector<std::string> Call_Log::calls() const
{
    const Auto_Lock lock(mutex_);
    return calls_;
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
    const Auto_Lock lock(mutex_);
    calls_.clear();
}

void Call_Log::fail(const std::string& call, unsigned nth, CMPIrc rc)
{
    const Auto_Lock lock(mutex_);
    faults_.insert({call, {nth, rc, false}});
    faulty_ = true;
}

void Call_Log::throw_at(const std::string& call, unsigned nth)
{
    const Auto_Lock lock(mutex_);
    faults_.insert({call, {nth, CMPI_RC_ERR_FAILED, true}});
    faulty_ = true;
}

void Call_Log::mend()
{
    const Auto_Lock lock(mutex_);
    faults_.clear();
    faulty_ = false;
}

CMPIrc Call_Log::enter(const char* call, std::string_view argument)
{
    if (!recording_ && !faulty_)
        return CMPI_RC_OK;
    const Auto_Lock lock(mutex_);
    if (recording_) {
        std::string text = call;
        if (!argument.empty())
            text.append(" ").append(argument);
        calls_.push_back(std::move(text));
    }
    auto [from, to] = faults_.equal_range(std::string_view(call));
    for (auto at = from; at != to; ++at) {
        if (--at->second.countdown != 0)
            continue;
        Fault fault = at->second;
        faults_.erase(at);
        if (fault.throws)
            throw std::runtime_error(std::string(call) + " was told to throw");
        return fault.rc;
    }
    return CMPI_RC_OK;
}

} // namespace KPRV::broker
