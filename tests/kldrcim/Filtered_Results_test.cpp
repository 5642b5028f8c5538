// --where, --sort, --count and JSON Lines, over the toy's values of every type.
#include "tests/kldrcim/Run_Kldrcim.h"

#include <gtest/gtest.h>
#include <json/json.h>

#include <algorithm>
#include <sstream>

namespace KPRV::kldrcim {
namespace {

const char* const first_item = "root/toy:TOY_Item.Id=1,Name=\"one\"\n";
const char* const second_item = "root/toy:TOY_Item.Id=2,Name=\"two \\\"quoted\\\" \\\\\"\n";

Outcome with_many(const std::string& arguments, unsigned count)
{
    return kldrcim(arguments, TOY_DESCRIBED, ("TOY_MANY=" + std::to_string(count)).c_str());
}

/// How many of the two items a condition leaves.
std::string left_by(const std::string& condition)
{
    const Outcome run = kldrcim("ei TOY_Item --count --where '" + condition + "'");
    EXPECT_EQ(0, run.status) << condition;
    EXPECT_EQ("", run.error) << condition;
    return run.out;
}

TEST(Filtered_Results, AValueIsEqualByItsType)
{
    for (const char* condition : {"Flag=true",
                                  "flag=TRUE",
                                  "U8=200",
                                  "U8=0xc8",
                                  "U64=18000000000000000000",
                                  "U64=0xf9ccd8a1c5080000",
                                  "S8=-100",
                                  "S64=-9000000000000000000",
                                  "R32=1.5",
                                  "R64=-0.25",
                                  "R64=-2.5e-1",
                                  "C16=120",
                                  "When=20260102030405.000006+060",
                                  "Numbers=2",
                                  "Texts~line*break",
                                  "Nothing=",
                                  "Nothing=NULL",
                                  "Nothing!=x",
                                  "Empty=",
                                  "Name!=",
                                  "U8!=201",
                                  "Numbers!=3",
                                  "U8~20?",
                                  "R32~1.*",
                                  "Nothing~"})
        EXPECT_EQ("2\n", left_by(condition)) << condition;
    for (const char* condition :
         {"Flag=false", "U8=201", "U64=0", "S8=100", "R32=1.25", "Numbers=3", "Numbers!=2", "Nothing=x",
          "Name=", "U8!=200", "U8~2", "Nothing!=", "Texts=line"})
        EXPECT_EQ("0\n", left_by(condition)) << condition;
    EXPECT_EQ("1\n", left_by("Id=2"));
    EXPECT_EQ("1\n", left_by("Name=one"));
    EXPECT_EQ("0\n", left_by("Name=ONE"));
    EXPECT_EQ("1\n", left_by("Name~ON?"));
    EXPECT_EQ("1\n", left_by("Name=two \"quoted\" \\"));
    // A reference by the object that it names, whatever the order of its keys.
    EXPECT_EQ("1\n", left_by("Other=TOY_Item.Name=\"one\",Id=1"));
    EXPECT_EQ("1\n", left_by("Other~*TOY_Item.Id=2*"));
}

TEST(Filtered_Results, AllConditionsMustHold)
{
    EXPECT_EQ(first_item, kldrcim("ein TOY_Item --where Id=1 --where Name~o*").out);
    EXPECT_EQ("", kldrcim("ein TOY_Item --where Id=1 --where Name~t*").out);
    EXPECT_EQ(second_item, kldrcim("ein TOY_Item --where=Id!=1").out);
}

TEST(Filtered_Results, WhatIsOnlyLookedAtIsNotShown)
{
    EXPECT_EQ("U8\n---\n200\n", kldrcim("ei TOY_Item --properties U8 --where Id=2 --sort S8").out);
    EXPECT_EQ("Id  U8\n--  ---\n2   200\n", kldrcim("ei TOY_Item --properties Id,U8 --where Id=2").out);
}

TEST(Filtered_Results, NumbersAreSortedBySizeAndTextsByText)
{
    EXPECT_EQ(std::string(second_item) + first_item, kldrcim("ein TOY_Item --sort -Id").out);
    EXPECT_EQ(std::string(first_item) + second_item, kldrcim("ein TOY_Item --sort name").out);
    EXPECT_EQ(std::string(second_item) + first_item, kldrcim("ein TOY_Item --sort=-Name").out);
    const std::string table = with_many("ei TOY_Many --properties Id --sort -Id", 11).out;
    EXPECT_EQ("Id\n--\n11\n10\n9\n8\n7\n6\n5\n4\n3\n2\n1\n", table);
    // What has no value stands last, either way, and equals stay in the order in which they came.
    for (const char* sort : {"Late", "-Late"}) {
        const std::string ids =
            with_many("ei TOY_Many --format jsonl --properties Id --sort " + std::string(sort), 3001).out;
        EXPECT_NE(std::string::npos, ids.substr(0, 200).find("\"Id\": 3000}")) << sort;
        EXPECT_NE(std::string::npos, ids.substr(ids.size() - 200).find("\"Id\": 2999}")) << sort;
    }
}

TEST(Filtered_Results, AreCounted)
{
    EXPECT_EQ("2\n", kldrcim("ei TOY_Item --count").out);
    EXPECT_EQ("2\n", kldrcim("--count ein TOY_Item").out);
    EXPECT_EQ("2\n", kldrcim("--count --format json ein TOY_Item").out);
    EXPECT_EQ("0\n", kldrcim("ein TOY_Many --count").out);
    EXPECT_EQ("100000\n", with_many("ein TOY_Many --count", 100000).out);
    EXPECT_EQ("10\n", with_many("ei TOY_Many --count --where 'Id~2?'", 40).out);
    // Half a number is none.
    const Outcome failed = kldrcim("ein TOY_Many --count", TOY_DESCRIBED, "TOY_MANY=5 TOY_MANY_FAILS=1");
    EXPECT_EQ(1, failed.status);
    EXPECT_EQ("", failed.out);
    EXPECT_EQ("kldrcim: CIM_ERR_FAILED (1): no more of them\n", failed.error);
}

TEST(Filtered_Results, JsonLinesAreOneObjectEach)
{
    const Outcome run = kldrcim("ei TOY_Item --format jsonl");
    EXPECT_EQ(0, run.status);
    std::istringstream lines(run.out);
    unsigned id = 0;
    for (std::string line; std::getline(lines, line);) {
        Json::Value parsed;
        ASSERT_TRUE(Json::Reader().parse(line, parsed)) << line;
        EXPECT_EQ(++id, parsed["properties"]["Id"].asUInt());
        EXPECT_EQ("line\nbreak", parsed["properties"]["Texts"][0].asString());
    }
    EXPECT_EQ(2u, id);
    EXPECT_EQ("\"root/toy:TOY_Item.Id=1,Name=\\\"one\\\"\"\n",
              kldrcim("ein TOY_Item --format jsonl --where Id=1").out);
    EXPECT_EQ("", kldrcim("ein TOY_Many --format jsonl").out);
    EXPECT_EQ("{\"class\": \"TOY_Item\", \"path\": \"root/toy:TOY_Item.Id=1,Name=\\\"one\\\"\", "
              "\"properties\": {\"Id\": 1}}\n",
              kldrcim("gi 'TOY_Item.Id=1,Name=\"one\"' --format jsonl --properties Id").out);
}

TEST(Filtered_Results, NameTheCulpritOfBadInput)
{
    const std::pair<const char*, const char*> mistakes[] = {
        {"ei TOY_Item --where Foo=1", "TOY_Item has no property \"Foo\""},
        {"ei TOY_Item --sort -Foo", "TOY_Item has no property \"Foo\""},
        {"ein TOY_Item --where U8=1", "TOY_Item.U8 is no key, and ein brings keys only"},
        {"ein TOY_Item --sort u8", "TOY_Item.U8 is no key, and ein brings keys only"},
        {"ei TOY_Item --where U8=many", "TOY_Item.U8 is a uint8, which \"many\" is not"},
        {"ei TOY_Item --where U8!=256", "TOY_Item.U8 is a uint8, which \"256\" is not"},
        {"ei TOY_Item --where Numbers=x", "TOY_Item.Numbers is a uint16, which \"x\" is not"},
        {"ei TOY_Item --where Flag=maybe", "TOY_Item.Flag is a boolean, which \"maybe\" is not"},
        {"ei TOY_Item --where When=today", "TOY_Item.When is a datetime, which \"today\" is not"},
        {"ei TOY_Item --where Id", "--where takes NAME=VALUE, NAME!=VALUE or NAME~PATTERN, not \"Id\""},
        {"ei TOY_Item --where =1", "--where takes NAME=VALUE, NAME!=VALUE or NAME~PATTERN, not \"=1\""},
        {"ei TOY_Item --where 'Id!1'", "--where takes NAME=VALUE, NAME!=VALUE or NAME~PATTERN, not \"Id!1\""},
        {"ei TOY_Item --where", "--where wants a value"},
        {"ei TOY_Item --sort -",
         "--sort takes the name of a property, or a minus sign and a name, not \"-\""},
        {"ei TOY_Item --sort ''",
         "--sort takes the name of a property, or a minus sign and a name, not \"\""},
        {"ei TOY_Item --count --sort Id", "--sort makes no sense with --count"},
        {"ei TOY_Item --count 1", "usage: kldrcim [options] ei CLASS"},
        {"ei TOY_Item --count=1", "--count takes no value"},
        {"cm TOY_Item Echo --format jsonl", "--format jsonl makes no sense for cm"},
        {"gi TOY_Item.Id=1 --where A=1",
         "--where makes no sense for gi; it is for ei ein ai ain ri rin luns watch diag classes"},
        {"gi TOY_Item.Id=1 --count",
         "--count makes no sense for gi; it is for ei ein ai ain ri rin luns watch diag classes"},
    };
    for (const auto& [arguments, error] : mistakes) {
        const Outcome run = kldrcim(arguments);
        EXPECT_EQ(2, run.status) << arguments;
        EXPECT_EQ("", run.out) << arguments;
        EXPECT_EQ("kldrcim: " + std::string(error) + "\n", run.error);
    }
}

TEST(Filtered_Results, OfAnUnknownClassANameIsMissedWhenResultsHaveCome)
{
    const Outcome missed = kldrcim("ei TOY_Item --where Foo=1", TOY_PLAIN);
    EXPECT_EQ(2, missed.status);
    EXPECT_EQ("", missed.out);
    EXPECT_EQ("kldrcim: no result has a property \"Foo\"\n", missed.error);
    EXPECT_EQ("kldrcim: no result has a key \"U8\"\n", kldrcim("ein TOY_Item --sort U8", TOY_PLAIN).error);
    // Nobody knows of none.
    const Outcome none = kldrcim("ei TOY_Many --where Foo=1", TOY_PLAIN, "TOY_MANY=0");
    EXPECT_EQ(0, none.status);
    EXPECT_EQ("", none.error);
    EXPECT_EQ("2\n", kldrcim("ei TOY_Item --count --where U8=0xc8", TOY_PLAIN).out);
    EXPECT_EQ("0\n", kldrcim("ei TOY_Item --count --where U8=many", TOY_PLAIN).out);
}

} // namespace
} // namespace KPRV::kldrcim
