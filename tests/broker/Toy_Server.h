#pragma once

#include "broker/Local_Server.h"

#include <gtest/gtest.h>

namespace KPRV::broker {

inline std::unique_ptr<Local_Server> open_toy(const char* library, Server_Options options = {})
{
    std::string error;
    options.name_space = "root/toy";
    auto server = Local_Server::open(library, options, error);
    EXPECT_EQ("", error);
    return server;
}

inline Path_Value item(std::uint64_t id)
{
    return {
        .class_name = "TOY_Item",
        .keys = {{"Id", Plain_Value::unsigned_number(CMPI_uint32, id)}, {"Name", Plain_Value::text("one")}}};
}

inline Result call(Local_Server& server, const char* method, std::vector<Named_Value> in = {})
{
    return server.invoke_method(item(1), method, in);
}

/// A host whose provider must have kept to the contract, and lost nothing, by the end of each test.
class Toy_Test : public testing::Test
{
protected:
    void TearDown() override
    {
        EXPECT_EQ("", server->violations().text());
        EXPECT_EQ(0u, server->ledger().live());
    }

    std::unique_ptr<Local_Server> server = open_toy(TOY_DESCRIBED);
};

} // namespace KPRV::broker
