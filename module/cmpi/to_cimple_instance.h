#pragma once

#include "module/cmpi/Nesting.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/Meta_Repository.h"

#include <cmpidt.h>
#include <cmpift.h>

namespace KPRV {

/// An embedded instance or a reference of the server as an instance of whatever class of the repository it
/// names, so that it keeps its most derived class. Null on failure, with a log line (but none for a null
/// `CMPIInstance`). One whose class is not that which is wanted comes without its content: it is refused by
/// that class, and what may lie in it is not looked at. The caller owns the result.
Instance* _to_cimple_instance(const Meta_Repository* repository, const CMPIBroker* broker,
                              const char* name_space, const CMPIInstance* instance, Nesting nesting = {});
/// As above, with the keys only.
Instance* _to_cimple_instance(const Meta_Repository* repository, const CMPIBroker* broker,
                              const char* name_space, const CMPIObjectPath* path, Nesting nesting = {});

} // namespace KPRV
