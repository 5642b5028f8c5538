#pragma once

#include <json/json.h>
#include <span>
#include <string_view>

namespace KPRV::simulator {

struct State;

/// What an entry point answers, by the state of the library, which it may change. Runs under the
/// simulator's lock, on a request that has the members its row asks for.
using Behaviour = Json::Value (*)(State& state, const Json::Value& request);

/// A row of Entry_Points.def.
struct Entry_Row
{
    const char* symbol;
    const char* request;
    Behaviour behaviour;
};

/// Every entry point, as an index of the table.
enum class Entry
{
#define ROW(symbol, kind, request, behaviour) symbol,
#include "simulator/Entry_Points.def"
#undef ROW
};

std::span<const Entry_Row> entry_rows();

/// The row of that name, or a null pointer.
const Entry_Row* find_entry(std::string_view symbol);

} // namespace KPRV::simulator
