#include "simulator/Hardware_Tests.h"

#include "simulator/Behaviours.h"
#include "simulator/Faults.h"
#include "simulator/Inventory_Members.h"
#include "simulator/Lookup.h"

#include <algorithm>
#include <iterator>

namespace KPRV::simulator {

namespace {

struct Test_Row
{
    const char* symbol;
    /// The request member that holds the address.
    const char* address;
    Members counters;
};

// clang-format off
constexpr Test_Row test_rows[] = {
    {"diagMemoryTest",      "hbaWwn",  memory_failure_members},
    {"diagPCILoopbackTest", "portWwn", {}},
    {"diagLoopbackTest",    "portWwn", frame_counter_members},
    {"diagEthLoopbackTest", "portWwn", frame_counter_members},
};

constexpr const char* outcomes[] = {"pass", "fail", "error", "HbaAgentError", "std::runtime_error", "int"};
// clang-format on

const Test_Row* find_test(const std::string& symbol)
{
    const auto found = std::find_if(std::begin(test_rows), std::end(test_rows),
                                    [&](const Test_Row& row) { return symbol == row.symbol; });
    return found == std::end(test_rows) ? nullptr : found;
}

Inventory::Place place_of(State& state, const Test_Row& test, const Json::Value& request)
{
    const std::string address = request[test.address].asString();
    return std::string(test.address) == "hbaWwn" ? state.inventory.adapter_at(address)
                                                 : state.inventory.port_at(address);
}

/// What the author of the inventory wants to happen, with its defaults.
Json::Value outcome_of(const Inventory::Place& place, const Test_Row& test)
{
    const Json::Value& written = place.port ? place.port->tests : place.adapter->tests;
    Json::Value outcome(Json::objectValue);
    if (written.isMember(test.symbol))
        outcome = written[test.symbol];
    fill_defaults(outcome, test_outcome_members);
    return outcome;
}

/// Neither passed nor failed: the test itself went wrong.
Json::Value broken(const Json::Value& outcome)
{
    Fault fault;
    fault.kind = outcome["outcome"] == "error" ? Fault_Kind::ERROR : Fault_Kind::THROW;
    fault.words = outcome;
    fault.words["type"] = outcome["outcome"];
    return replaced_answer(fault);
}

/// Frames that went round, unless the author counts otherwise.
void count_frames(Json::Value& answer, const Json::Value& request, bool failed)
{
    const unsigned sent = request["frameCount"].isUInt() ? request["frameCount"].asUInt() : 0;
    const unsigned lost = failed && sent > 0 ? 1 : 0;
    answer["transmitFrames"] = sent;
    answer["GoodFrameRcv"] = sent - lost;
    answer["outstandingFrames"] = lost;
    answer["BadFrameNo"] = 0U;
    answer["BadFrameInfo"] = 0U;
}

Json::Value test_answer(State& state, const Json::Value& request, const char* symbol)
{
    const Test_Row& test = *find_test(symbol);
    return answer_at(place_of(state, test, request), request[test.address],
                     [&](const Inventory::Place& place) {
                         const Json::Value outcome = outcome_of(place, test);
                         const bool failed = outcome["outcome"] == "fail";
                         if (!failed && outcome["outcome"] != "pass")
                             return broken(outcome);
                         Json::Value answer;
                         answer["failed"] = failed;
                         answer["output"] = failed ? "Test failed" : "Test passed";
                         if (test.counters.data() == std::data(frame_counter_members))
                             count_frames(answer, request, failed);
                         for (const Member& counter : test.counters)
                             if (outcome.isMember(counter.name))
                                 answer[counter.name] = outcome[counter.name];
                         if (outcome.isMember("output"))
                             answer["output"] = outcome["output"];
                         return answer;
                     });
}

} // namespace

void check_hardware_tests(const Json_Text& source, const Json::Value& written)
{
    for (const std::string& symbol : written.getMemberNames()) {
        const Test_Row* const test = find_test(symbol);
        if (!test)
            source.refuse(written[symbol], "\"" + symbol + "\" in diagnostics is no entry point that tests");
        std::vector<Member> members(std::begin(test_outcome_members), std::end(test_outcome_members));
        members.insert(members.end(), test->counters.begin(), test->counters.end());
        const Json::Value& outcome = written[symbol];
        check_members(source, outcome, members, symbol);
        const Json::Value& word = outcome["outcome"];
        const auto same = [&](const char* each) { return word == each; };
        if (!word.isNull() && std::none_of(std::begin(outcomes), std::end(outcomes), same))
            source.refuse(word, "unknown outcome " + compact_text(word));
    }
}

std::chrono::milliseconds hardware_test_duration(State& state, const Entry_Row& row,
                                                 const Json::Value& request)
{
    const Test_Row* const test = find_test(row.symbol);
    if (!test || !request.isObject() || !request[test->address].isString())
        return {};
    const Inventory::Place place = place_of(state, *test, request);
    return std::chrono::milliseconds(place ? outcome_of(place, *test)["milliseconds"].asUInt() : 0);
}

Json::Value memory_test(State& state, const Json::Value& request)
{
    return test_answer(state, request, "diagMemoryTest");
}
Json::Value pci_loopback_test(State& state, const Json::Value& request)
{
    return test_answer(state, request, "diagPCILoopbackTest");
}
Json::Value loopback_test(State& state, const Json::Value& request)
{
    return test_answer(state, request, "diagLoopbackTest");
}
Json::Value eth_loopback_test(State& state, const Json::Value& request)
{
    return test_answer(state, request, "diagEthLoopbackTest");
}

} // namespace KPRV::simulator
