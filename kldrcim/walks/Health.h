#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/walks/Health_Plan.h"

#include <functional>

namespace KPRV::kldrcim {

using namespace broker;

/// Something that is wrong with an element.
struct Health_Finding
{
    const Finding_Kind* kind;
    Node_Kind element_kind;
    /// A class name alone where no instance can be named.
    Instance_Value element;
    /// What more there is to say of it; one line, may be empty.
    std::string detail = {};
};

/// What was looked at, beside what was found.
struct Health_Report
{
    Rank rank = Rank::OK;
    /// The worst first; within a kind in the order of the host.
    std::vector<Health_Finding> findings;
    std::size_t adapters = 0;
    std::size_t ports = 0;
    std::size_t ports_in_service = 0;
    /// Target ports, each once.
    std::size_t targets = 0;
    /// By how much all error counters have grown between two looks; nothing after one look.
    std::optional<std::uint64_t> errors_grown;
};

struct Health_Options
{
    /// Called between two looks at the counters; null for one look, which sees no growth.
    std::function<void()> pause;
    /// Names of findings, and addresses of adapters, ports and targets, that nobody wants to hear of.
    /// Addresses are hexadecimal digits alone, in small letters.
    std::vector<std::string> ignored = {};
};

/// Looks at the whole host but its logical units.
Health_Report check_health(Connection& connection, const Health_Options& options);

} // namespace KPRV::kldrcim
