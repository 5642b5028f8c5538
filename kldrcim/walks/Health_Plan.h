#pragma once

#include "kldrcim/walks/Topology_Plan.h"

#include <cstdint>
#include <span>

namespace KPRV::kldrcim {

/// How bad it is: the exit statuses of monitoring plugins.
enum class Rank
{
    OK,
    WARNING,
    CRITICAL,
    UNKNOWN,
};

/// "ok", "warning", "critical", "unknown".
const char* rank_name(Rank rank);

/// The worse of two: what is broken comes before what nobody can tell, and that before what may break.
Rank worse(Rank a, Rank b);

/// Something that can be wrong.
struct Finding_Kind
{
    const char* name;
    Rank rank;
    /// What it says of an element.
    const char* words;
    const char* advice;
};

/// All of them: the worst first, and within a rank in the order in which they are told.
std::span<const Finding_Kind> finding_kinds();

/// Null for a name that is none.
const Finding_Kind* find_finding(const char* name);

/// True for an `OperationalStatus` of what does what it is there for: OK, and in service.
bool is_in_service(std::uint64_t operational_status);

/// What a status of an element means.
struct Status_Finding
{
    Node_Kind element;
    std::uint64_t operational_status;
    /// Name of the finding.
    const char* finding;
};

/// The finding of an element with that status; null if it does what it is there for, or says nothing.
const Finding_Kind* finding_of_status(Node_Kind element, std::uint64_t operational_status);

/// Counters of KALDERA_FCPortStatistics that do not grow on a link that is well.
std::span<const char* const> error_counters();

} // namespace KPRV::kldrcim
