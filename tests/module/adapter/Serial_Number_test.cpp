#include "module/adapter/Serial_Number.h"

#include "module/adapter/Json_Access.h"
#include "tests/support/Fake_Library.h"

#include <gtest/gtest.h>

using namespace KPRV;

TEST(Serial_Number, ThePartNumberIsCutFromTheFront)
{
    EXPECT_EQ(oem_serial_number(json("{'oemSerialNum': 'ABC123', 'partNum': 'ABC'}")), "123");
    EXPECT_EQ(oem_serial_number(json("{'oemSerialNum': 'ABC123', 'partNum': 'XYZ'}")), "ABC123");
    EXPECT_EQ(oem_serial_number(json("{'oemSerialNum': 'ABC123', 'partNum': 'abc'}")), "ABC123");
    EXPECT_EQ(oem_serial_number(json("{'oemSerialNum': 'ABC123'}")), "ABC123");
    EXPECT_EQ(oem_serial_number(json("{'oemSerialNum': 'ABC', 'partNum': 'ABC'}")), "");
}

TEST(Serial_Number, ACardOfNoOemHasNone)
{
    EXPECT_EQ(oem_serial_number(json("{'oemSerialNum': '', 'partNum': 'ABC'}")), std::nullopt);
    EXPECT_EQ(oem_serial_number(json("{}")), std::nullopt);
    EXPECT_EQ(oem_serial_number(json("null")), std::nullopt);
    EXPECT_THROW(oem_serial_number(json("{'oemSerialNum': 5}")), Not_Convertible);
}
