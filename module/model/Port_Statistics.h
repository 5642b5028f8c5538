#pragma once

#include "module/runtime/ground/Types.h"
#include "module/schema/KALDERA_FCPortStatistics.h"

#include <json/value.h>

namespace KPRV {

/// The counters of one port; `Port_Statistics.cpp` knows the place of each.
struct prov_pport_stats_s
{
    uint64 counters[33];
};
static_assert(sizeof(prov_pport_stats_s) == 264);

/// Adds what an answer of `getDynamicPortStatistics` tells: an array of objects with `id` and `value`, a
/// number in decimal text. An FC port and an FCoE port use different ids; unknown ones are skipped. Throws
/// `Not_Convertible` for a member of the wrong type.
void read_statistics(const Json::Value& answer, bool fcoe, prov_pport_stats_s& statistics);

/// Sets the fourteen counters of the instance.
void set_counters(const prov_pport_stats_s& statistics, bool fcoe, KALDERA_FCPortStatistics& instance);

} // namespace KPRV
