#include "simulator/Counters.h"

#include "simulator/Members.h"

namespace KPRV::simulator {

namespace {

bool is_counter(const Json::Value& each)
{
    if (!has_type(each, Type::ARRAY) || each.size() < 2 || each.size() > 3 || !has_type(each[0], Type::COUNT))
        return false;
    const bool number = has_type(each[1], Type::COUNTER);
    return each.size() == 2 ? number || has_type(each[1], Type::TEXT)
                            : number && has_type(each[2], Type::COUNT);
}

} // namespace

Counters::Counters(std::span<const unsigned> ids)
{
    for (const unsigned id : ids)
        _counters.push_back({id, 0U, 0});
}

Counters::Counters(const Json_Text& source, const Json::Value& written)
{
    for (const Json::Value& each : written) {
        if (!is_counter(each))
            source.refuse(each, "a counter must be [id, value] or [id, value, growth per second], not " +
                                    compact_text(each));
        _counters.push_back({each[0].asUInt(), each[1], each.size() == 3 ? each[2].asUInt() : 0});
    }
}

Json::Value Counters::answer(Clock::time_point now) const
{
    using std::chrono::milliseconds;
    const auto age = std::chrono::duration_cast<milliseconds>(now - _since).count();
    Json::Value list(Json::arrayValue);
    for (const Counter& counter : _counters) {
        Json::Value& entry = list.append(Json::Value());
        entry["id"] = counter.id;
        if (counter.growth == 0) {
            entry["value"] = counter.start.asString();
            continue;
        }
        const std::uint64_t grown = counter.growth * static_cast<std::uint64_t>(age) / 1000;
        entry["value"] = std::to_string(counter.start.asUInt64() + grown);
    }
    return list;
}

void Counters::reset(Clock::time_point now)
{
    for (Counter& counter : _counters)
        counter.start = 0U;
    _since = now;
}

} // namespace KPRV::simulator
