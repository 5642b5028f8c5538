#pragma once

#include "module/adapter/classId_t.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/Wanted.h"
#include "module/runtime/system/log.h"

#include <span>

namespace KPRV {

/// What a class needs before it is served.
enum class Needs
{
    NOTHING,
    /// Not a missing or mismatched driver.
    DRIVER,
};

/// Gives all instances of a class; the caller owns them. A null stands for one that is not wanted.
using Instances_Source = Array<Instance*> (*)(classId_t id, const Wanted& wanted);

/// One class that a manager serves.
struct Class_Row
{
    classId_t id;
    Needs needs;
    Instances_Source source;
};

/// All instances of the class, by the manager's rows; empty for a class without a row. The reason of an empty
/// result is in the log, as the caller's line.
Array<Instance*> dispatch_class(Call_Site site, std::span<const Class_Row> rows, classId_t id,
                                const Wanted& wanted);

} // namespace KPRV
