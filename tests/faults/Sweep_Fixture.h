#pragma once

#include "simulator/Simulator_Control.h"
#include "tests/faults/Bad_Answers.h"
#include "tests/support/Eventually.h"
#include "tests/support/Module_Picture.h"
#include "tests/support/Temp_Folder.h"
#include "tests/support/Thrown_Text.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <future>
#include <memory>
#include <thread>

namespace KPRV {

/// The built module without a log, over the three adapters of neighbours.json, whose entry points are made to
/// answer badly one at a time. After each fault all stands as before: nothing is left with the server, no
/// lock is held, and no call went where no call ever goes.
class Sweep_Fixture
{
protected:
    /// Codes that stand in all addresses of an adapter, those of its targets too.
    static constexpr const char* FIRST = "aa";
    static constexpr const char* LAST = "cc";

    void open_host()
    {
        restore();
        std::string error;
        server = broker::Local_Server::open(module_under_test(), {}, error);
        ASSERT_TRUE(server) << error;
    }
    void close_host()
    {
        if (server)
            server->unload(true);
        expect_nothing_left();
        server.reset();
        simulator.reset();
    }

    /// The library as it was when the module was loaded.
    void restore() { simulator.load_file(KLDR_FAULTS "/neighbours.json"); }

    /// What the entry point truly answers to a request.
    Json::Value true_answer(const std::string& entry_point, const Json::Value& request)
    {
        return simulator.symbol<Json::Value(const Json::Value&)>(entry_point)(request);
    }
    bool was_called(const std::string& entry_point) { return simulator.wait_for_calls(entry_point, 1, 0); }

    /// No object left with the server, no breach of its contract, and no call of what nobody ever calls. An
    /// exception that leaves a provider is what some faults must come to.
    void expect_nothing_left()
    {
        if (server) {
            for (const std::string& violation : server->violations().list())
                EXPECT_TRUE(is_passed_exception(violation)) << violation;
            server->violations().clear();
            EXPECT_EQ(0u, server->ledger().live());
        }
#define UNREACHED(entry_point, reason) EXPECT_FALSE(was_called(#entry_point)) << reason;
#include "tests/faults/Ways_In.def"
        simulator.clear_calls();
    }

    /// The operation on a thread of its own. Whoever left a lock behind on this one keeps it from its end.
    template <class Operation>
    auto elsewhere(Operation&& operation)
    {
        std::packaged_task<decltype(operation())()> task(operation);
        auto result = task.get_future();
        std::thread thread(std::move(task));
        if (result.wait_for(PATIENCE) != std::future_status::ready) {
            ADD_FAILURE() << "a lock was left";
            fflush(nullptr);
            std::_Exit(1);
        }
        thread.join();
        return result.get();
    }

    simulator::Simulator_Control simulator{KLDR_SIMULATOR};
    std::unique_ptr<broker::Local_Server> server;

private:
    Temp_Folder _home;
    Environment_Override _home_override{"HOME", _home.path()};
};

} // namespace KPRV
