#include "module/adapter/ProviderInit.h"

#include "module/adapter/ProviderUtil.h"
#include "tests/module/adapter/test_library/dzntj.h"
#include "tests/support/Driver_Status_Override.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/In_Child.h"
#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

#include <dlfcn.h>

using namespace KPRV;

namespace {

struct Start
{
    sint32 status = -1;
    Dzntj_Script script;
    Lines said;
};

/// Starts against the test's library with a script, in a process of its own.
void start(const Dzntj_Script& script, void (*check)(const Start&))
{
    in_child([&] {
        void* library = dlopen(WHOLE_LIBRARY, RTLD_NOW);
        ASSERT_NE(library, nullptr) << dlerror();
        auto* live = reinterpret_cast<Dzntj_Script* (*)()>(dlsym(library, "dzntj_script"))();
        *live = script;
        Log_Capture log;
        Start result;
        {
            ProviderInit init;
            result.status = ProviderInit::getDriverStatus();
        }
        result.script = *live;
        result.said = log.said();
        check(result);
    });
}

Dzntj_Script with_version(const char* version)
{
    Dzntj_Script script;
    script.version = version;
    return script;
}

Dzntj_Script with_answer(const char* answer)
{
    Dzntj_Script script;
    script.init_answer = answer;
    return script;
}

} // namespace

TEST(ProviderInit, StartsWithoutALibrary)
{
    in_child([] {
        Log_Capture log;
        {
            ProviderInit init;
            EXPECT_EQ(ProviderInit::getDriverStatus(), 1);
        }
        Lines said = log.said();
        ASSERT_EQ(said.size(), 6u);
        EXPECT_EQ(said[0], "DBG Inside ProviderInit Constructor.");
        EXPECT_EQ(said[1], "DBG inside setupDLLEntryPoints");
        EXPECT_TRUE(said[2].starts_with("DBG Error in loading library: "));
        EXPECT_EQ(said[3], "INFO ZNTJ Library version: NOT Loaded");
        EXPECT_EQ(said[4], "ERR libInitHbaLib returns NULL response or has error");
        EXPECT_EQ(said[5], "DBG Inside ProviderInit Destructor.");
        EXPECT_TRUE(ProviderUtil::getDriverStatus());
    });
}

TEST(ProviderInit, InitialisesCountsAndSaysGoodbye)
{
    start({}, [](const Start& result) {
        EXPECT_EQ(result.status, 0);
        EXPECT_EQ(json(result.script.init_request), json("{'appId': 2}"));
        EXPECT_EQ(result.script.log_callbacks, 1);
        EXPECT_EQ(result.script.goodbyes, 1);
        EXPECT_EQ(result.said, (Lines{"DBG Inside ProviderInit Constructor.",
                                      "DBG inside setupDLLEntryPoints", "INFO ZNTJ Library version: 3.2.1",
                                      "DBG Adapter Count = 2", "DBG Inside ProviderInit Destructor."}));
    });
}

TEST(ProviderInit, AnUnknownVersionIsNotAnEmptyOne)
{
    start(with_version(nullptr), [](const Start& result) {
        EXPECT_EQ(result.said[2], "INFO ZNTJ Library version: Unknown");
        EXPECT_EQ(result.script.log_callbacks, 0);
        EXPECT_EQ(result.status, 0);
    });
    start(with_version(""), [](const Start& result) {
        EXPECT_EQ(result.said[2], "INFO ZNTJ Library version: ");
        EXPECT_EQ(result.script.log_callbacks, 0);
    });
}

TEST(ProviderInit, TheLogCallbackGoesByThreeDigitsEachOnItsOwn)
{
    for (const char* version : {"3.2.1", "9.9.9", "3.2.1.4", "3x2x1"})
        start(with_version(version), [](const Start& result) {
            EXPECT_EQ(result.script.log_callbacks, 1) << result.script.version;
        });
    // A byte above 0x7F compares as negative.
    for (const char* version : {"3.2.0", "4.1.0", "3.1.9", "2.9.9", "3.2", "3", "\xFF.2.1"})
        start(with_version(version), [](const Start& result) {
            EXPECT_EQ(result.script.log_callbacks, 0) << result.script.version;
        });
}

TEST(ProviderInit, ABadAnswerLeavesTheDriverUninitialised)
{
    for (const char* answer : {"null", "{\"result\": 0, \"error\": null}"})
        start(with_answer(answer), [](const Start& result) {
            EXPECT_EQ(result.status, 1);
            EXPECT_EQ(result.said[3], "ERR libInitHbaLib returns NULL response or has error");
            EXPECT_EQ(result.said.size(), 5u);
        });
}

TEST(ProviderInit, AResultOtherThan0IsAFailure)
{
    const auto failed_without_result = [](const Start& result) {
        EXPECT_EQ(result.status, 1);
        EXPECT_EQ(result.said[3], "ERR libInitHbaLib is failed - -1 ");
    };
    start(with_answer("{}"), failed_without_result);
    start(with_answer("[]"), failed_without_result);
    start(with_answer("{\"result\": 5}"), [](const Start& result) {
        EXPECT_EQ(result.status, 1);
        EXPECT_EQ(result.said[3], "ERR libInitHbaLib is failed - 5 ");
    });
    // Null converts to 0, as everywhere.
    start(with_answer("{\"result\": null}"), [](const Start& result) { EXPECT_EQ(result.status, 0); });
}

TEST(ProviderInit, AResultOfTheWrongTypeDoesNotEscapeIntoTheLoader)
{
    start(with_answer("{\"result\": \"0\"}"), [](const Start& result) {
        EXPECT_EQ(result.status, 1);
        EXPECT_EQ(result.said[3], "ERR libInitHbaLib got std exception: Type is not convertible to int");
        EXPECT_EQ(result.said[4], "ERR libInitHbaLib is failed - -1 ");
    });
}

TEST(ProviderInit, NoAdapterIsToldByTheStatusAlone)
{
    Dzntj_Script script;
    script.adapters = 0;
    start(script, [](const Start& result) {
        EXPECT_EQ(result.status, 1);
        EXPECT_EQ(result.said[3], "DBG Adapter Count = 0");
        for (const std::string& line : result.said)
            EXPECT_FALSE(line.starts_with("ERR")) << line;
    });
}

TEST(ProviderInit, TheGuardRefusesTheTwoReservedValues)
{
    for (const sint32 status : {0, 1, 4, -1}) {
        Driver_Status_Override driver(status);
        EXPECT_TRUE(ProviderUtil::getDriverStatus()) << status;
    }
    for (const sint32 status : {2, 3}) {
        Driver_Status_Override driver(status);
        EXPECT_FALSE(ProviderUtil::getDriverStatus()) << status;
    }
}
