#include "simulator/Inventory.h"

#include "simulator/Adapter_Reader.h"
#include "simulator/Address.h"
#include "simulator/Event_Reader.h"
#include "simulator/Inventory_Members.h"
#include "simulator/Port_Reader.h"
#include "simulator/Remote_Port_Reader.h"

namespace KPRV::simulator {

namespace {

constexpr const char* default_version = "3.2.1";

// "init" is the whole answer, or only its result.
Json::Value init_answer(const Json::Value& written)
{
    if (written.isObject() && !written.isNull())
        return written;
    Json::Value answer;
    answer["result"] = written.isNull() ? Json::Value(0) : written;
    return answer;
}

} // namespace

Inventory::Inventory() : Inventory(Json_Text("default", "{}")) {}

Inventory::Inventory(const Json_Text& source)
{
    // Read in place and taken apart: a large host should not stand in memory more than once.
    Json::Value parts = source.parse();
    check_members(source, parts, inventory_members, "the inventory");
    fill_defaults(parts, inventory_members);

    check_members(source, parts["host"], host_members, "host");
    host = answered_members(parts["host"], host_members);

    const Json::Value& library = parts["library"];
    check_members(source, library, library_members, "library");
    version = library.isMember("version") ? library["version"] : Json::Value(default_version);
    init = init_answer(library["init"]);
    faults = parts["faults"];
    events = read_events(source, parts["events"]);
    answers = parts["answers"];
    check_answers(source, answers);

    check_members(source, parts["postedTests"], simulator::posted_tests_members, "postedTests");
    posted_tests_members = answered_members(parts["postedTests"], simulator::posted_tests_members);

    const Remote_Port_List remote_ports = read_remote_ports(source, take_part(parts, "remotePorts"));
    std::size_t eth_ports = 0;
    for (Json::Value& each : parts["adapters"]) {
        adapters.push_back(read_adapter(source, each, {adapters.size() + 1, eth_ports, remote_ports}));
        eth_ports += adapters.back().eth_ports.size();
        index_adapter(source, each, adapters.size() - 1);
    }
}

void Inventory::index_adapter(const Json_Text& source, const Json::Value& written, std::size_t number)
{
    // An adapter may share an address with a port of its own, but with nothing of another adapter.
    const auto put = [&](Index& index, const Json::Value& address, Position position,
                         bool may_stand = false) {
        if (address.isNull())
            return;
        const std::string key = lower_case(address.asString());
        bool taken = !index.try_emplace(key, position).second && !may_stand;
        for (const Index* each : {&_adapter_index, &_port_index}) {
            const auto found = each->find(key);
            taken = taken || (found != each->end() && found->second.adapter != number);
        }
        if (taken)
            source.refuse(address, "duplicate address " + compact_text(address));
    };
    const Json::Value& hba = written["hbaData"];
    const Position self{number, 0, false};
    put(_adapter_index, hba["wwn"], self);
    put(_adapter_index, hba["hbaMAC"], self);
    put(_adapter_index, written["address"], self, true);

    std::size_t place = 0;
    for (const Json::Value& port : written["ethPorts"])
        put(_port_index, port["mac"], {number, place++, true});
    place = 0;
    for (const Json::Value& port : written["fcPorts"]) {
        put(_port_index, port["wwn"], {number, place, false});
        // FCoE traffic leaves by an Ethernet port, whose MAC it may use.
        const auto found = _port_index.find(lower_case(port["fcoeMac"].asString()));
        put(_port_index, port["fcoeMac"], {number, place++, false},
            found != _port_index.end() && found->second.ethernet);
    }
}

Inventory::Place Inventory::adapter_at(const std::string& address)
{
    const auto found = _adapter_index.find(lower_case(address));
    if (found == _adapter_index.end())
        return {};
    return {&adapters[found->second.adapter], nullptr};
}

Inventory::Place Inventory::port_at(const std::string& address)
{
    const auto found = _port_index.find(lower_case(address));
    if (found == _port_index.end())
        return {};
    const Position& position = found->second;
    Adapter& adapter = adapters[position.adapter];
    auto& ports = position.ethernet ? adapter.eth_ports : adapter.fc_ports;
    return {&adapter, &ports[position.port]};
}

unsigned Inventory::adapter_id(const Adapter& adapter) const
{
    return static_cast<unsigned>(&adapter - adapters.data()) + 1;
}

} // namespace KPRV::simulator
