#include "tests/faults/Fault_Fixture.h"

#include <algorithm>

namespace KPRV::library_answers {
namespace {

std::string long_text()
{
    return R"("do": "answer", "answer": ")" + std::string(1 << 20, 'x') + "\"";
}

/// What an entry point may answer, and the members of the fault that make it do so.
std::vector<std::pair<std::string, std::string>> bad_answers()
{
    return {
        {"null", R"("do": "null")"},
        {"error", R"("do": "error")"},
        {"error of another type", R"("do": "error", "error": null)"},
        {"number", R"("do": "answer", "answer": 7)"},
        {"negative number", R"("do": "answer", "answer": -2147483648)"},
        {"huge number", R"("do": "answer", "answer": 18446744073709551615)"},
        {"text", R"("do": "answer", "answer": "text")"},
        {"empty object", R"("do": "answer", "answer": {})"},
        {"array", R"("do": "answer", "answer": [[], {}, null, 1, "x"])"},
        {"long text", long_text()},
        {"own exception", R"("do": "throw", "type": "HbaAgentError", "code": 17, "message": "busy")"},
        {"standard exception", R"("do": "throw", "type": "std::runtime_error", "message": "gone")"},
        {"other exception", R"("do": "throw", "type": "int", "code": 3)"},
    };
}

class Library_Answers : public Fault_Fixture
{
protected:
    /// What the enumerations of the module ask the library for.
    std::set<std::string> asked()
    {
        simulator.clear_calls();
        look();
        const std::vector<std::string> names = simulator.call_names();
        return {names.begin(), names.end()};
    }
    static std::string fault(const std::string& call, const std::string& words)
    {
        return R"({"call": ")" + call + R"(", )" + words + "}";
    }
};

// Some calls stand without a guard, and what the library throws there is the server's; all else is kept.
bool is_of_the_library(const std::string& text)
{
    return text.find("busy") != std::string::npos || text == "gone" ||
           text.find("convertible") != std::string::npos || text.find("type") != std::string::npos ||
           text.find("unknown") != std::string::npos;
}

TEST_F(Library_Answers, NoneLeavesAnythingBehind)
{
    open("one_cna.json");
    const std::set<std::string> names = asked();
    EXPECT_LE(11u, names.size());
    for (const std::string& name : names)
        for (const auto& [kind, words] : bad_answers()) {
            SCOPED_TRACE(name + " answers " + kind);
            simulator.add_fault(fault(name, words));
            std::set<std::string> exceptions;
            look(&exceptions);
            for (const std::string& text : exceptions)
                EXPECT_TRUE(is_of_the_library(text)) << text;
            simulator.clear_faults();
            expect_nothing_left();
        }
}

// Members of the right name and the wrong type, at every depth of the good answers.
TEST_F(Library_Answers, MembersOfWrongTypesLoseTheirElementOnly)
{
    open("twins.json");
    const char* members[][2] = {
        {"getHbaByWwn", "hbaData"},         {"getHbaByWwn", "hbaData.model"},
        {"getHbaByWwn", "hbaData.wwn"},     {"getHbaByWwn", "driverData"},
        {"getPortByWwn", "portData"},       {"getPortByWwn", "portStatus"},
        {"getPortByWwn", "operatingSpeed"}, {"getPortByWwn", "supportedPortSpeeds"},
        {"getAdapterId", "adapterId"},      {"getFcPhyPortIndicesByAdapter", "indexStrings"},
    };
    for (const auto& [call, member] : members)
        for (const char* value : {"null", "[]", "{}", "\"text\"", "-1", "1e300", "true"}) {
            SCOPED_TRACE(std::string(call) + " has " + member + " as " + value);
            simulator.add_fault(
                fault(call, R"("do": "set", "member": ")" + std::string(member) + R"(", "value": )" + value));
            std::set<std::string> exceptions;
            look(&exceptions);
            simulator.clear_faults();
            expect_nothing_left();
        }
}

bool is_of_the_second(const std::string& text)
{
    return text.find("024B4C12") != std::string::npos || text.find("024b4c12") != std::string::npos;
}

// Two adapters that share nothing: what befalls the first is no matter of the second.
TEST_F(Library_Answers, TheOtherAdapterStaysWhole)
{
    open("twins.json");
    const char* devices[] = {"KALDERA_PortController",  "KALDERA_PhysicalPackage",      "KALDERA_Product",
                             "KALDERA_FCPort",          "KALDERA_SCSIProtocolEndpoint", "KALDERA_AlarmDevice",
                             "KALDERA_LogicalPortGroup"};
    const char* first[] = {"20:00:02:4b:4c:11:00:00", "10:00:02:4b:4c:11:00:00", "10:00:02:4b:4c:11:00:01"};
    unsigned lost = 0;
    for (const char* address : first)
        for (const char* call : {"getHbaByWwn", "getPortByWwn", "getFcPhyPortIndicesByAdapter"})
            for (const char* words :
                 {R"("do": "null")", R"("do": "error")", R"("do": "answer", "answer": {})",
                  R"("do": "throw")", R"("do": "throw", "type": "std::runtime_error")",
                  R"("do": "throw", "type": "int")"}) {
                SCOPED_TRACE(std::string(call) + " of " + address + ": " + words);
                simulator.add_fault(fault(call, std::string(words) + R"(, "address": ")" + address + "\""));
                for (const char* name : devices) {
                    const std::vector<std::string> now = lasting_texts(server->enumerate_instances(name));
                    lost += now != healthy.at(name);
                    for (const std::string& text : healthy.at(name))
                        if (is_of_the_second(text)) {
                            EXPECT_EQ(1, std::count(now.begin(), now.end(), text)) << name << "\n" << text;
                        }
                }
                simulator.clear_faults();
            }
    EXPECT_LT(0u, lost);
}

} // namespace
} // namespace KPRV::library_answers
