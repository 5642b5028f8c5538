#include "simulator/Entry_Points.h"

#include "module/runtime/Standard_Mutex.h"
#include "simulator/Behaviours.h"
#include "simulator/Simulator.h"

#include <algorithm>
#include <cstdint>
#include <set>

namespace KPRV::simulator {

namespace {

constexpr Entry_Row rows[] = {
#define ROW(symbol, kind, request, behaviour) {#symbol, request, behaviour},
#include "simulator/Entry_Points.def"
#undef ROW
};

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

std::span<const Entry_Row> entry_rows()
{
    return rows;
}

const Entry_Row* find_entry(std::string_view symbol)
{
    const auto found = std::find_if(std::begin(rows), std::end(rows),
                                    [&](const Entry_Row& row) { return symbol == row.symbol; });
    return found == std::end(rows) ? nullptr : found;
}

} // namespace KPRV::simulator

namespace simulator = KPRV::simulator;
using simulator::Entry;

#define EXPORTED(result, symbol, arguments)                                                                  \
    extern "C" __attribute__((visibility("default"))) result symbol arguments;                               \
    result symbol arguments

#define DEFINE_JSON(symbol)                                                                                  \
    EXPORTED(Json::Value, symbol, (const Json::Value& request))                                              \
    {                                                                                                        \
        return simulator::ask(Entry::symbol, request);                                                       \
    }
#define DEFINE_TEXT(symbol)                                                                                  \
    EXPORTED(const char*, symbol, ())                                                                        \
    {                                                                                                        \
        return simulator::lasting_text(simulator::ask(Entry::symbol));                                       \
    }
#define DEFINE_COUNT(symbol)                                                                                 \
    EXPORTED(std::uint32_t, symbol, ())                                                                      \
    {                                                                                                        \
        return simulator::count_of(simulator::ask(Entry::symbol));                                           \
    }
#define DEFINE_INTEGER(symbol)                                                                               \
    EXPORTED(std::int32_t, symbol, ())                                                                       \
    {                                                                                                        \
        return simulator::integer_of(simulator::ask(Entry::symbol));                                         \
    }
#define DEFINE_LOG_CB(symbol)                                                                                \
    EXPORTED(void, symbol, (simulator::Log_Callback callback))                                               \
    {                                                                                                        \
        simulator::ask(Entry::symbol, simulator::registration(callback != nullptr));                         \
        simulator::Simulator::instance().set_log_callback(callback);                                         \
    }
#define DEFINE_EVENT_CB(symbol)                                                                              \
    EXPORTED(void, symbol, (simulator::Event_Callback callback))                                             \
    {                                                                                                        \
        simulator::ask(Entry::symbol, simulator::registration(callback != nullptr));                         \
        simulator::Simulator::instance().set_event_callback(callback);                                       \
    }

#define ROW(symbol, kind, request, behaviour) DEFINE_##kind(symbol)
#include "simulator/Entry_Points.def"
