#include "module/runtime/objects/print_instance.h"
#include "module/runtime/objects/print_scalar.h"

#include "module/runtime/objects/Value.h"
#include "tests/module/runtime/objects/sample_values.h"

#include <gtest/gtest.h>

#include <string>

namespace KPRV {

namespace {

/// What a function writes to a file.
template <class Function>
std::string written(Function function)
{
    char* text = nullptr;
    size_t size = 0;
    FILE* file = open_memstream(&text, &size);
    function(file);
    fclose(file);
    std::string result(text, size);
    free(text);
    return result;
}

template <class T>
std::string scalar(const T& x)
{
    return written([&](FILE* file) { fprint_scalar_value(file, Type_Code<T>::value, &x); });
}

std::string of(const Value& x)
{
    return written([&](FILE* file) { x.fprint(file); });
}

std::string of(const Instance* x, bool keys_only = false)
{
    return written([&](FILE* file) { fprint(file, x, keys_only); });
}

} // namespace

TEST(print_scalar, Strings)
{
    const auto quoted = [](const char* text) {
        return written([=](FILE* file) { fprint_string(file, text); });
    };
    EXPECT_EQ("\"\"", quoted(""));
    EXPECT_EQ("\"a\\tb\\nc\\fd\\re\\\"f\"", quoted("a\tb\nc\fd\re\"f"));
    // All else as it is, the backslash too.
    EXPECT_EQ("\"\\ \x01 \xC3\xA4 '\"", quoted("\\ \x01 \xC3\xA4 '"));
}

TEST(print_scalar, Scalars)
{
    EXPECT_EQ("true", scalar(boolean(true)));
    EXPECT_EQ("false", scalar(boolean(false)));
    EXPECT_EQ("255", scalar(uint8(255)));
    EXPECT_EQ("-128", scalar(sint8(-128)));
    EXPECT_EQ("65535", scalar(uint16(65535)));
    EXPECT_EQ("-32768", scalar(sint16(-32768)));
    EXPECT_EQ("4294967295", scalar(uint32(4294967295u)));
    EXPECT_EQ("-2147483648", scalar(sint32(-2147483647 - 1)));
    EXPECT_EQ("18446744073709551615", scalar(~uint64(0)));
    EXPECT_EQ("-9223372036854775808", scalar(sint64(uint64(1) << 63)));
    EXPECT_EQ("1.500000", scalar(real32(1.5)));
    EXPECT_EQ("-0.250000", scalar(real64(-0.25)));
    EXPECT_EQ("\"a\\\"b\"", scalar(String("a\"b")));
    EXPECT_EQ("\"00000000000500.000000:000\"", scalar(Datetime(5 * Datetime::MIN)));
}

TEST(print_scalar, CharactersShowWhenTheyArePrintable)
{
    EXPECT_EQ("' '", scalar(char16(32)));
    EXPECT_EQ("'~'", scalar(char16(126)));
    EXPECT_EQ("0x001F", scalar(char16(31)));
    EXPECT_EQ("0x007F", scalar(char16(127)));
    EXPECT_EQ("0xABCD", scalar(char16(0xABCD)));
}

TEST(print_scalar, Arrays)
{
    const auto array = [](const auto& x) {
        Value value;
        value.set_value(x);
        const std::string text = of(value);
        const size_t at = text.find("value=") + 6;
        return text.substr(at, text.rfind('}') - at);
    };
    EXPECT_EQ("{ }", array(Array<uint32>()));
    Array<uint32> numbers;
    numbers.append(1);
    EXPECT_EQ("{ 1 }", array(numbers));
    numbers.append(2);
    EXPECT_EQ("{ 1, 2 }", array(numbers));
    Array<String> texts;
    texts.append(String("a"));
    texts.append(String());
    EXPECT_EQ("{ \"a\", \"\" }", array(texts));
}

TEST(print_scalar, DefaultsOfScalars)
{
    const auto literal = [](const Meta_Value& value, Type type) {
        return written([&](FILE* file) { fprint_scalar(file, value, type); });
    };
    EXPECT_EQ("true", literal({.boolean_value = true}, BOOLEAN));
    EXPECT_EQ("255", literal({.uint8_value = 255}, UINT8));
    EXPECT_EQ("-128", literal({.sint8_value = -128}, SINT8));
    EXPECT_EQ("65535", literal({.uint16_value = 65535}, UINT16));
    EXPECT_EQ("-2", literal({.sint16_value = -2}, SINT16));
    EXPECT_EQ("4294967295", literal({.uint32_value = 4294967295u}, UINT32));
    EXPECT_EQ("-3", literal({.sint32_value = -3}, SINT32));
    EXPECT_EQ("18446744073709551615", literal({.uint64_value = ~uint64(0)}, UINT64));
    EXPECT_EQ("-4", literal({.sint64_value = -4}, SINT64));
    EXPECT_EQ("0.500000", literal({.real32_value = 0.5f}, REAL32));
    EXPECT_EQ("-0.250000", literal({.real64_value = -0.25}, REAL64));
    EXPECT_EQ("'A'", literal({.char16_value = 'A'}, CHAR16));
    EXPECT_EQ("\"a\\\"b\"", literal({.string_value = "a\"b"}, STRING));
    EXPECT_EQ("\"00000000000500.000000:000\"", literal(_Sample_Element_Timeout_MV, DATETIME));
}

TEST(print_scalar, DefaultsOfArraysStandWithoutBraces)
{
    const auto literal = [](const Meta_Value& value, Type type) {
        return written([&](FILE* file) { fprint_array(file, value, type); });
    };
    EXPECT_EQ("2, 3, 5", literal(_Sample_Element_Codes_MV, UINT32));
    EXPECT_EQ("\"OK\", \"Up\"", literal(_Sample_Element_Words_MV, STRING));
    EXPECT_EQ("\"00000000000001.000000:000\", \"00000000000002.000000:000\"",
              literal(_Sample_Element_Pauses_MV, DATETIME));
    const boolean flags[] = {true, false};
    EXPECT_EQ("true, false", literal({.array_value = {flags, 2}}, BOOLEAN));
    EXPECT_EQ("", literal({.array_value = {flags, 0}}, BOOLEAN));
}

TEST(Value_print, Scalar)
{
    Value x;
    x.set_value(uint16(5));
    // No line ends behind the value.
    EXPECT_EQ("Value\n{\n    type=UINT16\n    null=false\n    value=5}\n", of(x));
    testing::internal::CaptureStdout();
    x.print();
    fflush(stdout);
    EXPECT_EQ(of(x), testing::internal::GetCapturedStdout());
}

// The record of a null stays open.
TEST(Value_print, Null)
{
    Value x;
    x.clear();
    EXPECT_EQ("Value\n{\n    type=NONE\n    null=true\n    value= NONE\n", of(x));
    x.set_null(static_cast<Value::Type>(128 + STRING));
    EXPECT_EQ("Value\n{\n    type=STRING_ARRAY\n    null=true\n    value= NONE\n", of(x));
    EXPECT_EQ("Value\n{\n    type=NONE\n    null=false\n    value=}\n", of(Value()));
}

TEST(Value_print, InstancesAndArraysOfThem)
{
    Value x;
    x.set_value(create(&Instance::static_meta_class, true));
    EXPECT_EQ("Value\n{\n    type=INSTANCE\n    null=false\n    value=Instance\n{\n}\n}\n", of(x));
    Array<Instance*> array;
    array.append(make_port("p", 1));
    array.append(nullptr);
    x.set_value(array);
    EXPECT_EQ("Value\n{\n    type=INSTANCE_ARRAY\n    null=false\n    value=\n    {\n"
              "        Sample_Port\n        {\n"
              "            string Name = \"p\";\n"
              "            uint64 Number = 1;\n"
              "        }\n"
              "        NULL\n"
              "    }\n}\n",
              of(x));
}

TEST(Instance_print, EveryFeatureAtTheTop)
{
    const Ref<Sample_Element> x(make_element("e"));
    x->__name_space = "root";
    x->Codes.null = 1;
    x->EnabledState.null = 1;
    EXPECT_EQ("Sample_Element\n{\n"
              "    string __name_space = \"root\";\n"
              "    string Name = \"e\";\n"
              "    uint16 EnabledState = NULL;\n"
              "    string Caption = \"An element\";\n"
              "    datetime Timeout = \"00000000000500.000000:000\";\n"
              "    uint32 Codes[] = NULL;\n"
              "    string Words[] = { \"OK\", \"Up\" };\n"
              "    datetime Pauses[] = { \"00000000000001.000000:000\", \"00000000000002.000000:000\" };\n"
              "}\n",
              of(x.ptr()));
    EXPECT_EQ("Sample_Element\n{\n    string __name_space = \"root\";\n    string Name = \"e\";\n}\n",
              of(x.ptr(), true));
    testing::internal::CaptureStdout();
    print(x.ptr(), true);
    fflush(stdout);
    EXPECT_EQ(of(x.ptr(), true), testing::internal::GetCapturedStdout());
}

TEST(Instance_print, KeysAndEmbeddedObjectsBelow)
{
    const Ref<Sample_Group> x = make_group("g");
    EXPECT_EQ("Sample_Group\n{\n"
              "    string Name = \"g\";\n"
              "    Sample_Element Leader =\n    {\n        string Name = \"leader\";\n    }\n"
              "    Sample_Port Members[] =\n    {\n"
              "        Sample_Port\n        {\n"
              "            string Name = \"member\";\n            uint64 Number = 1;\n        }\n"
              "        NULL\n"
              "        Sample_Port\n        {\n"
              "            string Name = \"member\";\n            uint64 Number = 2;\n        }\n"
              "    };\n"
              "}\n",
              of(x.ptr()));
    clear(x.ptr());
    EXPECT_EQ("Sample_Group\n{\n    string Name = NULL;\n    Sample_Element Leader = NULL;\n"
              "    Sample_Port Members[] = NULL;\n}\n",
              of(x.ptr()));
}

TEST(print_scalar, LiteralsOnStandardOutput)
{
    const uint16 codes[] = {4, 5};
    const Meta_Value list = {.array_value = {codes, 2}};
    const Meta_Value text = {.string_value = "a\tb"};
    testing::internal::CaptureStdout();
    print_string("c\"");
    print_scalar(text, STRING);
    print_array(list, UINT16);
    fflush(stdout);
    EXPECT_EQ("\"c\\\"\"\"a\\tb\"4, 5", testing::internal::GetCapturedStdout());
}

} // namespace KPRV
