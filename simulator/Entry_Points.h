#pragma once

#include <json/json.h>
#include <string_view>

namespace KPRV::simulator {

struct State;

/// What an entry point answers, by the state of the library, which it may change. Runs under the
/// simulator's lock, on a request that has the members its row asks for.
using Behaviour = Json::Value (*)(State& state, const Json::Value& request);

/// An entry point and its row of Behaviours.def.
struct Entry_Row
{
    const char* symbol;
    const char* request;
    Behaviour behaviour;
};

/// Every entry point, in the order of the library's contract.
enum class Entry
{
#define ENTRY_POINT(symbol, variable, signature) symbol,
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
};

const Entry_Row& row_of(Entry entry);

/// The row of that name, or a null pointer.
const Entry_Row* find_entry(std::string_view symbol);

} // namespace KPRV::simulator
