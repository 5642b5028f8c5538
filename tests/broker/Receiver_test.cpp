// Results that are handed over as the provider returns them.
#include "broker/Call_Frame.h"
#include "broker/values/Path_Identity.h"
#include "broker/values/Receiver.h"
#include "tests/broker/Toy_Server.h"

#include <cstdlib>
#include <stdexcept>

namespace KPRV::broker {
namespace {

/// Notes what comes, and what the server holds meanwhile.
struct Notes final : Receiver
{
    explicit Notes(Local_Server& asked) : server(asked) {}

    bool instance(Instance_Value&& instance) override
    {
        last = std::move(instance);
        return path(Path_Value(last.path));
    }
    bool path(Path_Value&& path) override
    {
        most_live = std::max(most_live, server.ledger().live());
        paths.push_back(std::move(path));
        if (throws)
            throw std::runtime_error("the disk is full");
        return paths.size() != enough;
    }

    Local_Server& server;
    std::size_t enough = 0;
    bool throws = false;
    std::size_t most_live = 0;
    std::vector<Path_Value> paths = {};
    Instance_Value last = {};
};

class Receiver_Test : public Toy_Test
{
protected:
    void SetUp() override { setenv("TOY_MANY", "300", 1); }
    void TearDown() override
    {
        unsetenv("TOY_MANY");
        unsetenv("TOY_MANY_FAILS");
        unsetenv("TOY_MANY_LEAVES");
        Toy_Test::TearDown();
    }

    Request enumerate{.operation = Operation::ENUMERATE_INSTANCES, .path = {.class_name = "TOY_Many"}};
    Notes notes{*server};
};

TEST_F(Receiver_Test, GetsAllInTheirOrderAndTheResultKeepsNone)
{
    for (const Operation operation : {Operation::ENUMERATE_INSTANCES, Operation::ENUMERATE_INSTANCE_NAMES}) {
        notes.paths.clear();
        enumerate.operation = operation;
        const Result result = server->run(enumerate, &notes);
        EXPECT_EQ(CMPI_RC_OK, result.rc);
        EXPECT_EQ(1u, result.done_count);
        EXPECT_FALSE(result.stopped);
        EXPECT_TRUE(result.instances.empty() && result.paths.empty());
        ASSERT_EQ(300u, notes.paths.size());
        for (std::uint64_t i = 0; i < 300; ++i)
            EXPECT_EQ(i + 1, notes.paths[i].key("Id")->as_uint());
    }
    EXPECT_EQ("as all", notes.last.property("Text")->as_text());
}

TEST_F(Receiver_Test, OneObjectAtATimeIsAliveOfAProviderThatReleasesThem)
{
    server->run(enumerate, &notes);
    // The instance and its path; the request's own arguments do not count.
    EXPECT_EQ(2u, notes.most_live);
}

TEST_F(Receiver_Test, WhatAProviderLeavesStaysGoodUntilItsCallEnds)
{
    setenv("TOY_MANY", "30000", 1);
    setenv("TOY_MANY_LEAVES", "1", 1);
    // All in memory; the most of it in a file; where no file can be made.
    for (const auto& [bound, folder] :
         {std::pair(0, "."), std::pair(1 << 20, "."), std::pair(1 << 20, "./none")}) {
        SCOPED_TRACE(std::to_string(bound) + " " + folder);
        setenv("TMPDIR", folder, 1);
        Server_Options options;
        options.most_object_memory = static_cast<std::size_t>(bound);
        options.most_shells = 100;
        server = open_toy(TOY_DESCRIBED, options);
        Notes kept(*server);
        const Result result = server->run(enumerate, &kept);
        EXPECT_EQ(CMPI_RC_OK, result.rc) << result.message;
        EXPECT_EQ(30000u, kept.paths.size());
        EXPECT_EQ("a text that stands for 30000", kept.last.property("Text")->as_text());
        // Path, instance, text, moment and numbers of each.
        EXPECT_LE(150000u, kept.most_live);
        EXPECT_EQ(0u, server->ledger().live());
        for (const Ledger::Entry& entry : server->ledger().entries())
            EXPECT_EQ(0u, entry.released) << entry.maker;
    }
    unsetenv("TMPDIR");
}

TEST_F(Receiver_Test, SeesTheListedPropertiesAlone)
{
    enumerate.properties = {{"text"}};
    server->run(enumerate, &notes);
    ASSERT_EQ(1u, notes.last.properties.size());
    EXPECT_EQ("Text", notes.last.properties[0].name);
}

TEST_F(Receiver_Test, EndsTheDeliveryAndTheProviderDoesNotNotice)
{
    notes.enough = 3;
    const Result result = server->run(enumerate, &notes);
    EXPECT_EQ(3u, notes.paths.size());
    EXPECT_TRUE(result.stopped);
    EXPECT_EQ(CMPI_RC_OK, result.rc);
    EXPECT_EQ(1u, result.done_count);
}

TEST_F(Receiver_Test, HasWhatCameBeforeAFailure)
{
    setenv("TOY_MANY_FAILS", "1", 1);
    const Result result = server->run(enumerate, &notes);
    EXPECT_EQ(CMPI_RC_ERR_FAILED, result.rc);
    EXPECT_EQ("no more of them", result.message);
    EXPECT_EQ(300u, notes.paths.size());
}

TEST_F(Receiver_Test, WhatItThrowsGoesRoundTheProvider)
{
    notes.throws = true;
    EXPECT_THROW(server->run(enumerate, &notes), std::runtime_error);
    EXPECT_EQ(1u, notes.paths.size());
}

TEST_F(Receiver_Test, OneProviderCanBeAsked)
{
    enumerate.path.class_name = "TOY_Nobody";
    enumerate.operation = Operation::ENUMERATE_INSTANCE_NAMES;
    EXPECT_EQ(CMPI_RC_OK, server->run_at("TOY_Many", enumerate, &notes).rc);
    EXPECT_EQ(300u, notes.paths.size());
}

/// Associations, of which some report the same object.
class Receiver_Of_Associations : public testing::Test
{
protected:
    Result ask(Operation operation, const char* class_name, const char* key, const char* value,
               Receiver* receiver)
    {
        return server->run({.operation = operation,
                            .path = {.class_name = class_name, .keys = {{key, Plain_Value::text(value)}}}},
                           receiver);
    }
    Result ask_the_system(Operation operation, Receiver* receiver = nullptr)
    {
        return ask(operation, "KALDERA_ComputerSystem", "Name", "10.0.0.5", receiver);
    }

