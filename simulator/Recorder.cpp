#include "simulator/Recorder.h"

#include <algorithm>

namespace KPRV::simulator {

void Recorder::keep(std::size_t most)
{
    _most = std::max<std::size_t>(most, 1);
    while (_calls.size() > _most)
        _calls.pop_front();
}

void Recorder::add(const char* symbol, const Json::Value& request)
{
    if (_calls.size() == _most)
        _calls.pop_front();
    _calls.push_back({symbol, request});
}

Json::Value Recorder::calls() const
{
    Json::Value list(Json::arrayValue);
    for (const Call& call : _calls) {
        Json::Value& entry = list.append(Json::Value());
        entry["call"] = call.symbol;
        entry["request"] = call.request;
    }
    return list;
}

std::size_t Recorder::count(const std::string& symbol) const
{
    return static_cast<std::size_t>(
        std::count_if(_calls.begin(), _calls.end(), [&](const Call& call) { return symbol == call.symbol; }));
}

} // namespace KPRV::simulator
