#include "module/runtime/text/number_text.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <limits>
#include <locale>
#include <random>
#include <regex>
#include <string>

namespace KPRV {

namespace {

/// One width: its parser, its formatter, and a value that no parser leaves behind by chance.
template <class T>
struct Width
{
    using type = T;
    const char* name;
    int (*parse)(const char*, T&);
    const char* (*format)(char*, T, size_t&);
};

/// Calls the body with each of the eight.
template <class Body>
void each_width(Body&& body)
{
    // clang-format off
    body(Width<uint8> {"uint8",  str_to_uint8,  uint8_to_str});
    body(Width<uint16>{"uint16", str_to_uint16, uint16_to_str});
    body(Width<uint32>{"uint32", str_to_uint32, uint32_to_str});
    body(Width<uint64>{"uint64", str_to_uint64, uint64_to_str});
    body(Width<sint8> {"sint8",  str_to_sint8,  sint8_to_str});
    body(Width<sint16>{"sint16", str_to_sint16, sint16_to_str});
    body(Width<sint32>{"sint32", str_to_sint32, sint32_to_str});
    body(Width<sint64>{"sint64", str_to_sint64, sint64_to_str});
    // clang-format on
}

template <class T>
std::string formatted(const char* (*format)(char*, T, size_t&), T value)
{
    char buffer[NUMBER_TEXT_SIZE];
    size_t size = 99;
    const char* text = format(buffer, value, size);
    EXPECT_EQ(size, strlen(text));
    return text;
}

/// The value, or what was there before.
constexpr uint64 BEFORE = 4711;
uint64 u64(const char* text, int expected = 0)
{
    uint64 value = BEFORE;
    EXPECT_EQ(expected, str_to_uint64(text, value)) << text;
    return value;
}
uint64 refused(const char* text)
{
    return u64(text, -1);
}

/// Values at the edges of every width and, from a fixed seed, of every length between.
template <class T>
std::vector<T> samples()
{
    std::vector<T> result = {T(0),
                             T(1),
                             T(9),
                             T(10),
                             T(99),
                             T(100),
                             T(127),
                             T(128),
                             T(255),
                             T(-1),
                             T(-9),
                             T(-10),
                             T(-127),
                             T(-128),
                             std::numeric_limits<T>::min(),
                             std::numeric_limits<T>::max(),
                             T(std::numeric_limits<T>::min() + 1),
                             T(std::numeric_limits<T>::max() - 1)};
    std::mt19937_64 random(7);
    for (int i = 0; i < 2000; i++)
        result.push_back(static_cast<T>(random() >> (random() % 64)));
    return result;
}

} // namespace

TEST(number_text, BooleansInAnyCase)
{
    boolean value = false;
    for (const char* text : {"true", "TRUE", "tRuE"}) {
        value = false;
        EXPECT_EQ(0, str_to_boolean(text, value));
        EXPECT_TRUE(value);
    }
    for (const char* text : {"false", "FALSE", "False"}) {
        value = true;
        EXPECT_EQ(0, str_to_boolean(text, value));
        EXPECT_FALSE(value);
    }
    value = true;
    for (const char* text : {"", "t", "tru", "truee", " true", "true ", "1", "0", "yes"})
        EXPECT_EQ(-1, str_to_boolean(text, value)) << text;
    EXPECT_TRUE(value);
}

TEST(number_text, DecimalFigures)
{
    EXPECT_EQ(0u, u64("0"));
    EXPECT_EQ(7u, u64("7"));
    EXPECT_EQ(9999u, u64("9999"));
    EXPECT_EQ(12u, u64("00012"));
    EXPECT_EQ(0u, u64("0000"));
    EXPECT_EQ(12345u, u64("12345"));
    EXPECT_EQ(~uint64(0), u64("18446744073709551615"));
    EXPECT_EQ(1u, u64("00000000000000000001"));
}

TEST(number_text, DecimalFiguresBeyond64BitsWrap)
{
    EXPECT_EQ(0u, u64("18446744073709551616"));
    EXPECT_EQ(41u, u64("18446744073709551657"));
    EXPECT_EQ(uint64(7766279631452241919), u64("99999999999999999999"));
    // The narrower types see what is left.
    uint8 narrow = 0;
    EXPECT_EQ(0, str_to_uint8("18446744073709551657", narrow));
    EXPECT_EQ(41, narrow);
}

TEST(number_text, WhatIsNoDecimalFigure)
{
    for (const char* text :
         {"", "000000000000000000001", "123456789012345678901", "1234x", "12345x", "12345 ",
          "99999999999999999999x", " 1", "1 ", "-1", "+1", "1.0", "1e3", "12a", "a", "\xB2"})
        EXPECT_EQ(BEFORE, refused(text)) << text;
}

TEST(number_text, HexadecimalFigures)
{
    EXPECT_EQ(31u, u64("0x1F"));
    EXPECT_EQ(31u, u64("0X1F"));
    EXPECT_EQ(0u, u64("0x0"));
    EXPECT_EQ(0xABCDEFu, u64("0xABCDEF"));
    EXPECT_EQ(~uint64(0), u64("0xFFFFFFFFFFFFFFFF"));
    EXPECT_EQ(uint64(0x0123456789ABCDEF), u64("0x0123456789ABCDEF"));
    EXPECT_EQ(1u, u64("0x0000000000000001"));
}

TEST(number_text, WhatIsNoHexadecimalFigure)
{
    // Letters come in upper case only, and the "x" in second place.
    for (const char* text : {"0x1f", "0xa", "0x", "0X", "x1", "00x1", "1x1", "0x1G", "0x 1", "0x-1", "0x1 ",
                             "0x00000000000000001", "0xFFFFFFFFFFFFFFFFF", "0x:", "0x@", "0x/"})
        EXPECT_EQ(BEFORE, refused(text)) << text;
    // Behind four digits it is too late.
    EXPECT_EQ(BEFORE, refused("0000x1"));
}

TEST(number_text, SignedFigures)
{
    sint8 value = 0;
    EXPECT_EQ(0, str_to_sint8("-128", value));
    EXPECT_EQ(-128, value);
    EXPECT_EQ(0, str_to_sint8("+127", value));
    EXPECT_EQ(127, value);
    for (const char* text : {"128", "-129", "+128", "", "-", "+", "--1", "+-1", "- 1", "-0x81", "0x80"})
        EXPECT_EQ(-1, str_to_sint8(text, value)) << text;
    EXPECT_EQ(127, value);
    EXPECT_EQ(0, str_to_sint8("-0", value));
    EXPECT_EQ(0, value);
    EXPECT_EQ(0, str_to_sint8("-0x80", value));
    EXPECT_EQ(-128, value);
    EXPECT_EQ(0, str_to_sint8("+0x7F", value));
    EXPECT_EQ(127, value);
    sint64 wide = 0;
    EXPECT_EQ(0, str_to_sint64("-9223372036854775808", wide));
    EXPECT_EQ(std::numeric_limits<sint64>::min(), wide);
    EXPECT_EQ(-1, str_to_sint64("9223372036854775808", wide));
    EXPECT_EQ(-1, str_to_sint64("-9223372036854775809", wide));
    EXPECT_EQ(std::numeric_limits<sint64>::min(), wide);
}

TEST(number_text, EveryWidthEndsWhereItsTypeDoes)
{
    each_width([](auto width) {
        SCOPED_TRACE(width.name);
        using T = typename decltype(width)::type;
        using Limits = std::numeric_limits<T>;
        T value = 5;
        EXPECT_EQ(0, width.parse(std::to_string(Limits::max()).c_str(), value));
        EXPECT_EQ(Limits::max(), value);
        if constexpr (sizeof(T) < 8) {
            EXPECT_EQ(-1, width.parse(std::to_string(sint64(Limits::max()) + 1).c_str(), value));
            EXPECT_EQ(-1, width.parse(std::to_string(sint64(Limits::min()) - 1).c_str(), value));
            EXPECT_EQ(Limits::max(), value);
        }
        EXPECT_EQ(0, width.parse(std::to_string(Limits::min()).c_str(), value));
        EXPECT_EQ(Limits::min(), value);
    });
}

TEST(number_text, FiguresAreWrittenAsTheyAre)
{
    EXPECT_EQ("0", formatted(uint64_to_str, uint64(0)));
    EXPECT_EQ("127", formatted(uint8_to_str, uint8(127)));
    EXPECT_EQ("128", formatted(uint8_to_str, uint8(128)));
    EXPECT_EQ("18446744073709551615", formatted(uint64_to_str, ~uint64(0)));
    EXPECT_EQ("-9223372036854775808", formatted(sint64_to_str, std::numeric_limits<sint64>::min()));
    EXPECT_EQ("-1", formatted(sint8_to_str, sint8(-1)));
}

TEST(number_text, SmallNumbersNeedNoWriting)
{
    for (int x = 0; x <= 200; x++) {
        char buffer[NUMBER_TEXT_SIZE];
        memset(buffer, '#', sizeof buffer);
        size_t size = 0;
        const char* text = sint16_to_str(buffer, static_cast<sint16>(x), size);
        EXPECT_EQ(std::to_string(x), text);
        const bool in_buffer = text >= buffer && text < buffer + sizeof buffer;
        EXPECT_EQ(x >= 128, in_buffer) << x;
        EXPECT_EQ(x >= 128 ? 22 - int(size) - 1 : 22, std::count(buffer, buffer + sizeof buffer, '#')) << x;
        char other[NUMBER_TEXT_SIZE];
        size_t again;
        EXPECT_EQ(x < 128, uint64_to_str(other, static_cast<uint64>(x), again) == text) << x;
    }
}

TEST(number_text, EveryValueOfEveryWidthReadsBack)
{
    each_width([](auto width) {
        SCOPED_TRACE(width.name);
        using T = typename decltype(width)::type;
        for (const T value : samples<T>()) {
            const std::string text = formatted(width.format, value);
            EXPECT_EQ(std::to_string(value), text);
            T back = static_cast<T>(~value);
            EXPECT_EQ(0, width.parse(text.c_str(), back)) << text;
            EXPECT_EQ(value, back) << text;
        }
    });
}

// Texts that are nearly figures, judged by a grammar of their own.
TEST(number_text, RandomTextsAreJudgedByTheGrammar)
{
    const std::regex unsigned_figure("[0-9]{1,20}|0[xX][0-9A-F]{1,16}");
    const std::regex signed_figure("[+-]?([0-9]{1,20}|0[xX][0-9A-F]{1,16})");
    const std::regex real("[+-]?[0-9]*\\.[0-9]+([eE][+-]?[0-9]+)?");
    const std::string alphabets[] = {"0123456789", "0xX1F9Aa", "+-01x.", "0123456789.eE+-", "trueFALSE 0"};
    std::mt19937 random(11);
    size_t good = 0;
    for (int i = 0; i < 60000; i++) {
        const std::string& alphabet = alphabets[random() % std::size(alphabets)];
        std::string text;
        for (size_t n = random() % 24; n > 0; n--)
            text += alphabet[random() % alphabet.size()];
        if (random() % 4 == 0)
            text.insert(0, "0x");
        uint64 u;
        EXPECT_EQ(std::regex_match(text, unsigned_figure) ? 0 : -1, str_to_uint64(text.c_str(), u)) << text;
        sint64 s;
        const bool is_signed = std::regex_match(text, signed_figure);
        const int status = str_to_sint64(text.c_str(), s);
        // Longer ones may lie beyond 63 bits.
        if (!is_signed || text.size() < 17) {
            EXPECT_EQ(is_signed ? 0 : -1, status) << text;
        }
        real64 r;
        const bool is_real = std::regex_match(text, real);
        EXPECT_EQ(is_real, _parse_real(text.c_str()) != nullptr) << text;
        EXPECT_EQ(is_real ? 0 : -1, str_to_real64(text.c_str(), r)) << text;
        good += is_real + is_signed;
    }
    EXPECT_GT(good, 5000u);
}

TEST(number_text, Reals)
{
    const std::pair<const char*, real64> figures[] = {
        {"1.0", 1},      {".5", .5},       {"-.5", -.5},     {"+1.25", 1.25}, {"007.250", 7.25},
        {"1.0e3", 1000}, {"1.0E+3", 1000}, {"25.0e-1", 2.5}, {"-0.0", -0.0},  {"1.5e0", 1.5},
    };
    for (const auto& [text, expected] : figures) {
        real64 value = 99;
        EXPECT_EQ(0, str_to_real64(text, value)) << text;
        EXPECT_EQ(expected, value) << text;
        real32 narrow = 99;
        EXPECT_EQ(0, str_to_real32(text, narrow)) << text;
        EXPECT_EQ(static_cast<real32>(expected), narrow) << text;
    }
    real64 value = 99;
    real32 narrow = 99;
    for (const char* text :
         {"",     "1",    "1e5",   "1.",  ".",   "-",   "+.",      "1.e5", "1.0e",  "1.0e+",  "1.0e5x",
          "1.0 ", " 1.0", "1.0.0", "1,5", "inf", "nan", "0x1.8p1", "1.0f", "--1.0", "1.0e1.0"}) {
        EXPECT_EQ(-1, str_to_real64(text, value)) << text;
        EXPECT_EQ(-1, str_to_real32(text, narrow)) << text;
    }
    EXPECT_EQ(99, value);
    EXPECT_EQ(99, narrow);
}

TEST(number_text, RealsBeyondTheirRange)
{
    real64 value = 0;
    EXPECT_EQ(0, str_to_real64("1.0e999", value));
    EXPECT_TRUE(std::isinf(value));
    EXPECT_EQ(0, str_to_real64("1.0e-999", value));
    EXPECT_EQ(0, value);
    real32 narrow = 0;
    EXPECT_EQ(0, str_to_real32("-1.0e99", narrow));
    EXPECT_TRUE(std::isinf(narrow));
}

// The server's locale is the server's business.
TEST(number_text, RealsHaveAPointInEveryLocale)
{
    const std::string before = setlocale(LC_NUMERIC, nullptr);
    const bool comma = setlocale(LC_NUMERIC, "de_DE.UTF-8") || setlocale(LC_NUMERIC, "fr_FR.UTF-8");
    real64 value = 0;
    EXPECT_EQ(0, str_to_real64("1.5", value));
    EXPECT_EQ(1.5, value);
    setlocale(LC_NUMERIC, before.c_str());
    if (!comma)
        GTEST_SKIP() << "this host has no locale with a decimal comma";
}

TEST(number_text, Tokens)
{
    const auto tokens = [](const char* text, const char* delimiters) {
        std::vector<std::string> result;
        const char *start, *end = text;
        while (find_token(end, delimiters, start, end) == 0)
            result.emplace_back(start, end);
        return result;
    };
    using Tokens = std::vector<std::string>;
    EXPECT_EQ((Tokens{"a", "bc", "d"}), tokens("  a bc\td ", " \t"));
    EXPECT_EQ((Tokens{"a,b"}), tokens("a,b", " "));
    EXPECT_EQ((Tokens{"abc"}), tokens("abc", ""));
    EXPECT_EQ(Tokens(), tokens("", " "));
    EXPECT_EQ(Tokens(), tokens(" ,, ", " ,"));
    const char *start = nullptr, *end = nullptr;
    EXPECT_EQ(-1, find_token("  ", " ", start, end));
    EXPECT_EQ(nullptr, start);
    EXPECT_EQ(nullptr, end);
}

} // namespace KPRV
