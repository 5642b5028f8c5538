#include "module/alerts/Adapter_Event.h"

#include "module/adapter/Json_Access.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

namespace KPRV {
namespace {

/// What the log says of a text that gives no event.
Lines refused(const char* text)
{
    const Log_Capture log;
    Adapter_Event event;
    EXPECT_FALSE(read_adapter_event(text, event)) << (text ? text : "null");
    return log.said();
}

const Lines unparsable = {"WARN Unable to parse json string to object. Return error"};
const Lines without_category = {"WARN eventCategory is a must in the eventObject. Return error"};
const Lines without_id = {"WARN eventId is a must in the eventObject. Return error"};

TEST(Adapter_Event, HasTheseMembers)
{
    Adapter_Event event;
    ASSERT_TRUE(read_adapter_event(R"(// as the library writes it
        {"eventCategory": 2, "eventId": 13, "eventSeverity": 4, "portIndexString": "1000", "eventMsg": "text",
         "basePortWWN": "10:00", "eventIdValue": "ZNT_FABRIC", "pomLevel": "high", "fWwn": "20:00",
         "cee_state": "up", "more": [1]})",
                                   event));
    EXPECT_EQ(2, event.category);
    EXPECT_EQ(13, event.id);
    EXPECT_EQ(4, event.severity);
    EXPECT_STREQ("1000", event.port_index.c_str());
    EXPECT_STREQ("10:00", event.base_port_wwn.c_str());
    EXPECT_STREQ("text", event.message.c_str());
    EXPECT_STREQ("ZNT_FABRIC", event.symbol.c_str());
    EXPECT_STREQ("high", event.pom_level->c_str());
    EXPECT_STREQ("20:00", event.fabric_wwn->c_str());
    EXPECT_STREQ("up", event.cee_state->c_str());
}

TEST(Adapter_Event, NeedsNoMoreThanCategoryAndId)
{
    Adapter_Event event;
    ASSERT_TRUE(read_adapter_event(R"({"eventCategory": 0, "eventId": 0})", event));
    EXPECT_EQ(0, event.severity);
    EXPECT_TRUE(event.port_index.empty() && event.base_port_wwn.empty() && event.message.empty() &&
                event.symbol.empty());
    EXPECT_FALSE(event.pom_level || event.fabric_wwn || event.cee_state);
}

TEST(Adapter_Event, OfATextThatIsNoJsonIsRefused)
{
    for (const char* text :
         {"", " ", "{", "{\"eventCategory\": }", "eventCategory", "{'eventId': 1}", "\xff"})
        EXPECT_EQ(unparsable, refused(text)) << text;
    EXPECT_EQ(unparsable, refused(nullptr));
    EXPECT_EQ(unparsable, refused(std::string(100000, '[').c_str()));
    EXPECT_EQ(unparsable, refused((R"({"eventCategory": 2, "eventId": 1, "x": )" + std::string(300, '[') +
                                   std::string(300, ']') + "}")
                                      .c_str()));
}

TEST(Adapter_Event, WithoutWhatItNeedsIsRefused)
{
    for (const char* text : {"{}", "[]", "[1]", "42", "null", "\"text\"", R"({"eventId": 1})",
                             R"({"EventCategory": 1, "eventId": 1})"})
        EXPECT_EQ(without_category, refused(text)) << text;
    EXPECT_EQ(without_id, refused(R"({"eventCategory": 1})"));
}

TEST(Adapter_Event, KeepsOnlySymbolsOfTheLibrary)
{
    const auto symbol = [](const char* value) {
        Adapter_Event event;
        read_adapter_event(
            (std::string(R"({"eventCategory": 1, "eventId": 1, "eventIdValue": ")") + value + "\"}").c_str(),
            event);
        return std::string(event.symbol.c_str());
    };
    EXPECT_EQ("ZNT_", symbol("ZNT_"));
    EXPECT_EQ("ZNT_X", symbol("ZNT_X"));
    EXPECT_EQ("", symbol("ZNT"));
    EXPECT_EQ("", symbol("znt_X"));
    EXPECT_EQ("", symbol("X_ZNT_"));
    EXPECT_EQ("", symbol(""));
}

TEST(Adapter_Event, TakesNullForNothing)
{
    Adapter_Event event;
    ASSERT_TRUE(read_adapter_event(
        R"({"eventCategory": null, "eventId": null, "eventSeverity": null, "eventMsg": null,
            "portIndexString": null, "pomLevel": null})",
        event));
    EXPECT_EQ(0, event.category);
    EXPECT_EQ(0, event.id);
    EXPECT_TRUE(event.message.empty());
    ASSERT_TRUE(event.pom_level) << "it is there";
    EXPECT_TRUE(event.pom_level->empty());
}

/// The words of the exception that a text throws.
std::string thrown_by(const std::string& text)
{
    Adapter_Event event;
    try {
        read_adapter_event(text.c_str(), event);
    } catch (const Not_Convertible& error) {
        return error.what();
    }
    return "nothing";
}

TEST(Adapter_Event, LetsMembersOfWrongTypesOut)
{
    const std::string no_int = "Type is not convertible to int";
    const std::string no_text = "Type is not convertible to string";
    EXPECT_EQ(no_int, thrown_by(R"({"eventCategory": "2", "eventId": 1})"));
    EXPECT_EQ(no_int, thrown_by(R"({"eventCategory": 4294967296, "eventId": 1})"));
    EXPECT_EQ(no_int, thrown_by(R"({"eventCategory": [2], "eventId": 1})"));
    EXPECT_EQ(no_int, thrown_by(R"({"eventCategory": 2, "eventId": {}})"));
    EXPECT_EQ(no_int, thrown_by(R"({"eventCategory": 2, "eventId": 1, "eventSeverity": "4"})"));
    for (const char* name :
         {"portIndexString", "basePortWWN", "eventMsg", "eventIdValue", "pomLevel", "fWwn", "cee_state"})
        for (const char* value : {"1", "[]", "{}"})
            EXPECT_EQ(no_text, thrown_by(std::string(R"({"eventCategory": 2, "eventId": 1, ")") + name +
                                         "\": " + value + "}"))
                << name << value;
    EXPECT_EQ("nothing", thrown_by(R"({"eventCategory": true, "eventId": 1.9, "eventMsg": true})"));
}

} // namespace
} // namespace KPRV
