#include "tests/broker/Toy_Server.h"

namespace KPRV::broker {
namespace {

class Up_Calls_Test : public Toy_Test
{
protected:
    Up_Calls_Test()
    {
        server = open_toy(TOY_PLAIN);
        server->store().add("root/other", other("a"));
        server->store().add("root/other", other("b"));
    }

    static Instance_Value other(const char* key)
    {
        return {.path = {.class_name = "TOY_Other", .keys = {{"Key", Plain_Value::text(key)}}},
                .properties = {{"Key", Plain_Value::text(key)}, {"Value", Plain_Value::text("v")}}};
    }

    Result up(const char* method, const char* name_space = "root/other", const char* key = "",
              const char* class_name = "TOY_Other")
    {
        return call(*server, method,
                    {{"Namespace", Plain_Value::text(name_space)},
                     {"Class", Plain_Value::text(class_name)},
                     {"Key", Plain_Value::text(key)},
                     {"Value", Plain_Value::text("new")},
                     {"Method", Plain_Value::text("Echo")}});
    }
};

TEST_F(Up_Calls_Test, EnumerateServerInstances)
{
    EXPECT_EQ(2u, find_value(up("CountOthers").out, "Count")->as_uint());
}

TEST_F(Up_Calls_Test, ComeBackIntoTheSameModule)
{
    Result result = up("CountOthers", "root/toy", "", "TOY_Item");
    EXPECT_EQ(0u, result.return_value.as_uint());
    EXPECT_EQ(2u, find_value(result.out, "Count")->as_uint());
    result = up("CallOther", "root/toy", "k", "TOY_Item");
    EXPECT_EQ(1001u, result.return_value.as_uint());
    EXPECT_EQ("new", find_value(result.out, "Text")->as_text());
}

TEST_F(Up_Calls_Test, NobodyServesTheClassOrNameSpace)
{
    EXPECT_EQ(unsigned(CMPI_RC_ERR_INVALID_CLASS), up("CountOthers", "root/toy").return_value.as_uint());
    EXPECT_EQ(unsigned(CMPI_RC_ERR_INVALID_NAMESPACE), up("CountOthers", "root/none").return_value.as_uint());
    server = open_toy(TOY_PLAIN, {.unknown_class_rc = CMPI_RC_ERR_NOT_FOUND});
    EXPECT_EQ(unsigned(CMPI_RC_ERR_NOT_FOUND), up("CountOthers", "root/toy").return_value.as_uint());
}

TEST_F(Up_Calls_Test, GetModifyCreateAndDelete)
{
    EXPECT_EQ("v", find_value(up("GetOther", "root/other", "a").out, "Other")
                       ->as_instance()
                       ->property("Value")
                       ->as_text());
    EXPECT_EQ(0u, up("ModifyOther", "root/other", "a").return_value.as_uint());
    EXPECT_EQ("new", server->store().instances("root/other").at(0).property("Value")->as_text());
    EXPECT_EQ(unsigned(CMPI_RC_ERR_NOT_FOUND), up("GetOther", "root/other", "c").return_value.as_uint());
    EXPECT_EQ("c",
              find_value(up("CreateOther", "root/other", "c").out, "Path")->as_path()->key("Key")->as_text());
    EXPECT_EQ(unsigned(CMPI_RC_ERR_ALREADY_EXISTS),
              up("CreateOther", "root/other", "c").return_value.as_uint());
    EXPECT_EQ(0u, up("DeleteOther", "root/other", "c").return_value.as_uint());
    EXPECT_EQ(unsigned(CMPI_RC_ERR_NOT_FOUND), up("DeleteOther", "root/other", "c").return_value.as_uint());
}

TEST_F(Up_Calls_Test, MethodsOfTheServer)
{
    server->store().on_method("root/other", "TOY_Other", "Echo", [](const Request& request) {
        Result result;
        result.return_value = Plain_Value::unsigned_number(CMPI_uint32, 7);
        result.out = request.in;
        return result;
    });
    Result result = up("CallOther", "root/other", "a");
    EXPECT_EQ(1007u, result.return_value.as_uint());
    EXPECT_EQ("new", find_value(result.out, "Text")->as_text());
}

TEST_F(Up_Calls_Test, ElementsWithTheNullBitAreStillGood)
{
    server = open_toy(TOY_PLAIN, Server_Options::pegasus_like());
    EXPECT_EQ(2u, find_value(up("CountOthers", "root/toy", "", "TOY_Item").out, "Count")->as_uint());
}

} // namespace
} // namespace KPRV::broker
