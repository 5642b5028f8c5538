#include "module/model/Port_Statistics.h"

#include "module/adapter/Json_Access.h"

#include <algorithm>
#include <cstdlib>
#include <iterator>
#include <span>

namespace KPRV {

namespace {

using S = KALDERA_FCPortStatistics;

struct Fc_Row
{
    int id;
    Property<uint64> S::*property;
};

// The place of a row is the place of its counter.
// clang-format off
constexpr Fc_Row fc_rows[] = {
//   id    property
    {1402, &S::PacketsTransmitted},
    {1403, &S::BytesTransmitted},
    {1409, &S::PacketsReceived},
    {1410, &S::BytesReceived},
    {1411, &S::LIPCount},
    {1412, &S::NOSCount},
    {1416, &S::CRCErrors},
    {1421, &S::ErrorFrames},
    {1422, &S::DumpedFrames},
    {1423, &S::LinkFailures},
    {1424, &S::LossOfSyncCounter},
    {1425, &S::LossOfSignalCounter},
    {1426, &S::PrimitiveSeqProtocolErrCount},
    {1428, &S::InvalidTransmissionWords},
};

enum Fcoe_Counter : size_t { A = std::size(fc_rows), B, C, D, E, F, COUNTERS };

struct Fcoe_Row
{
    int id;
    Fcoe_Counter counter;
};

constexpr Fcoe_Row fcoe_rows[] = {
//   id    counter
    {1615, A},
    {1616, B},
    {1624, C},
    {1625, D},
    {1626, B}, // the same counter as 1616: the later element wins
    {1627, E},
    {1628, F},
};
// clang-format on

static_assert(COUNTERS <= std::size(prov_pport_stats_s{}.counters));

/// The counter that an id stands for; null for an id that nobody asks about.
uint64* counter_of(int id, bool fcoe, prov_pport_stats_s& statistics)
{
    if (fcoe) {
        const auto row = std::ranges::find(fcoe_rows, id, &Fcoe_Row::id);
        return row == std::end(fcoe_rows) ? nullptr : &statistics.counters[row->counter];
    }
    const auto row = std::ranges::find(fc_rows, id, &Fc_Row::id);
    return row == std::end(fc_rows) ? nullptr : &statistics.counters[row - std::begin(fc_rows)];
}

} // namespace

void read_statistics(const Json::Value& answer, bool fcoe, prov_pport_stats_s& statistics)
{
    for (const Json::Value& entry : answer) {
        if (uint64* counter = counter_of(asInt(member(entry, "id")), fcoe, statistics))
            *counter = static_cast<uint64>(strtoll(asString(member(entry, "value")).c_str(), nullptr, 10));
    }
}

void set_counters(const prov_pport_stats_s& statistics, bool fcoe, KALDERA_FCPortStatistics& instance)
{
    const uint64* counters = statistics.counters;
    for (const Fc_Row& row : fc_rows)
        (instance.*row.property).set(fcoe ? 0 : counters[&row - fc_rows]);
    if (!fcoe)
        return;
    // The library gives an FCoE port no counters of frames and bytes, or of the FC link below: what is not
    // named here is 0 however many frames have passed.
    instance.ErrorFrames.set(counters[A] + counters[B] + counters[D] + counters[E] + counters[F]);
    instance.DumpedFrames.set(counters[C]);
    instance.CRCErrors.set(counters[B]);
}

} // namespace KPRV
