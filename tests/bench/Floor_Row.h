#pragma once

#include "tests/bench/Lean_Broker.h"

#include <functional>
#include <string>
#include <vector>

namespace KPRV::bench {

/// One request to the module, and the least that must be done for its answer: its floor.
struct Floor_Row
{
    /// A request with its objects made: what is counted is its call.
    using Request = std::function<void()>;
    using Maker = std::function<Request(Lean_Broker& server)>;

    std::string name;
    /// Makes the library ready, and whatever the makers use. Called once, before them.
    std::function<void()> prepare;
    Maker ours;
    /// Null: the library's calls that `ours` makes, the host's name, and its objects handed over.
    Maker floor = nullptr;
};

/// The floor of the row, after `prepare`. Ends the program if it delivers anything else than the module.
Floor_Row::Maker floor_of(const Floor_Row& row);

// The rows whose instructions count, and those whose memory does. With `tiny` they are of a small host.

std::vector<Floor_Row> floor_rows(bool tiny);
std::vector<Floor_Row> heap_rows(bool tiny);

/// What a program that runs rows does first: the server of the rows asks the module for single instances.
void serve_instances();

} // namespace KPRV::bench
