#include "broker/values/Value_Text.h"
#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Format_Table.h"

#include <gtest/gtest.h>
#include <json/json.h>
#include <limits>

namespace KPRV::kldrcim {
namespace {

Instance_Value sample()
{
    Path_Value other = {.name_space = "n", .class_name = "C", .keys = {{"K", Plain_Value::text("a\"b")}}};
    return {.path = {.class_name = "C", .keys = {{"K", Plain_Value::text("x")}}},
            .properties = {
                {"Zeta", Plain_Value::text("a \"b\" \\ \n\x01")},
                {"Alpha", Plain_Value::unsigned_number(CMPI_uint64, ~std::uint64_t(0))},
                {"None", Plain_Value::null_of(CMPI_string)},
                {"List", Plain_Value::array(CMPI_string,
                                            {Plain_Value::text("p"), Plain_Value::null_of(CMPI_string)})},
                {"Ref", Plain_Value::path(other)},
                {"Real", Plain_Value::real(CMPI_real64, 2)},
                {"Part",
                 Plain_Value::instance({.path = other, .properties = {{"K", Plain_Value::boolean(true)}}})}}};
}

TEST(Format_Mof, EscapesAndNests)
{
    EXPECT_EQ(R"(instance of C {
    Zeta = "a \"b\" \\ \n\x0001";
    Alpha = 18446744073709551615;
    List = {"p", NULL};
    Ref = "n:C.K=\"a\\\"b\"";
    Real = 2.0;
    Part = instance of C {
        K = true;
    };
};
)",
              mof_instance(sample()));
}

TEST(Format_Json, IsValidAndKeepsTheOrder)
{
    std::string text = json_array({json_instance(sample(), 2)});
    EXPECT_LT(text.find("Zeta"), text.find("Alpha"));
    Json::Value parsed;
    ASSERT_TRUE(Json::Reader().parse(text, parsed)) << text;
    const Json::Value& properties = parsed[0]["properties"];
    EXPECT_EQ("C.K=\"x\"", parsed[0]["path"].asString());
    EXPECT_EQ("a \"b\" \\ \n\x01", properties["Zeta"].asString());
    EXPECT_EQ(~Json::UInt64(0), properties["Alpha"].asUInt64());
    EXPECT_TRUE(properties.isMember("None") && properties["None"].isNull());
    EXPECT_TRUE(properties["List"][1].isNull());
    EXPECT_EQ(true, properties["Part"]["properties"]["K"].asBool());
}

TEST(Format_Json, EmptyListsAndUnspeakableNumbers)
{
    EXPECT_EQ("[]", json_array({}));
    EXPECT_EQ("{}", json_values({}));
    EXPECT_EQ("null", json_text(Plain_Value::real(CMPI_real64, std::numeric_limits<double>::quiet_NaN())));
}

Instance_Value row(const char* name, std::uint64_t number)
{
    return {.path = {.class_name = "C"},
            .properties = {{"Name", Plain_Value::text(name)},
                           {"N", Plain_Value::unsigned_number(CMPI_uint8, number)}}};
}

TEST(Format_Table, FewColumnsMakeATable)
{
    EXPECT_EQ("Name  N\n"
              "----  --\n"
              "\xC3\xA4     1\n"
              "a\\nb  20\n",
              instances_as_table({row("\xC3\xA4", 1), row("a\nb", 20)}, nullptr, 80));
}

TEST(Format_Table, AWideTableBecomesBlocks)
{
    EXPECT_EQ("C\n  Name = long name\n  N    = 1\n\nC\n  Name = b\n  N    = 2\n",
              instances_as_table({row("long name", 1), row("b", 2)}, nullptr, 8));
}

TEST(Format_Table, ColumnsCanBeChosen)
{
    std::vector<std::string> columns = {"N", "Missing"};
    EXPECT_EQ("N  Missing\n-  -------\n1\n", instances_as_table({row("a", 1)}, &columns, 0));
}

TEST(Format_Table, NullsAndControlCharactersOfBlocks)
{
    EXPECT_EQ("  A = x?[0m\n", values_as_block({{"A", Plain_Value::text("x\x1B[0m")},
                                                {"None", Plain_Value::null_of(CMPI_uint8)}}));
    EXPECT_EQ("", instances_as_table({}, nullptr, 80));
}

} // namespace
} // namespace KPRV::kldrcim
