#include "tests/broker/Toy_Server.h"

namespace KPRV::broker {
namespace {

using Call_Log_Test = Toy_Test;

TEST_F(Call_Log_Test, RecordsCallsInOrderWithTheirKeyArgument)
{
    server->calls().record(true);
    server->enumerate_instance_names("TOY_Item");
    std::vector<std::string> calls = server->calls().calls();
    ASSERT_EQ(13u, calls.size());
    EXPECT_EQ((std::vector<std::string>{"CMGetNameSpace", "CMGetCharsPtr", "CMNewObjectPath TOY_Item",
                                        "CMAddKey Id", "CMAddKey Name", "CMReturnObjectPath"}),
              std::vector<std::string>(calls.begin(), calls.begin() + 6));
    EXPECT_EQ("CMReturnDone", calls.back());
    server->calls().clear();
    server->calls().record(false);
    server->enumerate_instance_names("TOY_Item");
    EXPECT_TRUE(server->calls().calls().empty());
}

TEST_F(Call_Log_Test, TheNthCallFails)
{
    server->calls().fail("CMAddKey", 3, CMPI_RC_ERR_FAILED);
    Result result = server->enumerate_instance_names("TOY_Item");
    EXPECT_EQ(2u, result.paths.at(0).keys.size());
    EXPECT_EQ(1u, result.paths.at(1).keys.size());
    // Once told, once done.
    EXPECT_EQ(2u, server->enumerate_instance_names("TOY_Item").paths.at(1).keys.size());
}

TEST_F(Call_Log_Test, UpCallsAndFactoriesFailToo)
{
    server->store().add("root/other", {.path = {.class_name = "TOY_Other"}});
    server->calls().fail("CBEnumInstances", 1, CMPI_RC_ERR_ACCESS_DENIED);
    Result result =
        call(*server, "CountOthers",
             {{"Namespace", Plain_Value::text("root/other")}, {"Class", Plain_Value::text("TOY_Other")}});
    EXPECT_EQ(unsigned(CMPI_RC_ERR_ACCESS_DENIED), result.return_value.as_uint());
}

TEST_F(Call_Log_Test, TheNthCallThrows)
{
    server->calls().throw_at("CMReturnObjectPath", 2);
    Result result = server->enumerate_instance_names("TOY_Item");
    EXPECT_EQ("CMReturnObjectPath was told to throw", result.exception);
    EXPECT_EQ(1u, result.paths.size());
    server->violations().clear();
}

TEST_F(Call_Log_Test, Mending)
{
    server->calls().throw_at("CMReturnDone", 1);
    server->calls().mend();
    EXPECT_TRUE(server->enumerate_instance_names("TOY_Item").ok());
}

} // namespace
} // namespace KPRV::broker
