#pragma once

#include "module/runtime/ground/Types.h"

namespace KPRV {

/// Values of the schema's `PerceivedSeverity`.
enum Severity : uint16
{
    SEVERITY_UNKNOWN = 0,
    SEVERITY_INFORMATION = 2,
    SEVERITY_WARNING = 3,
    SEVERITY_MAJOR = 5,
    SEVERITY_CRITICAL = 6,
};

/// Severity of a standard alert, from the library's severity of the event. An unknown one is told at WARN.
uint16 getPerceivedSeverity(sint32 event_severity);

/// As above for a proprietary alert, which tells major from critical.
uint16 getExactPerceivedSeverity(sint32 event_severity);

} // namespace KPRV
