#include "module/runtime/ground/Types.h"

#include <gtest/gtest.h>

#include <string>

namespace KPRV {

struct Type_Row
{
    Type code;
    const char* name;
    const char* other_case;
    uint32 size;
};

constexpr uint32 HANDLE = sizeof(void*);

constexpr Type_Row TYPE_ROWS[] = {
    {BOOLEAN, "boolean", "BOOLEAN", 1},   {UINT8, "uint8", "UInt8", 1},
    {SINT8, "sint8", "SINT8", 1},         {UINT16, "uint16", "Uint16", 2},
    {SINT16, "sint16", "sInt16", 2},      {UINT32, "uint32", "UINT32", 4},
    {SINT32, "sint32", "SINT32", 4},      {UINT64, "uint64", "uinT64", 8},
    {SINT64, "sint64", "SINT64", 8},      {REAL32, "real32", "REAL32", 4},
    {REAL64, "real64", "Real64", 8},      {CHAR16, "char16", "CHAR16", 2},
    {STRING, "string", "STRING", HANDLE}, {DATETIME, "datetime", "DateTime", HANDLE},
};

class Types_Test : public testing::TestWithParam<Type_Row>
{
};

TEST_P(Types_Test, CodeNameAndSizes)
{
    const Type_Row& row = GetParam();
    EXPECT_STREQ(row.name, type_name[row.code]);
    EXPECT_EQ(row.size, type_size[row.code]);
    EXPECT_EQ(row.size, literal_type_size[row.code]);
}

TEST_P(Types_Test, NameIsFoundInAnyCase)
{
    const Type_Row& row = GetParam();
    for (const char* name : {row.name, row.other_case}) {
        Type type = DATETIME;
        EXPECT_EQ(0, type_name_to_type(name, type)) << name;
        EXPECT_EQ(row.code, type);
    }
}

INSTANTIATE_TEST_SUITE_P(All, Types_Test, testing::ValuesIn(TYPE_ROWS),
                         [](const auto& row) { return std::string(row.param.name); });

TEST(Types, CodesAreTheRowsOfTheTables)
{
    ASSERT_EQ(NUM_TYPES, std::size(TYPE_ROWS));
    for (uint32 i = 0; i < NUM_TYPES; i++)
        EXPECT_EQ(i, TYPE_ROWS[i].code);
}

TEST(Types, UnknownNamesLeaveTheAnswerAlone)
{
    // "uint88" and "strong" share length and outer letters with names of the table.
    for (const char* name : {"", "uint", "uint88", "strong", "booleans", "reference", " uint8"}) {
        Type type = CHAR16;
        EXPECT_EQ(-1, type_name_to_type(name, type)) << name;
        EXPECT_EQ(CHAR16, type);
    }
    Type type = CHAR16;
    EXPECT_EQ(-1, type_name_to_type(nullptr, type));
}

} // namespace KPRV
