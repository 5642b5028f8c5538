#pragma once

#include "broker/Local_Server.h"
#include "simulator/Simulator_Control.h"
#include "tests/support/Log_Lines.h"
#include "tests/support/Temp_Folder.h"

#include <gtest/gtest.h>

#include <memory>

namespace KPRV {

/// The built module in a CIM server of the test's own, with the simulator in the place of the adapter library
/// and a log of its own. Each test loads the module anew and must leave no breach of the CMPI contract and no
/// lost object behind.
class Module_Fixture : public ::testing::Test
{
protected:
    static std::string inventory(const std::string& name) { return std::string(KLDR_INVENTORIES "/") + name; }

    /// Opens the module over an inventory of simulator/inventories, or over a JSON text.
    void open(const std::string& inventory_name = "demo.json", broker::Server_Options options = {})
    {
        simulator.load_file(inventory(inventory_name));
        open_module(std::move(options));
    }
    void open_text(const std::string& text, broker::Server_Options options = {})
    {
        simulator.load_text(text);
        open_module(std::move(options));
    }
    void open_module(broker::Server_Options options = {})
    {
        std::string error;
        server = broker::Local_Server::open(module, std::move(options), error);
        ASSERT_TRUE(server) << error;
    }
    void close()
    {
        if (!server)
            return;
        server->unload(true);
        EXPECT_EQ("", server->violations().text());
        EXPECT_EQ(0u, server->ledger().live());
        server.reset();
    }

    void SetUp() override { _home.write(".cimplerc", "LOG_LEVEL=DBG\n"); }
    void TearDown() override
    {
        close();
        simulator.reset();
    }

    /// All instances of a class, from a call that must succeed.
    broker::Result enumerate(const std::string& class_name)
    {
        broker::Result result = server->enumerate_instances(class_name);
        EXPECT_EQ(CMPI_RC_OK, result.rc) << result.message;
        EXPECT_EQ(1u, result.done_count);
        return result;
    }

    /// Forgets what has been logged and called so far.
    void mark()
    {
        _mark = _home.size(log_file);
        simulator.clear_calls();
    }
    std::vector<Log_Line> log_lines() const { return parse_log(_home.read(log_file, _mark)); }
    /// Lines of one level since the mark, as "LEVEL text".
    Lines said(const std::string& level) const
    {
        return told(log_lines(), [&](const Log_Line& line) { return line.level == level; });
    }
    /// The lines that one source file wrote since the mark, as "LEVEL text".
    Lines said_by(const std::string& file) const
    {
        return told(log_lines(), [&](const Log_Line& line) { return line.file == file; });
    }

    static std::string text_of(const broker::Instance_Value& instance, const char* property)
    {
        const broker::Plain_Value* value = instance.property(property);
        return !value ? "(absent)" : value->null ? "(null)" : value->as_text();
    }

    const char* module = KLDR_MODULE;
    simulator::Simulator_Control simulator{KLDR_SIMULATOR};
    std::unique_ptr<broker::Local_Server> server;

private:
    static constexpr const char* log_file = ".cimple/messages";

    Temp_Folder _home;
    Environment_Override _home_override{"HOME", _home.path()};
    size_t _mark = 0;
};

} // namespace KPRV
