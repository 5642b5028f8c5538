#include "simulator/Port_Additions.h"

#include "simulator/Target.h"

#include <algorithm>

namespace KPRV::simulator {

bool Path_Records::contains(const std::string& path) const
{
    return std::any_of(_records.begin(), _records.end(),
                       [&](const auto& each) { return each.first == path; });
}

void Path_Records::put(const std::string& path, Json::Value record)
{
    for (auto& [at, kept] : _records)
        if (at == path) {
            kept = std::move(record);
            return;
        }
    _records.emplace_back(path, std::move(record));
}

void Path_Records::remove(const std::string& path)
{
    std::erase_if(_records, [&](const auto& each) { return each.first == path; });
}

void Path_Records::remove_below(const std::string& path)
{
    std::erase_if(_records, [&](const auto& each) { return is_at_or_below(each.first, path); });
}

Json::Value Path_Records::list() const
{
    Json::Value answer(Json::arrayValue);
    for (const auto& [path, record] : _records)
        answer.append(record);
    return answer;
}

} // namespace KPRV::simulator
