#pragma once

#include "broker/Host.h"

#include <gtest/gtest.h>

namespace KPRV::broker {

inline std::unique_ptr<Host> open_toy(const char* library, Host_Options options = {})
{
    std::string error;
    options.name_space = "root/toy";
    auto host = Host::open(library, options, error);
    EXPECT_EQ("", error);
    return host;
}

inline Path_Value item(std::uint64_t id)
{
    return {.class_name = "TOY_Item",
            .keys = {{"Id", Value::unsigned_number(CMPI_uint32, id)}, {"Name", Value::text("one")}}};
}

inline Result call(Host& host, const char* method, std::vector<Named_Value> in = {})
{
    return host.invoke_method(item(1), method, in);
}

/// A host whose provider must have kept to the contract, and lost nothing, by the end of each test.
class Toy_Test : public testing::Test
{
protected:
    void TearDown() override
    {
        EXPECT_EQ("", host->violations().text());
        EXPECT_EQ(0u, host->ledger().live());
    }

    std::unique_ptr<Host> host = open_toy(TOY_DESCRIBED);
};

} // namespace KPRV::broker
