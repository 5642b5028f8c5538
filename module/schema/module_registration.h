#pragma once

#include "module/runtime/dispatch/Registration.h"

namespace KPRV {

/// Name of the module; every registration record points at it.
extern const char _cimple_module_name[];

/// The last of the linked registration records, set by the static initialiser of the generated registration
/// source. The list runs in the reverse of the order of the product classes.
extern const Registration* _cimple_registration_head;

} // namespace KPRV
