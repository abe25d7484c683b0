// The balance of a capital asset, replayed from its document rows (CADocRow) in DocDate and ID
// order, with depreciation charged month by month in between.
//
// The rules of the replay, per row kind (DocName):
//   CDReceipts     the asset is received: BasicCost and BasicCostRef are added; the residual value
//                  grows by the row's DepreciatedCost(Ref) when given (an asset received partly
//                  depreciated), else by its BasicCost(Ref); Quantity grows by Quantity; a non-zero
//                  DepreciationRate becomes the rate; depreciation starts with the next month.
//   CDRebuilding   an improvement: BasicCost(Ref) and the residual grow by the row's BasicCost(Ref);
//                  a non-zero DepreciationRate replaces the rate.
//   CDMovement     a move to another place: values stay; the row becomes the last registering row.
//   CDConsumption  part or all of the asset leaves: with q = the row's Quantity (all of it when 0)
//                  of Q held, BasicCost(Ref) and the residual shrink by q / Q of themselves (rounded
//                  to cents); Quantity shrinks by q.
//   CDAmortizing   a depreciation entered by hand: the residual shrinks by the row's
//                  DepreciationAmount(Ref), which counts as depreciation of its accounting year.
//   DepreciationBegin  depreciation starts with the month after the row's date; a non-zero
//                  DepreciationRate becomes the rate.
// Receipts, rebuildings and movements are registering rows: the last one is IDCALastRegRow.
//
// Monthly depreciation: a month is charged once it has ended (its last day is before the date
// being replayed to). The charge is BasicCost × DepreciationRate / 1200 rounded to cents (with
// Round), the same from BasicCostRef for the reference amounts — straight-line on the basic cost —
// and never more than the residual value left.
//
// Outputs: BasicCost(Ref), DepreciatedCost(Ref) = the residual book value, DepreciationRate,
// DepreciationAmount(Ref) = the depreciation charged within the accounting year (BRAccountingYear,
// or the calendar year when none covers the date) that contains the balance date, Quantity and
// IDCALastRegRow. The balance date is DocDate when given, else the date of row IDCADocRow, else
// today; with IDCADocRow the replay stops before that row (the balance the row starts from).
#include "server/ca_balance.h"

#include <optional>

#include "runtime/convert.h"
#include "runtime/dates.h"
#include "runtime/text.h"
#include "runtime/trap.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {

int MonthIndex(Date d) {
  const DateParts p = SplitDate(d);
  return p.year * 12 + (p.month - 1);
}

// Whole days of a date (its time of day dropped).
double WholeDays(Date d) { return CDbl(Fix(Variant(d))); }

Currency Cur(const Variant& v) { return ValueOr(v, Currency()); }
double Dbl(const Variant& v) { return ValueOr(v, 0.0); }

struct AccountingYear {
  double begin = 0, end = 0;  // whole days, both included
};

class Replay {
 public:
  Replay(CABalance& b, AccountingYear year) : b_(b), year_(year) {}

  // Charges every month that ended before `upTo`.
  void ChargeMonthsBefore(Date upTo) {
    if (!startMonth_) return;
    const int last = MonthIndex(upTo) - 1;
    for (int m = std::max(*startMonth_, charged_ + 1); m <= last; ++m) {
      Charge(m);
      charged_ = m;
    }
  }

  void Apply(const std::string& kind, DataObject& row) {
    const Date date = CDate(row.Field("DocDate"));
    if (TextEquals(kind, "CDReceipts")) {
      const Currency dep = Cur(row.Field("DepreciatedCost")), depRef = Cur(row.Field("DepreciatedCostRef"));
      const Currency basic = Cur(row.Field("BasicCost")), basicRef = Cur(row.Field("BasicCostRef"));
      b_.basicCost = b_.basicCost + basic;
      b_.basicCostRef = b_.basicCostRef + basicRef;
      b_.depreciatedCost = b_.depreciatedCost + (dep.raw() != 0 ? dep : basic);
      b_.depreciatedCostRef = b_.depreciatedCostRef + (depRef.raw() != 0 ? depRef : basicRef);
      b_.quantity += Dbl(row.Field("Quantity"));
      TakeRate(row);
      StartAfter(date);
      Register(row);
    } else if (TextEquals(kind, "CDRebuilding")) {
      const Currency basic = Cur(row.Field("BasicCost")), basicRef = Cur(row.Field("BasicCostRef"));
      b_.basicCost = b_.basicCost + basic;
      b_.basicCostRef = b_.basicCostRef + basicRef;
      b_.depreciatedCost = b_.depreciatedCost + basic;
      b_.depreciatedCostRef = b_.depreciatedCostRef + basicRef;
      TakeRate(row);
      Register(row);
    } else if (TextEquals(kind, "CDMovement")) {
      Register(row);
    } else if (TextEquals(kind, "CDConsumption")) {
      Consume(Dbl(row.Field("Quantity")));
    } else if (TextEquals(kind, "CDAmortizing")) {
      WriteDown(Cur(row.Field("DepreciationAmount")), Cur(row.Field("DepreciationAmountRef")), date);
    } else if (TextEquals(kind, "DepreciationBegin")) {
      TakeRate(row);
      startMonth_ = MonthIndex(date) + 1;
      charged_ = MonthIndex(date);
    }
  }

