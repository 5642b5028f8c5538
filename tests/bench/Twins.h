#pragma once

#include "tests/bench/Lean_Broker.h"

#include <functional>
#include <string>

namespace KPRV::bench {

/// One measurement with its rival: the same request to the module and to the plain twin, over the same
/// answers of the library. Both are registered with the benchmark library as "<name>/ours" and
/// "<name>/plain".
struct Twins
{
    using Call = std::function<void(Lean_Broker& server)>;

    /// "B1 enumerate FC ports/64".
    std::string name;
    /// Makes the library ready. Called before each measurement; cheap the second time.
    std::function<void()> prepare;
    Call ours;
    Call plain;
    /// A call that takes seconds is measured as it is, once a repetition.
    bool slow = false;
    /// Other processes do part of the work.
    bool wall_clock = false;
};

/// Runs both once and compares what they returned; ends the program, with the first difference, if they
/// differ.
void check_equal(const Twins& twins);
/// Registers both. What is measured beside time, for each delivered object: calls of the allocator, and
/// bytes.
void add(const Twins& twins);

// Each adds the twins of one question. With `tiny`, only sizes that take no time.

void add_instances(bool tiny);
void add_paths(bool tiny);
void add_controlled_by(bool tiny);
void add_tunnel(bool tiny);
void add_agent_detection(bool tiny);

} // namespace KPRV::bench
