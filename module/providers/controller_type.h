#pragma once

#include "module/runtime/ground/Types.h"

namespace KPRV {

// `ControllerType` of an adapter, as `AdapterHelper` sets it.
inline constexpr uint16 CONTROLLER_CNA = 1;
inline constexpr uint16 CONTROLLER_FC = 4;

} // namespace KPRV
