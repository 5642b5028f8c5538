#include "simulator/Adapter_Reader.h"

#include "simulator/Hardware_Tests.h"
#include "simulator/Inventory_Members.h"
#include "simulator/Port_Reader.h"
#include "simulator/Settings.h"

#include <algorithm>

namespace KPRV::simulator {

namespace {

class Reader
{
public:
    Reader(const Json_Text& source, Json::Value& written, const Adapter_Place& place)
        : _source(source), _written(written), _place(place)
    {
        check_members(_source, _written, adapter_members, "an adapter");
        _hba = _written["hbaData"];
        check_members(_source, _hba, hba_data_members, "hbaData");
        if (!_hba.isMember("wwn") && !is_cna())
            _source.refuse(_written["hbaData"], "missing member \"wwn\" or \"hbaMAC\" in hbaData");
    }

    Adapter adapter()
    {
        Adapter adapter;
        read_ports(adapter);
        const Json::Value parts = answered_members(_written, adapter_members);
        adapter.data["hbaData"] = hba_data(adapter);
        if (parts.isMember("driver"))
            adapter.data["driver"] = driver(parts["driver"]);
        if (parts.isMember("firmware"))
            adapter.data["firmware"] = part(parts["firmware"], firmware_members, "firmware");
        adapter.flash_status = parts["flashStatus"];
        adapter.flash_update = part(parts["flashUpdate"], flash_update_members, "flashUpdate");
        adapter.address = address();
        adapter.answers = parts["answers"];
        check_answers(_source, adapter.answers);
        adapter.settings = parts["settings"];
        check_settings(_source, adapter.settings);
        adapter.tests = parts["diagnostics"];
        check_hardware_tests(_source, adapter.tests);
        return adapter;
    }

private:
    void read_ports(Adapter& adapter)
    {
        Json::Value& fc = _written["fcPorts"];
        Json::Value& eth = _written["ethPorts"];
        for (Json::ArrayIndex index = 0; index < std::min(fc.size(), eth.size()); ++index)
            share_optics(fc[index], eth[index]);
        for (Json::Value& port : fc)
            adapter.fc_ports.push_back(read_fc_port(_source, port, port_place(adapter.fc_ports.size())));
        for (const Json::Value& port : eth)
            adapter.eth_ports.push_back(read_eth_port(_source, port, port_place(adapter.eth_ports.size())));
    }

    Port_Place port_place(std::size_t index) const
    {
        return {_place.number, index, _place.eth_ports_before, is_cna(), _hba["wwn"], _place.known_ports};
    }

    bool is_cna() const { return _hba.isMember("hbaMAC"); }

    std::string address() const
    {
        if (_written.isMember("address"))
            return _written["address"].asString();
        return _hba[is_cna() ? "hbaMAC" : "wwn"].asString();
    }

    Json::Value part(const Json::Value& object, Members members, const char* what) const
    {
        check_members(_source, object, members, what);
        return answered_members(object, members);
    }

    Json::Value hba_data(const Adapter& adapter) const
    {
        Json::Value data = _hba;
        set_default(data, "model", is_cna() ? "1020" : "825");
        set_default(data, "serialNumber", "KLDR" + six_digits(_place.number));
        set_default(data, "isCNA", is_cna());
        set_default(data, "hasEthPort", !adapter.eth_ports.empty());
        const std::size_t ports = std::max(adapter.fc_ports.size(), adapter.eth_ports.size());
        set_default(data, "portCount", static_cast<Json::UInt>(ports));
        return answered_members(data, hba_data_members);
    }

    Json::Value driver(Json::Value data) const
    {
        check_members(_source, data, driver_members, "driver");
        if (is_cna()) {
            set_default(data, "networkDriverName", "kldrnet");
            set_default(data, "networkDriverVersion", "3.2.1.0");
        }
        return answered_members(data, driver_members);
    }

    const Json_Text& _source;
    Json::Value& _written;
    const Adapter_Place& _place;
    Json::Value _hba;
};

} // namespace

Adapter read_adapter(const Json_Text& source, Json::Value& written, const Adapter_Place& place)
{
    return Reader(source, written, place).adapter();
}

} // namespace KPRV::simulator
