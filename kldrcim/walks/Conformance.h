#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/walks/Conformance_Plan.h"

namespace KPRV::kldrcim {

using namespace broker;

/// What one step of the walk came to.
struct Conformance_Finding
{
    enum class Verdict
    {
        OK,
        /// Nothing there, and nothing has to be.
        NONE,
        /// Something that has to be there is not; `missing` says what.
        MISSING,
        /// The step had no object to start at.
        NO_START,
    };

    const Conformance_Step* step;
    Verdict verdict = Verdict::OK;
    std::size_t found = 0;
    std::vector<std::string> missing = {};
};

/// Walks as a client does that knows profiles and nothing of this module: it enumerates registered profiles
/// and from there on follows associations by the names of the CIM Schema. One finding a step, in the order of
/// the plan.
std::vector<Conformance_Finding> check_conformance(Connection& connection);

/// True if a finding misses something.
bool misses_something(const std::vector<Conformance_Finding>& findings);

} // namespace KPRV::kldrcim
