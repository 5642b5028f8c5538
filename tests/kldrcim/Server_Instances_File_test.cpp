#include "kldrcim/local/Server_Instances_File.h"

#include "broker/values/Value_Text.h"
#include "tests/kldrcim/Run_Kldrcim.h"
#include "tests/support/Temp_Folder.h"

#include <gtest/gtest.h>

namespace KPRV::kldrcim {
namespace {

Feature_Info feature(const char* name, CMPIType type, bool key = false)
{
    Feature_Info info;
    info.name = name;
    info.type = type;
    info.key = key;
    return info;
}

/// Knows one class.
class One_Class final : public Class_Catalogue
{
public:
    One_Class()
    {
        _info.name = "CIM_Thing";
        _info.properties = {
            feature("Name", CMPI_string, true), feature("Number", CMPI_uint16, true),
            feature("Signed", CMPI_sint8),      feature("Real", CMPI_real64),
            feature("Truth", CMPI_boolean),     feature("When", CMPI_dateTime),
            feature("Other", CMPI_ref),         feature("Words", CMPI_stringA),
            feature("Numbers", CMPI_uint16A),   feature("Inner", CMPI_instance),
        };
    }
    std::vector<std::string> class_names() const override { return {_info.name}; }
    const Class_Info* find(std::string_view name) const override
    {
        return same_name(name, _info.name) ? &_info : nullptr;
    }
    std::string module_name() const override { return {}; }

private:
    Class_Info _info;
};

struct Server_Instances_File : testing::Test
{
    One_Class catalogue;
    Server_Store store;
    Temp_Folder folder;
    std::string file = folder.path("server.json");

    /// Empty on success, else the error without the file's name.
    std::string read(const std::string& text)
    {
        folder.write("server.json", text);
        std::string error;
        if (read_server_instances(file, catalogue, store, error))
            return error;
        EXPECT_EQ(0u, error.find(file + ":")) << error;
        return error.substr(file.size() + 1);
    }
    /// The error of an instance of the known class with one property.
    std::string with(const std::string& name, const std::string& value)
    {
        return read("[{\"namespace\": \"n\", \"class\": \"CIM_Thing\", \"properties\": {\"" + name +
                    "\": " + value + "}}]");
    }
};

TEST_F(Server_Instances_File, InstancesWithTheTypesOfTheirClass)
{
    EXPECT_EQ("", read(R"([{"namespace": "Root/N", "class": "cim_thing", "properties": {
        "name": "NULL", "Number": 42, "Signed": -128, "Real": 0.5, "Truth": true,
        "When": "20260101120000.000000+060", "Other": "CIM_Thing.Name=\"b\",Number=1",
        "Words": ["a, b", "{c}", ""], "Numbers": []}}])"));
    ASSERT_EQ(1u, store.instances("root/n").size());
    const Instance_Value instance = store.instances("root/n")[0];
    EXPECT_EQ("Root/N:cim_thing.Name=\"NULL\",Number=42", path_text(instance.path));
    EXPECT_EQ(Plain_Value::text("NULL"), *instance.property("Name"));
    EXPECT_EQ(Plain_Value::unsigned_number(CMPI_uint16, 42), *instance.property("Number"));
    EXPECT_EQ(Plain_Value::signed_number(CMPI_sint8, -128), *instance.property("Signed"));
    EXPECT_EQ(Plain_Value::real(CMPI_real64, 0.5), *instance.property("Real"));
    EXPECT_EQ(Plain_Value::boolean(true), *instance.property("Truth"));
    EXPECT_EQ(Plain_Value::datetime("20260101120000.000000+060"), *instance.property("When"));
    EXPECT_EQ("b", instance.property("Other")->as_path()->key("Name")->as_text());
    EXPECT_EQ(Plain_Value::array(
                  CMPI_string, {Plain_Value::text("a, b"), Plain_Value::text("{c}"), Plain_Value::text("")}),
              *instance.property("Words"));
    EXPECT_EQ(Plain_Value::array(CMPI_uint16, {}), *instance.property("Numbers"));
}

