// Rebuilding the kept balances from their defining views, and the bulk load around it.
#include "host/kept_balances.h"

#include "runtime/error.h"
#include "runtime/text.h"

namespace xal::host {

void RebuildStockBalances(Database& db, const std::string& field, const Variant& value) {
  if (!field.empty() && !TextEquals(field, "IDGRArticle") && !TextEquals(field, "IDDRStore"))
    Raise(kErrInvalidCall, "The current balances have no key field " + field);
  const std::string where = field.empty() ? "" : " WHERE " + field + " = ?";
  std::vector<Variant> args;
  if (!field.empty()) args.push_back(value);
  db.Exec("DELETE FROM DCurBalanceStore" + where, args);
  db.Exec("INSERT INTO DCurBalanceStore SELECT * FROM vCurBalanceStore" + where, args);
}

void RebuildReserveBalances(Database& db) {
  db.Exec("DELETE FROM DCurDRStockReserve");
  db.Exec("INSERT INTO DCurDRStockReserve SELECT * FROM vCurDRStockReserve");
}

void LoadInBulk(HostConnection& conn, const std::function<void(Database&)>& load) {
  Database& db = conn.db();
  const bool own = conn.BeginTransaction();
  db.SetKeepsBalances(false);
  try {
    load(db);
    RebuildStockBalances(db);
    RebuildReserveBalances(db);
  } catch (...) {
    db.SetKeepsBalances(true);
    if (own) conn.RollbackTransaction();
    conn.InvalidateLinks();
    throw;
  }
  db.SetKeepsBalances(true);
  if (own) conn.CommitTransaction();
  conn.InvalidateLinks();
}

}  // namespace xal::host
