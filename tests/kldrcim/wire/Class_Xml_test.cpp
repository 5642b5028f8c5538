#include "kldrcim/wire/Class_Xml.h"

#include "kldrcim/wire/Qualifiers.h"
#include "kldrcim/wire/Wire_Error.h"
#include "kldrcim/wire/Xml_Reader.h"
#include "tests/kldrcim/wire/Toy_Classes.h"

#include <gtest/gtest.h>

namespace KPRV::kldrcim {

class Class_Xml : public testing::Test
{
protected:
    std::string written(std::string_view name, const Class_Form& form)
    {
        std::string out;
        Xml_Writer writer(out);
        write_class(writer, _classes, *_classes.find(name), form);
        return out;
    }
    static Class_Info read(const std::string& text)
    {
        Xml_Reader reader;
        EXPECT_TRUE(reader.feed(text) && reader.finish()) << reader.fault_text() << text;
        return read_class(reader.document().root());
    }
    static void expect_same(const std::vector<Feature_Info>& a, const std::vector<Feature_Info>& b)
    {
        ASSERT_EQ(a.size(), b.size());
        for (std::size_t i = 0; i < a.size(); ++i)
            EXPECT_TRUE(a[i].name == b[i].name && a[i].type == b[i].type && a[i].key == b[i].key &&
                        a[i].in == b[i].in && a[i].out == b[i].out &&
                        a[i].target_class == b[i].target_class && a[i].default_value == b[i].default_value)
                << a[i].name;
    }

    const Toy_Classes _classes;
};

TEST_F(Class_Xml, ComesBackAsItWas)
{
    for (const std::string& name : _classes.class_names()) {
        const Class_Info& info = *_classes.find(name);
        const Class_Info again = read(written(name, {.local_only = false}));
        EXPECT_EQ(info.name, again.name);
        EXPECT_EQ(info.superclass, again.superclass);
        EXPECT_EQ(info.is_association, again.is_association);
        EXPECT_EQ(info.is_indication, again.is_indication);
        expect_same(info.properties, again.properties);
        ASSERT_EQ(info.methods.size(), again.methods.size());
        for (std::size_t i = 0; i < info.methods.size(); ++i) {
            EXPECT_EQ(info.methods[i].is_static, again.methods[i].is_static);
            EXPECT_EQ(info.methods[i].return_type, again.methods[i].return_type);
            expect_same(info.methods[i].parameters, again.methods[i].parameters);
        }
    }
}

TEST_F(Class_Xml, SaysWhatIsItsOwn)
{
    const std::string own = written("Toy_Ball", {.qualifiers = false});
    EXPECT_EQ(std::string::npos, own.find("\"Name\"")) << own;
    EXPECT_EQ(std::string::npos, own.find("QUALIFIER")) << own;
    EXPECT_NE(std::string::npos, own.find("<PROPERTY NAME=\"Size\" TYPE=\"uint8\"></PROPERTY>")) << own;
    const std::string all = written(
        "Toy_Ball", {.local_only = false, .qualifiers = false, .origins = true, .properties = {{"name"}}});
    EXPECT_EQ(
        0U,
        all.find("<CLASS NAME=\"Toy_Ball\" SUPERCLASS=\"Toy_Base\"><PROPERTY NAME=\"Name\" TYPE=\"string\" "
                 "CLASSORIGIN=\"Toy_Base\" PROPAGATED=\"true\"></PROPERTY><METHOD"))
        << all;
}

TEST_F(Class_Xml, SaysWhatIsDeclaredAnew)
{
    const std::string link = written("Toy_Ball_Link", {.qualifiers = false, .origins = true});
    EXPECT_EQ(std::string::npos, link.find("\"From\"")) << link;
    EXPECT_NE(std::string::npos,
              link.find("NAME=\"To\" REFERENCECLASS=\"Toy_Ball\" CLASSORIGIN=\"Toy_Link\">"))
        << link;
    const std::string ball = written("Toy_Small_Ball", {.qualifiers = false});
    for (const char* inherited : {"\"Name\"", "\"Size\"", "\"Parts\"", "PROPAGATED"})
        EXPECT_EQ(std::string::npos, ball.find(inherited)) << ball;
    EXPECT_NE(std::string::npos, ball.find("<VALUE>blue</VALUE>")) << ball;
    EXPECT_NE(std::string::npos, ball.find("<METHOD NAME=\"Grow\"")) << ball;
    const std::string all = written("Toy_Small_Ball", {.local_only = false, .qualifiers = false});
    EXPECT_NE(std::string::npos, all.find("<PROPERTY NAME=\"Size\" TYPE=\"uint8\" PROPAGATED=\"true\">"))
        << all;
    EXPECT_NE(std::string::npos, all.find("<PROPERTY NAME=\"Color\" TYPE=\"string\"><VALUE>blue")) << all;
}

TEST_F(Class_Xml, TellsTheWordsOfOrganizations)
{
    const std::string text = written("CIM_RegisteredSpecification", {});
    const char* words =
        "<QUALIFIER NAME=\"Values\" TYPE=\"string\"><VALUE.ARRAY><VALUE>Other</VALUE><VALUE>DMTF";
    EXPECT_NE(std::string::npos, text.find(words)) << text;
    EXPECT_NE(std::string::npos, text.find("<VALUE>11</VALUE>")) << text;
}

TEST_F(Class_Xml, PutsWhatIsLeftOfNumbersBeforeTheLastRange)
{
    const std::string text = written("CIM_EnabledLogicalElement", {});
    EXPECT_NE(
        std::string::npos,
        text.find("<VALUE>9</VALUE><VALUE>10</VALUE><VALUE>11..32767</VALUE><VALUE>32768..65535</VALUE>"))
        << text;
    const std::string status = written("CIM_ManagedSystemElement", {});
    EXPECT_NE(std::string::npos, status.find("<VALUE>19</VALUE><VALUE>..</VALUE><VALUE>32768..</VALUE>"))
        << status;
}

TEST_F(Class_Xml, RefusesWhatIsNoClass)
{
    EXPECT_THROW(read("<CLASS/>"), Wire_Error);
    EXPECT_THROW(read("<INSTANCE CLASSNAME='A'/>"), Wire_Error);
    EXPECT_THROW(read("<CLASS NAME='A'><PROPERTY NAME='x' TYPE='odd'/></CLASS>"), Wire_Error);
}

TEST(Qualifiers, AreFoundInAnyCase)
{
    ASSERT_TRUE(find_qualifier("KEY"));
    EXPECT_FALSE(find_qualifier("Nothing"));
    std::string out;
    Xml_Writer writer(out);
    write_declaration(writer, *find_qualifier("key"));
    EXPECT_EQ("<QUALIFIER.DECLARATION NAME=\"Key\" TYPE=\"boolean\" ISARRAY=\"false\" OVERRIDABLE=\"false\" "
              "TOSUBCLASS=\"true\"><SCOPE PROPERTY=\"true\" REFERENCE=\"true\"/><VALUE>FALSE</VALUE>"
              "</QUALIFIER.DECLARATION>",
              out);
}

} // namespace KPRV::kldrcim
