// CIM datetime texts (DSP0004, 5.2.4): `yyyymmddhhmmss.mmmmmmsutc` for a point in time,
// `ddddddddhhmmss.mmmmmm:000` for an interval.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace velkhost::broker::datetime {

// As loosely as brokers of the sfcb kind look at it: 25 characters, with + - or : at index 21.
bool is_valid(std::string_view text);

bool is_interval(std::string_view text);

// Microseconds since 1970-01-01 UTC, or the interval's length. Characters that are no digits, such
// as the wildcard '*', count as 0.
std::uint64_t to_microseconds(std::string_view text);

// The text of that moment in UTC, or of that length.
std::string from_microseconds(std::uint64_t microseconds, bool interval);

}  // namespace velkhost::broker::datetime
