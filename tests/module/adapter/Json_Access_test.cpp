#include "module/adapter/Json_Access.h"

#include "tests/support/Fake_Library.h"

#include <gtest/gtest.h>

using namespace KPRV;

namespace {

template <class Conversion>
std::string failure(Conversion conversion, const char* text)
{
    try {
        conversion(json(text));
        return "";
    } catch (const std::runtime_error& error) {
        return error.what();
    }
}

} // namespace

TEST(Json_Access, NullCountsAsArrayAndObject)
{
    EXPECT_TRUE(isArrayOrNull(json("null")));
    EXPECT_TRUE(isArrayOrNull(json("[]")));
    EXPECT_FALSE(isArrayOrNull(json("{}")));
    EXPECT_FALSE(isArrayOrNull(json("5")));
    EXPECT_TRUE(isObjectOrNull(json("null")));
    EXPECT_TRUE(isObjectOrNull(json("{}")));
    EXPECT_FALSE(isObjectOrNull(json("[]")));
    EXPECT_FALSE(isObjectOrNull(json("'x'")));
}

TEST(Json_Access, NullConvertsToNothing)
{
    EXPECT_EQ(asString(json("null")), "");
    EXPECT_EQ(asInt(json("null")), 0);
    EXPECT_EQ(asUInt(json("null")), 0u);
    EXPECT_FALSE(asBool(json("null")));
}

TEST(Json_Access, TextsAreTextsAndNumbersAreNumbers)
{
    EXPECT_EQ(asString(json("'gr\\u00fcn'")), "gr\xC3\xBCn");
    EXPECT_EQ(asString(json("true")), "true");
    EXPECT_EQ(asInt(json("-7")), -7);
    EXPECT_EQ(asInt(json("7.9")), 7);
    EXPECT_EQ(asInt(json("true")), 1);
    EXPECT_EQ(asInt(Json::Value(7u)), 7);
    EXPECT_EQ(asUInt(json("4294967295")), 4294967295u);
    EXPECT_EQ(asUInt(json("1.5")), 1u);

    for (const char* text : {"5", "1.5", "[]", "{}"})
        EXPECT_EQ(failure(asString, text), "Type is not convertible to string") << text;
    for (const char* text : {"'5'", "[]", "{}", "2147483648", "-2147483649", "1e300", "18446744073709551615"})
        EXPECT_EQ(failure(asInt, text), "Type is not convertible to int") << text;
    for (const char* text : {"'5'", "[]", "{}", "-1", "4294967296", "-1.5"})
        EXPECT_EQ(failure(asUInt, text), "Type is not convertible to uint") << text;
}

TEST(Json_Access, NumbersReachToTheLimitsOfTheirTypes)
{
    // Each as an integer and as a real number.
    for (const char* end : {"", ".0"}) {
        const auto number = [end](const char* digits) { return json(std::string(digits) + end); };
        EXPECT_EQ(asInt(number("2147483647")), 2147483647);
        EXPECT_EQ(asInt(number("-2147483648")), -2147483647 - 1);
        EXPECT_EQ(asUInt(number("4294967295")), 4294967295u);
        EXPECT_EQ(asUInt(number("0")), 0u);
        EXPECT_THROW(asInt(number("2147483648")), Not_Convertible);
        EXPECT_THROW(asInt(number("-2147483649")), Not_Convertible);
        EXPECT_THROW(asUInt(number("4294967296")), Not_Convertible);
        EXPECT_THROW(asUInt(number("-1")), Not_Convertible);
    }
    EXPECT_EQ(asInt(Json::Value(2147483647u)), 2147483647);
    EXPECT_THROW(asInt(Json::Value(2147483648u)), Not_Convertible);
}

TEST(Json_Access, EverythingIsTrueOrFalse)
{
    for (const char* text : {"true", "1", "-1", "0.5", "'x'", "[0]", "{'a': 0}"})
        EXPECT_TRUE(asBool(json(text))) << text;
    EXPECT_TRUE(asBool(Json::Value(1u)));
    for (const char* text : {"false", "0", "0.0", "''", "[]", "{}"})
        EXPECT_FALSE(asBool(json(text))) << text;
}

