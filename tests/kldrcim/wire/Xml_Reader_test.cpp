#include "kldrcim/wire/Xml_Reader.h"

#include <gtest/gtest.h>

namespace KPRV::kldrcim {

namespace {

Xml_Fault fault_of(const std::string& text, const Xml_Limits& limits = {})
{
    Xml_Reader reader(limits);
    if (reader.feed(text))
        reader.finish();
    EXPECT_EQ(reader.fault() == Xml_Fault::NONE, reader.fault_text().empty());
    return reader.fault();
}

std::string repeated(const std::string& text, std::size_t times)
{
    std::string result;
    for (std::size_t i = 0; i < times; ++i)
        result += text;
    return result;
}

} // namespace

TEST(Xml_Reader, KeepsElementsAttributesAndText)
{
    Xml_Reader reader;
    ASSERT_TRUE(
        reader.feed("<INSTANCE CLASSNAME='A&amp;B'><PROPERTY NAME=\"x\" TYPE=\"string\">"
                    "<VALUE> a<![CDATA[<b>]]>&#10;&lt; </VALUE></PROPERTY>\n <PROPERTY.ARRAY NAME=\"y\"/>"));
    ASSERT_TRUE(reader.feed("</INSTANCE>"));
    ASSERT_TRUE(reader.finish());
    const Xml_Node root = reader.document().root();
    EXPECT_EQ(Xml_Tag::INSTANCE, root.tag());
    EXPECT_EQ("A&B", root.attribute(Xml_Attribute::CLASSNAME));
    const Xml_Node x = root.child(Xml_Tag::PROPERTY);
    EXPECT_EQ("x", x.attribute(Xml_Attribute::NAME));
    EXPECT_EQ(" a<b>\n< ", x.first().text());
    EXPECT_EQ(Xml_Tag::PROPERTY_ARRAY, x.next().tag());
    EXPECT_FALSE(x.next().next());
    EXPECT_FALSE(x.has(Xml_Attribute::CLASSORIGIN));
    EXPECT_FALSE(root.child(Xml_Tag::QUALIFIER));
}

TEST(Xml_Reader, TakesATextInAnyPieces)
{
    const std::string text =
        "\xEF\xBB\xBF<?xml version=\"1.0\"?><!-- c --><?pi x?><VALUE unknown='1'>\xC3\xA4\r\n</VALUE>";
    for (std::size_t size : {std::size_t(1), std::size_t(7), text.size()}) {
        Xml_Reader reader;
        for (std::size_t at = 0; at < text.size(); at += size)
            ASSERT_TRUE(reader.feed(std::string_view(text).substr(at, size))) << reader.fault_text();
        ASSERT_TRUE(reader.finish()) << reader.fault_text();
        EXPECT_EQ("\xC3\xA4\n", reader.document().root().text());
    }
}

TEST(Xml_Reader, RefusesWhatIsNoXml)
{
    for (const char* text : {"", " ", "<VALUE>", "<VALUE></VALU>", "<VALUE/><VALUE/>", "<VALUE>&lt</VALUE>",
                             "<VALUE>&#1;</VALUE>", "<VALUE>\xFF</VALUE>", "<VALUE>\x01</VALUE>",
                             "<VALUE a='1' a='2'/>", "<VALUE>&other;</VALUE>"})
        EXPECT_EQ(Xml_Fault::NOT_WELL_FORMED, fault_of(text)) << text;
    EXPECT_EQ(Xml_Fault::NOT_WELL_FORMED, fault_of(std::string("<VALUE>\0</VALUE>", 16)));
    EXPECT_EQ(Xml_Fault::NOT_WELL_FORMED, fault_of(std::string("\xFF\xFE<\0V\0/\0>\0", 10)));
}

TEST(Xml_Reader, RefusesDocumentTypes)
{
    EXPECT_EQ(Xml_Fault::NOT_WELL_FORMED, fault_of("<!DOCTYPE VALUE><VALUE/>"));
    EXPECT_EQ(Xml_Fault::NOT_WELL_FORMED, fault_of("<!DOCTYPE VALUE SYSTEM 'file:///etc/passwd'><VALUE/>"));
    std::string bomb = "<!DOCTYPE VALUE [<!ENTITY a 'aaaaaaaaaa'>";
    for (char c = 'b'; c < 'k'; ++c)
        bomb += std::string("<!ENTITY ") + c + " '" +
                repeated(std::string("&") + static_cast<char>(c - 1) + ";", 10) + "'>";
    EXPECT_EQ(Xml_Fault::NOT_WELL_FORMED, fault_of(bomb + "]><VALUE>&j;</VALUE>"));
}

TEST(Xml_Reader, RefusesWhatIsNotOfCim)
{
    for (const char* text :
         {"<HTML/>", "<value/>", "<VALUE><VALUE/></VALUE>", "<CIM>text</CIM>", "<CIM><VALUE/></CIM>"})
        EXPECT_EQ(Xml_Fault::NOT_VALID, fault_of(text)) << text;
    Xml_Reader reader;
    EXPECT_FALSE(reader.feed("<CIM>\n <HOST/></CIM>"));
    EXPECT_EQ("line 2, column 2: no element <HOST> in <CIM>", reader.fault_text());
    EXPECT_FALSE(reader.feed("<more>")) << "a fault stays";
    EXPECT_FALSE(reader.finish());
}

TEST(Xml_Reader, KeepsItsLimits)
{
    EXPECT_EQ(Xml_Fault::TOO_LARGE, fault_of("<VALUE>" + std::string(100, 'a') + "</VALUE>", {.bytes = 100}));
    const std::string deep = "<CIM><MESSAGE><SIMPLEREQ/></MESSAGE></CIM>";
    EXPECT_EQ(Xml_Fault::TOO_LARGE, fault_of(deep, {.depth = 2}));
    EXPECT_EQ(Xml_Fault::NONE, fault_of(deep, {.depth = 3}));
    EXPECT_EQ(Xml_Fault::TOO_LARGE, fault_of("<VALUE a='' b='' c=''/>", {.attributes = 2}));
    // References go into keys and keys into references, without end.
    const std::string nested = "<INSTANCENAME CLASSNAME='A'><VALUE.REFERENCE>";
    EXPECT_EQ(Xml_Fault::TOO_LARGE, fault_of(repeated(nested, 10000)));
    EXPECT_EQ(Xml_Fault::TOO_LARGE, fault_of("<!--" + std::string(std::size_t(5) << 20, 'x')));
}

TEST(Xml_Reader, TakesAFewTimesTheSizeOfTheText)
{
    const std::string text = "<VALUE.ARRAY>" + repeated("<VALUE/>", 100000) + "</VALUE.ARRAY>";
    Xml_Reader reader;
    ASSERT_TRUE(reader.feed(text) && reader.finish());
    EXPECT_LT(reader.document().size(), 4 * text.size());
}

TEST(Xml_Reader, HandsObjectsOnAndForgetsThem)
{
    std::vector<std::string> classes;
    Xml_Reader reader({.bytes = 4096}, [&](Xml_Node node) {
        ASSERT_TRUE(node.is(Xml_Tag::INSTANCE));
        classes.emplace_back(node.attribute(Xml_Attribute::CLASSNAME));
        EXPECT_EQ("text", node.first().first().text());
    });
    ASSERT_TRUE(reader.feed("<IMETHODRESPONSE NAME='X'><IRETURNVALUE>"));
    for (int i = 0; i < 1000; ++i)
        ASSERT_TRUE(
            reader.feed("<INSTANCE CLASSNAME='C" + std::to_string(i) +
                        "'><PROPERTY NAME='a' TYPE='string'><VALUE>text</VALUE></PROPERTY></INSTANCE>"))
            << reader.fault_text();
    ASSERT_TRUE(reader.feed("</IRETURNVALUE><PARAMVALUE NAME='EndOfSequence'/></IMETHODRESPONSE>"));
    ASSERT_TRUE(reader.finish());
    ASSERT_EQ(1000U, classes.size());
    EXPECT_EQ("C999", classes.back());
    const Xml_Node root = reader.document().root();
    EXPECT_FALSE(root.first().first());
    EXPECT_EQ("EndOfSequence", root.child(Xml_Tag::PARAMVALUE).attribute(Xml_Attribute::NAME));
}

TEST(Xml_Reader, LetsItsReceiverThrow)
{
    Xml_Reader reader({}, [](Xml_Node) { throw std::runtime_error("enough"); });
    EXPECT_THROW(reader.feed("<IMETHODRESPONSE><IRETURNVALUE><VALUE/></IRETURNVALUE>"), std::runtime_error);
}

} // namespace KPRV::kldrcim
