// In-place ascending sort of a Variant array for scripts: a 1-D array by its elements, a 2-D array
// row by row keyed on its first column. Values compare as the runtime's "<" does with text
// comparison, so "b" and "B" are equal and numbers compare as numbers. The quicksort keeps its own
// small stack of ranges instead of recursing, always deferring the larger part, so the stack never
// holds more than about log2(n) ranges.
#include <array>
#include <utility>

#include "runtime/operators.h"
#include "server/array_sort.h"

namespace xal::server {

namespace {

// Pending (low, high) ranges; 65 pairs cover any array the 32-bit bounds allow.
constexpr size_t kMaxPending = 65;

// The array seen as rows: row i is element i (1-D) or the elements (i, lb2..ub2) (2-D).
class Rows {
 public:
  explicit Rows(SafeArray& a) : a_(a), twoD_(a.Dims() == 2) {
    if (a.Dims() > 2) Raise(kErrSubscript);  // rows of a 3-D array have no single first column
  }
  int32_t Low() const { return a_.LBound(1); }
  int32_t High() const { return a_.UBound(1); }
  const Variant& Key(int32_t i) const { return twoD_ ? a_.At({i, a_.LBound(2)}) : a_.At({i}); }
  void Swap(int32_t i, int32_t j) {
    if (i == j) return;
    if (!twoD_) {
      std::swap(a_.At({i}), a_.At({j}));
      return;
    }
    for (int32_t c = a_.LBound(2); c <= a_.UBound(2); ++c) std::swap(a_.At({i, c}), a_.At({j, c}));
  }

 private:
  SafeArray& a_;
  bool twoD_;
};

// "a < b" as a condition: a comparison with Null is not true.
bool Less(const Variant& a, const Variant& b) {
  const std::optional<int> c = Compare(a, b, CompareMode::Text);
  return c && *c < 0;
}

// Partitions [low, high] around its middle element and returns the pivot's final position.
int32_t Partition(Rows& rows, int32_t low, int32_t high) {
  rows.Swap(low, low + (high - low) / 2);
  const Variant pivot = rows.Key(low);
  int32_t i = low + 1;
  int32_t j = high;
  for (;;) {
    while (i < j && Less(rows.Key(i), pivot)) ++i;
    while (j >= i && Less(pivot, rows.Key(j))) --j;
    if (i >= j) break;
    rows.Swap(i, j);
    ++i;
    --j;
  }
  rows.Swap(low, j);
  return j;
}

}  // namespace

void ArraySort(Variant& pArray) {
  if (!pArray.IsArray()) return;
  Rows rows(pArray.MutableArray());
  std::array<std::pair<int32_t, int32_t>, kMaxPending> pending;
  size_t depth = 0;
  pending[depth++] = {rows.Low(), rows.High()};
  while (depth > 0) {
    auto [low, high] = pending[--depth];
    while (low < high) {
      const int32_t j = Partition(rows, low, high);
      // Sort the smaller part next and keep the larger for later (only if it has 2+ elements).
      if (j - low < high - j) {
        if (high - (j + 1) >= 1) {
          if (depth == kMaxPending) Raise(kErrSubscript);
          pending[depth++] = {j + 1, high};
        }
        high = j - 1;
      } else {
        if ((j - 1) - low >= 1) {
          if (depth == kMaxPending) Raise(kErrSubscript);
          pending[depth++] = {low, j - 1};
        }
        low = j + 1;
      }
    }
  }
}

}  // namespace xal::server
