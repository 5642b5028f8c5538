// Any text as a request of the agent. What may leave is a reply or, for a request of the wrong kind, a
// standard exception.
#include "module/agent/JsonRpcManager.h"
#include "tests/fuzz/Fuzz_Target.h"
#include "tests/support/Fake_Library.h"

using namespace KPRV;

namespace {

/// A library that counts its adapters wrongly is walked to the end that it names; here that end is near.
void make_small(Json::Value& answer, const char* member)
{
    constexpr int MOST = 16;
    if (answer.isObject() && answer[member].isNumeric() && answer[member].asDouble() > MOST)
        answer[member] = MOST;
}

/// Answers what it is asked, so that the texts of requests are walked in replies too; what is asked for an
/// exception gets it.
Json::Value echo(const Json::Value& request)
{
    if (request.isObject() && request.isMember("throw"))
        throw HbaAgentError{7, "asked to"};
    Json::Value answer = request;
    make_small(answer, "numOfAdapters");
    if (answer.isObject() && answer["adapter"].isArray())
        for (Json::Value& adapter : answer["adapter"])
            make_small(adapter, "numOfPorts");
    return answer;
}

void answer_everything(Fake_Library& library)
{
#define ENTRY_POINT(symbol, variable, signature) library.answers(#symbol, Fake_Library::Answer(echo));
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    static Fake_Library& library = *new Fake_Library;
    static const bool ready = (answer_everything(library), true);
    (void)ready;
    library.calls.clear();
    JsonRpcManager::response reply;
    try {
        JsonRpcManager::instance()->process(std::string(reinterpret_cast<const char*>(data), size), reply);
        FUZZ_EXPECT(reply.status == 200 || reply.status == 500);
        FUZZ_EXPECT(!reply.text.empty());
    } catch (const std::exception&) {
    }
    return 0;
}
