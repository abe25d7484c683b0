// Fixed-point money: a 64-bit count of ten-thousandths, exactly as the original runtime keeps it.
// Every conversion into Currency rounds half to even at the fourth decimal and raises error 6 when
// the result falls outside the range.
#pragma once

#include <compare>
#include <cstdint>

namespace xal {

class Currency {
 public:
  static constexpr int64_t kScale = 10000;

  constexpr Currency() = default;
  // The raw count of 1/10,000 units: FromRaw(12345) is 1.2345.
  static constexpr Currency FromRaw(int64_t raw) { return Currency(raw); }
  // Half-even rounding of the exact product value × 10,000; error 6 outside the range, NaN included.
  static Currency FromDouble(double value);
  static constexpr Currency FromInt(int64_t whole) { return Currency(whole * kScale); }

  constexpr int64_t raw() const { return raw_; }
  double ToDouble() const { return static_cast<double>(raw_) / kScale; }

  // Exact integer arithmetic; error 6 on overflow.
  Currency operator+(Currency other) const;
  Currency operator-(Currency other) const;
  Currency operator-() const;
  // Currency × Currency and Currency × integer stay Currency (exact product, half-even at 4 decimals).
  Currency operator*(Currency other) const;
  Currency MulInt(int64_t factor) const;

  constexpr auto operator<=>(const Currency&) const = default;

 private:
  constexpr explicit Currency(int64_t raw) : raw_(raw) {}
  int64_t raw_ = 0;
};

}  // namespace xal
