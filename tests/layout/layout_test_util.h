// Helpers for the layout tests: arrays of definition objects as the host stores them, and the
// error number of a call.
#pragma once

#include "error_of.h"
#include <functional>
#include <initializer_list>
#include <vector>

#include "runtime/error.h"
#include "runtime/variant.h"

namespace xal::testing {

// A 1-D array with lower bound 0.
inline Variant Vec(std::vector<Variant> items) { return Variant(SafeArray::Vector(std::move(items))); }

// A 2-D array (rows, columns), bounds 0..rows-1 and 0..cols-1, filled row by row from `items`;
// Empty entries stay holes.
inline Variant Grid(int32_t rows, int32_t cols, std::vector<Variant> items) {
  SafeArray a({SafeArray::Bound{0, rows - 1}, SafeArray::Bound{0, cols - 1}});
  for (int32_t r = 0; r < rows; ++r)
    for (int32_t c = 0; c < cols; ++c) a.At({r, c}) = items.at(static_cast<size_t>(r * cols + c));
  return Variant(std::move(a));
}

// The run-time error number `f` raises; 0 when it returns normally.
using ::xal::test::ErrorOf;

}  // namespace xal::testing
