#include "module/adapter/ProviderUtil.h"
#include "module/runtime/objects/Ref.h"
#include "tests/module/model/Port_Fixture.h"

using namespace KPRV;

namespace {

constexpr classId_t of_ports[] = {FCPORT,      SCSIPROTOCOLENDPOINT, FCPORTSTATISTICS, LOGICALPORTGROUP,
                                  ALARMDEVICE, STORAGEEXTENT,        TAPEDRIVE,        LOGICALDISK};

/// Two ports, and behind each of them two targets with a disk and one with a tape; an odd id among the units.
struct Wanted_Walks : Port_Fixture
{
    static constexpr const char* OTHER_PORT = "10:00:8c:7c:ff:00:00:02";

    Wanted_Walks()
    {
        library.answers("getFcPhyPortIndicesByAdapter", list_of({PORT, OTHER_PORT}));
        library.answers("getPortByWwn", [](const Json::Value& request) {
            return with(fc_port(request["wwn"].asCString()), "nodeWwn", request["wwn"]);
        });
        library.answers("getDynamicPortStatistics", json("[{}]"));
        remote_ports({REMOTE, REMOTE_2}, Json::Value());
        library.answers("getCompleteRemotePort", [](const Json::Value& request) {
            Json::Value answer =
                json("{'deviceData': {'isTarget': true, 'stateMofValue': 11, 'type': 'Disk'}, 'lunList': ["
                     " {'number': 0, 'vendor': 'ACME ', 'productID': 'A', 'lunDescIdType': 3,"
                     "  'lunDescription': 'x'},"
                     " {'number': 1, 'vendor': 'ACME ', 'productID': 'A', 'lunDescIdType': 77,"
                     "  'lunDescription': 'y'}]}");
            if (request["rPortWwn"] == REMOTE_2)
                answer["deviceData"]["type"] = "Tape";
            return answer;
        });
    }

    /// What the walk gives, owned, and the lines that it writes.
    std::vector<Ref<Instance>> walked(classId_t id, const Wanted& wanted, Lines& lines)
    {
        log.clear();
        std::vector<Ref<Instance>> owned;
        for (Instance* instance : helper->getInstancesByClass(id, wanted))
            owned.emplace_back(instance);
        lines.clear();
        for (const Log_Line& line : log.lines())
            lines.push_back(line.level + " " + line.file + " " + line.text);
        return owned;
    }
};

} // namespace

TEST_F(Wanted_Walks, CountAndTellWhatTheyLeaveOut)
{
    for (const classId_t id : of_ports) {
        SCOPED_TRACE(ProviderUtil::getClassName(id));
        Lines whole_lines, lines;
        const auto whole = walked(id, {}, whole_lines);
        ASSERT_GE(whole.size(), 2u);

        const auto names = walked(id, Wanted::names(), lines);
        EXPECT_EQ(lines, whole_lines);
        ASSERT_EQ(names.size(), whole.size());
        for (size_t i = 0; i < whole.size(); i++)
            EXPECT_TRUE(names[i] && key_eq(names[i].ptr(), whole[i].ptr()));

        for (size_t wanted = 0; wanted < whole.size(); wanted++) {
            const auto found = walked(id, Wanted::object(whole[wanted].ptr()), lines);
            EXPECT_EQ(lines, whole_lines);
            ASSERT_EQ(found.size(), whole.size());
            for (size_t i = 0; i < whole.size(); i++) {
                EXPECT_EQ(bool(found[i]), i == wanted);
                EXPECT_TRUE(!found[i] || identical(found[i].ptr(), whole[i].ptr()));
            }
        }
    }
}
