// Small helpers the amount, tax and totals code shares: money rounded the one way every amount is
// rounded, and walks over a row set that leave the rows where they were found.
#pragma once

#include <cstdint>
#include <utility>

#include "bridge/host_model.h"
#include "runtime/convert.h"
#include "runtime/currency.h"
#include "runtime/trap.h"
#include "server/sql_utils.h"

namespace xal::docfunc {

// `value` rounded to `decimals` by the server's Round (2 for amounts and percentages, 4 for unit
// prices), as currency.
inline Currency RoundedMoney(double value, int16_t decimals) {
  return CCur(server::Round(Variant(value), decimals));
}
inline Currency RoundedMoney(Currency value, int16_t decimals) {
  return CCur(server::Round(Variant(value), decimals));
}

// The current row's bookmark, or Empty when there is no current row (past the last, no rows).
inline Variant PositionOf(DataObject& rows) {
  return rows.IsEOF() ? Variant() : TryOr([&] { return rows.Bookmark(); }, Variant());
}

// Back to `position`; an Empty position leaves the rows where they are.
inline void RestorePosition(DataObject& rows, const Variant& position) {
  if (!position.IsEmpty()) rows.GoToBookmark(position);
}

// Runs `step` on every row from the first (marked-deleted rows included) and puts the rows back on
// the row they were on, also when `step` fails.
template <class F>
void WalkRows(DataObject& rows, F&& step) {
  const Variant position = PositionOf(rows);
  try {
    for (rows.MoveFirst(); !rows.IsEOF(); rows.MoveNext()) step();
  } catch (...) {
    TryStep([&] { RestorePosition(rows, position); });
    throw;
  }
  RestorePosition(rows, position);
}

}  // namespace xal::docfunc
