#include "tests/broker/Toy_Server.h"

#include "kldrcim/input/Typed_Input.h"

namespace KPRV::kldrcim {
namespace {

class Typed_Input_Test : public testing::Test
{
protected:
    std::string assign(const char* text, const char* method = "")
    {
        std::string error;
        assignment = {};
        typed_assignment(host->catalogue(), "TOY_Item", method, text, assignment, error);
        return error;
    }

    std::unique_ptr<Local_Server> host = open_toy(TOY_DESCRIBED);
    Named_Value assignment;
};

TEST_F(Typed_Input_Test, TakesTheTypeOfTheClass)
{
    EXPECT_EQ("", assign("u16=0xFFFF"));
    EXPECT_EQ("U16", assignment.name);
    EXPECT_EQ(Plain_Value::unsigned_number(CMPI_uint16, 65535), assignment.value);
    EXPECT_EQ("", assign("S8=-128"));
    EXPECT_EQ(Plain_Value::signed_number(CMPI_sint8, -128), assignment.value);
    EXPECT_EQ("", assign("Name=12"));
    EXPECT_EQ(Plain_Value::text("12"), assignment.value);
    EXPECT_EQ("", assign("Name=\"a \\\"b\\\"\""));
    EXPECT_EQ(Plain_Value::text("a \"b\""), assignment.value);
    EXPECT_EQ("", assign("Name="));
    EXPECT_EQ(Plain_Value::text(""), assignment.value);
    EXPECT_EQ("", assign("Flag=False"));
    EXPECT_EQ(Plain_Value::boolean(false), assignment.value);
    EXPECT_EQ("", assign("R32=1e3"));
    EXPECT_EQ(1000, assignment.value.as_real());
    EXPECT_EQ("", assign("Nothing=NULL"));
    EXPECT_EQ(Plain_Value::null_of(CMPI_string), assignment.value);
    EXPECT_EQ("", assign("Other=TOY_Item.Id=5,Name=\"n\""));
    EXPECT_EQ(CMPI_uint32, assignment.value.as_path()->key("Id")->type);
    EXPECT_EQ("", assign("Texts={a, \"b, c\"}"));
    EXPECT_EQ(Plain_Value::array(CMPI_string, {Plain_Value::text("a"), Plain_Value::text("b, c")}),
              assignment.value);
    EXPECT_EQ("", assign("Empty={}"));
    EXPECT_EQ(Plain_Value::array(CMPI_boolean, {}), assignment.value);
    EXPECT_EQ("", assign("text={\"not\": \"a list\"}", "Echo"));
    EXPECT_EQ(Plain_Value::text("{\"not\": \"a list\"}"), assignment.value);
}

TEST_F(Typed_Input_Test, NamesWhatDoesNotFit)
{
    EXPECT_EQ("TOY_Item.U8 is a uint8, which \"256\" is not", assign("U8=256"));
    EXPECT_EQ("TOY_Item.U8 is a uint8, which \"-1\" is not", assign("U8=-1"));
    EXPECT_EQ("TOY_Item.S8 is a sint8, which \"128\" is not", assign("S8=128"));
    EXPECT_EQ("TOY_Item.Flag is a boolean, which \"yes\" is not", assign("Flag=yes"));
    EXPECT_EQ("TOY_Item.When is a datetime, which \"now\" is not", assign("When=now"));
    EXPECT_EQ("TOY_Item.Numbers is a uint16[], which \"{1, x}\" is not", assign("Numbers={1, x}"));
    EXPECT_EQ("TOY_Item has no property \"Foo\"", assign("Foo=1"));
    EXPECT_EQ("TOY_Item.Echo has no in parameter \"Foo\"", assign("Foo=1", "Echo"));
    EXPECT_EQ("expected NAME=VALUE, not \"Flag\"", assign("Flag"));
}

TEST_F(Typed_Input_Test, Paths)
{
    Path_Value path;
    std::string error;
    EXPECT_TRUE(typed_path(host->catalogue(), "toy_item.id=5,name=\"n\"", path, error));
    EXPECT_EQ("TOY_Item", path.class_name);
    EXPECT_EQ(Plain_Value::unsigned_number(CMPI_uint32, 5), *path.key("Id"));
    EXPECT_FALSE(typed_path(host->catalogue(), "TOY_Item.U8=5", path, error));
    EXPECT_EQ("TOY_Item has no key \"U8\"", error);
    error.clear();
    EXPECT_FALSE(typed_path(host->catalogue(), "TOY_Item.Name=5", path, error));
    EXPECT_EQ("TOY_Item.Name is a string, not a uint64", error);
    error.clear();
    EXPECT_FALSE(typed_path(host->catalogue(), "TOY_Item.", path, error));
    EXPECT_EQ("malformed object path at column 10: expected a key name: TOY_Item.", error);
}

TEST(Guessed_Value, LooksAtTheText)
{
    EXPECT_EQ(Plain_Value::boolean(true), guessed_value("true"));
    EXPECT_EQ(Plain_Value::unsigned_number(CMPI_uint64, 5), guessed_value("5"));
    EXPECT_EQ(Plain_Value::signed_number(CMPI_sint64, -5), guessed_value("-5"));
    EXPECT_EQ(Plain_Value::real(CMPI_real64, 0.5), guessed_value("0.5"));
    EXPECT_EQ(Plain_Value::text("5"), guessed_value("\"5\""));
    EXPECT_EQ(Plain_Value::text("nan"), guessed_value("nan"));
    EXPECT_EQ(CMPI_dateTime, guessed_value("20260102030405.000006+060").type);
    EXPECT_EQ(CMPI_uint64A, guessed_value("{1, 2}").type);
    // A list of one kind or of texts.
    EXPECT_EQ(Plain_Value::array(CMPI_string, {Plain_Value::text("1"), Plain_Value::text("a")}),
              guessed_value("{1, a}"));
}

} // namespace
} // namespace KPRV::kldrcim
