#include "simulator/Remote_Ports.h"

#include "simulator/Address.h"

namespace KPRV::simulator {

bool Remote_Ports::add(Shared port)
{
    if (!index_.try_emplace(lower_case(port->address), ports_.size()).second)
        return false;
    ports_.push_back(std::move(port));
    return true;
}

Remote_Ports::Shared Remote_Ports::find(const std::string& address) const
{
    const auto found = index_.find(lower_case(address));
    return found == index_.end() ? nullptr : ports_[found->second];
}

Json::Value Remote_Ports::list() const
{
    Json::Value answer(Json::arrayValue);
    for (const Shared& port : ports_)
        answer.append(port->listed);
    return answer;
}

} // namespace KPRV::simulator
