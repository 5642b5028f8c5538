#include "host/Node_Label.h"

#include "Toy_Host.h"

namespace KPRV::host {
namespace {

std::string line(Node_Kind kind, const char* class_name, std::vector<Named_Value> properties)
{
    return label_line(
        node_label({kind, {.path = {.class_name = class_name}, .properties = std::move(properties)}}));
}

Value states(std::vector<Value> elements)
{
    return Value::array(CMPI_uint16, std::move(elements));
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
                    {{"DeviceID", Value::text(id)}, {"ElementName", Value::text("LUN_3")}});
    };
    EXPECT_EQ("disk LUN_3 ACME Big Disk", unit("1_2_ACME_Big Disk_LUN_3"));
    EXPECT_EQ("disk LUN_3 ACME Big_Disk", unit("1_2_ACME_Big_Disk_LUN_3"));
    for (const char* odd :
         {"", "1", "1_2", "1_2_LUN_3", "1_LUN_3", "LUN_3", "_LUN_3", "1_2_ACME_Big Disk_LUN_4"})
        EXPECT_EQ("disk LUN_3", unit(odd)) << odd;
}

TEST(Node_Label, WhatIsMissingLeavesNoTrace)
{
    EXPECT_EQ("host", line(Node_Kind::SYSTEM, "S", {}));
    EXPECT_EQ("adapter ()", line(Node_Kind::ADAPTER, "A", {}));
    EXPECT_EQ("FC port", line(Node_Kind::FC_PORT, "P", {{"Speed", Value::null_of(CMPI_uint64)}}));
    EXPECT_EQ("host", line(Node_Kind::SYSTEM, "S", {{"OperationalStatus", states({})}}));
    EXPECT_EQ("host",
              line(Node_Kind::SYSTEM, "S", {{"OperationalStatus", states({Value::null_of(CMPI_uint16)})}}));
    EXPECT_EQ("software x", line(Node_Kind::SOFTWARE, "S", {{"InstanceID", Value::text("x")}}));
}

TEST(Node_Label, ATerminalIsNotMoved)
{
    EXPECT_EQ("host a?[2Jb\\n", line(Node_Kind::SYSTEM, "S", {{"Name", Value::text("a\33[2Jb\n")}}));
}

} // namespace
} // namespace KPRV::host
