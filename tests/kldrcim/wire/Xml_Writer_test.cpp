#include "kldrcim/wire/Xml_Writer.h"

#include "kldrcim/wire/Xml_Reader.h"

#include <gtest/gtest.h>

namespace KPRV::kldrcim {

namespace {

std::string written(std::string_view text)
{
    std::string out;
    Xml_Writer(out).open(Xml_Tag::VALUE).text(text).close(Xml_Tag::VALUE);
    return out.substr(7, out.size() - 15);
}

std::string written_attribute(std::string_view text)
{
    std::string out;
    Xml_Writer(out).open(Xml_Tag::ERROR).attribute(Xml_Attribute::CODE, text).empty();
    return out.substr(13, out.size() - 16);
}

} // namespace

TEST(Xml_Writer, ClosesEachElementByATagOfItsOwn)
{
    std::string out = "before ";
    Xml_Writer writer(out);
    writer.open(Xml_Tag::INSTANCE).attribute(Xml_Attribute::CLASSNAME, "A\"B");
    writer.open(Xml_Tag::PROPERTY).close(Xml_Tag::PROPERTY);
    writer.open(Xml_Tag::VALUE_NULL).empty().close(Xml_Tag::INSTANCE);
    EXPECT_EQ("before <INSTANCE CLASSNAME=\"A&quot;B\"><PROPERTY></PROPERTY><VALUE.NULL/></INSTANCE>", out);
}

TEST(Xml_Writer, EscapesWhatHasAForm)
{
    EXPECT_EQ("a&lt;b&gt;&amp;\"'\n\t&#13;", written("a<b>&\"'\n\t\r"));
    EXPECT_EQ("a&lt;b&gt;&amp;&quot;'   ", written_attribute("a<b>&\"'\n\t\r"));
}

TEST(Xml_Writer, ReplacesWhatHasNone)
{
    const std::string r = "\xEF\xBF\xBD";
    EXPECT_EQ("a" + r + "b", written(std::string_view("a\0b", 3)));
    EXPECT_EQ(r + r, written("\x01\x1F"));
    EXPECT_EQ("\x7F", written("\x7F"));
    EXPECT_EQ("\xC3\xA4\xE2\x82\xAC\xF0\x9F\x98\x80", written("\xC3\xA4\xE2\x82\xAC\xF0\x9F\x98\x80"));
    EXPECT_EQ(r + "x", written("\xC3x")) << "cut short";
    EXPECT_EQ(r, written("\xC3")) << "at the end";
    EXPECT_EQ(r + r, written("\xC0\x80")) << "longer than needed";
    EXPECT_EQ(r + r + r, written("\xED\xA0\x80")) << "half of a pair";
    EXPECT_EQ(r + r + r, written("\xEF\xBF\xBF"));
    EXPECT_EQ(r + r + r + r, written("\xF4\x90\x80\x80")) << "beyond the last";
    EXPECT_EQ(r + r, written("\x80\xFF"));
    EXPECT_EQ(r, written_attribute("\x02"));
}

TEST(Xml_Writer, WritesWhatTheReaderReads)
{
    std::string all;
    for (int c = 1; c < 256; ++c)
        all += static_cast<char>(c);
    std::string out;
    Xml_Writer(out).open(Xml_Tag::VALUE).text(all + "\r\n]]>").close(Xml_Tag::VALUE);
    Xml_Reader reader;
    ASSERT_TRUE(reader.feed(out) && reader.finish()) << reader.fault_text();
    EXPECT_TRUE(reader.document().root().text().ends_with("\r\n]]>"));
}

} // namespace KPRV::kldrcim
