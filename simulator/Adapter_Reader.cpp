#include "simulator/Adapter_Reader.h"

#include "simulator/Entry_Points.h"
#include "simulator/Inventory_Members.h"
#include "simulator/Status.h"

#include <algorithm>

namespace KPRV::simulator {

namespace {

// Takes the member out of its object, as an object that may be empty.
Json::Value take_object(Json::Value& from, const char* name)
{
    Json::Value taken;
    from.removeMember(name, &taken);
    return taken.isNull() ? Json::Value(Json::objectValue) : taken;
}

void default_status(Json::Value& object, const char* name, const Json::Value& enabled)
{
    set_default(object, name, enabled.isBool() && !enabled.asBool() ? STOPPED : IN_SERVICE);
}

std::string padded(std::size_t number)
{
    const std::string digits = std::to_string(number);
    return std::string(digits.size() < 6 ? 6 - digits.size() : 0, '0') + digits;
}

class Reader
{
public:
    Reader(const Json_Text& source, const Json::Value& written, Adapter_Place place)
        : source_(source), written_(written), place_(place)
    {
        check_members(source_, written_, adapter_members, "an adapter");
        hba_ = written_["hbaData"];
        check_members(source_, hba_, hba_data_members, "hbaData");
        if (!hba_.isMember("wwn") && !is_cna())
            source_.refuse(written_["hbaData"], "missing member \"wwn\" or \"hbaMAC\" in hbaData");
    }

    Adapter adapter()
    {
        const Json::Value parts = answered_members(written_, adapter_members);
        Adapter adapter;
        for (const Json::Value& port : parts["fcPorts"])
            adapter.fc_ports.push_back(fc_port(port, adapter.fc_ports.size()));
        for (const Json::Value& port : parts["ethPorts"])
            adapter.eth_ports.push_back(eth_port(port, adapter.eth_ports.size()));
        adapter.data["hbaData"] = hba_data(adapter);
        if (parts.isMember("driver"))
            adapter.data["driver"] = driver(parts["driver"]);
        if (parts.isMember("firmware"))
            adapter.data["firmware"] = part(parts["firmware"], firmware_members, "firmware");
        adapter.flash_status = parts["flashStatus"];
        adapter.address = address();
        adapter.answers = parts["answers"];
        check_answers(source_, written_["answers"]);
        return adapter;
    }

private:
    bool is_cna() const { return hba_.isMember("hbaMAC"); }

    std::string address() const
    {
        if (written_.isMember("address"))
            return written_["address"].asString();
        return hba_[is_cna() ? "hbaMAC" : "wwn"].asString();
    }

    Json::Value part(const Json::Value& object, Members members, const char* what) const
    {
        check_members(source_, object, members, what);
        return answered_members(object, members);
    }

    Json::Value hba_data(const Adapter& adapter) const
    {
        Json::Value data = hba_;
        set_default(data, "model", is_cna() ? "1020" : "825");
        set_default(data, "serialNumber", "KLDR" + padded(place_.number));
        set_default(data, "isCNA", is_cna());
        set_default(data, "hasEthPort", !adapter.eth_ports.empty());
        const std::size_t ports = std::max(adapter.fc_ports.size(), adapter.eth_ports.size());
        set_default(data, "portCount", static_cast<Json::UInt>(ports));
        return answered_members(data, hba_data_members);
    }

    Json::Value driver(Json::Value data) const
    {
        check_members(source_, data, driver_members, "driver");
        if (is_cna()) {
            set_default(data, "networkDriverName", "kldrnet");
            set_default(data, "networkDriverVersion", "3.2.1.0");
        }
        return answered_members(data, driver_members);
    }

    Port fc_port(const Json::Value& written, std::size_t index) const
    {
        check_members(source_, written, fc_port_members, "an FC port");
        check_answers(source_, written["answers"]);
        Port port;
        port.data = written;
        port.answers = take_object(port.data, "answers");
        port.address = written["wwn"].asString();
        if (hba_.isMember("wwn"))
            set_default(port.data, "nodeWwn", hba_["wwn"]);
        set_default(port.data, "PortSymbolicName", "KLDR port " + std::to_string(index));
        set_default(port.data, "isFCoE", is_cna());
        default_status(port.data, "portStatusValue", written["portStatus"]);
        port.data = answered_members(port.data, fc_port_members);
        return port;
    }

    Port eth_port(const Json::Value& written, std::size_t index) const
    {
        check_members(source_, written, eth_port_members, "an Ethernet port");
        check_answers(source_, written["answers"]);
        Port port;
        port.data = answered_members(written, eth_port_members);
        port.answers = take_object(port.data, "answers");
        port.address = written["mac"].asString();
        default_status(port.data, "portStatusValue", port.data["portStatus"]);
        Json::Value eth;
        if (port.data.removeMember("ethData", &eth))
            port.eth_data = eth_data(eth, index, port.data["portStatus"]);
        return port;
    }

    Json::Value eth_data(Json::Value data, std::size_t index, const Json::Value& enabled) const
    {
        check_members(source_, data, eth_data_members, "ethData");
        set_default(data, "ethDev", "eth" + std::to_string(place_.eth_ports_before + index));
        default_status(data, "ethPortStateMOFValue", enabled);
        return answered_members(data, eth_data_members);
    }

    const Json_Text& source_;
    const Json::Value& written_;
    Adapter_Place place_;
    Json::Value hba_;
};

} // namespace

Adapter read_adapter(const Json_Text& source, const Json::Value& written, Adapter_Place place)
{
    return Reader(source, written, place).adapter();
}

void check_answers(const Json_Text& source, const Json::Value& answers)
{
    for (const std::string& name : answers.getMemberNames())
        if (!find_entry(name))
            source.refuse(answers[name], "unknown entry point \"" + name + "\" in answers");
}

} // namespace KPRV::simulator