 private:
  static Currency Monthly(Currency base, double rate) {
    return CCur(Round(Variant(base.ToDouble() * rate / 1200.0), 2));
  }

  void Charge(int month) {
    const Currency amount = Monthly(b_.basicCost, b_.depreciationRate);
    const Currency amountRef = Monthly(b_.basicCostRef, b_.depreciationRate);
    // Charged on the month's last day.
    WriteDown(amount, amountRef, DateSerial(month / 12, month % 12 + 2, 0));
  }

  // Lowers the residual value by at most what is left, and counts it in the year's depreciation.
  void WriteDown(Currency amount, Currency amountRef, Date when) {
    if (amount > b_.depreciatedCost) amount = b_.depreciatedCost;
    if (amountRef > b_.depreciatedCostRef) amountRef = b_.depreciatedCostRef;
    if (amount.raw() < 0) amount = Currency();
    if (amountRef.raw() < 0) amountRef = Currency();
    b_.depreciatedCost = b_.depreciatedCost - amount;
    b_.depreciatedCostRef = b_.depreciatedCostRef - amountRef;
    const double day = WholeDays(when);
    if (day >= year_.begin && day <= year_.end) {
      b_.depreciationAmount = b_.depreciationAmount + amount;
      b_.depreciationAmountRef = b_.depreciationAmountRef + amountRef;
    }
  }

  void Consume(double q) {
    if (b_.quantity <= 0) return;
    if (q <= 0 || q >= b_.quantity) q = b_.quantity;
    const double f = q / b_.quantity;
    auto part = [&](Currency c) { return CCur(Round(Variant(c.ToDouble() * f), 2)); };
    b_.basicCost = b_.basicCost - part(b_.basicCost);
    b_.basicCostRef = b_.basicCostRef - part(b_.basicCostRef);
    b_.depreciatedCost = b_.depreciatedCost - part(b_.depreciatedCost);
    b_.depreciatedCostRef = b_.depreciatedCostRef - part(b_.depreciatedCostRef);
    b_.quantity -= q;
  }

  void TakeRate(DataObject& row) {
    const double rate = Dbl(row.Field("DepreciationRate"));
    if (rate != 0) b_.depreciationRate = rate;
  }

  void StartAfter(Date date) {
    if (startMonth_) return;
    startMonth_ = MonthIndex(date) + 1;
    charged_ = MonthIndex(date);
  }

  void Register(DataObject& row) { b_.idCALastRegRow = CLng(row.Field("ID")); }

  CABalance& b_;
  AccountingYear year_;
  std::optional<int> startMonth_;
  int charged_ = 0;
};

AccountingYear YearOf(const Checked<XALServer>& server, Date date) {
  const Checked<DataObject> years = server->OpenQuery("SELECT BeginDate, EndDate FROM BRAccountingYear WHERE BeginDate <= " +
                                                SQLDate(Variant(date)) + " AND EndDate >= " + SQLDate(Variant(date)) +
                                                " ORDER BY BeginDate DESC",
                                            kQueryEditable, "", "");
  if (!years->IsEOF())
    return {WholeDays(CDate(years->Field("BeginDate"))), WholeDays(CDate(years->Field("EndDate")))};
  const int y = Year(date);
  return {DateSerial(y, 1, 1).serial, DateSerial(y, 12, 31).serial};
}

}  // namespace

bool CountCABalance(const Ref<XALConnect>& xalConnect, int32_t idCRCapitalAssets, int32_t idCADocRow, Date docDate,
                    CABalance& out) {
  return TryStep([&] {
    const Checked<XALServer> server = Checked<XALConnect>(xalConnect)->Server();
    const Checked<DataObject> rows = server->OpenQuery("SELECT * FROM CADocRow WHERE IDCRCapitalAssets = " +
                                                           std::to_string(idCRCapitalAssets) + " ORDER BY DocDate, ID",
                                                       kQueryEditable, "", "");
    Date until = docDate;
    if (until.serial == 0 && idCADocRow != 0 && rows->FindFirst("ID=" + std::to_string(idCADocRow), 0) == 0)
      until = CDate(rows->Field("DocDate"));
    if (until.serial == 0) until = Today();
    CABalance b;
    Replay replay(b, YearOf(server, until));
    for (rows->MoveFirst(); !rows->IsEOF(); rows->MoveNext()) {
      if (idCADocRow != 0 && CLng(rows->Field("ID")) == idCADocRow) break;
      const Date date = CDate(rows->Field("DocDate"));
      if (WholeDays(date) > WholeDays(until)) break;
      replay.ChargeMonthsBefore(date);
      replay.Apply(CStr(rows->Field("DocName")), *rows);
    }
    replay.ChargeMonthsBefore(until);
    out = b;
  });
}

}  // namespace xal::server
