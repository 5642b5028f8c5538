#pragma once

#include "module/adapter/Host_Name.h"
#include "module/runtime/ground/Types.h"

#include <json/value.h>

namespace KPRV {

/// What the builders know of one Ethernet port. Texts are cut to their field and always terminated; an
/// unknown one is empty, an unknown number 0.
struct _ethPortInfo
{
    char mac[36];          ///< Flat form.
    char deviceName[1028]; ///< The operating system's name of the interface.
    uint32 status;
    String systemName;         ///< At most 63 characters.
    char permanentAddress[24]; ///< Flat form.
    sint32 portType;           ///< As CIM numbers it; only for ports, not for endpoints.
    sint32 portNumber;         ///< Place in the adapter's list, from 0.
    uint32 mtu;
};

/// Fills the record from an answer of `getEthPortByEthMac`; the port type is left alone. Throws
/// `Not_Convertible` for a member of the wrong type.
void fill_ethernet_port(const char* mac, const Json::Value& answer, sint32 port_number, Host_Name& host,
                        _ethPortInfo& port);

} // namespace KPRV
