#include "tests/simulator/Simulator_Fixture.h"

namespace KPRV::simulator {
namespace {

// The host that the build lets make_inventory.py write: 16 adapters of 4 ports, of which each sees 64 targets
// of 64 LUNs. Looking anything up by walking over everything would show here as a test that never ends.
class Large_Host_test : public Simulator_Fixture
{
protected:
    Large_Host_test() { simulator.load_file(SIMULATOR_LARGE_INVENTORY); }

    Json::Value ask(const char* name, const Json::Value& address)
    {
        Json::Value request;
        request["indexStr"] = address;
        return answer(name, request);
    }

    // Without the way over text, which would take longer than the calls.
    Json::Value answer(const char* name, const Json::Value& request)
    {
        return simulator.symbol<Json::Value(const Json::Value&)>(name)(request);
    }
};

TEST_F(Large_Host_test, EveryUnitBehindEveryPortIsThere)
{
    unsigned ports = 0;
    unsigned targets = 0;
    unsigned luns = 0;
    const Json::Value adapters = call("getAllAdaptersIndexString")["indexStrings"];
    for (const Json::Value& adapter : adapters) {
        const Json::Value addresses = ask("getFcPhyPortIndicesByAdapter", adapter)["indexStrings"];
        for (const Json::Value& port : addresses) {
            ++ports;
            Json::Value request;
            request["pPortWwn"] = port;
            request["lPortWwn"] = port;
            for (const Json::Value& each : answer("getAllRemotePorts", request)) {
                ++targets;
                request["rPortWwn"] = each["remotePortWwn"];
                luns += answer("getCompleteRemotePort", request)["lunList"].size();
            }
        }
    }
    EXPECT_EQ(ports, 16u * 4);
    EXPECT_EQ(targets, 16u * 4 * 64);
    // Of 64 targets 4 are parts of a tape library, with a single LUN each.
    EXPECT_EQ(luns, 16u * 4 * (60 * 64 + 4));
}

TEST_F(Large_Host_test, AQuarterOfTheAdaptersIsConverged)
{
    unsigned converged = 0;
    const Json::Value info = call("getGlobalInfo");
    for (const Json::Value& record : info["adapter"])
        converged += record["cna"].asBool();
    EXPECT_EQ(converged, 4u);
}

} // namespace
} // namespace KPRV::simulator