TEST_F(Server_Instances_File, NullsKeepTheirTypeAndMakeNoKey)
{
    EXPECT_EQ("", with("Name", "null"));
    const Instance_Value instance = store.instances("n").at(0);
    EXPECT_EQ(Plain_Value::null_of(CMPI_string), *instance.property("Name"));
    EXPECT_TRUE(instance.path.keys.empty());
}

TEST_F(Server_Instances_File, ClassesOfTheServersOwnTakeTypesFromTheSuperclass)
{
    EXPECT_EQ("", read(R"([{"namespace": "n", "class": "PG_Thing", "superclass": "CIM_Thing", "properties": {
        "Number": 7, "Text": "t", "Truth2": false, "Big": 18446744073709551615, "Minus": -1, "Half": 0.5,
        "List": [1, 2], "None": null, "Empty": []}}])"));
    const Instance_Value instance = store.instances("n").at(0);
    EXPECT_EQ("n:PG_Thing.Number=7", path_text(instance.path));
    EXPECT_EQ(Plain_Value::text("t"), *instance.property("Text"));
    EXPECT_EQ(Plain_Value::boolean(false), *instance.property("Truth2"));
    EXPECT_EQ(Plain_Value::unsigned_number(CMPI_uint64, ~std::uint64_t(0)), *instance.property("Big"));
    EXPECT_EQ(Plain_Value::signed_number(CMPI_sint64, -1), *instance.property("Minus"));
    EXPECT_EQ(Plain_Value::real(CMPI_real64, 0.5), *instance.property("Half"));
    EXPECT_EQ(CMPIType(CMPI_uint64A), instance.property("List")->type);
    EXPECT_EQ(Plain_Value::null_of(CMPI_string), *instance.property("None"));
    EXPECT_EQ(CMPIType(CMPI_stringA), instance.property("Empty")->type);
    EXPECT_TRUE(store.serves(catalogue, {.name_space = "n", .class_name = "CIM_Thing"}));
}

TEST_F(Server_Instances_File, ClassesWithoutInstancesAndNameSpacesThatRefuse)
{
    EXPECT_EQ("", read(R"([
        {"namespace": "empty", "class": "CIM_Thing"},
        {"namespace": "closed", "refuses": "CIM_ERR_ACCESS_DENIED"}
    ])"));
    const auto answer = [&](const char* name_space) {
        return store.run(catalogue, {.path = {.name_space = name_space, .class_name = "CIM_Thing"}});
    };
    EXPECT_EQ(CMPI_RC_OK, answer("empty").rc);
    EXPECT_TRUE(answer("empty").instances.empty());
    EXPECT_EQ(CMPI_RC_ERR_ACCESS_DENIED, answer("closed").rc);
    EXPECT_EQ("", read("[]"));
}

TEST_F(Server_Instances_File, EntriesThatDoNotFit)
{
    const std::pair<const char*, const char*> rows[] = {
        {"", "1: Syntax error: value, object or array expected."},
        {"[\n{\"namespace\": }]", "2: Syntax error: value, object or array expected."},
        {"[] x", "1: Extra non-whitespace after JSON value."},
        {"{}", "1: expected a list of entries"},
        {"[\n\n1]", "3: expected an entry: an object with \"namespace\""},
        {"[\n{}]", "2: the entry needs a text \"namespace\""},
        {"[{\"namespace\": 1}]", "1: the entry needs a text \"namespace\""},
        {"[{\"namespace\": \"\"}]", "1: the entry needs a text \"namespace\""},
        {"[{\"namespace\": \"n\"}]", "1: the entry needs a text \"class\""},
        {"[{\"namespace\": \"n\",\n\"klass\": \"C\"}]", "2: an entry has no member \"klass\""},
        {"[{\"namespace\": \"n\", \"class\": \"A\", \"superclass\": \"B\"}]", "1: the module has no class B"},
        {"[{\"namespace\": \"n\", \"class\": \"A\", \"superclass\": 5}]",
         "1: the entry needs a text \"superclass\""},
        {"[{\"namespace\": \"n\", \"class\": \"A\", \"properties\": []}]",
         "1: expected the properties: an object"},
        {"[{\"namespace\": \"n\", \"refuses\": \"no\"}]",
         "1: \"no\" is no CIM error; CIM_ERR_ACCESS_DENIED is one"},
        {"[{\"namespace\": \"n\", \"refuses\": \"CMPI_RC_OK\"}]",
         "1: \"CMPI_RC_OK\" is no CIM error; CIM_ERR_ACCESS_DENIED is one"},
        {"[{\"namespace\": \"n\", \"refuses\": \"CIM_ERR_FAILED\", \"class\": \"A\"}]",
         "1: \"refuses\" is for the whole name space, without \"class\""},
    };
    for (const auto& [text, error] : rows)
        EXPECT_EQ(error, read(text)) << text;
    EXPECT_NE("", read("[{\"namespace\": \"n\", \"namespace\": \"m\", \"class\": \"A\"}]"));
    EXPECT_EQ("1: nested too deeply", read(std::string(100, '[')));
}

