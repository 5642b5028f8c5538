#include "kldrcim/formats/Utf8_Text.h"

#include <gtest/gtest.h>

namespace KPRV::kldrcim {
namespace {

#define NO_CHARACTER "\xEF\xBF\xBD"

TEST(Utf8_Text, CharactersStay)
{
    for (const char* text : {"", "plain", "\xC3\xA9", "\xE2\x82\xAC", "\xF0\x9F\x92\xBE", "\x7F",
                             "\xED\x9F\xBF", "\xEE\x80\x80", "\xF4\x8F\xBF\xBF"})
        EXPECT_EQ(text, utf8_text(text));
    EXPECT_EQ(std::string(1, '\0'), utf8_text(std::string(1, '\0')));
}

TEST(Utf8_Text, EachByteOfNoCharacterIsReplaced)
{
    const std::pair<const char*, const char*> texts[] = {
        {"a\xFFz", "a" NO_CHARACTER "z"},
        {"\x80", NO_CHARACTER},
        {"\xC3", NO_CHARACTER},
        {"\xC3z", NO_CHARACTER "z"},
        // Longer than needed, half of a pair, beyond the last.
        {"\xC0\x80", NO_CHARACTER NO_CHARACTER},
        {"\xED\xA0\x80", NO_CHARACTER NO_CHARACTER NO_CHARACTER},
        {"\xF4\x90\x80\x80", NO_CHARACTER NO_CHARACTER NO_CHARACTER NO_CHARACTER},
        {"\xE2\x82", NO_CHARACTER NO_CHARACTER},
    };
    for (const auto& [text, expected] : texts)
        EXPECT_EQ(expected, utf8_text(text));
}

} // namespace
} // namespace KPRV::kldrcim
