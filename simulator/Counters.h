#pragma once

#include "simulator/Json_Text.h"

#include <chrono>
#include <cstdint>
#include <json/json.h>
#include <span>
#include <vector>

namespace KPRV::simulator {

/// The statistics of a port, in the order in which the library tells them. An id may come twice.
class Counters
{
public:
    using Clock = std::chrono::steady_clock;

    /// Counters of these ids that stand at 0.
    explicit Counters(std::span<const unsigned> ids = {});

    /// Reads an array of [id, value] or [id, value, growth per second]. Throws Refused.
    Counters(const Json_Text& source, const Json::Value& written);

    /// An array of {"id", "value"}, the value in decimal digits.
    Json::Value answer(Clock::time_point now = Clock::now()) const;

    /// Sets all to 0. Those that grow go on growing.
    void reset(Clock::time_point now = Clock::now());

private:
    struct Counter
    {
        unsigned id;
        Json::Value start; // a number, or any text in its place
        std::uint32_t growth;
    };
    std::vector<Counter> _counters;
    Clock::time_point _since = Clock::now();
};

} // namespace KPRV::simulator
