#pragma once

#include "simulator/Simulator_Control.h"
#include "tests/support/Module_Picture.h"
#include "tests/support/Temp_Folder.h"
#include "tests/support/Thrown_Text.h"

#include <gtest/gtest.h>

#include <memory>
#include <set>

namespace KPRV {

/// The built module without a log, or with one that tells all where KLDR_TEST_LOG is set, in a server whose
/// calls, and over an adapter library whose answers, are made to fail. Whatever happened, each test ends with
/// a module that answers as it did at first.
class Fault_Fixture : public ::testing::Test
{
protected:
    Fault_Fixture()
    {
        if (logs())
            _home.write(".cimplerc", "LOG_LEVEL=DBG\n");
    }
    static bool logs() { return getenv("KLDR_TEST_LOG"); }

    void open(const std::string& inventory)
    {
        simulator.load_file(std::string(KLDR_INVENTORIES "/") + inventory);
        open_server();
    }
    void open_text(const std::string& inventory)
    {
        simulator.load_text(inventory);
        open_server();
    }
    void open_server()
    {
        std::string error;
        server = broker::Local_Server::open(module_under_test(), {}, error);
        ASSERT_TRUE(server) << error;
        classes = enumerable_classes(*server);
        healthy = look();
    }

    void TearDown() override
    {
        if (server) {
            server->calls().mend();
            simulator.clear_faults();
            expect_healthy("at the end");
            server->unload(true);
            expect_nothing_left();
            server.reset();
        }
        simulator.reset();
        EXPECT_EQ(logs(), !_home.read(".cimple/messages").empty());
    }

    /// Every class enumerated once; `exceptions` gets the texts of what left a provider.
    Picture look(std::set<std::string>* exceptions = nullptr)
    {
        Picture picture;
        for (const std::string& name : classes) {
            const broker::Result result = server->enumerate_instances(name);
            const std::optional<std::string> thrown = thrown_text(result);
            if (thrown && exceptions)
                exceptions->insert(*thrown);
            EXPECT_TRUE(!thrown || exceptions) << name << ": " << *thrown;
            picture[name] = lasting_texts(result);
        }
        return picture;
    }

    /// An exception that leaves a provider is what some failures must come to, and a server that refuses a
    /// result has none; nothing else may be wrong.
    void expect_nothing_left()
    {
        for (const std::string& violation : server->violations().list()) {
            EXPECT_TRUE(is_passed_exception(violation) || violation.ends_with(", not 0")) << violation;
        }
        server->violations().clear();
        EXPECT_EQ(0u, server->ledger().live());
    }

    void expect_healthy(const std::string& when)
    {
        const Picture now = look();
        for (const auto& [name, instances] : healthy)
            EXPECT_EQ(instances, now.at(name)) << name << " " << when;
    }

    simulator::Simulator_Control simulator{KLDR_SIMULATOR};
    std::unique_ptr<broker::Local_Server> server;
    std::vector<std::string> classes;
    Picture healthy;

private:
    // Of the whole program: a module that stays mapped keeps its log open.
    static inline Temp_Folder _home;
    Environment_Override _home_override{"HOME", _home.path()};
};

} // namespace KPRV
