#include "simulator/Settings.h"

#include "simulator/Members.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace KPRV::simulator {

namespace {

void derive_advanced_adapter(Inventory& inventory, const Target& target, Json::Value& answer)
{
    const Adapter& adapter = *target.adapter;
    const Json::Value& hba = adapter.data["hbaData"];
    answer["adapterId"] = inventory.adapter_id(adapter);
    answer["model"] = hba["model"];
    answer["serialNumber"] = hba["serialNumber"];
    answer["firmwareVersion"] = adapter.data["firmware"]["version"];
    answer["adapterMode"] = hba.isMember("hbaMAC") ? "CNA" : "HBA";
}

void derive_advanced_port(Inventory&, const Target& target, Json::Value& answer)
{
    const Port& port = *target.port;
    answer["address"] = port.address;
    answer["portStatus"] = port.data["portStatus"];
    if (port.kind == Port_Kind::FC)
        answer["maxFrameSize"] = port.data["maxFrameSize"];
}

void derive_fc(Inventory&, const Target& target, Json::Value& answer)
{
    const Port& port = *target.port;
    for (const char* name : {"wwn", "nodeWwn", "PortSymbolicName", "operatingSpeed", "supportedPortSpeeds"})
        answer[name] = port.data[name];
    answer["virtualPorts"] = static_cast<Json::UInt>(port.virtual_ports.size());
}

void derive_fcoe(Inventory&, const Target& target, Json::Value& answer)
{
    answer["wwn"] = target.port->address;
    const auto place = static_cast<std::size_t>(target.port - target.adapter->fc_ports.data());
    if (target.port->data.isMember("fcoeMac"))
        answer["fcoeMac"] = target.port->data["fcoeMac"];
    else if (place < target.adapter->eth_ports.size())
        answer["fcoeMac"] = target.adapter->eth_ports[place].address;
}

void derive_lldp(Inventory& inventory, const Target& target, Json::Value& answer)
{
    answer["local"]["portId"] = target.port->address;
    answer["local"]["systemName"] = std::as_const(inventory.host)["hostModel"];
}

// In the order of the enumeration.
// clang-format off
constexpr Setting_Row rows[] = {
    {"advancedAdapter", Scope::ADAPTER, R"({
        "trunkingEnabled": false, "maxVirtualPorts": 255, "maxVnics": 4, "interruptMode": "MSI-X", "temperature": 47 })",
        derive_advanced_adapter},
    {"advancedPort",    Scope::PORT, R"({
        "topology": "Point to point", "configuredSpeed": "Auto", "queueDepth": 32, "bbCredits": 40, "pathTimeout": 30,
        "qosEnabled": false, "targetRateLimiting": false })",
        derive_advanced_port},
    {"bootOverSan",     Scope::FC_PORT, R"({
        "bootEnabled": false, "bootOption": "Auto discovered from fabric", "bootSpeed": "Auto", "bootDevices": [] })",
        nullptr},
    {"fc",              Scope::FC_PORT, R"({
        "fcId": 66048, "topology": "Point to point", "configuredSpeed": "Auto", "vfId": 0 })",
        derive_fc},
    {"fcoe",            Scope::FCOE_PORT, R"({
        "vlanId": 1002, "fcMap": "0e:fc:00", "fcfMac": "02:4b:4c:fc:f0:01", "fcfPriority": 128, "linkState": "Up",
        "fcoePriority": 3 })",
        derive_fcoe},
    {"authentication",  Scope::FC_PORT, R"({
        "enabled": false, "algorithm": "MD5", "group": "DH-NULL", "secretSet": false, "state": "Not authenticated" })",
        nullptr},
    {"cee",             Scope::ETH_PORT, R"({
        "state": "Up", "pfcEnabled": true, "networkPriority": 0, "fcoePriority": 3,
        "priorityGroups": [ { "id": 0, "bandwidthPercent": 50 }, { "id": 1, "bandwidthPercent": 50 } ] })",
        nullptr},
    {"lldp",            Scope::ETH_PORT, R"({
        "local": { "timeToLive": 120, "systemDescription": "Converged network adapter" },
        "neighbor": { "chassisId": "02:4b:4c:fc:f0:00", "portId": "Te 0/4", "systemName": "kldr-switch-1",
                      "timeToLive": 120 } })",
        derive_lldp},
};
// clang-format on

static_assert(std::size(rows) == static_cast<std::size_t>(Setting::LLDP) + 1);

bool is_of_kind(const Json::Value& value, const Json::Value& present)
{
    return present.isNumeric() ? value.isNumeric() : value.type() == present.type();
}

} // namespace

const Setting_Row& setting_row(Setting setting)
{
    return rows[static_cast<std::size_t>(setting)];
}

void check_settings(const Json_Text& source, const Json::Value& written)
{
    for (const std::string& name : written.getMemberNames()) {
        const bool known = std::any_of(std::begin(rows), std::end(rows),
                                       [&](const Setting_Row& row) { return name == row.name; });
        if (!known)
            source.refuse(written[name], "unknown setting \"" + name + "\"");
        if (!has_type(written[name], Type::OBJECT))
            source.refuse(written[name], "the setting \"" + name + "\" must be an object");
    }
}

Json::Value setting_of(Inventory& inventory, Setting setting, const Target& target)
{
    const Setting_Row& row = setting_row(setting);
    Json::Value answer = Json_Text(row.name, row.fallback).parse();
    if (row.derive)
        row.derive(inventory, target, answer);
    const Json::Value& kept = kept_setting(setting, target);
    for (const std::string& name : kept.getMemberNames())
        answer[name] = kept[name];
    return answer;
}

Json::Value& kept_setting(Setting setting, const Target& target)
{
    Json::Value& settings = target.port ? target.port->settings : target.adapter->settings;
    return settings[setting_row(setting).name];
}

std::string setting_objection(const Json::Value& names, const Json::Value& values, const Json::Value& present)
{
    if (!names.isArray() || !values.isObject())
        return "what is set must be an object, and the names of its members an array";
    for (const Json::Value& name : names) {
        if (!name.isString() || !values.isMember(name.asString()))
            return "a member is named but not given: " + compact_text(name);
        if (!present.isMember(name.asString()))
            return "no such member: " + compact_text(name);
        if (!is_of_kind(values[name.asString()], present[name.asString()]))
            return name.asString() + " must be as in " + compact_text(present[name.asString()]);
    }
    return "";
}

} // namespace KPRV::simulator
