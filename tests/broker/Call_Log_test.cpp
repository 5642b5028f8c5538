#include "tests/broker/Toy_Host.h"

namespace KPRV::broker {
namespace {

using Call_Log_Test = Toy_Test;

TEST_F(Call_Log_Test, RecordsCallsInOrderWithTheirKeyArgument)
{
    host->calls().record(true);
    host->enumerate_instance_names("TOY_Item");
    std::vector<std::string> calls = host->calls().calls();
    ASSERT_EQ(13u, calls.size());
    EXPECT_EQ((std::vector<std::string>{"CMGetNameSpace", "CMGetCharsPtr", "CMNewObjectPath TOY_Item",
                                        "CMAddKey Id", "CMAddKey Name", "CMReturnObjectPath"}),
              std::vector<std::string>(calls.begin(), calls.begin() + 6));
    EXPECT_EQ("CMReturnDone", calls.back());
    host->calls().clear();
    host->calls().record(false);
    host->enumerate_instance_names("TOY_Item");
    EXPECT_TRUE(host->calls().calls().empty());
}

TEST_F(Call_Log_Test, TheNthCallFails)
{
    host->calls().fail("CMAddKey", 3, CMPI_RC_ERR_FAILED);
    Result result = host->enumerate_instance_names("TOY_Item");
    EXPECT_EQ(2u, result.paths.at(0).keys.size());
    EXPECT_EQ(1u, result.paths.at(1).keys.size());
    // Once told, once done.
    EXPECT_EQ(2u, host->enumerate_instance_names("TOY_Item").paths.at(1).keys.size());
}

TEST_F(Call_Log_Test, UpCallsAndFactoriesFailToo)
{
    host->store().add("root/other", {.path = {.class_name = "TOY_Other"}});
    host->calls().fail("CBEnumInstances", 1, CMPI_RC_ERR_ACCESS_DENIED);
    Result result = call(*host, "CountOthers",
                         {{"Namespace", Value::text("root/other")}, {"Class", Value::text("TOY_Other")}});
    EXPECT_EQ(unsigned(CMPI_RC_ERR_ACCESS_DENIED), result.return_value.as_uint());
}

TEST_F(Call_Log_Test, TheNthCallThrows)
{
    host->calls().throw_at("CMReturnObjectPath", 2);
    Result result = host->enumerate_instance_names("TOY_Item");
    EXPECT_EQ("CMReturnObjectPath was told to throw", result.exception);
    EXPECT_EQ(1u, result.paths.size());
    host->violations().clear();
}

TEST_F(Call_Log_Test, Mending)
{
    host->calls().throw_at("CMReturnDone", 1);
    host->calls().mend();
    EXPECT_TRUE(host->enumerate_instance_names("TOY_Item").ok());
}

} // namespace
} // namespace KPRV::broker
