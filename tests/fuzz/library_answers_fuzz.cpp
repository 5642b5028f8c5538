// Any answers of the adapter library, under every class that the managers build: an object with an answer for
// each entry point, where "!" throws. The builders give instances or nothing.
#include "module/managers/FCHBAManager.h"
#include "module/managers/HDRManager.h"
#include "tests/fuzz/Fuzz_Target.h"
#include "tests/support/Fake_Library.h"

using namespace KPRV;

namespace {

void answer(Fake_Library& library, const std::string& symbol, const Json::Value& value)
{
    if (value.isString() && value == "!")
        library.throws(symbol, HbaAgentError{7, "asked to"});
    else
        library.answers(symbol, value);
}

/// Without an array in a list of instances there is nothing to give back.
template <class Manager>
void build(const Manager& manager, int id)
{
    try {
        const Array<Instance*> instances = manager.getInstances(static_cast<classId_t>(id));
        for (uint32 i = 0; i < instances.size(); ++i) {
            FUZZ_EXPECT(instances[i] != nullptr);
            destroy(instances[i]);
        }
    } catch (const std::exception&) {
        // Some calls stand without a guard, and a member of another type ends them.
    } catch (const HbaAgentError&) {
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const char* const text = reinterpret_cast<const char*>(data);
    // Two adapters with two ports of eight remote ports make no other paths than one with one.
    constexpr std::size_t MOST = 1 << 14;
    if (size > MOST)
        return 0;
    Json::Value answers;
    Json::CharReaderBuilder builder;
    builder["stackLimit"] = 200;
    const std::unique_ptr<Json::CharReader> reader(builder.newCharReader());
    try {
        if (!reader->parse(text, text + size, &answers, nullptr) || !answers.isObject())
            return 0;
    } catch (const std::exception&) {
        return 0;
    }
    Fake_Library library;
    for (const std::string& symbol : answers.getMemberNames())
        answer(library, symbol, answers[symbol]);
    constexpr int LAST_CLASS_ID = 38;
    for (int id = 1; id <= LAST_CLASS_ID; ++id) {
        build(*FCHBAManager::getFCHBAManager(), id);
        build(*HDRManager::getHDRManager(), id);
    }
    return 0;
}
