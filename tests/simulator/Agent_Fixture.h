#pragma once

#include "tests/simulator/Simulator_Fixture.h"

namespace KPRV::simulator {

/// The demo host: an FC adapter that sees a disk array, and a converged adapter.
class Agent_Fixture : public Simulator_Fixture
{
protected:
    Agent_Fixture() { simulator.load_file(inventory("demo.json")); }

    /// A call that must be done.
    void done(const std::string& name, const std::string& request)
    {
        EXPECT_EQ(call(name, request.c_str())["status"], Json::Value(0)) << name << request;
    }

    /// The code of the refusal of a call.
    int refused(const std::string& name, const std::string& request)
    {
        return error_code(call(name, request.c_str()));
    }

    static constexpr const char* hba = "20:00:02:4b:4c:10:00:00";
    static constexpr const char* fc_port = "10:00:02:4b:4c:10:00:00";
    static constexpr const char* idle_port = "10:00:02:4b:4c:10:00:01";
    static constexpr const char* cna = "20:00:02:4b:4c:20:00:00";
    static constexpr const char* fcoe_port = "10:00:02:4b:4c:20:00:00";
    static constexpr const char* eth_port = "02:4b:4c:20:00:00";
    static constexpr const char* remote = "50:24:b4:c0:00:40:00:01";
    static constexpr const char* vport = "10:01:02:4b:4c:10:00:00";

    enum Code
    {
        REQUEST = 1,
        ADDRESS = 2,
        DUPLICATE = 6,
        NOT_FOUND = 7,
        CONFLICT = 8,
    };

    /// A virtual port of fc_port.
    static std::string new_vport(const std::string& address = vport)
    {
        return "{'pwwn': '10:00:02:4b:4c:10:00:00', 'nwwn': '20:01:02:4b:4c:10:00:00', 'vwwn': '" + address +
               "', 'symbolicName': 'guest', 'vfId': 0}";
    }

    static std::string vports(const std::string& list)
    {
        return "{'pwwn': '10:00:02:4b:4c:10:00:00', 'vfId': 0, 'vportArray': " + list + "}";
    }
};

} // namespace KPRV::simulator
