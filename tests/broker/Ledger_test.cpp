#include "broker/Ledger.h"

#include <gtest/gtest.h>

using namespace KPRV::broker;

TEST(Ledger, ANameIsItsTextAndNotItsPlace)
{
    const std::string one = "CMNewString", other = one;
    Ledger ledger;
    for (const std::string& name : {std::cref(one), std::cref(other), std::cref(one)})
        ledger.made(Object_Kind::STRING, name.c_str());
    ledger.released(Object_Kind::STRING, other.c_str());
    ASSERT_EQ(ledger.entries().size(), 1u);
    EXPECT_EQ(ledger.entries()[0].made, 3u);
    EXPECT_EQ(ledger.live(), 2u);
}

TEST(Ledger, KindsOfOneNameAreCountedApart)
{
    Ledger ledger;
    ledger.made(Object_Kind::STRING, "CMClone");
    ledger.made(Object_Kind::PATH, "CMClone");
    ledger.released(Object_Kind::PATH, "CMClone");
    EXPECT_EQ(ledger.live(Object_Kind::STRING), 1u);
    EXPECT_EQ(ledger.live(Object_Kind::PATH), 0u);
}

TEST(Ledger, ItBeginsAnewAfterTheEndOfAll)
{
    Ledger ledger;
    ledger.made(Object_Kind::STRING, "CMNewString");
    ledger.clear();
    EXPECT_TRUE(ledger.entries().empty());
    ledger.made(Object_Kind::STRING, "CMNewString");
    EXPECT_EQ(ledger.live(), 1u);
}
