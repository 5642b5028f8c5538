#pragma once

#include "kldrcim/formats/Exposition.h"
#include "kldrcim/walks/Host_Readings.h"

namespace KPRV::kldrcim {

using namespace broker;

/// All families, in the order in which they are written.
std::vector<Metric_Family> metric_families();

/// A host in numbers. Every family is announced, also one without samples. `media_type` tells what it is:
///
///     Metrics_Notation notation = Metrics_Notation::OPENMETRICS;
///     answer(media_type(notation), metrics_text(read_host(connection), notation));
std::string metrics_text(const Host_Readings& readings, Metrics_Notation notation);

} // namespace KPRV::kldrcim
