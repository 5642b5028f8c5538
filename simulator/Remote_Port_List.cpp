#include "simulator/Remote_Port_List.h"

#include "simulator/Address.h"

namespace KPRV::simulator {

bool Remote_Port_List::add(Shared port)
{
    if (!index_.try_emplace(lower_case(port->address), ports_.size()).second)
        return false;
    ports_.push_back(std::move(port));
    return true;
}

Remote_Port_List::Shared Remote_Port_List::find(const std::string& address) const
{
    const auto found = index_.find(lower_case(address));
    return found == index_.end() ? nullptr : ports_[found->second];
}

Json::Value Remote_Port_List::list() const
{
    Json::Value answer(Json::arrayValue);
    for (const Shared& port : ports_)
        answer.append(port->listed);
    return answer;
}

} // namespace KPRV::simulator
