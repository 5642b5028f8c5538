#include "contracts/adapter/Signatures.h"
#include "tests/simulator/Simulator_Fixture.h"

#include <dlfcn.h>

namespace KPRV::simulator {
namespace {

struct Entry_Point
{
    const char* name;
    bool is_json;
};

constexpr Entry_Point entry_points[] = {
#define ENTRY_POINT(symbol, variable, signature) {#symbol, std::is_same_v<signature, JsonReqFP>},
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
};

// Every member that any entry point asks for, so that no request is refused for lacking one.
const char* everything = R"({
    "indexStr": "a", "wwn": "a", "pwwn": "a", "nwwn": "a", "vwwn": "a", "lwwn": "a", "hbaWwn": "a", "portWwn": "a",
    "mac": "a", "pPortWwn": "a", "lPortWwn": "a", "rPortWwn": "a", "lunId": "0", "vfId": 0, "vfID": 0, "appId": 2,
    "dropOldEvents": true, "requestID": "1", "enableState": true, "adapterMode": 1, "type": 0, "Node": "a",
    "port": {}, "propArray": [], "fcPortData": {}, "paramsConfigured": [], "fcoePort": {}, "ethPort": {},
    "portAuth": {}, "removedLunMaskData": [], "addedLunMaskData": [], "clearLunMaskData": false,
    "addedAdvancedIoProfiles": [], "removedAdvancedIoProfiles": [], "symbolicName": "a", "vportArray": [],
    "minBandwidth": 1, "maxBandwidth": 2, "pciFunctionIndices": [], "vNICs": [], "state": true, "file": "a",
    "dataPattern": 1, "frameCount": 1, "mode": 1, "speed": 1, "function": "a", "stopOnError": true})";

class Entry_Points_test : public Simulator_Fixture
{
};

TEST_F(Entry_Points_test, ExportsEverySymbolThatTheModuleResolves)
{
    for (const auto& [name, is_json] : entry_points)
        EXPECT_NO_THROW(simulator.symbol<void()>(name)) << name;
}

TEST_F(Entry_Points_test, EveryJsonEntryPointAnswersAnObjectWhateverIsAsked)
{
    for (const auto& [name, is_json] : entry_points) {
        if (!is_json)
            continue;
        for (const Json::Value& request :
             {Json::Value(), Json::Value(Json::arrayValue), Json::Value(7), json("{}"), json(everything)}) {
            const Json::Value answer = call(name, request);
            EXPECT_TRUE(answer.isObject()) << name << " " << request;
        }
    }
}

TEST_F(Entry_Points_test, WhatNothingAnswersIsRefusedByName)
{
    simulator.load_file(inventory("demo.json"));
    for (const auto& [name, is_json] : entry_points) {
        const Json::Value answer = is_json ? call(name, json(everything)) : Json::Value();
        if (answer.isObject() && error_code(answer) == 3) {
            EXPECT_EQ(answer["error"]["message"].asString(), std::string(name) + ": not supported");
        }
    }
}

TEST_F(Entry_Points_test, ARequestThatLacksAMemberIsRefused)
{
    const Json::Value answer = call("getCompleteRemotePort", "{'pPortWwn': 'a', 'lPortWwn': 'b'}");
    EXPECT_EQ(error_code(answer), 1);
    EXPECT_EQ(answer["error"]["message"].asString(), "getCompleteRemotePort: the request must have rPortWwn");
    EXPECT_EQ(error_code(call("getHbaByWwn", "{'indexStr': 'a'}")), 1);
    EXPECT_EQ(error_code(call("getHbaByWwn", "{'wwn': 7}")), 1);
}

TEST_F(Entry_Points_test, TheFabricStatisticsAreAskedForWithAnUpperCaseD)
{
    EXPECT_EQ(error_code(call("getDynamicFabricStatistics", "{'wwn': 'a', 'vfID': 0}")), 2);
    EXPECT_EQ(error_code(call("getDynamicFabricStatistics", "{'wwn': 'a', 'vfId': 0}")), 1);
}

TEST_F(Entry_Points_test, ExportsNothingOfItsOwnButEntryPointsAndControlFunctions)
{
    void* library = dlopen(SIMULATOR_LIBRARY, RTLD_NOW);
    ASSERT_NE(library, nullptr);
    EXPECT_EQ(dlsym(library, "_ZN4KPRV9simulator9Simulator8instanceEv"), nullptr);
    // The exception's type information is the one thing that both sides must share.
    EXPECT_NE(dlsym(library, "_ZTIN4KPRV13HbaAgentErrorE"), nullptr);
    dlclose(library);
}

} // namespace
} // namespace KPRV::simulator
