// Tests of the Currency type: rounding a Double into ten-thousandths (half to even on the exact
// product, not on the rounded double product) and the exact integer arithmetic with its overflow
// checks. Amounts in stored documents were computed this way, so every raw unit matters.
#include <gtest/gtest.h>

#include "error_of.h"

#include <cmath>
#include <functional>
#include <limits>

#include "runtime/currency.h"
#include "runtime/error.h"

namespace xal {
namespace {

constexpr int64_t kMax = std::numeric_limits<int64_t>::max();
constexpr int64_t kMin = std::numeric_limits<int64_t>::min();

// Runs f and returns the run-time error number it raised, 0 when none.
using ::xal::test::ErrorOf;

TEST(CurrencyTest, FromDoubleRoundsExactProductHalfEven) {
  struct Row {
    double input;
    int64_t raw;
    int error;
  };
  const Row rows[] = {
      {1.5, 15000, 0},
      {1.03125, 10312, 0},    // 10312.5 exactly: tie goes to even
      {1.09375, 10938, 0},    // 10937.5 exactly: tie goes to even
      {-1.03125, -10312, 0},
      {2.675, 26750, 0},      // the double is a hair below 2.675, still nearest 26750
      {0.00005, 1, 0},        // double product is 0.5 but the exact one lies above the tie
      {-0.00005, -1, 0},
      {0.00015, 1, 0},        // the double is below 1.5E-4: exact product under the tie
      {0.00025, 3, 0},        // the double is above 2.5E-4: up, where a false tie would give 2
      {0.3, 3000, 0},
      {0.0, 0, 0},
      {-0.0, 0, 0},
      {922337203685477.0, 9223372036854770000, 0},
      {-922337203685477.0, -9223372036854770000, 0},
      {1e15, 0, kErrOverflow},                     // beyond the Currency range
      {922337203685477.5807, 0, kErrOverflow},     // the nearest double is .625: just out of range
      {-1e300, 0, kErrOverflow},                   // far out of range
      {std::nan(""), 0, kErrOverflow},             // not a number
      {std::numeric_limits<double>::infinity(), 0, kErrOverflow},  // infinite
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.input);
    int64_t raw = 0;
    EXPECT_EQ(ErrorOf([&] { raw = Currency::FromDouble(r.input).raw(); }), r.error);
    if (!r.error) {
      EXPECT_EQ(raw, r.raw);
    }
  }
}

enum class Op { Add, Sub, Mul, MulInt, Neg };

TEST(CurrencyTest, ArithmeticIsExactAndChecksOverflow) {
  struct Row {
    Op op;
    int64_t a, b;  // raw operands (for MulInt, b is the integer factor)
    int64_t raw;
    int error;
  };
  const Row rows[] = {
      {Op::Add, 1000, 2000, 3000, 0},
      {Op::Add, kMax, 1, 0, kErrOverflow},          // past the largest amount
      {Op::Add, kMin, -1, 0, kErrOverflow},         // past the smallest amount
      {Op::Sub, 1000, 2500, -1500, 0},
      {Op::Sub, kMax, -1, 0, kErrOverflow},         // subtracting a negative overflows upward
      {Op::Sub, kMin, 1, 0, kErrOverflow},          // below the smallest amount
      {Op::Neg, 15000, 0, -15000, 0},
      {Op::Neg, kMin, 0, 0, kErrOverflow},          // -(-922337203685477.5808) does not fit
      {Op::Mul, 999900, 1800, 179982, 0},           // 99.99 × 0.18 = 17.9982
      {Op::Mul, 15000, 15000, 22500, 0},            // 1.5 × 1.5
      {Op::Mul, 1, 5000, 0, 0},                     // 0.00005: tie to even 0
      {Op::Mul, 3, 5000, 2, 0},                     // 0.00015: tie to even 0.0002
      {Op::Mul, -3, 5000, -2, 0},                   // symmetric for negatives
      {Op::Mul, 7, 3333, 2, 0},                     // 0.00023331 → 0.0002
      {Op::Mul, kMax, 10000, kMax, 0},              // × 1 keeps the largest amount
      {Op::Mul, 1000000000000, 1000000000000, 0, kErrOverflow},  // 1E8 × 1E8 = 1E16
      {Op::MulInt, 9000000000000000000, 2, 0, kErrOverflow},     // CCur(900000000000000) * 2
      {Op::MulInt, 15000, -3, -45000, 0},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(testing::Message() << int(r.op) << " " << r.a << " " << r.b);
    Currency a = Currency::FromRaw(r.a), b = Currency::FromRaw(r.b), out;
    int err = ErrorOf([&] {
      switch (r.op) {
        case Op::Add: out = a + b; break;
        case Op::Sub: out = a - b; break;
        case Op::Mul: out = a * b; break;
        case Op::MulInt: out = a.MulInt(r.b); break;
        case Op::Neg: out = -a; break;
      }
    });
    EXPECT_EQ(err, r.error);
    if (!r.error) {
      EXPECT_EQ(out.raw(), r.raw);
    }
  }
}

}  // namespace
}  // namespace xal
