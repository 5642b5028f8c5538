// Bad answers of the adapter library in the lists that clients enumerate.
#include "tests/faults/Sweep_Fixture.h"

#include <algorithm>
#include <map>
#include <set>

namespace KPRV::listed_answers {
namespace {

enum Thrown
{
    GUARDED,
    PASSES,
    CONNECTORS,
};

struct Way
{
    const char* entry_point;
    Thrown thrown;
};

constexpr Way ways[] = {
#define LISTED(entry_point, thrown) {#entry_point, thrown},
#include "tests/faults/Ways_In.def"
};

/// Addresses come with and without colons, and in either case.
bool is_of(const std::string& text, const std::string& code)
{
    std::string plain;
    for (const char c : text)
        if (c != ':')
            plain += static_cast<char>(tolower(c));
    return plain.find("4b4c" + code) != std::string::npos ||
           plain.find("4b4c000" + code) != std::string::npos;
}

/// Some things, such as the drivers of the host, are told by the first adapter that answers; those are
/// nobody's.
bool is_of_neighbour(const std::string& text, const std::string& code)
{
    const char* const codes[] = {"aa", "bb", "cc"};
    return !is_of(text, code) && std::any_of(std::begin(codes), std::end(codes),
                                             [&](const char* each) { return is_of(text, each); });
}

/// Some text of the request that is the adapter's own.
std::string address_in(const Json::Value& request, const std::string& code)
{
    for (const Json::Value& member : request)
        if (member.isString() && is_of(member.asString(), code))
            return member.asString();
    return "";
}

class Listed_Answers : public Sweep_Fixture, public testing::TestWithParam<Way>
{
protected:
    void SetUp() override
    {
        open_host();
        for (const std::string& name : enumerable_classes(*server))
            if (server->providers().serves(name, broker::Mi_Kind::INSTANCE))
                look_at(name);
    }
    void TearDown() override { close_host(); }

    /// Keeps what the class has, if it asks for the entry point.
    void look_at(const std::string& name)
    {
        simulator.clear_calls();
        const std::vector<std::string> texts = lasting_texts(server->enumerate_instances(name));
        if (name == "KALDERA_ComputerSystem" || was_called(GetParam().entry_point))
            healthy[name] = texts;
        for (const Json::Value& request : simulator.requests(GetParam().entry_point)) {
            requests.push_back(request);
            asked[name].insert(Json::FastWriter().write(request));
        }
    }
    bool asks(const std::string& name, const std::string& address) const
    {
        const auto found = asked.find(name);
        return found != asked.end() &&
               std::any_of(found->second.begin(), found->second.end(),
                           [&](auto& each) { return each.find(address) != std::string::npos; });
    }

    /// The classes under a fault that concerns the adapter alone, or all if it has no code.
    void sweep(const Json::Value& request, const std::string& code)
    {
        const Way& way = GetParam();
        const std::string address = address_in(request, code);
        for (const Bad_Answer& bad : bad_json_answers(true_answer(way.entry_point, request))) {
            SCOPED_TRACE(bad.name + " for " + (code.empty() ? "all" : code));
            simulator.add_fault(bad.fault(way.entry_point, address));
            for (const auto& [name, texts] : healthy)
                expect_family(bad, address, name, texts, code);
            simulator.clear_faults();
            expect_nothing_left();
        }
        elsewhere([&] {
            for (const auto& [name, texts] : healthy)
                EXPECT_EQ(texts, lasting_texts(server->enumerate_instances(name))) << name;
            return 0;
        });
        expect_nothing_left();
    }

    static bool is_unguarded(const std::string& name)
    {
        // The connectors' count of an adapter's ports is the one unguarded call of an entry point that has
        // guards elsewhere.
        const std::set<std::string> of_connectors = {"KALDERA_PhysicalConnector",
                                                     "KALDERA_PhysicalConnectorContainer",
                                                     "KALDERA_EthernetPortRealizes", "KALDERA_Realizes"};
        return GetParam().thrown == PASSES ||
               (GetParam().thrown == CONNECTORS && of_connectors.contains(name));
    }

    /// An answer, from which at most the adapter's own are missing, or what the library threw.
    void expect_family(const Bad_Answer& bad, const std::string& address, const std::string& name,
                       const std::vector<std::string>& texts, const std::string& code)
    {
        const broker::Result now = server->enumerate_instances(name);
        const bool passes = bad.thrown && asks(name, address) && is_unguarded(name);
        const std::optional<std::string> thrown = thrown_text(now);
        EXPECT_EQ(passes, thrown.has_value()) << name << ": " << thrown.value_or("no exception");
        if (thrown) {
            // Only the module itself knows the library's own exceptions.
            const bool has_words = bad.thrown == Bad_Answer::STANDARD ||
                                   (bad.thrown == Bad_Answer::AGENT_ERROR && contains_exceptions());
            EXPECT_EQ(has_words ? THROWN_TEXT : "an exception of unknown type", *thrown);
            return;
        }
        EXPECT_EQ(CMPI_RC_OK, now.rc) << name << ": " << now.message;
        expect_neighbours(name, texts, lasting_texts(now), code);
    }
    void expect_neighbours(const std::string& name, const std::vector<std::string>& texts,
                           const std::vector<std::string>& now, const std::string& code)
    {
        if (name == "KALDERA_ComputerSystem") {
            EXPECT_EQ(texts, now);
        }
        if (code.empty())
            return;
        for (const std::string& text : texts)
            if (is_of_neighbour(text, code) && !is_given_up(name, text, code)) {
                EXPECT_EQ(std::count(texts.begin(), texts.end(), text),
                          std::count(now.begin(), now.end(), text))
                    << name << "\n"
                    << text;
                ++neighbours;
            }
    }

    static bool is_given_up(const std::string& name, const std::string& text, const std::string& code)
    {
        if (GetParam().entry_point != std::string("getHbaByWwn"))
            return false;
        // The walk of the connectors ends with the first adapter that tells nothing of itself, unlike all
        // others.
        if (text.find("KALDERA_PhysicalConnector") != std::string::npos)
            return code == FIRST;
        // The tests and the drivers of the host are told by its adapters together: what one of them answers
        // changes them for all.
        const std::set<std::string> of_host = {"KALDERA_AdapterElementSoftwareIdentity",
                                               "KALDERA_AvailableDiagnosticServiceForEthernetPort",
                                               "KALDERA_AvailableDiagnosticServiceForFCPort"};
        return of_host.contains(name);
    }

    Picture healthy;
    std::map<std::string, std::set<std::string>> asked;
    std::vector<Json::Value> requests;
    unsigned neighbours = 0;
};

TEST_P(Listed_Answers, CostNoMoreThanTheElementAtHand)
{
    ASSERT_FALSE(requests.empty());
    ASSERT_LT(1u, healthy.size());
    if (std::none_of(requests.begin(), requests.end(),
                     [](const Json::Value& each) { return each.isObject(); }))
        return sweep(requests[0], "");
    for (const char* code : {FIRST, LAST}) {
        const auto request = std::find_if(requests.begin(), requests.end(), [&](const Json::Value& each) {
            return !address_in(each, code).empty();
        });
        if (request != requests.end())
            sweep(*request, code);
    }
    EXPECT_LT(0u, neighbours);
}

INSTANTIATE_TEST_SUITE_P(Way, Listed_Answers, testing::ValuesIn(ways),
                         [](const auto& row) { return std::string(row.param.entry_point); });

} // namespace
} // namespace KPRV::listed_answers
