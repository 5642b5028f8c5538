#include "simulator/Entry_Points.h"

#include "contracts/adapter/Signatures.h"
#include "module/runtime/system/Standard_Mutex.h"
#include "simulator/Behaviours.h"
#include "simulator/Simulator.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <set>
#include <type_traits>

namespace KPRV::simulator {

namespace {

constexpr std::size_t ENTRY_COUNT = 0
#define ENTRY_POINT(symbol, variable, signature) +1
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
    ;

// A row of another name, two of one, or one too few: none of it compiles.
constexpr auto rows = [] {
    std::array<Entry_Row, ENTRY_COUNT> filled = {};
    const auto fill = [&](Entry entry, const Entry_Row& row) {
        Entry_Row& place = filled[static_cast<std::size_t>(entry)];
        if (place.symbol)
            throw "an entry point has two rows";
        place = row;
    };
#define ROW(symbol, request, behaviour) fill(Entry::symbol, {#symbol, request, behaviour});
#include "simulator/Behaviours.def"
#undef ROW
    return filled;
}();
static_assert(std::ranges::all_of(rows, [](const Entry_Row& row) { return row.symbol != nullptr; }),
              "an entry point has no row");

Json::Value ask(Entry entry, const Json::Value& request = {})
{
    return Simulator::instance().answer(entry, request);
}

// A fault may answer anything in place of a number or a text. What is neither counts as a failure,
// told as the callers of such entry points know it.
std::uint32_t count_of(const Json::Value& answer)
{
    return answer.isUInt() ? answer.asUInt() : 65535U;
}

std::int32_t integer_of(const Json::Value& answer)
{
    return answer.isInt() ? answer.asInt() : -1;
}

// The caller may keep the text for ever.
const char* lasting_text(const Json::Value& answer)
{
    static constinit Standard_Mutex<> mutex;
    static std::set<std::string>* const texts PT_GUARDED_BY(mutex) = new std::set<std::string>;
    if (!answer.isString())
        return nullptr;
    const Auto_Lock lock(mutex);
    return texts->insert(answer.asString()).first->c_str();
}

Json::Value registration(bool registers)
{
    Json::Value request;
    request["callback"] = registers;
    return request;
}

} // namespace

const Entry_Row& row_of(Entry entry)
{
    return rows[static_cast<std::size_t>(entry)];
}

const Entry_Row* find_entry(std::string_view symbol)
{
    const auto found = std::ranges::find(rows, symbol, &Entry_Row::symbol);
    return found == rows.end() ? nullptr : &*found;
}

} // namespace KPRV::simulator

namespace simulator = KPRV::simulator;
using simulator::Entry;

#define EXPORTED(result, symbol, arguments)                                                                  \
    extern "C" __attribute__((visibility("default"))) result symbol arguments;                               \
    result symbol arguments

#define DEFINE_JsonReqFP(symbol)                                                                             \
    EXPORTED(Json::Value, symbol, (const Json::Value& request))                                              \
    {                                                                                                        \
        return simulator::ask(Entry::symbol, request);                                                       \
    }
#define DEFINE_voidRetStrFP(symbol)                                                                          \
    EXPORTED(const char*, symbol, ())                                                                        \
    {                                                                                                        \
        return simulator::lasting_text(simulator::ask(Entry::symbol));                                       \
    }
#define DEFINE_voidRetUIntFP(symbol)                                                                         \
    EXPORTED(std::uint32_t, symbol, ())                                                                      \
    {                                                                                                        \
        return simulator::count_of(simulator::ask(Entry::symbol));                                           \
    }
#define DEFINE_voidRetIntFP(symbol)                                                                          \
    EXPORTED(std::int32_t, symbol, ())                                                                       \
    {                                                                                                        \
        return simulator::integer_of(simulator::ask(Entry::symbol));                                         \
    }
#define DEFINE_log4cxxMsgRetVoidFP(symbol)                                                                   \
    EXPORTED(void, symbol, (KPRV::log4cxxMsgCB callback))                                                    \
    {                                                                                                        \
        simulator::ask(Entry::symbol, simulator::registration(callback != nullptr));                         \
        simulator::Simulator::instance().set_log_callback(callback);                                         \
    }
#define DEFINE_evtProcessCBRetVoidFP(symbol)                                                                 \
    EXPORTED(void, symbol, (KPRV::evtProcessCB callback))                                                    \
    {                                                                                                        \
        simulator::ask(Entry::symbol, simulator::registration(callback != nullptr));                         \
        simulator::Simulator::instance().set_event_callback(callback);                                       \
    }

#define ENTRY_POINT(symbol, variable, signature)                                                             \
    DEFINE_##signature(symbol) static_assert(std::is_same_v<decltype(&symbol), KPRV::signature>);
#include "contracts/adapter/Entry_Points.def"
