#include "module/alerts/Perceived_Severity.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

namespace KPRV {
namespace {

TEST(Perceived_Severity, OfStandardAndProprietaryAlertsDiffersAtOneInput)
{
    const int standard[] = {0, 6, 6, 3, 2, 0};
    const int exact[] = {0, 6, 5, 3, 2, 0};
    for (int input = 0; input <= 5; input++) {
        EXPECT_EQ(standard[input], getPerceivedSeverity(input)) << input;
        EXPECT_EQ(exact[input], getExactPerceivedSeverity(input)) << input;
    }
    for (const int input : {-1, 6, 100, INT32_MAX, INT32_MIN}) {
        EXPECT_EQ(0, getPerceivedSeverity(input));
        EXPECT_EQ(0, getExactPerceivedSeverity(input));
    }
}

TEST(Perceived_Severity, HasOneNameInTheLog)
{
    const Log_Capture log;
    getPerceivedSeverity(1);
    getExactPerceivedSeverity(7);
    const Lines traces = {"DBG Entering: getPerceivedSeverity", "DBG Returning: getPerceivedSeverity",
                          "DBG Entering: getPerceivedSeverity", "DBG Returning: getPerceivedSeverity"};
    EXPECT_EQ(traces, log.traces());
    EXPECT_EQ(Lines{"WARN Received a un-expected severity value: 7"}, log.said());
}

} // namespace
} // namespace KPRV