    std::unique_ptr<Local_Server> server = open_toy(TOY_FABRIC);
    Notes notes{*server};
};

TEST_F(Receiver_Of_Associations, WhatSeveralReportComesOnce)
{
    const Result kept = ask_the_system(Operation::ASSOCIATORS);
    const Result result = ask_the_system(Operation::ASSOCIATORS, &notes);
    EXPECT_EQ(CMPI_RC_OK, result.rc);
    EXPECT_EQ(kept.done_count, result.done_count);
    EXPECT_TRUE(result.instances.empty());
    ASSERT_EQ(kept.instances.size(), notes.paths.size());
    for (std::size_t i = 0; i < notes.paths.size(); ++i)
        EXPECT_EQ(path_identity(kept.instances[i].path), path_identity(notes.paths[i]));
    notes.paths.clear();
    ask_the_system(Operation::ASSOCIATOR_NAMES, &notes);
    EXPECT_EQ(kept.instances.size(), notes.paths.size());
}

TEST_F(Receiver_Of_Associations, OnceItHasEnoughNobodyElseIsAsked)
{
    server->calls().record(true);
    ask_the_system(Operation::REFERENCE_NAMES);
    const std::size_t all = server->calls().calls("CMReturnObjectPath").size();
    server->calls().clear();
    notes.enough = 1;
    const Result result = ask_the_system(Operation::REFERENCE_NAMES, &notes);
    EXPECT_EQ(1u, notes.paths.size());
    EXPECT_TRUE(result.stopped);
    EXPECT_LT(server->calls().calls("CMReturnObjectPath").size(), all);
}

TEST_F(Receiver_Of_Associations, AFailingProviderIsNamed)
{
    const Result kept =
        ask(Operation::REFERENCE_NAMES, "KALDERA_TapeDrive", "DeviceID", "tape_only", nullptr);
    const Result result =
        ask(Operation::REFERENCE_NAMES, "KALDERA_TapeDrive", "DeviceID", "tape_only", &notes);
    EXPECT_EQ(kept.rc, result.rc);
    EXPECT_EQ(kept.paths.size(), notes.paths.size());
    ASSERT_EQ(1u, result.failures.size());
    EXPECT_EQ("TOY_Broken", result.failures[0].provider_class);
}

TEST_F(Receiver_Test, IsNotKeptWaitingUntilWhatIsLeftIsFreed)
{
    setenv("TOY_MANY_LEAVES", "1", 1);
    std::size_t left = 0;
    {
        const Late_Freeing later;
        EXPECT_TRUE(server->run(enumerate, &notes).ok());
        left = server->ledger().live();
        EXPECT_LE(notes.paths.size(), left);
        // What the next call leaves takes its place.
        EXPECT_TRUE(server->run(enumerate, &notes).ok());
        EXPECT_EQ(left, server->ledger().live());
    }
    EXPECT_EQ(0u, server->ledger().live());
    EXPECT_TRUE(server->run(enumerate, &notes).ok());
    EXPECT_EQ(0u, server->ledger().live());
}

} // namespace
} // namespace KPRV::broker
