#include "tests/module/exports/Rich_Fixture.h"

namespace KPRV {
namespace {

/// What the rich host does not show by itself: the other rows of the tables, put into the library's answers.
class Rich_Values : public Rich_Fixture
{
protected:
    void answer_with(const std::string& call, const std::string& address, const std::string& member,
                     const Json::Value& value)
    {
        Json::Value fault;
        fault["call"] = call;
        fault["address"] = address;
        fault["do"] = "set";
        fault["member"] = member;
        fault["value"] = value;
        simulator.add_fault(fault.toStyledString());
    }
    void answer_without(const std::string& call, const std::string& address, const std::string& member)
    {
        simulator.add_fault(R"({"call": ")" + call + R"(", "address": ")" + address +
                            R"(", "do": "remove", "member": ")" + member + R"("})");
    }

    Lines all(const std::string& class_name, const char* property)
    {
        Lines values;
        for (const broker::Instance_Value& instance : enumerate(class_name).instances)
            values.push_back(text_of(instance, property));
        return values;
    }

    static std::string shown(const broker::Result& result, size_t at,
                             std::initializer_list<const char*> properties)
    {
        std::string text;
        for (const char* property : properties)
            text +=
                (text.empty() ? "" : " ") + broker::plain_text(*result.instances.at(at).property(property));
        return text;
    }
};

TEST_F(Rich_Values, OfEachStatusFollowTheTables)
{
    struct Row
    {
        int status;
        const char* port;
        const char* lan_endpoint;
    };
    // clang-format off
    constexpr Row rows[] = {
    //  status  OperationalStatus and EnabledState  HealthState and EnabledState
        { 2,    "{2} 1",                            "0 1"},
        { 6,    "{6} 1",                            "15 1"},
        { 8,    "{8} 9",                            "5 9"},
        { 9,    "{9} 4",                            "10 4"},
        {10,    "{10} 3",                           "10 3"},
        {11,    "{11} 2",                           "5 2"},
        {12,    "{12} 1",                           "0 1"},
        {13,    "{13} 6",                           "10 6"},
        {14,    "{14} 1",                           "0 1"},
    };
    // clang-format on
    open_rich();
    for (const Row& row : rows) {
        SCOPED_TRACE(row.status);
        simulator.clear_faults();
        answer_with("getPortByWwn", "10:00:02:4b:4c:a1:00:00", "portStatusValue", row.status);
        answer_with("getCompleteRemotePort", "50:24:b4:c0:00:a2:00:02", "deviceData.stateMofValue",
                    row.status);
        answer_with("getEthPortByEthMac", "02:4b:4c:a2:00:01", "ethData.ethPortStateMOFValue", row.status);
        EXPECT_EQ(row.port, shown(enumerate("KALDERA_FCPort"), 0, {"OperationalStatus", "EnabledState"}));
        const broker::Result endpoints = enumerate("KALDERA_SCSIProtocolEndpoint");
        // The initiator has its port's status, a target that of the remote port.
        EXPECT_EQ(row.port, shown(endpoints, 0, {"OperationalStatus", "EnabledState"}));
        EXPECT_EQ(row.port, shown(endpoints, 3, {"OperationalStatus", "EnabledState"}));
        EXPECT_EQ("{11} 2", shown(endpoints, 1, {"OperationalStatus", "EnabledState"}));
        EXPECT_EQ(row.lan_endpoint,
                  shown(enumerate("KALDERA_LANEndpoint"), 1, {"HealthState", "EnabledState"}));
    }
}

TEST_F(Rich_Values, OfATapeDriveFollowTheIdTypeWithoutAFormat)
{
    open_rich();
    const std::string description = "5024b4c000a20001";
    const std::vector<std::pair<int, std::string>> rows = {
        {0, "KLDR+ULTRA TD5+"}, {1, description}, {2, description}, {3, description},
        {8, description},       {5, ""},          {9, ""},          {10, "Unable To Fetch"}};
    for (const auto& [id_type, name] : rows) {
        SCOPED_TRACE(id_type);
        simulator.clear_faults();
        answer_with("getCompleteRemotePort", "50:24:b4:c0:00:a2:00:01", "lunList.0.lunDescIdType", id_type);
        mark();
        EXPECT_EQ((Lines{name, "5024b4c000a20002"}), all("KALDERA_TapeDrive", "Name"));
        EXPECT_EQ(name.empty() ? Lines{"ERR Default case for lunInfo.idType. Should not have reached here. "}
                               : Lines{},
                  said("ERR"));
    }
}

TEST_F(Rich_Values, OfUnitsBehindOneWithoutDescriptionAreNamedLikeIt)
{
    open_rich();
    answer_without("getCompleteRemotePort", "50:24:b4:c0:00:a1:00:01", "lunList.1.lunDescription");
    const std::string unknown = "Unable To Fetch";
    // What comes before keeps its description, what comes behind another port is read afresh.
    EXPECT_EQ((Lines{"6024b4c0000a10000000000000000003", "KLDR+ARRAY 4000+KA-R1", unknown, unknown,
                     "KLDR+ARRAY 4000+KA-R4", unknown, unknown, unknown, "KLDR+JBOD+KJ-R0", unknown}),
              all("KALDERA_StorageExtent", "Name"));
    // A disk goes by its description alone.
    EXPECT_EQ(
        (Lines{"6024b4c0000a10000000000000000003", "", "KLDR    ARRAY 4000 T10-R2", "iqn.2009-05.example:r3",
               "vendor's own R4", "not to be told R5", "of no known type R6", "", "", "5024b4c000a40002"}),
        all("KALDERA_LogicalDisk", "Name"));
    // The walk for tape drives does not look at the disk array at all.
    EXPECT_EQ((Lines{"5024b4c000a20001", "5024b4c000a20002"}), all("KALDERA_TapeDrive", "Name"));
    // From one remote port to the next it holds.
    answer_without("getCompleteRemotePort", "50:24:b4:c0:00:a2:00:01", "lunList.0.lunDescription");
    EXPECT_EQ((Lines{unknown, unknown}), all("KALDERA_TapeDrive", "Name"));
}

} // namespace
} // namespace KPRV
