// Behaviours of hardware tests: posted, started, cancelled, asked after.
#include "simulator/Behaviours.h"
#include "simulator/Lookup.h"
#include "simulator/Target.h"

#include <algorithm>
#include <iterator>

namespace KPRV::simulator {

namespace {

// What a test needs to be there.
enum class Needs
{
    ADAPTER,
    PORT, // of either kind
    FC_PORT,
    ETH_PORT,
    LINK,   // an FC port with something plugged in
    DPORT,  // an FC port that setDport has enabled
    REMOTE, // an enabled FC port that sees the remote port
};

struct Test_Kind
{
    const char* function;
    const char* request; // the members that it must have, as in Behaviours.def
    Needs needs;
};

// clang-format off
constexpr Test_Kind kinds[] = {
    {"QuickTest",       "hbaWwn",                                                        Needs::ADAPTER},
    {"MemoryTest",      "hbaWwn",                                                        Needs::ADAPTER},
    {"QueueTest",       "hbaWwn portWwn",                                                Needs::PORT},
    {"PCILoopbackTest", "hbaWwn portWwn frameCount dataPattern numCycles",               Needs::PORT},
    {"DPortTest",       "hbaWwn portWwn frameCount dataPattern numCycles",               Needs::DPORT},
    {"LoopbackTest",    "portWwn mode speed numCycles frameCount dataPattern",           Needs::LINK},
    {"EthLoopbackTest", "portWwn mode speed numCycles frameCount dataPattern",           Needs::ETH_PORT},
    {"LEDTest",         "hbaWwn portWwn ledBitmap command color frequency",              Needs::PORT},
    {"EchoTest",        "hbaWwn portWwn localPortWwn remotePortWwn vfID numCycles",      Needs::REMOTE},
    {"FCPingTest",      "hbaWwn portWwn localPortWwn remotePortWwn vfID numCycles",      Needs::REMOTE},
    {"FCTraceTest",     "hbaWwn portWwn localPortWwn remotePortWwn vfID numCycles",      Needs::REMOTE},
};
// clang-format on

const Test_Kind* find_kind(const Json::Value& function)
{
    const auto found = std::find_if(std::begin(kinds), std::end(kinds),
                                    [&](const Test_Kind& kind) { return function == kind.function; });
    return found == std::end(kinds) ? nullptr : found;
}

Scope port_scope(Needs needs)
{
    return needs == Needs::PORT ? Scope::PORT : needs == Needs::ETH_PORT ? Scope::ETH_PORT : Scope::FC_PORT;
}

// What the test is run on: its port, by way of the logical one, or its adapter.
Target tested(Inventory& inventory, const Test_Kind& kind, const Json::Value& request)
{
    if (request.isMember("hbaWwn")) {
        Target adapter = target_at(inventory, request["hbaWwn"], Scope::ADAPTER);
        if (!adapter || kind.needs == Needs::ADAPTER)
            return adapter;
    }
    Json::Value address;
    address["portWwn"] = request["portWwn"];
    if (kind.needs == Needs::REMOTE) {
        address["lPortWwn"] = request["localPortWwn"];
        address["vfID"] = request["vfID"];
    }
    return find_target(inventory, address, port_scope(kind.needs));
}

bool is_enabled(const Port& port)
{
    return !port.data["portStatus"].isBool() || port.data["portStatus"].asBool();
}

// Why the test will fail; empty if it will pass.
std::string failure_of(const Inventory& inventory, const Test_Kind& kind, const Target& target,
                       const Json::Value& request)
{
    const Json::Value& failing = inventory.posted_tests_members["failing"];
    if (std::find(failing.begin(), failing.end(), Json::Value(kind.function)) != failing.end())
        return "the hardware is at fault";
    const Port* port = target.port;
    if (kind.needs == Needs::LINK && !port->optics)
        return "nothing is plugged into the port";
    if (kind.needs == Needs::DPORT && !port->dport)
        return "the port is not enabled as a D-Port";
    if (kind.needs == Needs::REMOTE && !is_enabled(*port))
        return "the port is disabled";
    const Json::Value& remote = request["remotePortWwn"];
    if (kind.needs == Needs::REMOTE && !port->remote_ports.find(remote.isString() ? remote.asString() : ""))
        return "no answer from " + compact_text(remote);
    return "";
}

// Answers with what `answer` makes of the request's id and state; an id is a text that is not empty.
template <typename Answer>
Json::Value answer_for_request(State& state, const Json::Value& request, Answer answer)
{
    const Json::Value& id = request["requestID"];
    if (!id.isString() || id == "")
        return error_answer(Error_Code::REQUEST, "requestID must be a text");
    return answer(id.asString(), state.inventory.posted_tests.state(id.asString()));
}

Json::Value no_such_request(const std::string& id)
{
    return error_answer(Error_Code::NOT_FOUND, "no such request: " + compact_text(id));
}

Json::Value not_now(const std::string& id)
{
    return error_answer(Error_Code::CONFLICT, "not in the present state of request " + compact_text(id));
}

} // namespace

Json::Value post_test(State& state, const Json::Value& request)
{
    using Request = Posted_Tests::State;
    return answer_for_request(state, request, [&](const std::string& id, Request found) {
        const Test_Kind* kind = find_kind(request["function"]);
        if (!kind)
            return error_answer(Error_Code::REQUEST, "no such test: " + compact_text(request["function"]));
        const std::string missing = missing_member(kind->request, request);
        if (!missing.empty())
            return error_answer(Error_Code::REQUEST,
                                kind->function + std::string(": the request must have ") + missing);
        const Target target = tested(state.inventory, *kind, request);
        if (!target)
            return target.refusal;
        if (found != Request::UNKNOWN && found != Request::POSTED)
            return not_now(id);
        const unsigned duration = state.inventory.posted_tests_members["milliseconds"].asUInt();
        state.inventory.posted_tests.post(id, request, failure_of(state.inventory, *kind, target, request),
                                          std::chrono::milliseconds(duration));
        return done_answer();
    });
}

Json::Value start_tests(State& state, const Json::Value& request)
{
    using Request = Posted_Tests::State;
    if (!request["stopOnError"].isBool())
        return error_answer(Error_Code::REQUEST, "stopOnError must be true or false");
    return answer_for_request(state, request, [&](const std::string& id, Request found) {
        if (found == Request::UNKNOWN)
            return no_such_request(id);
        if (found != Request::POSTED)
            return not_now(id);
        state.inventory.posted_tests.start(id, request["stopOnError"].asBool());
        return done_answer();
    });
}

Json::Value cancel_tests(State& state, const Json::Value& request)
{
    using Request = Posted_Tests::State;
    return answer_for_request(state, request, [&](const std::string& id, Request found) {
        if (found == Request::UNKNOWN)
            return no_such_request(id);
        if (found != Request::POSTED && found != Request::RUNNING)
            return not_now(id);
        state.inventory.posted_tests.cancel(id);
        return done_answer();
    });
}

Json::Value test_results(State& state, const Json::Value& request)
{
    return answer_for_request(state, request, [&](const std::string& id, Posted_Tests::State found) {
        return found == Posted_Tests::State::UNKNOWN ? no_such_request(id)
                                                     : state.inventory.posted_tests.results(id);
    });
}

Json::Value set_dport(State& state, const Json::Value& request)
{
    if (!request["state"].isBool())
        return error_answer(Error_Code::REQUEST, "state must be true or false");
    return answer_for_request(state, request, [&](const std::string& id, Posted_Tests::State) {
        return answer_for_target(state, request, Scope::FC_PORT, [&](const Target& target) {
            target.port->dport = request["state"].asBool() ? std::optional(id) : std::nullopt;
            return done_answer();
        });
    });
}

Json::Value dport_result(State& state, const Json::Value& request)
{
    return answer_for_target(state, request, Scope::FC_PORT, [&](const Target& target) {
        const Port& port = *target.port;
        if (!port.dport)
            return error_answer(Error_Code::CONFLICT, "the port is not enabled as a D-Port");
        Json::Value answer;
        answer["portWwn"] = port.address;
        answer["requestID"] = *port.dport;
        for (const char* name : {"electricalLoopback", "opticalLoopback", "linkTraffic"})
            answer[name] = port.optics ? "Passed" : "Failed";
        return answer;
    });
}

} // namespace KPRV::simulator
