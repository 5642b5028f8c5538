#include "simulator/Port_Reader.h"

#include "simulator/Entry_Points.h"
#include "simulator/Hardware_Tests.h"
#include "simulator/Inventory_Members.h"
#include "simulator/Optics_Reader.h"
#include "simulator/Remote_Port_Reader.h"
#include "simulator/Settings.h"
#include "simulator/Status.h"

#include <utility>

namespace KPRV::simulator {

namespace {

// What the library counts if the author says nothing: all that the module reads, and a few of the
// many that it does not.
constexpr unsigned fc_counter_ids[] = {1401, 1402, 1403, 1404, 1409, 1410, 1411, 1412, 1416,
                                       1421, 1422, 1423, 1424, 1425, 1426, 1427, 1428};
constexpr unsigned fcoe_counter_ids[] = {1601, 1602, 1614, 1615, 1616, 1624, 1625, 1626, 1627, 1628};

void default_status(Json::Value& object, const char* name, const Json::Value& enabled)
{
    set_default(object, name, enabled.isBool() && !enabled.asBool() ? STOPPED : IN_SERVICE);
}

Json::Value take_answers(const Json_Text& source, Json::Value& port)
{
    Json::Value answers = take_part(port, "answers");
    check_answers(source, answers);
    return answers;
}

Counters take_counters(const Json_Text& source, Json::Value& port)
{
    const Json::Value written = take_part(port, "statistics");
    if (!written.isObject())
        return {source, written};
    const Json::Value& fcoe = std::as_const(port)["isFCoE"];
    return fcoe.isBool() && fcoe.asBool() ? Counters(fcoe_counter_ids) : Counters(fc_counter_ids);
}

Json::Value eth_data(const Json_Text& source, Json::Value data, const Port_Place& place,
                     const Json::Value& enabled)
{
    check_members(source, data, eth_data_members, "ethData");
    set_default(data, "ethDev", "eth" + std::to_string(place.eth_ports_before + place.index));
    default_status(data, "ethPortStateMOFValue", enabled);
    return answered_members(std::move(data), eth_data_members);
}

} // namespace

Port read_fc_port(const Json_Text& source, Json::Value& written, const Port_Place& place)
{
    check_members(source, written, fc_port_members, "an FC port");
    Port port;
    port.kind = Port_Kind::FC;
    port.address = written["wwn"].asString();
    port.remote_ports = read_remote_ports(source, take_part(written, "remotePorts"), place.known_ports);
    port.data = written;
    port.answers = take_answers(source, port.data);
    port.settings = take_part(port.data, "settings");
    check_settings(source, port.settings);
    port.tests = take_part(port.data, "diagnostics");
    check_hardware_tests(source, port.tests);
    port.optics = take_optics(source, port.data, place);
    if (!place.node_wwn.isNull())
        set_default(port.data, "nodeWwn", place.node_wwn);
    set_default(port.data, "PortSymbolicName", "KLDR port " + std::to_string(place.index));
    // A port that does not speak FCoE says nothing of it.
    if (place.converged)
        set_default(port.data, "isFCoE", true);
    default_status(port.data, "portStatusValue", std::as_const(port.data)["portStatus"]);
    port.counters = take_counters(source, port.data);
    port.data = answered_members(std::move(port.data), fc_port_members);
    return port;
}

Port read_eth_port(const Json_Text& source, const Json::Value& written, const Port_Place& place)
{
    check_members(source, written, eth_port_members, "an Ethernet port");
    Port port;
    port.kind = Port_Kind::ETHERNET;
    port.address = written["mac"].asString();
    port.data = written;
    port.answers = take_answers(source, port.data);
    port.settings = take_part(port.data, "settings");
    check_settings(source, port.settings);
    port.tests = take_part(port.data, "diagnostics");
    check_hardware_tests(source, port.tests);
    port.optics = take_optics(source, port.data, place);
    const Json::Value& enabled = written["portStatus"];
    const Json::Value eth = take_part(port.data, "ethData");
    if (!eth.isNull())
        port.eth_data = eth_data(source, eth, place, enabled);
    default_status(port.data, "portStatusValue", enabled);
    port.data = answered_members(std::move(port.data), eth_port_members);
    return port;
}

void share_optics(Json::Value& one, Json::Value& other)
{
    const auto hand_over = [](const Json::Value& from, Json::Value& to) {
        if (from.isObject() && to.isObject() && from.isMember("optics"))
            set_default(to, "optics", from["optics"]);
    };
    hand_over(one, other);
    hand_over(other, one);
}

void check_answers(const Json_Text& source, const Json::Value& answers)
{
    for (const std::string& name : answers.getMemberNames())
        if (!find_entry(name))
            source.refuse(answers[name], "unknown entry point \"" + name + "\" in answers");
}

} // namespace KPRV::simulator
