#include "kldrcim/walks/Health_Plan.h"

#include <algorithm>
#include <cstring>
#include <string_view>

namespace KPRV::kldrcim {

namespace {

using enum Node_Kind;

// clang-format off
constexpr Finding_Kind finding_table[] = {
    {"adapter-out-of-service",  Rank::CRITICAL, "the adapter is not in service",
     "enable it, and look into the system log for why it was disabled"},
    {"driver-missing",          Rank::CRITICAL, "no driver runs it",
     "install or load the driver of the adapter"},
    {"port-link-down",          Rank::CRITICAL, "the link is down",
     "look at the switch port and the zoning"},
    {"port-no-contact",         Rank::CRITICAL, "no contact, nothing is at the other end",
     "check the cable, the transceiver and the switch port"},
    {"port-failed",             Rank::CRITICAL, "the port has failed",
     "run its diagnostic tests: kldrcim diag list"},
    {"target-lost",             Rank::CRITICAL, "the target does not answer",
     "check the storage system and the path to it"},
    {"diagnostic-failed",       Rank::CRITICAL, "its last diagnostic test failed",
     "read the records of the test: kldrcim ei KALDERA_DiagnosticCompletionRecord"},
    {"adapter-library-missing", Rank::UNKNOWN,  "the adapter library does not answer, so no adapter can be seen",
     "see that libdzntj.so is where the module looks for it"},
    {"no-adapter",              Rank::UNKNOWN,  "no adapter is seen",
     "if the host has one, look at its driver and into the module's log"},
    {"no-answer",               Rank::UNKNOWN,  "the provider does not answer",
     "look into the module's log"},
    {"port-errors-growing",     Rank::WARNING,  "it counts errors",
     "clean or replace the cable and the transceiver"},
    {"link-slow",               Rank::WARNING,  "the link is slower than it could be",
     "look at the speed of the switch port and at the transceiver"},
    {"port-degraded",           Rank::WARNING,  "the port is degraded",
     "run its diagnostic tests: kldrcim diag list"},
    {"port-disabled",           Rank::WARNING,  "the port is disabled",
     "enable it, or leave it out: --ignore"},
    {"port-not-in-service",     Rank::WARNING,  "the port is not in service",
     "look again soon; if it stays so, look into the system log"},
    {"target-not-in-service",   Rank::WARNING,  "the target is not in service",
     "look at the storage system"},
    {"single-path-target",      Rank::WARNING,  "only one port sees it",
     "cable and zone a second path, or leave it out: --ignore"},
    {"firmware-differs",        Rank::WARNING,  "its firmware is not the newest among the adapters of its model",
     "update it: kldrcim flash"},
};

// What is not listed is not in service; `in_service` lists what is.
constexpr Status_Finding status_findings[] = {
    {FC_PORT, 3,  "port-degraded"},
    {FC_PORT, 4,  "port-degraded"},
    {FC_PORT, 5,  "port-degraded"},
    {FC_PORT, 6,  "port-failed"},
    {FC_PORT, 7,  "port-failed"},
    {FC_PORT, 9,  "port-disabled"},
    {FC_PORT, 10, "port-disabled"},
    {FC_PORT, 12, "port-no-contact"},
    {FC_PORT, 13, "port-link-down"},
    {TARGET,  6,  "target-lost"},
    {TARGET,  7,  "target-lost"},
    {TARGET,  12, "target-lost"},
    {TARGET,  13, "target-lost"},
};
// clang-format on

constexpr const char* error_counter_names[] = {
    "ErrorFrames",       "DumpedFrames",
    "LinkFailures",      "LossOfSignalCounter",
    "LossOfSyncCounter", "PrimitiveSeqProtocolErrCount",
    "CRCErrors",         "InvalidTransmissionWords",
    "NOSCount",
};

int badness(Rank rank)
{
    return rank == Rank::CRITICAL ? 3 : rank == Rank::UNKNOWN ? 2 : rank == Rank::WARNING;
}

} // namespace

bool is_in_service(std::uint64_t operational_status)
{
    return operational_status == 2 || operational_status == 11;
}

const char* rank_name(Rank rank)
{
    static constexpr const char* names[] = {"ok", "warning", "critical", "unknown"};
    return names[static_cast<int>(rank)];
}

Rank worse(Rank a, Rank b)
{
    return badness(a) < badness(b) ? b : a;
}

std::span<const Finding_Kind> finding_kinds()
{
    return finding_table;
}

const Finding_Kind* find_finding(const char* name)
{
    const auto at = std::ranges::find_if(
        finding_table, [&](const Finding_Kind& kind) { return std::strcmp(kind.name, name) == 0; });
    return at == std::end(finding_table) ? nullptr : &*at;
}

const Finding_Kind* finding_of_status(Node_Kind element, std::uint64_t operational_status)
{
    if (is_in_service(operational_status))
        return nullptr;
    if (element == ADAPTER)
        return find_finding("adapter-out-of-service");
    const Node_Kind kind = element == ETHERNET_PORT ? FC_PORT : element;
    for (const Status_Finding& each : status_findings)
        if (each.element == kind && each.operational_status == operational_status)
            return find_finding(each.finding);
    return find_finding(kind == TARGET ? "target-not-in-service" : "port-not-in-service");
}

std::span<const char* const> error_counters()
{
    return error_counter_names;
}

} // namespace KPRV::kldrcim
