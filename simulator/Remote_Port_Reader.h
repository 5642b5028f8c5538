#pragma once

#include "simulator/Json_Text.h"
#include "simulator/Remote_Port_List.h"

namespace KPRV::simulator {

/// Builds the remote ports of "remotePorts": each an object, or the address of one of `known`, the
/// host's. Consumes `written`, which is most of the text of a large host. Throws Refused.
Remote_Port_List read_remote_ports(const Json_Text& source, Json::Value written,
                                   const Remote_Port_List& known = {});

} // namespace KPRV::simulator
