#include "module/model/Port_Data.h"

#include "module/model/Record_Filling.h"

namespace KPRV {

namespace {

// What is read of an answer, in the order of its members.
enum : size_t
{
    SYMBOLIC_NAME,
    PORT_ERROR,
    MAX_FRAME_SIZE,
    NODE_WWN,
    OPERATING_SPEED,
    PORT_STATUS,
    PORT_TYPE,
    SUPPORTED_SPEEDS,
    PORT_WWN,
    NUM_PORT_MEMBERS
};
constexpr Members<NUM_PORT_MEMBERS>::Names port_members = {
    "PortSymbolicName",
    "error",
    "maxFrameSize",
    "nodeWwn",
    "operatingSpeed",
    "portStatusValue",
    "portTypeMOFValue",
    "supportedPortSpeeds",
    "wwn",
};

sint64 bits_per_second(const Json::Value& gigabits)
{
    constexpr sint64 GIGABIT = 1000000000;
    return asInt(gigabits) * GIGABIT;
}

sint64 operating_speed(const Json::Value& gigabits)
{
    // What a port without a link says.
    constexpr int UNKNOWN_SPEED = 99999;
    return asInt(gigabits) == UNKNOWN_SPEED ? 0 : bits_per_second(gigabits);
}

} // namespace

bool fill_port(const Json::Value& answer, sint32 port_number, Host_Name& host, _hbaPortInfo& port)
{
    const Answer_Members<port_members> members(answer);
    if (!members.is_valid())
        return false;
    copy_flat(port.localWWN, text_of(members[PORT_WWN]));
    copy_text(port.portWWN, port.localWWN);
    copy_flat(port.nodeWWN, text_of(members[NODE_WWN]));
    copy_text(port.symbolicName, asView(members[SYMBOLIC_NAME]));
    port.status = asInt(members[PORT_STATUS]);
    port.systemName = host.get();
    port.portType = asInt(members[PORT_TYPE]);
    port.maxFrameSize = asInt(members[MAX_FRAME_SIZE]);
    port.speed = operating_speed(members[OPERATING_SPEED]);
    port.maxSpeed = bits_per_second(element(members[SUPPORTED_SPEEDS], 0));
    port.portNumber = port_number;
    return true;
}

void name_remote_port(const char* remote_wwn, _hbaPortInfo& port)
{
    char remote[sizeof port.localWWN];
    copy_flat(remote, remote_wwn);
    copy_text(port.portWWN, std::string(port.localWWN) + "_" + remote);
}

} // namespace KPRV
