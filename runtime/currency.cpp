// Currency arithmetic: conversion from Double with half-even rounding of the exact product
// value × 10,000, and exact integer +, −, × on the raw ten-thousandths. Amounts stored by the
// original system were produced this way, so every result has to agree to the last unit.
#include "runtime/currency.h"

#include <cmath>
#include <cstdint>
#include <limits>

#include "runtime/error.h"

namespace xal {

namespace {

using i128 = __int128;

constexpr int64_t kRawMax = std::numeric_limits<int64_t>::max();
constexpr int64_t kRawMin = std::numeric_limits<int64_t>::min();

Currency FromWide(i128 raw) {
  if (raw > kRawMax || raw < kRawMin) Raise(kErrOverflow);
  return Currency::FromRaw(static_cast<int64_t>(raw));
}

// Rounds a non-negative product given as p + e (p = the double product, e = its exact error as
// an fma yields it) to an integer, ties to even. The double product alone can land exactly on
// .5 although the true product is a hair above or below; e tells which side it really is.
i128 RoundProductHalfEven(double p, double e) {
  if (p >= 0x1p52) {
    // p is already an integer and e may carry a whole part of its own.
    double ew = std::floor(e);
    double frac = e - ew;  // exact, 0 <= frac < 1
    i128 n = static_cast<i128>(p) + static_cast<i128>(ew);
    bool up = frac > 0.5 || (frac == 0.5 && (n & 1) != 0);
    return n + (up ? 1 : 0);
  }
  double whole = std::floor(p);
  double frac = p - whole;  // exact: p >= 0 and whole <= p < whole + 1
  i128 n = static_cast<i128>(whole);
  bool up = frac > 0.5 || (frac == 0.5 && (e > 0 || (e == 0 && (n & 1) != 0)));
  return n + (up ? 1 : 0);
}

// Division of a scaled product by 10,000 with ties to even (sign-symmetric).
i128 DivScaleHalfEven(i128 num) {
  bool neg = num < 0;
  i128 mag = neg ? -num : num;
  i128 q = mag / Currency::kScale;
  i128 r = mag % Currency::kScale;
  if (r * 2 > Currency::kScale || (r * 2 == Currency::kScale && (q & 1) != 0)) ++q;
  return neg ? -q : q;
}

}  // namespace

Currency Currency::FromDouble(double value) {
  if (!std::isfinite(value)) Raise(kErrOverflow);
  double mag = std::fabs(value);
  double p = mag * static_cast<double>(kScale);
  // Anything at or beyond 2^63 ten-thousandths cannot fit, whatever the rounding does.
  if (!(p <= 0x1p63)) Raise(kErrOverflow);
  double e = std::fma(mag, static_cast<double>(kScale), -p);
  i128 n = RoundProductHalfEven(p, e);
  return FromWide(value < 0 ? -n : n);
}

Currency Currency::operator+(Currency other) const {
  int64_t r;
  if (__builtin_add_overflow(raw_, other.raw_, &r)) Raise(kErrOverflow);
  return Currency(r);
}

Currency Currency::operator-(Currency other) const {
  int64_t r;
  if (__builtin_sub_overflow(raw_, other.raw_, &r)) Raise(kErrOverflow);
  return Currency(r);
}

Currency Currency::operator-() const {
  if (raw_ == kRawMin) Raise(kErrOverflow);
  return Currency(-raw_);
}

Currency Currency::operator*(Currency other) const {
  // raw × raw carries the scale twice; the 128-bit product cannot overflow.
  i128 product = static_cast<i128>(raw_) * other.raw_;
  return FromWide(DivScaleHalfEven(product));
}

Currency Currency::MulInt(int64_t factor) const {
  return FromWide(static_cast<i128>(raw_) * factor);
}

}  // namespace xal
