#pragma once

#include "simulator/Entry_Points.h"
#include "simulator/State.h"

#include <chrono>

namespace KPRV::simulator {

/// Throws Refused, with the line, unless `written` is a "diagnostics" member: an outcome for each of some of
/// the four entry points that test hardware.
void check_hardware_tests(const Json_Text& source, const Json::Value& written);

/// How long the test takes that the call asks for; 0 for a call that is no test, or one without an outcome.
std::chrono::milliseconds hardware_test_duration(State& state, const Entry_Row& row,
                                                 const Json::Value& request);

} // namespace KPRV::simulator
