#include "kldrcim/formats/Node_Label.h"

#include "tests/broker/Toy_Server.h"

namespace KPRV::kldrcim {
namespace {

std::string line(Node_Kind kind, const char* class_name, std::vector<Named_Value> properties)
{
    return label_line(
        node_label({kind, {.path = {.class_name = class_name}, .properties = std::move(properties)}}));
}

Plain_Value states(std::vector<Plain_Value> elements)
{
    return Plain_Value::array(CMPI_uint16, std::move(elements));
}

TEST(Node_Label, Addresses)
{
    EXPECT_EQ("10:00:02:4B:4c:10:00:00", colon_form("1000024B4c100000"));
    EXPECT_EQ("00:02:4b:4c:10:00", colon_form("00024b4c1000"));
    EXPECT_EQ("00024b4c10", colon_form("00024b4c10"));
    EXPECT_EQ("not an addrs", colon_form("not an addrs"));
    EXPECT_EQ("", colon_form(""));
}

TEST(Node_Label, Speeds)
{
    EXPECT_EQ("", speed_text(0));
    EXPECT_EQ("8 Gb/s", speed_text(8000000000));
    EXPECT_EQ("2.5 Gb/s", speed_text(2500000000));
    EXPECT_EQ("100 Mb/s", speed_text(100000000));
}

TEST(Node_Label, UnitsTellVendorAndProduct)
{
    auto unit = [](const char* id) {
        return line(Node_Kind::UNIT, "KALDERA_StorageExtent",
                    {{"DeviceID", Plain_Value::text(id)}, {"ElementName", Plain_Value::text("LUN_3")}});
    };
    EXPECT_EQ("disk LUN_3 ACME Big Disk", unit("1_2_ACME_Big Disk_LUN_3"));
    EXPECT_EQ("disk LUN_3 ACME Big_Disk", unit("1_2_ACME_Big_Disk_LUN_3"));
    for (const char* odd :
         {"", "1", "1_2", "1_2_LUN_3", "1_LUN_3", "LUN_3", "_LUN_3", "1_2_ACME_Big Disk_LUN_4"})
        EXPECT_EQ("disk LUN_3", unit(odd)) << odd;
}

TEST(Node_Label, StatesOfAPortInTheWordsOfThoseWhoLookAfterIt)
{
    struct Row
    {
        int operational;
        int enabled;
        const char* words;
        Condition condition;
    };
    // As the module fills the two together.
    const Row rows[] = {
        {11, 2, "in service", Condition::GOOD},  {10, 3, "disabled", Condition::IDLE},
        {12, 1, "no contact", Condition::BAD},   {13, 6, "link down", Condition::BAD},
        {6, 1, "error", Condition::BAD},         {8, 9, "starting", Condition::IDLE},
        {9, 4, "stopping", Condition::IDLE},     {14, 1, "aborted", Condition::BAD},
        {3, 2, "degraded", Condition::DOUBTFUL}, {99, 1, "state 99", Condition::NONE},
    };
    for (const Row& row : rows)
        for (const Node_Kind kind : {Node_Kind::FC_PORT, Node_Kind::ETHERNET_PORT, Node_Kind::TARGET}) {
            const Node_Label label = node_label(
                {kind,
                 {.path = {},
                  .properties = {{"OperationalStatus", states({Plain_Value::unsigned_number(
                                                           CMPI_uint16, std::uint64_t(row.operational))})},
                                 {"EnabledState",
                                  Plain_Value::unsigned_number(CMPI_uint16, std::uint64_t(row.enabled))}}}});
            EXPECT_EQ(row.words, label.facts.back());
            EXPECT_EQ(row.condition, label.condition) << row.words;
        }
}

TEST(Node_Label, WithoutAStatusItIsWhetherAPortIsEnabled)
{
    for (const auto& [enabled, words] : {std::pair{2, "enabled"}, {3, "disabled"}, {99, "state 99"}})
        EXPECT_EQ(
            std::string("FC port ") + words,
            line(Node_Kind::FC_PORT, "P",
                 {{"EnabledState", Plain_Value::unsigned_number(CMPI_uint16, std::uint64_t(enabled))}}));
}

TEST(Node_Label, WhatIsMissingLeavesNoTrace)
{
    EXPECT_EQ("host", line(Node_Kind::SYSTEM, "S", {}));
    EXPECT_EQ("adapter ()", line(Node_Kind::ADAPTER, "A", {}));
    EXPECT_EQ("FC port", line(Node_Kind::FC_PORT, "P", {{"Speed", Plain_Value::null_of(CMPI_uint64)}}));
    EXPECT_EQ("host", line(Node_Kind::SYSTEM, "S", {{"OperationalStatus", states({})}}));
    EXPECT_EQ("host", line(Node_Kind::SYSTEM, "S",
                           {{"OperationalStatus", states({Plain_Value::null_of(CMPI_uint16)})}}));
    EXPECT_EQ("software x", line(Node_Kind::SOFTWARE, "S", {{"InstanceID", Plain_Value::text("x")}}));
}

TEST(Node_Label, ATerminalIsNotMoved)
{
    EXPECT_EQ("host a?[2Jb\\n", line(Node_Kind::SYSTEM, "S", {{"Name", Plain_Value::text("a\33[2Jb\n")}}));
}

} // namespace
} // namespace KPRV::kldrcim
