#pragma once

#include "module/cmpi/Nesting.h"
#include "module/runtime/objects/Meta_Repository.h"
#include "module/runtime/objects/Value.h"

#include <cmpidt.h>
#include <cmpift.h>

namespace KPRV {

/// Translates what the server gives into a value of its own type; nothing is widened. 0, or -1 with a log
/// line (but none for an array without object).
int cmpi_to_cimple_value(const Meta_Repository* repository, const CMPIBroker* broker, const char* name_space,
                         const CMPIData& data, Value& value, Nesting nesting = {});

} // namespace KPRV
