#include "simulator/Recorder.h"

#include <algorithm>

namespace KPRV::simulator {

void Recorder::keep(std::size_t most)
{
    most_ = std::max<std::size_t>(most, 1);
    while (calls_.size() > most_)
        calls_.pop_front();
}

void Recorder::add(const char* symbol, const Json::Value& request)
{
    if (calls_.size() == most_)
        calls_.pop_front();
    calls_.push_back({symbol, request});
}

Json::Value Recorder::calls() const
{
    Json::Value list(Json::arrayValue);
    for (const Call& call : calls_) {
        Json::Value& entry = list.append(Json::Value());
        entry["call"] = call.symbol;
        entry["request"] = call.request;
    }
    return list;
}

std::size_t Recorder::count(const std::string& symbol) const
{
    return static_cast<std::size_t>(
        std::count_if(calls_.begin(), calls_.end(), [&](const Call& call) { return symbol == call.symbol; }));
}

} // namespace KPRV::simulator
