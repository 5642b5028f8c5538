#include "tests/simulator/Agent_Fixture.h"

#include <atomic>
#include <thread>

namespace KPRV::simulator {
namespace {

class Virtual_Port_Answers_test : public Agent_Fixture
{
protected:
    Json::Value list() { return call("getAllVPorts", "{'wwn': '10:00:02:4b:4c:10:00:00'}"); }

    std::string one(const std::string& more = "")
    {
        return std::string("{'pPortWwn': '") + fc_port + "', 'lPortWwn': '" + vport + "'" + more + "}";
    }
};

TEST_F(Virtual_Port_Answers_test, WhatIsCreatedIsListedUntilItIsDeleted)
{
    EXPECT_EQ(list(), json("[]"));
    done("createVport", new_vport());
    const Json::Value expected =
        json("{'portWwn': '10:01:02:4b:4c:10:00:00', 'nodeWwn': '20:01:02:4b:4c:10:00:00',"
             "'symbolicName': 'guest', 'vfId': 0, 'portStatus': true, 'portStatusValue': 11}");
    EXPECT_EQ(call("getVPort", one().c_str()), expected);
    ASSERT_EQ(list().size(), 1u);
    EXPECT_EQ(list()[0], expected);
    EXPECT_EQ(call("getFcByFcWwn", "{'wwn': '10:00:02:4b:4c:10:00:00'}")["virtualPorts"].asUInt(), 1u);
    done("deleteVport", vports("['10:01:02:4B:4C:10:00:00']"));
    EXPECT_EQ(list(), json("[]"));
    EXPECT_EQ(refused("getVPort", one()), ADDRESS);
}

TEST_F(Virtual_Port_Answers_test, AVirtualPortSeesWhatItsPortSees)
{
    EXPECT_EQ(refused("getAllRemotePorts", one()), ADDRESS);
    done("createVport", new_vport());
    EXPECT_EQ(call("getAllRemotePorts", one().c_str()).size(), 4u);
    EXPECT_EQ(call("getAllLunsByRemotePort", one(", 'rPortWwn': '50:24:b4:c0:00:40:00:01'").c_str()).size(),
              3u);
}

TEST_F(Virtual_Port_Answers_test, AnAddressIsGivenOnceOnly)
{
    done("createVport", new_vport());
    for (const char* taken : {vport, "10:01:02:4B:4C:10:00:00", fc_port, fcoe_port, hba})
        EXPECT_EQ(refused("createVport", new_vport(taken)), DUPLICATE) << taken;
    EXPECT_EQ(list().size(), 1u);
    done("deleteVport", vports("['10:01:02:4b:4c:10:00:00']"));
    done("createVport", new_vport());
}

TEST_F(Virtual_Port_Answers_test, WhatMakesNoSenseIsRefused)
{
    for (const char* wrong : {"", "10:01", "02:4b:4c:20:00:00", "10:01:02:4b:4c:10:00:0g"})
        EXPECT_EQ(refused("createVport", new_vport(wrong)), REQUEST) << wrong;
    const std::string rest = "'nwwn': '20:01:02:4b:4c:10:00:00', 'vwwn': '10:01:02:4b:4c:10:00:00', "
                             "'symbolicName': 'guest', 'vfId': ";
    EXPECT_EQ(refused("createVport", "{'pwwn': 'nowhere', " + rest + "0}"), ADDRESS);
    EXPECT_EQ(refused("createVport", "{'pwwn': '02:4b:4c:20:00:00', " + rest + "0}"), ADDRESS);
    EXPECT_EQ(refused("createVport", "{'pwwn': '10:00:02:4b:4c:10:00:00', " + rest + "1}"), ADDRESS);
    EXPECT_EQ(refused("deleteVport", vports("'10:01:02:4b:4c:10:00:00'")), REQUEST);
    EXPECT_EQ(list(), json("[]"));
}

TEST_F(Virtual_Port_Answers_test, DeletingIsAllOrNothing)
{
    done("createVport", new_vport());
    for (const char* doomed : {"['10:01:02:4b:4c:10:00:00', '10:01:02:4b:4c:10:00:01']",
                               "['10:01:02:4b:4c:10:00:00', '10:01:02:4B:4C:10:00:00']",
                               "['10:00:02:4b:4c:10:00:00']", "[7]", "[null]"})
        EXPECT_EQ(refused("deleteVport", vports(doomed)), NOT_FOUND) << doomed;
    EXPECT_EQ(list().size(), 1u);
    done("deleteVport", vports("[]"));
    EXPECT_EQ(list().size(), 1u);
}

TEST_F(Virtual_Port_Answers_test, APortHas255OfThem)
{
    const auto address = [](int number) {
        char text[24];
        std::snprintf(text, sizeof text, "10:01:02:4b:4c:10:%02x:%02x", number / 256 & 0xff, number % 256);
        return std::string(text);
    };
    for (int number = 0; number < 255; ++number)
        done("createVport", new_vport(address(number)));
    EXPECT_EQ(refused("createVport", new_vport(address(255))), CONFLICT);
}

TEST_F(Virtual_Port_Answers_test, OneOfSeveralThreadsGetsTheAddress)
{
    std::atomic<int> created = 0;
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 8; ++thread)
        threads.emplace_back([&] { created += refused("createVport", new_vport()) == 0; });
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(created, 1);
    EXPECT_EQ(list().size(), 1u);
}

TEST_F(Virtual_Port_Answers_test, ANewInventoryHasNone)
{
    done("createVport", new_vport());
    simulator.load_file(inventory("demo.json"));
    EXPECT_EQ(list(), json("[]"));
}

} // namespace
} // namespace KPRV::simulator
