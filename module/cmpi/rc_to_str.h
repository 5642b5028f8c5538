#pragma once

#include <cmpidt.h>

namespace KPRV {

/// The symbol of a CMPI return code as text, for the trace. A code outside the table, and 1, is
/// "CMPI_RC_ERR_FAILED".
const char* _rc_to_str(CMPIrc rc);

} // namespace KPRV
