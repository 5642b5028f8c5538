#include "module/adapter/ProviderUtil.h"

#include "module/adapter/No_Address.h"

#include "tests/support/Log_Capture.h"

#include <gtest/gtest.h>

#include <stdexcept>

using namespace KPRV;

namespace {

std::string index_form(const char* address)
{
    return ProviderUtil::getIndexInColonFormat(address).c_str();
}

std::string from_tag(const char* tag)
{
    return ProviderUtil::getNodeMACOrWWNFromTag(tag, "ignored").c_str();
}

std::string trim(const char* text)
{
    std::string out(strlen(text) + 1, '#');
    ProviderUtil::trimString(text, out.data());
    return out.c_str();
}

} // namespace

TEST(ProviderUtil_Addresses, FlatFormHasNoColons)
{
    EXPECT_TRUE(ProviderUtil::eraseColonsFromIndex("10:00:8C:7C:FF:00:00:01") == "10008C7CFF000001");
    EXPECT_TRUE(ProviderUtil::eraseColonsFromIndex("::a:") == "a");
    EXPECT_TRUE(ProviderUtil::eraseColonsFromIndex("abc") == "abc");
    EXPECT_TRUE(ProviderUtil::eraseColonsFromIndex("") == "");
}

TEST(ProviderUtil_Addresses, IndexFormHasAColonAfterEachPair)
{
    EXPECT_EQ(index_form("AABBCC"), "AA:BB:CC");
    EXPECT_EQ(index_form("AABB"), "AA:BB");
    EXPECT_EQ(index_form("8c7cff000001"), "8c:7c:ff:00:00:01");
    EXPECT_EQ(index_form("10008c7cff000001"), "10:00:8c:7c:ff:00:00:01");
    EXPECT_EQ(index_form("AABBC"), "AA:BB:C");
    EXPECT_EQ(index_form("AA"), "AA");
    EXPECT_EQ(index_form("AAB"), "AAB");
    EXPECT_THROW(index_form("A"), No_Address);
    EXPECT_THROW(index_form(""), std::out_of_range);
}

TEST(ProviderUtil_Addresses, IndexFormStays)
{
    Log_Capture log;
    EXPECT_EQ(index_form("AA:BBCC"), "AA:BBCC");
    EXPECT_EQ(index_form(":"), ":");
    EXPECT_EQ(log.said(), (Lines{"INFO The string AA:BBCC is already in : format",
                                 "INFO The string : is already in : format"}));
    EXPECT_EQ(log.lines()[0].file, "ProviderUtil.cpp");
}

TEST(ProviderUtil_Addresses, RawForms)
{
    using Mac = std::array<unsigned char, 6>;
    Mac mac;
    ProviderUtil::getRawMacFromStr("8C7cFF000a01", mac.data());
    EXPECT_EQ(mac, (Mac{0x8C, 0x7C, 0xFF, 0, 0x0A, 1}));
    ProviderUtil::getRawMacFromStr("8C7zFF", mac.data());
    EXPECT_EQ(mac, (Mac{0x8C, 7, 0, 0, 0, 0}));
    ProviderUtil::getRawMacFromStr("", mac.data());
    EXPECT_EQ(mac, Mac{});

    // Nothing behind it is touched.
    std::array<unsigned char, 7> longer;
    longer.fill(0xEE);
    ProviderUtil::getRawMacFromStr("8C7cFF000a01", longer.data());
    EXPECT_EQ(longer[6], 0xEE);

    using Wwn = std::array<unsigned char, 8>;
    Wwn wwn;
    ProviderUtil::getRawWWNFromStr("10008C7CFF000aFE", wwn.data());
    EXPECT_EQ(wwn, (Wwn{0x10, 0, 0x8C, 0x7C, 0xFF, 0, 0x0A, 0xFE}));
    ProviderUtil::getRawWWNFromStr("1000", wwn.data());
    EXPECT_EQ(wwn, (Wwn{0x10}));
}

TEST(ProviderUtil_Addresses, ATagGivesTheAddressBack)
{
    EXPECT_EQ(from_tag("10000000-0000-0000-0000-8c7cff000001"), "8c7cff000001");
    EXPECT_EQ(from_tag("10000000-0000-0000-1000-8c7cff000001"), "10008c7cff000001");
    EXPECT_EQ(from_tag("10000000-0000-0000-1000-"), "1000");
    EXPECT_EQ(from_tag("short"), "");
    EXPECT_EQ(from_tag(""), "");
}

TEST(ProviderUtil_Addresses, TrimmingTakesBlanksAlone)
{
    EXPECT_EQ(trim("  a b  "), "a b");
    EXPECT_EQ(trim("\ta "), "\ta");
    EXPECT_EQ(trim("   "), "");
    EXPECT_EQ(trim(""), "");
    char in_place[] = "  ab ";
    ProviderUtil::trimString(in_place, in_place);
    EXPECT_STREQ(in_place, "ab");
}

TEST(ProviderUtil_Addresses, TheFirstByteDecidesOnUtf8)
{
    for (const char* good : {"", "a", "\x7F", "\xC2", "\xF4\xFF"})
        EXPECT_TRUE(ProviderUtil::valid_UTF_string(good)) << good;
    for (const char* bad : {"\x80", "\xC1", "\xF5", "\xFFok"})
        EXPECT_FALSE(ProviderUtil::valid_UTF_string(bad)) << bad;
}
