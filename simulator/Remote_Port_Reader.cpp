#include "simulator/Remote_Port_Reader.h"

#include "simulator/Inventory_Members.h"

#include <set>
#include <utility>

namespace KPRV::simulator {

namespace {

// Lengths of the fields in a logical unit's standard inquiry data.
constexpr std::size_t VENDOR_LENGTH = 8;
constexpr std::size_t PRODUCT_LENGTH = 16;

Json::Value device_data(const Json_Text& source, Json::Value data)
{
    check_members(source, data, device_data_members, "deviceData");
    fill_defaults(data, device_data_members);
    const Json::Value& target = data["isTarget"];
    set_default(data, "type", target.isBool() && !target.asBool() ? "Unknown" : "Disk");
    return answered_members(std::move(data), device_data_members);
}

Json::Value lun(const Json_Text& source, Json::Value data, Json::ArrayIndex place,
                std::set<Json::UInt>& numbers)
{
    check_members(source, data, lun_members, "a LUN");
    set_default(data, "number", place);
    const Json::Value& number = data["number"];
    if (number.isUInt() && !numbers.insert(number.asUInt()).second)
        source.refuse(data, "duplicate LUN number " + compact_text(number));
    set_default(data, "lunDescIdType", data["lunDescription"].isString() ? 3U : 0U);
    fill_defaults(data, lun_members);
    pad_text(data, "vendor", VENDOR_LENGTH);
    pad_text(data, "productID", PRODUCT_LENGTH);
    return answered_members(std::move(data), lun_members);
}

Json::Value lun_list(const Json_Text& source, Json::Value list)
{
    std::set<Json::UInt> numbers;
    Json::ArrayIndex place = 0;
    for (Json::Value& each : list)
        each = lun(source, std::move(each), place++, numbers);
    return list;
}

Remote_Port_List::Shared remote_port(const Json_Text& source, Json::Value written)
{
    check_members(source, written, remote_port_members, "a remote port");
    fill_defaults(written, remote_port_members);
    const auto port = std::make_shared<Remote_Port>();
    port->address = written["remotePortWwn"].asString();
    for (const char* name : {"remotePortWwn", "remoteNodeWwn"})
        if (!written[name].isNull())
            port->listed[name] = written[name];
    if (!written["deviceData"].isNull())
        written["deviceData"] = device_data(source, std::move(written["deviceData"]));
    if (!written["lunList"].isNull())
        written["lunList"] = lun_list(source, std::move(written["lunList"]));
    port->complete = answered_members(std::move(written), remote_port_members);
    return port;
}

Remote_Port_List::Shared known_port(const Json_Text& source, const Json::Value& address,
                                    const Remote_Port_List& known)
{
    Remote_Port_List::Shared port = known.find(address.asString());
    if (!port)
        source.refuse(address, "unknown remote port " + compact_text(address));
    return port;
}

} // namespace

Remote_Port_List read_remote_ports(const Json_Text& source, Json::Value written,
                                   const Remote_Port_List& known)
{
    Remote_Port_List ports;
    for (Json::Value& each : written) {
        const bool named = each.isString();
        const Json::Value place = each.isObject() ? std::as_const(each)["remotePortWwn"] : each;
        if (!ports.add(named ? known_port(source, each, known) : remote_port(source, std::move(each))))
            source.refuse(place, "duplicate remote port " + compact_text(place));
    }
    return ports;
}

} // namespace KPRV::simulator
