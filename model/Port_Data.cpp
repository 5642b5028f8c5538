#include "model/Port_Data.h"

#include "model/Record_Filling.h"

namespace KPRV {

namespace {

constexpr sint64 GIGABIT = 1000000000;

sint64 operating_speed(const Json::Value& answer)
{
    // What a port without a link says.
    constexpr int UNKNOWN_SPEED = 99999;
    const int speed = asInt(member(answer, "operatingSpeed"));
    return speed == UNKNOWN_SPEED ? 0 : speed * GIGABIT;
}

} // namespace

void fill_port(const Json::Value& answer, sint32 port_number, Host_Name& host, _hbaPortInfo& port)
{
    copy_flat(port.localWWN, answer, "wwn");
    copy_text(port.portWWN, port.localWWN);
    copy_flat(port.nodeWWN, answer, "nodeWwn");
    copy_member(port.symbolicName, answer, "PortSymbolicName");
    port.status = asInt(member(answer, "portStatusValue"));
    host.get(port.systemName, sizeof port.systemName);
    port.portType = asInt(member(answer, "portTypeMOFValue"));
    port.maxFrameSize = asInt(member(answer, "maxFrameSize"));
    port.speed = operating_speed(answer);
    port.maxSpeed = asInt(element(member(answer, "supportedPortSpeeds"), 0)) * GIGABIT;
    port.portNumber = port_number;
}

void name_remote_port(const char* remote_wwn, _hbaPortInfo& port)
{
    char remote[sizeof port.localWWN];
    copy_flat(remote, remote_wwn);
    copy_text(port.portWWN, std::string(port.localWWN) + "_" + remote);
}

} // namespace KPRV