TEST(Json_Access, ReadingAddsNothingAndNeverThrows)
{
    const Json::Value object = json("{'a': 1, 'n': null}");
    EXPECT_TRUE(hasMember(object, "n"));
    EXPECT_FALSE(hasMember(object, "b"));
    EXPECT_EQ(asInt(member(object, "a")), 1);
    EXPECT_TRUE(member(object, "b").isNull());
    EXPECT_EQ(object.size(), 2u);
    for (const char* text : {"null", "[1]", "5", "'x'"}) {
        EXPECT_FALSE(hasMember(json(text), "a")) << text;
        EXPECT_TRUE(member(json(text), "a").isNull()) << text;
    }
    EXPECT_EQ(asInt(element(json("[3, 4]"), 1)), 4);
    EXPECT_TRUE(element(json("[3, 4]"), 2).isNull());
    EXPECT_TRUE(element(json("{}"), 0).isNull());
}

TEST(Json_Access, MembersInOnePass)
{
    const Members<4>::Names names = {"B", "a", "aa", "c"};
    const Json::Value object = json("{'c': 3, 'B': 'x', 'aa': null, 'ab': 4, 'A': 5}");
    const Members<4> members(object, names);
    EXPECT_EQ(asView(members[0]), "x");
    EXPECT_FALSE(members.has(1));
    EXPECT_TRUE(members[1].isNull());
    EXPECT_TRUE(members.has(2));
    EXPECT_TRUE(members[2].isNull());
    EXPECT_EQ(asInt(members[3]), 3);
    for (const char* text : {"null", "[1]", "5", "{}"}) {
        const Json::Value other = json(text);
        const Members<4> none(other, names);
        for (size_t i = 0; i < names.size(); i++)
            EXPECT_FALSE(none.has(i)) << text;
    }
}

/// One that is asked for is found behind others of its size that differ in any place.
TEST(Json_Access, MembersAreToldFromThoseOfTheirSize)
{
    for (const size_t size : {1, 3, 4, 7, 8, 9, 16, 17, 40}) {
        const std::string name(size, 'n');
        Json::Value object;
        for (size_t i = 0; i < size; i++) {
            for (const char other : {'a', 'z'}) {
                std::string neighbour = name;
                neighbour[i] = other;
                object[neighbour] = false;
            }
        }
        const Members<1>::Names names = {name};
        EXPECT_FALSE(Members<1>(object, names).has(0)) << size;
        object[name] = true;
        EXPECT_TRUE(asBool(Members<1>(object, names)[0])) << size;
    }
}

TEST(Json_Access, TextsWhereTheyStand)
{
    EXPECT_EQ(asView(json("''")), "");
    EXPECT_EQ(asView(json("null")), "");
    EXPECT_EQ(asView(json("true")), "true");
    EXPECT_THROW(asView(json("5")), Not_Convertible);
    for (const char* text : {"''", "'x'", "null", "true"})
        EXPECT_NO_THROW(expectText(json(text))) << text;
    for (const char* text : {"5", "-5", "0.5", "[]", "{}"})
        EXPECT_THROW(expectText(json(text)), Not_Convertible) << text;
    const auto taken = [](Json::Value value) {
        Json::Value to("former");
        take_text(value, to);
        return to;
    };
    EXPECT_EQ(taken(json("'x'")), Json::Value("x"));
    EXPECT_EQ(taken(json("null")), Json::Value(""));
    EXPECT_EQ(taken(json("true")), Json::Value("true"));
    EXPECT_THROW(taken(json("[]")), Not_Convertible);
}

TEST(Json_Access, AnAnswerIsBadIfItIsNullOrHasAnError)
{
    static constexpr Members<2>::Names NAMES = {"error", "list"};
    EXPECT_TRUE(Answer_Members<NAMES>(json("{'list': 1}")).is_valid());
    EXPECT_TRUE(Answer_Members<NAMES>(json("[]")).is_valid());
    EXPECT_FALSE(Answer_Members<NAMES>(json("null")).is_valid());
    EXPECT_FALSE(Answer_Members<NAMES>(json("{'error': null, 'list': 1}")).is_valid());
}

TEST(Json_Access, AWalkOverAnArrayCountsItsHoles)
{
    Json::Value array;
    array[1] = "one";
    array[3] = "three";
    ASSERT_EQ(array.size(), 4u);
    Element_Walk walk(array);
    for (const char* expected : {"", "one", "", "three", "", ""})
        EXPECT_EQ(asView(walk.next()), expected);
    EXPECT_EQ(std::distance(array.begin(), array.end()), 2) << "a hole was filled";

    Json::Value none;
    EXPECT_TRUE(Element_Walk(none).next().isNull());
}
