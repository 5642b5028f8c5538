#include "simulator/Remote_Port_List.h"

#include "simulator/Address.h"

namespace KPRV::simulator {

bool Remote_Port_List::add(Shared port)
{
    if (!_index.try_emplace(lower_case(port->address), _ports.size()).second)
        return false;
    _ports.push_back(std::move(port));
    return true;
}

Remote_Port_List::Shared Remote_Port_List::find(const std::string& address) const
{
    const auto found = _index.find(lower_case(address));
    return found == _index.end() ? nullptr : _ports[found->second];
}

Json::Value Remote_Port_List::list() const
{
    Json::Value answer(Json::arrayValue);
    for (const Shared& port : _ports)
        answer.append(port->listed);
    return answer;
}

} // namespace KPRV::simulator
