// The host's "GetBalance" named function on the data objects of the balance tables VBalanceBank
// and VBalanceCash: the balance of one bank account or cash desk at the end of a day. The balance
// tables are the truth: the balance is the sum of DebitFlow - CreditFlow of the account's rows up
// to and including the day asked for (vouchers reach the balance only through those rows), over
// every currency row of the account. The data object is then reopened on one row with the key,
// "DocDate" and "Balance".
#include <cmath>

#include "host/connection.h"
#include "host/data_object.h"
#include "host/host_error.h"
#include "runtime/convert.h"
#include "runtime/text.h"

namespace xal::host {

namespace {

struct BalanceTable {
  const char* table;     // the balance table the data object is open on
  const char* keyField;  // the parameter and column that name the account
  const char* owner;     // the register the account belongs to
};

constexpr BalanceTable kBalanceTables[] = {
    {"VBalanceBank", "IDGRBankAccount", "GRBankAccount"},
    {"VBalanceCash", "IDVRCashDesk", "VRCashDesk"},
};

Ref<ParamList> ParamsOf(const Variant& params, const char* function) {
  Ref<ParamList> list;
  if (params.IsObject()) list = std::dynamic_pointer_cast<ParamList>(params.AsObject());
  if (!list) Raise(kErrInvalidCall, std::string(function) + " needs a parameter list");
  return list;
}

// Params: "Date" and the account's key ("IDGRBankAccount" or "IDVRCashDesk"). True with the data
// object on its balance row; False, the data object untouched, when the account does not exist.
Variant GetBalance(HostDataObject& self, const Variant& params, int32_t) {
  const BalanceTable* bt = nullptr;
  for (const auto& t : kBalanceTables)
    if (TextEquals(self.TableName(), t.table)) bt = &t;
  if (!bt) Raise(kErrInvalidCall, "GetBalance works on VBalanceBank and VBalanceCash, not on " + self.TableName());
  Ref<ParamList> list = ParamsOf(params, "GetBalance");
  const int32_t id = CLng(list->Item(bt->keyField));
  const Date date = CDate(list->Item("Date"));

  Database& db = self.HostConn()->db();
  const std::string owner = bt->owner, table = bt->table, key = bt->keyField;
  if (CLng(db.Scalar("SELECT count(*) FROM " + owner + " WHERE ID = ?", {Variant(id)})) == 0) return Variant(false);
  // Summed in ten-thousandths so that the money adds up exactly; the whole day counts.
  const Variant raw = db.Scalar("SELECT total(round(DebitFlow * 10000) - round(CreditFlow * 10000)) FROM " + table +
                                    " WHERE " + key + " = ? AND DocDate < ?",
                                {Variant(id), Variant(std::trunc(date.serial) + 1)});
  const Currency balance = Currency::FromRaw(static_cast<int64_t>(std::llround(CDbl(raw))));

  ResultSet row;
  row.columns = {key, "DocDate", "Balance"};
  row.kinds = {ColumnKind::Integer, ColumnKind::Date, ColumnKind::Currency};
  row.rows.push_back({Variant(id), Variant(date), Variant(balance)});
  self.Reload(std::move(row));
  return Variant(true);
}

const bool kRegistered = [] {
  RegisterDataObjectFunction("GetBalance", GetBalance);
  return true;
}();

}  // namespace

}  // namespace xal::host
