#include "module/alerts/IndicationHelper.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

namespace KPRV {
namespace {

struct Known_Event
{
    sint32 key;
    const char* message_id;
    const char* cause;
    const char* action;
};

constexpr Known_Event known_events[] = {
#include "tests/module/alerts/catalogue.inc"
};

TEST(Event_Catalogue, KnowsTheseEventsAndNoOther)
{
    ASSERT_EQ(52u, std::size(known_events));
    EXPECT_EQ(52u, event_rows().size());
    IndicationHelper helper;
    helper.initEventDetailsMaps();
    size_t found = 0;
    for (sint32 key = -70000; key < 900000; key++)
        found += !(helper.getMessageIDById(key) == "Unknown");
    EXPECT_EQ(52u, found);
    for (const Known_Event& event : known_events) {
        EXPECT_STREQ(event.message_id, helper.getMessageIDById(event.key).c_str());
        EXPECT_STREQ(event.cause, helper.getEventCauseById(event.key).c_str()) << event.key;
        EXPECT_STREQ(event.action, helper.getEventActionById(event.key).c_str()) << event.key;
    }
}

TEST(Event_Catalogue, AnEmptyCauseIsACause)
{
    IndicationHelper helper;
    helper.initEventDetailsMaps();
    EXPECT_STREQ("", helper.getEventCauseById(event_key(2, 3)).c_str());
}

TEST(Event_Catalogue, IsUnknownBeforeTheFirstSubscription)
{
    const IndicationHelper helper;
    for (const Known_Event& event : known_events) {
        EXPECT_STREQ("Unknown", helper.getEventCauseById(event.key).c_str());
        EXPECT_STREQ("Unknown", helper.getEventActionById(event.key).c_str());
        EXPECT_STREQ("Unknown", helper.getMessageIDById(event.key).c_str());
    }
}

TEST(Event_Catalogue, KeepsItsMessageIdsWhenItIsCleared)
{
    IndicationHelper helper;
    helper.initEventDetailsMaps();
    helper.clearEventDetailsMaps();
    for (const Known_Event& event : known_events) {
        EXPECT_STREQ("Unknown", helper.getEventCauseById(event.key).c_str());
        EXPECT_STREQ("Unknown", helper.getEventActionById(event.key).c_str());
        EXPECT_STREQ(event.message_id, helper.getMessageIDById(event.key).c_str());
    }
    helper.initEventDetailsMaps();
    helper.initEventDetailsMaps();
    EXPECT_STREQ("SFP removed.", helper.getEventCauseById(event_key(2, 5)).c_str());
}

TEST(Event_Catalogue, HasNothingUnderTheKeyOfEventsWithoutACategory)
{
    IndicationHelper helper;
    helper.initEventDetailsMaps();
    EXPECT_STREQ("Unknown", helper.getMessageIDById(0).c_str());
}

TEST(Event_Catalogue, TellsTheLogThatItIsFilled)
{
    const Log_Capture log;
    IndicationHelper helper;
    helper.initEventDetailsMaps();
    ASSERT_FALSE(log.traces().empty());
    EXPECT_EQ("DBG Entering: initEventDetailsMaps", log.traces().at(0));
}

} // namespace
} // namespace KPRV
