// Behaviours of the host as a whole: its adapters in one answer, global data, time, the driver's log.
#include "simulator/Answers.h"
#include "simulator/Behaviours.h"

#include <algorithm>
#include <ctime>

namespace KPRV::simulator {

namespace {

const Port* at_or_null(const std::vector<Port>& ports, std::size_t index)
{
    return index < ports.size() ? &ports[index] : nullptr;
}

// One element of the arrays that run in parallel over an adapter's physical ports. On a converged
// adapter an FCoE function and an Ethernet function share the port.
void append_port(Json::Value& record, const Port* fc, const Port* eth)
{
    const bool fcoe = fc && fc->data["isFCoE"].isBool() && fc->data["isFCoE"].asBool();
    record["portHasFc"].append(fc && !fcoe);
    record["portHasFcoe"].append(fcoe);
    record["portHasEth"].append(eth != nullptr);
    record["portWwn"].append(fc ? fc->address : "");
    record["portMac"].append(eth ? eth->address : "");
    const bool own_mac = fcoe && fc->data.isMember("fcoeMac");
    record["fcoeMac"].append(own_mac ? fc->data["fcoeMac"] : Json::Value(fcoe && eth ? eth->address : ""));
}

bool any_port_is(const Json::Value& flags)
{
    return std::any_of(flags.begin(), flags.end(), [](const Json::Value& flag) { return flag.asBool(); });
}

Json::Value adapter_record(const Adapter& adapter)
{
    Json::Value record;
    for (const char* name : {"portHasFc", "portHasFcoe", "portHasEth", "portWwn", "portMac", "fcoeMac"})
        record[name] = Json::Value(Json::arrayValue);
    const std::size_t ports = std::max(adapter.fc_ports.size(), adapter.eth_ports.size());
    for (std::size_t index = 0; index < ports; ++index)
        append_port(record, at_or_null(adapter.fc_ports, index), at_or_null(adapter.eth_ports, index));
    const Json::Value& hba = adapter.data["hbaData"];
    record["cna"] = hba.isMember("hbaMAC");
    record["fc"] = any_port_is(record["portHasFc"]);
    record["fcoe"] = any_port_is(record["portHasFcoe"]);
    record["ethPort"] = any_port_is(record["portHasEth"]);
    record["mac"] = hba.get("hbaMAC", "");
    record["wwn"] = hba.get("wwn", "");
    record["numOfPorts"] = static_cast<Json::UInt>(ports);
    return record;
}

} // namespace

Json::Value adapter_count(State& state, const Json::Value&)
{
    return static_cast<Json::UInt>(state.inventory.adapters.size());
}

Json::Value host_data(State& state, const Json::Value&)
{
    Json::Value answer;
    answer["result"] = state.inventory.host;
    return answer;
}

Json::Value global_info(State& state, const Json::Value& request)
{
    Json::Value answer;
    answer["numOfAdapters"] = adapter_count(state, request);
    answer["adapter"] = Json::Value(Json::arrayValue);
    for (const Adapter& adapter : state.inventory.adapters)
        answer["adapter"].append(adapter_record(adapter));
    return answer;
}

Json::Value server_time(State&, const Json::Value&)
{
    const std::time_t now = std::time(nullptr);
    std::tm local = {};
    localtime_r(&now, &local);
    char text[32];
    std::strftime(text, sizeof text, "%Y/%m/%d %H:%M:%S", &local);
    Json::Value answer;
    answer["seconds"] = static_cast<Json::Int64>(now);
    answer["utcOffsetMinutes"] = static_cast<Json::Int>(local.tm_gmtoff / 60);
    answer["text"] = text;
    return answer;
}

Json::Value driver_log(State& state, const Json::Value&)
{
    Json::Value answer;
    answer["entries"] = Json::Value(Json::arrayValue);
    for (const Adapter& adapter : state.inventory.adapters) {
        Json::Value& entry = answer["entries"].append(Json::Value());
        entry["adapter"] = adapter.address;
        entry["driver"] = adapter.data["driver"]["storageDriverName"];
        entry["version"] = adapter.data["driver"]["storageDriverVersion"];
        entry["status"] = "Up to date";
    }
    return answer;
}

} // namespace KPRV::simulator
