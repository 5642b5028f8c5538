#pragma once

#include "module/runtime/ground/Types.h"

namespace KPRV {

// What CIM says of a port, from the operational status that the library gives it. The status may be any
// number; one that is not known tells nothing.

/// `EnabledState`; 1 (unknown) for a status that is not known.
uint16 enabled_state(sint32 status);
/// `HealthState`; 0 (unknown) for a status that is not known.
uint16 health_state(sint32 status);

} // namespace KPRV
