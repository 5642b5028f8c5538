#pragma once

#include "module/runtime/ground/String.h"
#include "module/runtime/system/log.h"

#include <json/value.h>

namespace KPRV {

/// Asks the library for one Ethernet port: 0, and in `out` the answer with its object `ethData`; or -1. Both
/// the toolbox and the Ethernet ports of the model ask, so it stands below them; the lines of its log are its
/// caller's.
int query_ethernet_port(Call_Site site, const String& mac, Json::Value& out);

} // namespace KPRV
