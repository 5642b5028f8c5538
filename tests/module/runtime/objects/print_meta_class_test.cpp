#include "module/runtime/objects/print_meta_class.h"

#include "tests/module/runtime/objects/meta_records.h"

#include <gtest/gtest.h>

#include <csignal>

namespace KPRV {

namespace {

template <class... Arguments>
std::string printed(const Arguments&... arguments)
{
    testing::internal::CaptureStdout();
    print(arguments...);
    fflush(stdout);
    return testing::internal::GetCapturedStdout();
}

std::string printed_feature(const Owned_Class& owner, const char* name)
{
    return printed(find_feature(owner.get(), name, ANY_FEATURE), size_t(0), true);
}

std::string printed_qualifier(Meta_Qualifier* owned)
{
    const Owned_Class holder(create_meta_class("Holder", nullptr, FLAG_CLASS));
    add_qualifier(holder.get(), owned);
    return printed(static_cast<const Meta_Qualifier*>(owned));
}

const char* const RESET_TEXT = "    uint32 Reset(\n"
                               "        boolean Force = NULL,\n"
                               "        Sample_Element ref Target,\n"
                               "        uint32 Count = NULL,\n"
                               "        string Message = NULL);\n";

} // namespace

TEST(print_meta_class, AClassOfEveryFeature)
{
    EXPECT_EQ(std::string("class Sample_Element\n{\n"
                          "    string Name = NULL;\n"
                          "    uint16 EnabledState = 5;\n"
                          "    string Caption = \"An element\";\n"
                          "    datetime Timeout = \"00000000000500.000000:000\";\n"
                          "    uint32 Codes[] = { 2, 3, 5 };\n"
                          "    string Words[] = { \"OK\", \"Up\" };\n"
                          "    datetime Pauses[] = { \"00000000000001.000000:000\", "
                          "\"00000000000002.000000:000\" };\n") +
                  RESET_TEXT + "};\n",
              printed(ELEMENT, false, false));
}

TEST(print_meta_class, LocalFeaturesOnly)
{
    EXPECT_EQ("class Sample_Port : Sample_Element\n{\n"
              "    uint64 Number = NULL;\n"
              "    real64 Load = NULL;\n"
              "};\n",
              printed(PORT, false, true));
    // Without the table nothing is.
    EXPECT_EQ("class Sample_Other\n{\n};\n", printed(&Sample_Other::static_meta_class, false, true));
}

TEST(print_meta_class, Qualifiers)
{
    EXPECT_EQ("[Association]\nclass Sample_Link\n{\n"
              "    [Key]\n    Sample_Element ref Antecedent;\n"
              "    [Key]\n    Sample_Port ref Dependent;\n"
              "};\n",
              printed(&Sample_Link::static_meta_class, true, false));
}

TEST(print_meta_class, TheTwoThatAreTrueByDefaultShowWhereTheyAreFalse)
{
    const Owned_Class copy = cloned(ELEMENT);
    EXPECT_EQ("[Key]\nstring Name = NULL", printed_feature(copy, "Name"));
    Meta_Property* name = own_feature<Meta_Property>(copy, "Name");
    name->flags = FLAG_PROPERTY | FLAG_KEY | FLAG_WRITE;
    EXPECT_EQ("[Key, Read(False), Write]\nstring Name = NULL", printed_feature(copy, "Name"));
    // Read says nothing of a parameter, and neither of the two of a method.
    EXPECT_EQ("uint32 Reset(\n"
              "    boolean Force = NULL,\n"
              "    Sample_Element ref Target,\n"
              "    [Out]\n    uint32 Count = NULL,\n"
              "    [In(False), Out]\n    string Message = NULL)",
              printed_feature(copy, "Reset"));
}

TEST(print_meta_class, NamedQualifiersStandBehindFlags)
{
    const Owned_Class copy = cloned(ELEMENT);
    copy->flags |= FLAG_ABSTRACT | FLAG_EMBEDDED_INSTANCE;
    add_qualifier(copy.get(), qualifier("abstract"));
    add_qualifier(copy.get(), qualifier("Version", STRING, text_value("2.26.0")));
    add_qualifier(copy.get(), qualifier("Nullable", BOOLEAN, boolean_value(false)));
    const std::string text = printed(static_cast<const Meta_Class*>(copy.get()), true, true);
    EXPECT_EQ("[Abstract, EmbeddedInstance, Version(\"2.26.0\"), Nullable(False)]\nclass Sample_Element\n",
              text.substr(0, text.find('{')));
    EXPECT_TRUE(printed(static_cast<const Meta_Class*>(copy.get()), false, true).starts_with("class "));
}

TEST(print_meta_class, EachQualifierByItsShape)
{
    EXPECT_EQ("Plain", printed_qualifier(qualifier("Plain")));
    EXPECT_EQ("Flag", printed_qualifier(qualifier("Flag", BOOLEAN, boolean_value(true))));
    EXPECT_EQ("Flag(False)", printed_qualifier(qualifier("Flag", BOOLEAN, boolean_value(false))));
    EXPECT_EQ("MaxLen(64)", printed_qualifier(qualifier("MaxLen", UINT32, uint32_value(64))));
    EXPECT_EQ("Text(\"a\\\"b\")", printed_qualifier(qualifier("Text", STRING, text_value("a\"b"))));
    EXPECT_EQ("ValueMap{ \"0\", \"1\" }",
              printed_qualifier(qualifier("ValueMap", STRING, texts_value({"0", "1"}), true)));
}

TEST(print_meta_class, BracketsOfArrays)
{
    const Owned_Class copy = cloned(&Sample_Group::static_meta_class);
    const auto members = [&](sint16 subscript) {
        own_feature<Meta_Reference>(copy, "Members")->subscript = subscript;
        return printed(find_feature(copy.get(), "Members", ANY_FEATURE), size_t(0), false);
    };
    EXPECT_EQ("Sample_Port ref Members[]", members(-1));
    EXPECT_EQ("Sample_Port ref Members[4]", members(4));
    EXPECT_EQ("Sample_Port ref Members", members(0));
    const Owned_Class other = cloned(&Sample_Other::static_meta_class);
    own_feature<Meta_Property>(other, "Size")->subscript = 3;
    EXPECT_EQ("uint32 Size[3] = NULL", printed(find_feature(other.get(), "Size", 1), size_t(0), false));
}

TEST(print_meta_class, AMethodWithoutParameters)
{
    const Meta_Feature* const only[] = {&_Sample_Element_Reset_method_return_value};
    const Meta_Method method = {{{0, FLAG_METHOD, "Stop", nullptr, 0}}, only, 1, 32, UINT32};
    EXPECT_EQ("    uint32 Stop()", printed(static_cast<const Meta_Feature*>(&method), size_t(1), true));
}

TEST(print_meta_class, AMethodWithoutFeaturesIsABrokenTable)
{
    const Meta_Method method = {{{0, FLAG_METHOD, "Stop", nullptr, 0}}, nullptr, 0, 32, UINT32};
    EXPECT_EXIT(print(static_cast<const Meta_Feature*>(&method), size_t(0), false),
                testing::KilledBySignal(SIGABRT), "mm->num_meta_features > 0");
}

TEST(print_meta_class, ADumpHasEveryClass)
{
    testing::internal::CaptureStdout();
    dump(&sample_repository);
    fflush(stdout);
    const std::string text = testing::internal::GetCapturedStdout();
    std::string expected;
    for (const Meta_Class* each : sample_meta_classes)
        expected += printed(each, true, false);
    EXPECT_EQ(expected, text);
}

} // namespace KPRV