TEST_F(Server_Instances_File, ValuesThatDoNotFit)
{
    EXPECT_EQ("1: CIM_Thing has no property \"Nmae\"", with("Nmae", "1"));
    EXPECT_EQ("1: CIM_Thing.Number is a uint16, which \"65536\" is not", with("Number", "65536"));
    EXPECT_EQ("1: CIM_Thing.Number is a uint16, which \"-1\" is not", with("Number", "-1"));
    EXPECT_EQ("1: CIM_Thing.When is a datetime, which \"today\" is not", with("When", "\"today\""));
    for (const auto& [name, type] :
         {std::pair("Name", "string"), {"Truth", "boolean"}, {"Inner", "instance"}})
        EXPECT_EQ(std::string("1: CIM_Thing.") + name + " is a " + type + ", and what is written is none",
                  with(name, "{}"));
    for (const char* value : {"\"42\"", "true", "[42]", "{}"})
        EXPECT_EQ("1: CIM_Thing.Number is a uint16, and what is written is none", with("Number", value));
    EXPECT_EQ("1: CIM_Thing.Numbers is a uint16[], and what is written is none", with("Numbers", "1"));
    EXPECT_EQ("1: CIM_Thing.Numbers is a uint16, and what is written is none", with("Numbers", "[1, \"2\"]"));
    EXPECT_TRUE(with("Other", "\"no path\"").starts_with("1: malformed object path at column"));
    const auto own = [&](const char* value) {
        return read(std::string("[{\"namespace\": \"n\", \"class\": \"A\", \"properties\": {\"X\": ") +
                    value + "}}]");
    };
    EXPECT_EQ("1: A.X: an object is no value of a property", own("{}"));
    EXPECT_EQ("1: A.X: the elements of an array are values of one type", own("[1, \"a\"]"));
    EXPECT_EQ("1: A.X: the elements of an array are values of one type", own("[[1]]"));
    // Nothing of an entry that does not fit is there.
    EXPECT_TRUE(store.instances("n").empty());
}

TEST_F(Server_Instances_File, AFileThatIsNotThere)
{
    std::string error;
    EXPECT_FALSE(read_server_instances("no/such.json", catalogue, store, error));
    EXPECT_EQ("no/such.json: cannot be read: No such file or directory", error);
    EXPECT_FALSE(read_server_instances(folder.path(), catalogue, store, error));
    EXPECT_NE("", error);
}

TEST_F(Server_Instances_File, AsAnOption)
{
    folder.write("server.json", "[\n5]");
    Outcome run = kldrcim("--server-instances " + file + " classes");
    EXPECT_EQ(2, run.status);
    EXPECT_EQ("", run.out);
    EXPECT_EQ("kldrcim: " + file + ":2: expected an entry: an object with \"namespace\"\n", run.error);
    folder.write("server.json", "[]");
    EXPECT_EQ(0, kldrcim("--server-instances " + file + " classes").status);
}

} // namespace
} // namespace KPRV::kldrcim
