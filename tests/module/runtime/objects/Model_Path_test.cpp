#include "module/runtime/objects/Model_Path.h"

#include "module/runtime/ground/type_dispatch.h"
#include "tests/module/runtime/objects/sample_values.h"

#include <gtest/gtest.h>

#include <string>

namespace KPRV {

namespace {

/// A class with one key of a type.
template <class T>
struct Keyed : Instance
{
    Property<T> Key;
    static const Meta_Property meta;
    static const Meta_Feature* const features[];
    static const Meta_Class static_meta_class;
};

template <class T>
struct Element_Type
{
    static constexpr Type code = Type_Code<T>::value;
    static constexpr sint16 subscript = 0;
};
template <class T>
struct Element_Type<Array<T>>
{
    static constexpr Type code = Type_Code<T>::value;
    static constexpr sint16 subscript = -1;
};

template <class T>
constexpr Meta_Property Keyed<T>::meta = {{{0, FLAG_PROPERTY | FLAG_KEY | FLAG_READ, "Key", nullptr, 0}},
                                          Element_Type<T>::code,
                                          Element_Type<T>::subscript,
                                          offsetof(Keyed<T>, Key),
                                          nullptr};
template <class T>
constexpr const Meta_Feature* const Keyed<T>::features[] = {&Keyed<T>::meta};
template <class T>
constexpr Meta_Class Keyed<T>::static_meta_class = {
    {{0, FLAG_CLASS, "Keyed", nullptr, 0}}, features, 1, sizeof(Keyed<T>), nullptr, nullptr, 1, nullptr};

/// Keys of which one is an array of references.
struct Bundle : Instance
{
    Property<String> Name;
    Property<Array<Instance*>> Parts;
    Property<uint32> Number;
    static const Meta_Class static_meta_class;
};
constexpr Meta_Property bundle_name = {
    {{0, FLAG_PROPERTY | FLAG_KEY, "Name", nullptr, 0}}, STRING, 0, offsetof(Bundle, Name), nullptr};
constexpr Meta_Reference bundle_parts = {{{0, FLAG_REFERENCE | FLAG_KEY, "Parts", nullptr, 0}},
                                         -1,
                                         &Sample_Element::static_meta_class,
                                         offsetof(Bundle, Parts)};
constexpr Meta_Property bundle_number = {
    {{0, FLAG_PROPERTY | FLAG_KEY, "Number", nullptr, 0}}, UINT32, 0, offsetof(Bundle, Number), nullptr};
constexpr const Meta_Feature* bundle_features[] = {&bundle_name, &bundle_parts, &bundle_number};
constexpr Meta_Class Bundle::static_meta_class = {{{0, FLAG_CLASS, "Bundle", nullptr, 0}},
                                                  bundle_features,
                                                  3,
                                                  sizeof(Bundle),
                                                  nullptr,
                                                  nullptr,
                                                  3,
                                                  nullptr};

constexpr Meta_Class keyless = {
    {{0, FLAG_CLASS, "Keyless", nullptr, 0}}, nullptr, 0, sizeof(Instance), nullptr, nullptr, 0, nullptr};

std::string path(const Instance* instance, int result = 0)
{
    String text("what stood before");
    EXPECT_EQ(result, instance_to_model_path(instance, text));
    return text.c_str();
}

/// The path of a class with one key of a type that holds the value.
template <class T>
std::string path_of(const T& value)
{
    const Ref<Keyed<T>> x(create<Keyed<T>>(false));
    x->Key.set(value);
    return path(x.ptr());
}

template <class T>
Ref<T> read(const std::string& text)
{
    return Ref<T>(cast<T>(model_path_to_instance(&T::static_meta_class, text.c_str())));
}

/// The key's value in the text "Keyed.Key=" and `value`; -99 where it does not read.
template <class T>
T read_key(const std::string& value)
{
    const Ref<Keyed<T>> x = read<Keyed<T>>("Keyed.Key=" + value);
    return x ? x->Key.value : static_cast<T>(-99);
}

template <class T>
bool reads(const std::string& value)
{
    return bool(read<Keyed<T>>("Keyed.Key=" + value));
}

bool element_reads(const std::string& text)
{
    return bool(read<Sample_Element>(text));
}

Ref<Sample_Link> make_link(const char* from, const char* to)
{
    Ref<Sample_Link> link(create<Sample_Link>(false));
    link->Antecedent = make_element(from);
    link->Dependent = make_port(to, 7);
    return link;
}

} // namespace

TEST(Model_Path_write, ClassAndKeysInTheirOrder)
{
    const Ref<Sample_Element> element(make_element("e 1"));
    EXPECT_EQ("Sample_Element.Name=\"e 1\"", path(element.ptr()));
    const Ref<Sample_Port> port(make_port("p", 5));
    EXPECT_EQ("Sample_Port.Name=\"p\",Number=5", path(port.ptr()));
}

TEST(Model_Path_write, EveryTypeOfKey)
{
    EXPECT_EQ("Keyed.Key=true", path_of(boolean(true)));
    EXPECT_EQ("Keyed.Key=false", path_of(boolean(false)));
    EXPECT_EQ("Keyed.Key=255", path_of(uint8(255)));
    EXPECT_EQ("Keyed.Key=-128", path_of(sint8(-128)));
    EXPECT_EQ("Keyed.Key=65535", path_of(uint16(65535)));
    EXPECT_EQ("Keyed.Key=-32768", path_of(sint16(-32768)));
    EXPECT_EQ("Keyed.Key=4294967295", path_of(uint32(4294967295u)));
    EXPECT_EQ("Keyed.Key=-2147483648", path_of(sint32(-2147483647 - 1)));
    EXPECT_EQ("Keyed.Key=18446744073709551615", path_of(~uint64(0)));
    EXPECT_EQ("Keyed.Key=-9223372036854775808", path_of(sint64(uint64(1) << 63)));
    EXPECT_EQ("Keyed.Key=1.500000", path_of(real32(1.5)));
    EXPECT_EQ("Keyed.Key=-0.250000", path_of(real64(-0.25)));
    EXPECT_EQ(10 + 309 + 7u, path_of(real64(1e308)).size());
    EXPECT_EQ("Keyed.Key='x'", path_of(char16('x')));
    EXPECT_EQ("Keyed.Key=\"\"", path_of(String()));
    EXPECT_EQ("Keyed.Key=00000000000500.000000:000", path_of(Datetime(5 * Datetime::MIN)));
}

TEST(Model_Path_write, NoKeysNullKeysAndArraysFail)
{
    const Ref<Instance> none(create(&keyless, false));
    EXPECT_EQ("", path(none.ptr(), -1));

    const Ref<Sample_Port> port(make_port("p", 5));
    port->Number.null = 1;
    // What was written before stays.
    EXPECT_EQ("Sample_Port.Name=\"p\",Number=", path(port.ptr(), -1));

    const Ref<Keyed<Array<uint32>>> array(create<Keyed<Array<uint32>>>(false));
    EXPECT_EQ("Keyed.Key=", path(array.ptr(), -1));

    const Ref<Sample_Link> link(create<Sample_Link>(false));
    EXPECT_EQ("Sample_Link.Antecedent=", path(link.ptr(), -1));
    link->Antecedent = make_element("e");
    EXPECT_EQ("Sample_Link.Antecedent=\"Sample_Element.Name=\\\"e\\\"\",Dependent=", path(link.ptr(), -1));
    // A failure within is a failure.
    link->Dependent = create<Sample_Port>(true);
    EXPECT_EQ("Sample_Link.Antecedent=\"Sample_Element.Name=\\\"e\\\"\",Dependent=", path(link.ptr(), -1));
}

TEST(Model_Path_write, ReferencesNest)
{
    EXPECT_EQ("Sample_Link.Antecedent=\"Sample_Element.Name=\\\"a\\\"\","
              "Dependent=\"Sample_Port.Name=\\\"b\\\",Number=7\"",
              path(make_link("a", "b").ptr()));
}

// Its name stays, without value and comma, and the comma of another key is one too many.
TEST(Model_Path_write, ReferenceArraysLeaveTheirNameAlone)
{
    const Ref<Bundle> bundle(create<Bundle>(false));
    bundle->Name.set(String("n"));
    bundle->Number.set(3);
    EXPECT_EQ("Bundle.Name=\"n\",Parts=Number=3,", path(bundle.ptr()));
}

TEST(Model_Path_read, KeysAreSetAndAllElseIsNull)
{
    const Ref<Sample_Port> port = read<Sample_Port>("Sample_Port.Name=\"p\",Number=5");
    ASSERT_TRUE(port);
    EXPECT_EQ(1, port->__refs);
    EXPECT_EQ(&Sample_Port::static_meta_class, port->__meta_class);
    EXPECT_EQ(0, port->Name.null);
    EXPECT_STREQ("p", port->Name.value.c_str());
    EXPECT_EQ(0, port->Number.null);
    EXPECT_EQ(5u, port->Number.value);
    for_each_null_byte(port.ptr(),
                       [](const Meta_Feature* f, uint8 null) { EXPECT_EQ(is_key(f) ? 0 : 1, null); });
}

TEST(Model_Path_read, NamesFoldCaseAndKeysComeInAnyOrder)
{
    const Ref<Sample_Port> port = read<Sample_Port>("SAMPLE_PORT.number=5,nAmE=\"p\"");
    ASSERT_TRUE(port);
    EXPECT_EQ("Sample_Port.Name=\"p\",Number=5", path(port.ptr()));
}

// The ancestors of the given class first, then its repository.
TEST(Model_Path_read, FindsTheClassByName)
{
    const Ref<Instance> up(
        model_path_to_instance(&Sample_Port::static_meta_class, "Sample_Element.Name=\"e\""));
    ASSERT_TRUE(up);
    EXPECT_EQ(&Sample_Element::static_meta_class, up->__meta_class);
    const Ref<Instance> other(
        model_path_to_instance(&Sample_Port::static_meta_class, "Sample_Other.Name=\"o\""));
    ASSERT_TRUE(other);
    EXPECT_EQ(&Sample_Other::static_meta_class, other->__meta_class);
    EXPECT_FALSE(element_reads("Sample_Nothing.Name=\"e\""));
}

TEST(Model_Path_read, TheFormIsAsked)
{
    EXPECT_TRUE(element_reads("Sample_Element.Name=\"e\""));
    for (const char* text :
         {"", ".", "Sample_Element", "Sample_Element:Name=\"e\"", "1Sample.Name=\"e\"",
          " Sample_Element.Name=\"e\"", "Sample_Element .Name=\"e\"", "Sample_Element.=\"e\"",
          "Sample_Element.1=\"e\"", "Sample_Element.Name\"e\"", "Sample_Element.Name =\"e\"",
          "Sample_Element.Name= \"e\"", "Sample_Element.,Name=\"e\"", "Sample_Element.Name=\"e\" ",
          "Sample_Element.Name=\"e\",,"})
        EXPECT_FALSE(element_reads(text)) << text;
    // The comma is taken where it stands, and missed by nobody.
    EXPECT_TRUE(element_reads("Sample_Element.Name=\"e\","));
    EXPECT_TRUE(read<Sample_Port>("Sample_Port.Name=\"p\"Number=5"));
}

TEST(Model_Path_read, NamesAreOfLettersDigitsAndUnderscores)
{
    const auto reads_name = [](const char* name) {
        const Meta_Class named = {
            {{0, FLAG_CLASS, name, nullptr, 0}}, nullptr, 0, sizeof(Instance), nullptr, nullptr, 0, nullptr};
        const Ref<Instance> instance(model_path_to_instance(&named, (std::string(name) + ".").c_str()));
        return bool(instance);
    };
    for (const char* name : {"_", "a", "z", "A", "Z", "A_azAZ09", "__9", "_0"})
        EXPECT_TRUE(reads_name(name)) << name;
    // Those behind and before the ranges.
    for (const char* name : {"0", "9", "@A", "A@", "A[", "[A", "A`", "`A", "A{", "{A", "A/", "A:"})
        EXPECT_FALSE(reads_name(name)) << name;
}

TEST(Model_Path_read, OnlyKeysAreBound)
{
    EXPECT_FALSE(element_reads("Sample_Element.Caption=\"c\""));
    EXPECT_FALSE(element_reads("Sample_Element.Reset=\"c\""));
    EXPECT_FALSE(element_reads("Sample_Element.Nothing=\"c\""));
}

TEST(Model_Path_read, TheNumberOfKeysIsAsked)
{
    EXPECT_FALSE(read<Sample_Port>("Sample_Port."));
    EXPECT_FALSE(read<Sample_Port>("Sample_Port.Name=\"p\""));
    EXPECT_FALSE(read<Sample_Port>("Sample_Port.Name=\"p\",Number=5,Number=5"));
    EXPECT_FALSE(element_reads("Sample_Element.Name=\"a\",Name=\"a\""));
    // And only the number: one key twice stands in for the other.
    const Ref<Sample_Port> port = read<Sample_Port>("Sample_Port.Number=5,Number=6");
    ASSERT_TRUE(port);
    EXPECT_EQ("Sample_Port.Name=\"\",Number=6", path(port.ptr()));
    // A class without keys has an empty list of them.
    EXPECT_TRUE(Ref<Instance>(model_path_to_instance(&keyless, "Keyless.")));
    EXPECT_FALSE(Ref<Instance>(model_path_to_instance(&keyless, "Keyless")));
}

TEST(Model_Path_read, Texts)
{
    const auto text = [](const char* value) {
        const Ref<Keyed<String>> x = read<Keyed<String>>(std::string("Keyed.Key=") + value);
        return x ? std::string(x->Key.value.c_str()) : "nothing";
    };
    EXPECT_EQ("", text("\"\""));
    EXPECT_EQ("a,b=c.d", text("\"a,b=c.d\""));
    EXPECT_EQ("a\"b\\c", text("\"a\\\"b\\\\c\""));
    for (const char* bad : {"", "a", "\"", "\"a", "\"a\\\"", "\"a\\n\"", "\"a\\", "'a'", "\"a\"b\"", "5"})
        EXPECT_EQ("nothing", text(bad)) << bad;
}

TEST(Model_Path_read, Integers)
{
    EXPECT_EQ(16u, read_key<uint32>("0x10"));
    EXPECT_EQ(16u, read_key<uint32>("16"));
    EXPECT_EQ(16u, read_key<uint32>("+16"));
    EXPECT_EQ(-16, read_key<sint32>("-16"));
    // Base 16 is tried where base 10 stops too soon, with or without its prefix.
    EXPECT_EQ(255u, read_key<uint32>("ff"));
    EXPECT_EQ(0x1au, read_key<uint32>("1A"));
    EXPECT_EQ(10u, read_key<uint32>("010"));
    // No look at the range: what does not fit is cut.
    EXPECT_EQ(44u, read_key<uint8>("300"));
    EXPECT_EQ(-1, read_key<sint8>("255"));
    EXPECT_EQ(0u, read_key<uint16>("65536"));
    EXPECT_EQ(-1, read_key<sint16>("65535"));
    EXPECT_EQ(4294967295u, read_key<uint32>("-1"));
    EXPECT_EQ(-1, read_key<sint32>("4294967295"));
    EXPECT_EQ(~uint64(0), read_key<uint64>("-1"));
    EXPECT_EQ(sint64(uint64(1) << 63), read_key<sint64>("-9223372036854775808"));
    // What is read is signed: the upper half of 64 bits is cut to the largest value.
    EXPECT_EQ(uint64(9223372036854775807), read_key<uint64>("18446744073709551615"));
    // No digits are 0.
    EXPECT_EQ(0u, read_key<uint32>(""));
    EXPECT_EQ(0u, read_key<uint32>(","));
    for (const char* bad : {"5 ", "5x", "0x", "x", "\"5\"", "1.0", "5\"", "--5", "true"})
        EXPECT_FALSE(reads<uint32>(bad)) << bad;
}

TEST(Model_Path_read, Booleans)
{
    for (const char* yes : {"true", "TRUE", "True", "true,"})
        EXPECT_TRUE(read_key<boolean>(yes)) << yes;
    for (const char* no : {"false", "FALSE", "fAlse,"}) {
        EXPECT_TRUE(reads<boolean>(no)) << no;
        EXPECT_FALSE(read_key<boolean>(no)) << no;
    }
    for (const char* bad : {"", "1", "tru", "fals", "true ", "truee", "falsee", "yes!", "\"true\"", ","})
        EXPECT_FALSE(reads<boolean>(bad)) << bad;
}

TEST(Model_Path_read, WhatIsNoPartOfANameFails)
{
    EXPECT_FALSE(reads<real32>("1.500000"));
    EXPECT_FALSE(reads<real64>("1.500000"));
    EXPECT_FALSE(reads<char16>("'x'"));
    EXPECT_FALSE(reads<Datetime>("00000000000500.000000:000"));
    EXPECT_FALSE(reads<Array<uint32>>("5"));
}

TEST(Model_Path_read, References)
{
    const std::string text = path(make_link("a", "b").ptr());
    const Ref<Sample_Link> link = read<Sample_Link>(text);
    ASSERT_TRUE(link);
    EXPECT_EQ(text, path(link.ptr()));
    // Whatever class the name within names.
    const Ref<Sample_Link> other =
        read<Sample_Link>("Sample_Link.Antecedent=\"Sample_Port.Name=\\\"a\\\",Number=1\","
                          "Dependent=\"Sample_Other.NAME=\\\"b\\\"\"");
    ASSERT_TRUE(other);
    EXPECT_EQ(&Sample_Other::static_meta_class, other->Dependent->__meta_class);

    const std::string good = "\"Sample_Element.Name=\\\"a\\\"\"";
    for (const char* bad : {"\"\"", "\"Sample_Element.\"", "\"Sample_Nothing.Name=\\\"a\\\"\"",
                            "Sample_Element.Name=\\\"a\\\"", "5"})
        EXPECT_FALSE(read<Sample_Link>("Sample_Link.Antecedent=" + good + ",Dependent=" + bad)) << bad;
    // One given twice takes the place of the first.
    const Ref<Sample_Link> twice =
        read<Sample_Link>("Sample_Link.Antecedent=" + good + ",Antecedent=\"Sample_Element.Name=\\\"z\\\"\"");
    ASSERT_TRUE(twice);
    EXPECT_EQ("z", std::string(cast<Sample_Element>(twice->Antecedent)->Name.value.c_str()));
    EXPECT_EQ(nullptr, twice->Dependent);
}

TEST(Model_Path_read, ReferenceArraysAreCountedWithoutAValue)
{
    const Ref<Bundle> bundle = read<Bundle>("Bundle.Name=\"n\",Parts=Number=3,");
    ASSERT_TRUE(bundle);
    EXPECT_EQ(3u, bundle->Number.value);
    EXPECT_FALSE(read<Bundle>("Bundle.Name=\"n\",Parts=,Number=3"));
}

// Quotes are told apart only in names within names.
TEST(Model_Path, ATextWithAQuoteDoesNotComeBackButANestedNameDoes)
{
    const Ref<Sample_Element> element(make_element("a\"b"));
    EXPECT_EQ("Sample_Element.Name=\"a\"b\"", path(element.ptr()));
    EXPECT_FALSE(element_reads(path(element.ptr())));
    const std::string nested = path(make_link("a", "b").ptr());
    EXPECT_EQ(nested, path(read<Sample_Link>(nested).ptr()));
}

// The backslashes of the inner name get none of their own.
TEST(Model_Path, NamesNestedTwiceAreWrittenAndDoNotComeBack)
{
    const Ref<Sample_Link> outer(create<Sample_Link>(false));
    outer->Antecedent = make_link("a", "b").steal();
    outer->Dependent = make_port("c", 9);
    const std::string text = path(outer.ptr());
    EXPECT_EQ(R"(Sample_Link.Antecedent="Sample_Link.Antecedent=\"Sample_Element.Name=\\"a\\"\",)"
              R"(Dependent=\"Sample_Port.Name=\\"b\\",Number=7\"",)"
              R"(Dependent="Sample_Port.Name=\"c\",Number=9")",
              text);
    EXPECT_FALSE(read<Sample_Link>(text));
}

} // namespace KPRV
