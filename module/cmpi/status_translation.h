#pragma once

#include "module/runtime/dispatch/provider_status.h"

#include <cmpidt.h>

namespace KPRV {

/// The families of provider statuses, by the operation that reads them.
enum class Status_Family
{
    GET_INSTANCE,
    CREATE_INSTANCE,
    MODIFY_INSTANCE,
    DELETE_INSTANCE,
    ENUM_INSTANCES,
    INVOKE_METHOD,
    ENUM_ASSOCIATORS,
    ENUM_ASSOCIATOR_NAMES,
    ENUM_REFERENCES,
    ENABLE_INDICATIONS,
    DISABLE_INDICATIONS,
};

/// The CMPI code of a provider's status. A status that its family does not list, one of another family among
/// them, is no failure: 0.
CMPIrc translate(Status_Family family, int status);

} // namespace KPRV
