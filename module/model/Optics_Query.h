#pragma once

#include "module/runtime/ground/String.h"
#include "module/runtime/system/log.h"

#include <json/value.h>

namespace KPRV {

/// Asks the library for the transceiver of a port, by its address in either form: 0 and the answer in `out`,
/// or -1, told at ERR as the caller's line. An answer without the member `needed`, if one is named, is as
/// good as none. Throws nothing.
int query_optics(Call_Site site, const String& address, const char* needed, Json::Value& out);

} // namespace KPRV
