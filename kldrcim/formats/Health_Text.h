#pragma once

#include "kldrcim/walks/Health.h"

namespace KPRV::kldrcim {

/// One line a finding, with its element's path at the end; one line if there is none.
std::string health_lines(const Health_Report& report);

/// One object: "status", "findings" and what was counted.
std::string health_json(const Health_Report& report);

/// The one line of a monitoring plugin: status, the worst finding, and behind a bar the performance data.
std::string health_plugin_line(const Health_Report& report);

} // namespace KPRV::kldrcim
