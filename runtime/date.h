// The host date type: serial days since 1899-12-30, the fraction being the time of day. Negative
// serials count whole days backwards while their fraction is still a time forwards from midnight
// (-1.25 is 1899-12-29 06:00), so splitting a serial truncates toward zero and takes |fraction|.
#pragma once

#include <compare>
#include <cstdint>

namespace xal {

struct Date {
  double serial = 0;

  constexpr Date() = default;
  constexpr explicit Date(double s) : serial(s) {}
  constexpr auto operator<=>(const Date&) const = default;
};

// Smallest and largest serials the type accepts: 100-01-01 and 9999-12-31 23:59:59.
constexpr double kMinDateSerial = -657434.0;
constexpr double kMaxDateSerial = 2958465.9999999;

}  // namespace xal
