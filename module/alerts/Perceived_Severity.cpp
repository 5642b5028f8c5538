#include "module/alerts/Perceived_Severity.h"

#include "module/runtime/system/log.h"

namespace KPRV {

namespace {

struct Severity_Row
{
    sint32 event_severity;
    Severity standard;
    Severity exact;
};

// clang-format off
constexpr Severity_Row severity_rows[] = {
//   event  standard               exact
    {1,     SEVERITY_CRITICAL,     SEVERITY_CRITICAL},
    {2,     SEVERITY_CRITICAL,     SEVERITY_MAJOR},
    {3,     SEVERITY_WARNING,      SEVERITY_WARNING},
    {4,     SEVERITY_INFORMATION,  SEVERITY_INFORMATION},
};
// clang-format on

uint16 look_up(sint32 event_severity, Severity Severity_Row::*column)
{
    // Both go by this name in the log.
    LOG_SCOPE("getPerceivedSeverity");
    for (const Severity_Row& row : severity_rows)
        if (row.event_severity == event_severity)
            return row.*column;
    LOG(WARN, "Received a un-expected severity value: %d", event_severity);
    return SEVERITY_UNKNOWN;
}

} // namespace

uint16 getPerceivedSeverity(sint32 event_severity)
{
    return look_up(event_severity, &Severity_Row::standard);
}

uint16 getExactPerceivedSeverity(sint32 event_severity)
{
    return look_up(event_severity, &Severity_Row::exact);
}

} // namespace KPRV
