#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace KPRV::broker {

/// True for the 25 characters of a CIM timestamp (`yyyymmddhhmmss.mmmmmm+ooo`) or interval
/// (`ddddddddhhmmss.mmmmmm:000`): digits or asterisks in their places.
bool is_datetime_text(std::string_view text);
bool is_interval_text(std::string_view text);

/// Microseconds since 1970 in UTC, or of the interval. Asterisks count as zero.
std::uint64_t datetime_microseconds(std::string_view text);

/// The 25 characters; a timestamp is written in UTC.
std::string datetime_text(std::uint64_t microseconds, bool interval);

} // namespace KPRV::broker
