// Currency rates and conversion. A rate r of a currency means that an amount a of it is worth
// a × r in the system's own money. Rates come from GRCurrency (the fixed rate) or, for currencies
// with dated rates, from GRCurValue on exactly the given day; ConvertWithRates works with rates
// the caller already has and is what the form handlers use when they recompute row amounts.
// None of these trap errors: a failing query, or a zero base-currency rate in Convert, reaches
// the caller.
#include "server/currency.h"

#include <cmath>
#include <string>

#include "runtime/convert.h"
#include "runtime/error.h"
#include "runtime/trap.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {

// The dated rate of `curID` on the day of `date`, when GRCurValue has one; the SQL spacing differs
// between the two callers and is kept as each sends it.
bool DatedRate(const Checked<XALServer>& server, const std::string& sql, double& rate) {
  const Checked<DataObject> rs = server->OpenQuery(sql, kQueryEditable, "", "");
  if (rs->IsEOF()) return false;
  rate = NumberField(rs, "ConversionRate");
  return true;
}

}  // namespace

// The rate of `pCurID`: its fixed rate, or the rate recorded for exactly `pRateDate` when the
// currency keeps dated rates and a date was given. 0 when the currency does not exist.
double CurRate(const Ref<XALConnect>& pXALConnect, int32_t pCurID, Date pRateDate) {
  const Checked<XALServer> server = Checked<XALConnect>(pXALConnect)->Server();
  const Checked<DataObject> cur = server->OpenQuery(
      "SELECT DivThreshold, FixedRate FROM GRCurrency WHERE ID = " + std::to_string(pCurID), kQueryEditable, "", "");
  if (cur->IsEOF()) return 0;
  double rate = NumberField(cur, "FixedRate");
  // A zero date means "no date": the fixed rate applies. No earlier date is searched for.
  if (std::floor(pRateDate.serial) != 0 && NumberField(cur, "DivThreshold") != 0) {
    DatedRate(server,
              "SELECT ConversionRate FROM GRCurValue WHERE IDGRCurrency = " + std::to_string(pCurID) +
                  " AND ChangeDate = " + SQLDate(Variant(pRateDate)),
              rate);
  }
  return rate;
}

// Converts with the caller's rates. Without a second rate the amount is simply multiplied by the
// first; with one, a triangulation currency goes through the second (or stops at the first when
// the reference amount is asked for), and other currencies divide by it for the reference amount.
// The value is taken to four decimals and then rounded half away from zero to cents.
Currency ConvertWithRates(Currency pAmount, double pRate1, double pRate2, bool pRefAmount, bool pIsTriangulation) {
  const double r1 = pRate1 == 0 ? 1.0 : pRate1;
  const double a = pAmount.ToDouble();
  double x;
  if (pRate2 == 0)
    x = a * r1;
  else if (pIsTriangulation)
    x = pRefAmount ? a / r1 : a / r1 * pRate2;
  else
    x = pRefAmount ? a * r1 / pRate2 : a * r1;
  const Currency fourDecimals = CCur(Variant(x));
  return CCur(Round(Variant(fourDecimals), 2));
}

// Converts `pAmount` of currency `pCurID` on `pConvDate` with the database's rates. The first
// amount is in the system's money, the second in the base currency of the "BaseCurrency" setting;
// a triangulation currency returns the second and hands back the first through `pRefAmount`,
// every other currency the other way round. A currency that does not exist returns the amount
// unchanged in both. A base-currency rate of 0 (or none) is a division by zero (error 11).
Currency Convert(const Ref<XALConnect>& pXALConnect, int32_t pCurID, Date pConvDate, Currency pAmount,
                 Currency& pRefAmount) {
  pRefAmount = pAmount;
  const Checked<XALConnect> conn = pXALConnect;
  const Checked<XALServer> server = conn->Server();
  const Checked<DataObject> cur = server->OpenQuery(
      "SELECT IsTriangulation, DivThreshold, FixedRate FROM GRCurrency WHERE ID=" + std::to_string(pCurID),
      kQueryEditable, "", "");
  if (cur->IsEOF()) return pAmount;

  double rate = NumberField(cur, "FixedRate");
  const bool tri = IsTrue(cur->Field("IsTriangulation"));
  // Unlike CurRate, a zero date is looked up like any other.
  if (NumberField(cur, "DivThreshold") != 0) {
    DatedRate(server,
              "SELECT ConversionRate FROM GRCurValue WHERE IDGRCurrency=" + std::to_string(pCurID) +
                  " AND ChangeDate=" + SQLDate(Variant(pConvDate)),
              rate);
  }

  const double first = pAmount.ToDouble() * rate;
  const int32_t baseCurrency = CLng(conn->Setting("GRCurrency", "BaseCurrency", Variant(int32_t{0})));
  const double baseRate = CurRate(pXALConnect, baseCurrency, pConvDate);
  if (baseRate == 0) Raise(kErrDivByZero);
  const double second = first / baseRate;

  // Both go to four decimals (half to even) with no further rounding; the reference amount is
  // written only once both conversions have succeeded.
  const Currency firstCur = CCur(Variant(first));
  const Currency secondCur = CCur(Variant(second));
  pRefAmount = tri ? firstCur : secondCur;
  return tri ? secondCur : firstCur;
}

}  // namespace xal::server
