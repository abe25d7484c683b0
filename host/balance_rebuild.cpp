// The host's rebuild of the stored balances of closed periods, and the cost refresh a record merge
// asks for, as named data-object functions:
//   "ComputeBalance" on DBalanceStore, VBalanceBank or VBalanceCash (ParamList "Date", "CallBack"):
//                    the table refilled with the flows dated before "Date", per day and key; True.
//   "CountCost"      on GRArticle (ParamList "ID", "Filter"): the unit cost of the current balances
//                    of article "ID" ("Filter" empty) or store "ID" ("Filter" "1"); True.
#include <string>

#include "host/connection.h"
#include "host/data_object.h"
#include "host/host_error.h"
#include "runtime/convert.h"
#include "runtime/text.h"

namespace xal::host {

namespace {

Ref<ParamList> ParamsOf(const Variant& params, const char* function) {
  Ref<ParamList> list;
  if (params.IsObject()) list = std::dynamic_pointer_cast<ParamList>(params.AsObject());
  if (!list) Raise(kErrInvalidCall, std::string(function) + " needs a parameter list");
  return list;
}

// Stock flows per day, article and store, kept as the file database's stock balance reads them:
// the closed flows before DateFixed/Store plus the rows from that day on give the quantity on hand.
//  - DebitQFlow: quantity received into the store; CreditQFlow: quantity issued from it. A movement
//    between stores is a credit of the sender and a debit of the receiver.
//  - Services (article type S) and pre-reservations (deal state P) are left out, as the balance
//    leaves them out.
//  - DebitFlowBase: cost of the receipts in deal state ''; CreditFlowBase: cost of the issues not
//    pre-reserved: the same amounts the current balances and the running cost count.
//  - Store rows carry no reference-currency cost, so the Ref flows are 0.
//  - The day is the row's DocDate without its time.
constexpr const char* kRebuildStore = R"sql(
INSERT INTO DBalanceStore (DocDate, IDGRArticle, IDDRStore, DebitQFlow, CreditQFlow, DebitFlowBase,
                           CreditFlowBase, DebitFlowRef, CreditFlowRef)
SELECT Day, IDGRArticle, Store, total(DQ), total(CQ), total(DB), total(CB), 0, 0
FROM (SELECT CAST(DocDate AS INTEGER) AS Day, IDGRArticle, IDReceiverStore AS Store, BaseQuantity AS DQ, 0 AS CQ,
             CASE WHEN DealState = '' THEN Cost ELSE 0 END AS DB, 0 AS CB
        FROM DDStoreDRow
       WHERE IDReceiverStore IS NOT NULL AND ArticleType <> 'S' AND DealState <> 'P' AND DocDate < ?1
      UNION ALL
      SELECT CAST(DocDate AS INTEGER), IDGRArticle, IDSenderStore, 0, BaseQuantity, 0, Cost
        FROM DDStoreDRow
       WHERE IDSenderStore IS NOT NULL AND ArticleType <> 'S' AND DealState <> 'P' AND DocDate < ?1)
GROUP BY Day, IDGRArticle, Store)sql";

// Money flows per day, account (or cash desk) and currency from the voucher rows of that account.
// A row's sign says the direction: a positive Amount is money received (debit), a negative one
// money paid out (credit, stored as a positive flow); a row with Amount 0 goes by AmountBase.
// Base and Ref amounts follow their row's direction.
std::string MoneyRebuildSql(const std::string& table, const std::string& link) {
  const std::string in = "(CASE WHEN Amount <> 0 THEN Amount > 0 ELSE AmountBase >= 0 END)";
  return "INSERT INTO " + table + " (DocDate, " + link +
         ", IDGRCurrency, DebitFlow, CreditFlow, DebitFlowBase, CreditFlowBase, DebitFlowRef, CreditFlowRef) "
         "SELECT CAST(DocDate AS INTEGER), " + link + ", IDGRCurrency, "
         "total(CASE WHEN " + in + " THEN Amount END), total(CASE WHEN NOT " + in + " THEN -Amount END), "
         "total(CASE WHEN " + in + " THEN AmountBase END), total(CASE WHEN NOT " + in + " THEN -AmountBase END), "
         "total(CASE WHEN " + in + " THEN AmountRef END), total(CASE WHEN NOT " + in + " THEN -AmountRef END) "
         "FROM VDVoucherRow WHERE " + link + " <> 0 AND DocDate < ?1 "
         "GROUP BY CAST(DocDate AS INTEGER), " + link + ", IDGRCurrency";
}

// The progress of a rebuild is the caller's to report; the "CallBack" entry is not used.
Variant ComputeBalance(HostDataObject& self, const Variant& params, int32_t) {
  Ref<ParamList> list = ParamsOf(params, "ComputeBalance");
  const Variant dateArg = list->Item("Date");
  if (dateArg.IsEmpty() || dateArg.IsNull()) Raise(kErrInvalidCall, "ComputeBalance needs a date");
  const Variant before(CDate(dateArg).serial);
  Ref<HostConnection> conn = self.HostConn();
  Database& db = conn->db();
  const std::string table = self.TableName();
  std::string sql, target;
  if (TextEquals(table, "DBalanceStore")) {
    target = "DBalanceStore";
    sql = kRebuildStore;
  } else if (TextEquals(table, "VBalanceBank")) {
    target = "VBalanceBank";
    sql = MoneyRebuildSql(target, "IDGRBankAccount");
  } else if (TextEquals(table, "VBalanceCash")) {
    target = "VBalanceCash";
    sql = MoneyRebuildSql(target, "IDVRCashDesk");
  } else {
    Raise(kErrInvalidCall, "ComputeBalance does not know the balance table " + table);
  }
  // Both statements or neither: a balance table is never left half rebuilt.
  const bool own = conn->BeginTransaction();
  try {
    db.Exec("DELETE FROM " + target);
    db.Exec(sql, {before});
  } catch (...) {
    if (own) conn->RollbackTransaction();
    conn->InvalidateLinks();
    throw;
  }
  if (own) conn->CommitTransaction();
  conn->InvalidateLinks();
  return Variant(true);
}

// The least a merge relies on: the Cost column of the current balances of the article (or store)
// recomputed from their amount and quantity, as the current-balance refresh computes it. Article
// costs kept elsewhere (GRArticle.Cost) are the user's and stay as they are.
Variant CountCost(HostDataObject& self, const Variant& params, int32_t) {
  Ref<ParamList> list = ParamsOf(params, "CountCost");
  const int32_t id = CLng(list->Item("ID"));
  const bool byStore = Trim(CStr(list->Item("Filter"))) == "1";
  Ref<HostConnection> conn = self.HostConn();
  conn->db().Exec(std::string("UPDATE DCurBalanceStore SET Cost = CASE WHEN Quantity + RQuantity <> 0 THEN "
                              "AmountBase / (Quantity + RQuantity) ELSE 0 END WHERE ") +
                      (byStore ? "IDDRStore" : "IDGRArticle") + " = ?",
                  {Variant(id)});
  conn->InvalidateLinks();
  return Variant(true);
}

const bool kRegistered = [] {
  RegisterDataObjectFunction("ComputeBalance", ComputeBalance);
  RegisterDataObjectFunction("CountCost", CountCost);
  return true;
}();

}  // namespace

}  // namespace xal::host
