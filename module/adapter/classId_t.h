#pragma once

#include "module/runtime/ground/Types.h"

namespace KPRV {

/// Names what the managers can build. `ProviderUtil::getClassName` gives the class.
enum classId_t : uint32
{
    NO_CLASS,
#define CLASS_ID(id, enumerator, name) enumerator = id,
#include "module/adapter/Class_Ids.def"
#undef CLASS_ID
    MAXCLASSID
};

static_assert(MAXCLASSID == 39);

} // namespace KPRV
