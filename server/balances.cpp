// Bank and cash balances, balance dates, penalties, working days and the user's employee.
// The balance of an account or a cash desk is the host's business: the component asks the data
// object of the balance view for it through its "GetBalance" function. The rest are small
// computations over dates and one-row queries. GetBalanceDate, ComputePenalty and ComputeWDays
// trap run-time errors and answer Empty, 0 and 0; the others let a failing host call through.
#include "server/balances.h"

#include <cmath>
#include <string>

#include "runtime/convert.h"
#include "runtime/dates.h"
#include "runtime/error.h"
#include "runtime/trap.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {

// The calendar day of a date: the serial without its time of day (toward zero, as dates split).
double WholeDays(Date d) { return std::trunc(d.serial); }

// Asks the data object of `view` for the balance of the record `id` named by `keyField` on `date`;
// 0 when the host answers that it has none.
Currency ViewBalance(const Ref<XALConnect>& conn, const char* view, const char* keyField, int32_t id, Date date) {
  const Checked<XALServer> server = Checked<XALConnect>(conn)->Server();
  const Checked<DataObject> ob = server->OpenDataObject(view);
  const Checked<ParamList> params = server->NewParamList();
  params->Set("Date", Variant(date));
  params->Set(keyField, Variant(id));
  if (!IsTrue(ob->CallFunction("GetBalance", Variant(params.get()), 0))) return Currency();
  return CCur(ob->Field("Balance"));
}

}  // namespace

Currency CountBankBalance(const Ref<XALConnect>& pXALConnect, int32_t pIDGRBankAccount, Date pDocDate) {
  return ViewBalance(pXALConnect, "VBalanceBank", "IDGRBankAccount", pIDGRBankAccount, pDocDate);
}

Currency CountCashBalance(const Ref<XALConnect>& pXALConnect, int32_t pIDVRCashDesk, Date pDocDate) {
  return ViewBalance(pXALConnect, "VBalanceCash", "IDVRCashDesk", pIDVRCashDesk, pDocDate);
}

// The engine hands an aggregate of a date column back as a plain number, so a found maximum is
// turned into a Date here; Null (no earlier row) stays Null.
Variant GetBalanceDate(const Ref<XALConnect>& pXALConnect, Date pDocDate, const std::string& pBalanceName) {
  return TryOr(
      [&] {
        const Checked<XALServer> server = Checked<XALConnect>(pXALConnect)->Server();
        const Checked<DataObject> rs = server->OpenQuery(
            "SELECT MAX(DocDate) AS DDate FROM " + pBalanceName + " WHERE DocDate<" + SQLDate(Variant(pDocDate)),
            kQueryEditable, "", "");
        const Variant v = rs->Field("DDate");
        return (v.IsNull() || v.IsEmpty()) ? v : Variant(CDate(v));
      },
      Variant());
}

// Simple interest per day late: amount × percent / 100 for each whole day by which the payment
// date passes the due date. With a connection and a payment term the term's row is read, but no
// penalty is computed from it (0), as the system has always done.
double ComputePenalty(double pAmount, Date pPDate, Date pPromptDate, double pPenaltyPercent, int32_t pIDGDPrompDate,
                      const Ref<XALConnect>& pXALConnect) {
  return TryOr(
      [&]() -> double {
        if (pAmount == 0 || pPDate.serial == 0) return 0;
        if (!pXALConnect || pIDGDPrompDate == 0) {
          const double days = WholeDays(pPDate) - WholeDays(pPromptDate);
          if (WholeDays(pPromptDate) != 0 && pPenaltyPercent != 0 && pPDate > pPromptDate && days > 0)
            return pAmount * pPenaltyPercent / 100 * days;
          return 0;
        }
        Checked<XALServer>(pXALConnect->Server())
            ->OpenQuery("SELECT * FROM GRTermPayment WHERE ID=" + std::to_string(pIDGDPrompDate), kQueryEditable, "",
                        "");
        return 0;
      },
      0.0);
}

// Monday to Friday from the first day to the last, both included: whole weeks count five days
// each, the remaining days are looked at one by one. A last day before the first gives 0 or less
// (the week count is rounded down, as Int does).
int32_t ComputeWDays(Date pDate1, Date pDate2) {
  return TryOr(
      [&] {
        const double first = WholeDays(pDate1), last = WholeDays(pDate2);
        const double weeks = std::floor((last - first) / 7);
        double count = 5 * weeks;
        for (double d = first + 7 * weeks; d <= last; d += 1)
          if (Weekday(Date(d), 2) < 6) count += 1;
        return CLng(Variant(count));
      },
      int32_t{0});
}

int32_t GetEmployeeID(const Ref<XALConnect>& pXALConnect) {
  const Checked<XALConnect> conn = pXALConnect;
  const int32_t user = conn->UserID();
  const Checked<XALServer> server = conn->Server();
  const Checked<DataObject> rs =
      server->OpenQuery("SELECT IDEREmployee FROM XALUser WHERE ID=" + std::to_string(user), kQueryEditable, "", "");
  if (rs->IsEOF()) return 0;
  return CLng(rs->Field("IDEREmployee"));
}

}  // namespace xal::server
