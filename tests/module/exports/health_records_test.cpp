// What health makes of the records of tests, which live as long as the module does.
#include "tests/module/exports/Module_Fixture.h"
#include "tests/support/Eventually.h"
#include "tests/support/In_Child.h"

#include "kldrcim/local/Local_Connection.h"
#include "kldrcim/walks/Diag_Names.h"
#include "kldrcim/walks/Health.h"

namespace KPRV {
namespace {

class Health_Records : public Module_Fixture
{
protected:
    void run_test(const char* name, const char* address)
    {
        std::string error;
        kldrcim::Local_Connection connection(*server);
        broker::Path_Value test, element;
        ASSERT_TRUE(kldrcim::find_test(connection, name, test, error)) << error;
        ASSERT_TRUE(kldrcim::find_element(connection, test.class_name, address, element, error)) << error;
        EXPECT_EQ(4096u, server
                             ->invoke_method(test, "RunDiagnostic",
                                             {{"ManagedElement", broker::Plain_Value::path(element)}})
                             .return_value.as_uint());
        EXPECT_TRUE(eventually([&] { return server->ledger().live() == 0; }));
    }
    /// "FINDING KEY: DETAIL" of what tests have to say.
    std::vector<std::string> failed_tests()
    {
        std::vector<std::string> texts;
        kldrcim::Local_Connection connection(*server);
        for (const kldrcim::Health_Finding& finding : kldrcim::check_health(connection, {}).findings)
            if (finding.kind == kldrcim::find_finding("diagnostic-failed"))
                texts.push_back(text_of(finding.element, "DeviceID") + ": " + finding.detail);
        return texts;
    }
    static constexpr const char* failing = R"({"adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00"},
        "diagnostics": {"diagMemoryTest": {"outcome": "fail", "output": "bit 2 is stuck"}},
        "fcPorts": [{"wwn": "10:00:02:4b:4c:10:00:00",
                     "diagnostics": {"diagPCILoopbackTest": {"outcome": "fail", "output": "parity"}}}]}]})";
    static constexpr const char* passing = R"({"adapters": [{"hbaData": {"wwn": "20:00:02:4b:4c:10:00:00"},
        "fcPorts": [{"wwn": "10:00:02:4b:4c:10:00:00"}]}]})";
};

TEST_F(Health_Records, OnlyTheLastRunOfATestCounts)
{
    in_child([&] {
        open_text(failing);
        EXPECT_EQ(std::vector<std::string>{}, failed_tests());
        run_test("MemoryTest", "2000024b4c100000");
        run_test("PCILoopbackTest", "1000024b4c100000");
        EXPECT_EQ((std::vector<std::string>{
                      "1000024b4c100000: Kaldera:PCILoopbackTest: PCI Loopback test failed",
                      "2000024b4c100000: Kaldera:MemoryTest: Memory test failed",
                  }),
                  failed_tests());
        simulator.load_text(passing);
        run_test("PCILoopbackTest", "1000024b4c100000");
        EXPECT_EQ((std::vector<std::string>{"2000024b4c100000: Kaldera:MemoryTest: Memory test failed"}),
                  failed_tests());
    });
}

} // namespace
} // namespace KPRV
