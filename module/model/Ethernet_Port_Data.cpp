#include "module/model/Ethernet_Port_Data.h"

#include "module/model/Record_Filling.h"

namespace KPRV {

void fill_ethernet_port(const char* mac, const Json::Value& answer, sint32 port_number, Host_Name& host,
                        _ethPortInfo& port)
{
    const Json::Value& data = member(answer, "ethData");
    copy_flat(port.mac, mac);
    copy_text(port.permanentAddress, port.mac);
    port.systemName = host.get();
    port.portNumber = port_number;
    copy_member(port.deviceName, data, "ethDev");
    port.status = asUInt(member(data, "ethPortStateMOFValue"));
    port.mtu = asUInt(member(data, "mtu"));
}

} // namespace KPRV
