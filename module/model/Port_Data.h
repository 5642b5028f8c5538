#pragma once

#include "module/adapter/Host_Name.h"
#include "module/runtime/ground/Types.h"

#include <json/value.h>

namespace KPRV {

/// What the builders know of one FC port. Texts are cut to their field and always terminated; an unknown one
/// is empty, an unknown number 0.
struct _hbaPortInfo
{
    /// Flat form. For the endpoint of a remote port: the local WWN, "_", the remote WWN.
    char portWWN[48];
    char nodeWWN[24]; ///< Flat form.
    char symbolicName[1028];
    sint32 status;
    String systemName;   ///< At most 255 characters.
    char localWWN[24];   ///< The port's own WWN, whatever `portWWN` becomes.
    sint32 portType;     ///< As CIM numbers it.
    sint64 maxFrameSize; ///< Bytes.
    sint64 speed;        ///< Bits per second.
    sint64 maxSpeed;     ///< Bits per second.
    sint32 portNumber;   ///< Place in the adapter's list, from 0.
};

/// Fills the record from an answer of `getPortByWwn`; false if that is none, as
/// `ProviderUtil::isValidJsonResponse` has it. Throws `Not_Convertible` for a member of the wrong type.
bool fill_port(const Json::Value& answer, sint32 port_number, Host_Name& host, _hbaPortInfo& port);

/// Makes `portWWN` the name of the remote port with that WWN, in either form, as the local port sees it.
void name_remote_port(const char* remote_wwn, _hbaPortInfo& port);

} // namespace KPRV
