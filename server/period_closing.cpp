// Period closing. A subsystem (store, bank, purchase, sales, capital assets, booking orders,
// wages) is closed up to a date once its documents before that date are certified: the user is
// asked through the host callback to certify what is not, the subsystem's "DateFixed" setting is
// written and the host rebuilds the stored balances. Closing "Booking" first closes, in order,
// every subsystem still open before the date, then certifies the bookings themselves.
#include "server/period_closing.h"

#include <array>
#include <cmath>
#include <exception>
#include <string>
#include <vector>

#include "collections/ui_strings.h"
#include "runtime/convert.h"
#include "runtime/text.h"
#include "server/internal/require.h"
#include "server/module_state.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {

using internal::Require;

// ---------------------------------------------------------------------------------------------
// Closing messages
// ---------------------------------------------------------------------------------------------

struct ClosingText {
  const char* english;
  const char* estonian;
};

// Texts 1-10, in that order.
constexpr std::array<ClosingText, 10> kClosingTexts{{
    {"Some %s documents before %s are not certified. Certify?", "Osa %s dokumente enne %s ei ole kinnitatud. Kas kinnitada?"},
    {"Some %s bookings before %s are not certified. Certify?", "Osa %s konteeringuid enne %s ei ole kinnitatud. Kas kinnitada?"},
    {"There are reserved documents in this period!", "Perioodis on reserveeringu dokumente!"},
    {"accountancy", "raamatupidamise"},
    {"store", "lao"},
    {"bank", "panga"},
    {"capital assets", "põhivara"},
    {"purchase", "ostu"},
    {"sales", "müügi"},
    {"wages", "palga"},
}};

constexpr int32_t kLangEstonian = 4;

// The language of the closing texts: the connection's language, refreshed on every closing.
thread_local int32_t tClosingLangID = 0;

// Text `n` in the closing language with each "%s" replaced, in order, by the next argument;
// arguments left over are appended, placeholders left over become empty. Empty outside 1-10.
std::string GetClosingText(int n, const std::vector<std::string>& args = {}) {
  if (n < 1 || n > static_cast<int>(kClosingTexts.size())) return std::string();
  const ClosingText& t = kClosingTexts[n - 1];
  return FillPlaceholders((tClosingLangID == kLangEstonian && *t.estonian) ? t.estonian : t.english, args);
}

// ---------------------------------------------------------------------------------------------
// Subsystems
// ---------------------------------------------------------------------------------------------

struct Subsystem {
  const char* name;
  const char* filter;  // on GDocument.RefType
  int nameText;        // closing text that names the subsystem
};

constexpr std::array<Subsystem, 7> kSubsystems{{
    {"BookingOrder", "RefType = 'BDBookingO'", 4},
    {"Store", "RefType In ('DDCostInvD', 'DDMovement', 'PDReceiptD', 'SDConsignmD')", 5},
    {"Bank", "RefType = 'VDVoucher'", 6},
    {"CapitalAssets", "RefType = 'CADocument'", 7},
    {"Purchase", "RefType In ('PDOrder', 'PDInvoice')", 8},
    {"Sales", "RefType In ('SDInvoice', 'SDOrder')", 9},
    {"Wages", "RefType In ('WDocument')", 10},
}};

// The order in which closing the accounting closes the subsystems.
constexpr std::array<const char*, 7> kBookingCascade{"Store",         "Bank",         "Purchase", "Sales",
                                                     "CapitalAssets", "BookingOrder", "Wages"};

const Subsystem* FindSubsystem(const std::string& name) {
  for (const Subsystem& s : kSubsystems)
    if (TextEquals(name, s.name)) return &s;
  return nullptr;
}

// Callback codes.
constexpr int32_t kCallerID = 77;
constexpr int32_t kButtonsExclamationOK = 48;
constexpr int32_t kButtonsQuestionYesNo = 36;
constexpr int32_t kNotifyProgressStart = 2;  // value: the number of steps that follow
constexpr int32_t kNotifyProgressStep = 4;

int32_t Ask(const std::string& prompt, int32_t buttons) {
  return Require(CurrentCallback()).MsgBox(kCallerID, prompt, buttons, "", "", 0);
}

void Notify(int32_t kind, const Variant& value = Variant()) {
  Require(CurrentCallback()).Notify(kCallerID, kind, "", value);
}

// ---------------------------------------------------------------------------------------------
// Helpers
// ---------------------------------------------------------------------------------------------

// A date or a stored setting as a whole number of days; Empty and Null count as day 0.
double WholeDays(const Variant& v) {
  return std::floor(ValueOr(v, Date()).serial);
}

int32_t CountOf(const Ref<XALServer>& server, const std::string& sql) {
  Ref<DataObject> rs = server->OpenQuery(sql, 4, "", "");
  if (rs->IsEOF()) return 0;
  const Variant c = rs->Field("C");
  return ValueOr(c, 0);
}

// Runs `body` in a transaction of the connection when the host offers one: a closing that fails
// half-way must not leave a period marked closed over balances that were never rebuilt.
template <class Body>
bool InTransaction(const Ref<XALConnect>& conn, Body body) {
  const bool own = conn->BeginTransaction();
  try {
    const bool ok = body();
    if (own) {
      if (ok)
        conn->CommitTransaction();
      else
        conn->RollbackTransaction();
    }
    return ok;
  } catch (...) {
    if (own) conn->RollbackTransaction();
    throw;
  }
}

struct Closing {
  Ref<ParamList> params;
  Ref<XALConnect> conn;
  Ref<XALServer> server;
  std::string system;
  Date date;
};

// Asks the host to rebuild the balance table `table` from the flows before the closing date.
void RebuildBalance(const Closing& c, const Ref<ParamList>& args, const char* table) {
  args->Set("Date", Variant(c.date));
  Ref<DataObject> balance = c.server->OpenDataObject(table);
  Require(balance).CallFunction("ComputeBalance", Variant(args), 0);
}

// Closes one subsystem; False when the user refuses or reserved documents block it.
bool CloseSubsystem(const Closing& c, const Subsystem& sys) {
  const std::string before = " AND DealDate < " + SQLDate(Variant(c.date)) + " AND " + sys.filter;
  bool certify = false;
  if (CountOf(c.server, "SELECT COUNT(*) AS C FROM GDocument WHERE IsCertified=FALSE" + before) > 0) {
    if (CountOf(c.server, "SELECT COUNT(*) AS C FROM GDocument WHERE IsCertified=FALSE AND DealState<>''" + before) >
        0) {
      Ask(GetClosingText(3), kButtonsExclamationOK);
      return false;
    }
    const std::string question = GetClosingText(1, {GetClosingText(sys.nameText), CStr(Variant(c.date))});
    if (Ask(question, kButtonsQuestionYesNo) != kAnswerYes) return false;
    certify = true;
  }

  // The user has answered; what follows is written as one unit.
  return InTransaction(c.conn, [&] {
    if (certify) {
      Notify(kNotifyProgressStart, Variant(int32_t{4}));
      c.conn->Execute("UPDATE GDocument SET IsCertified = True WHERE IsCertified=False" + before, 0);
      Notify(kNotifyProgressStep);
    } else {
      Notify(kNotifyProgressStart, Variant(int32_t{3}));
    }
    c.conn->SetSetting("DateFixed", sys.name, Variant(static_cast<int32_t>(WholeDays(Variant(c.date)))));

    Ref<ParamList> args = c.server->NewParamList();
    args->SetObject("CallBack", CurrentCallback());
    if (TextEquals(sys.name, "Store")) {
      RebuildBalance(c, args, "DBalanceStore");
      Notify(kNotifyProgressStep);
      Notify(kNotifyProgressStep);
    } else if (TextEquals(sys.name, "Bank")) {
      RebuildBalance(c, args, "VBalanceBank");
      Notify(kNotifyProgressStep);
      RebuildBalance(c, args, "VBalanceCash");
      Notify(kNotifyProgressStep);
    } else {
      Notify(kNotifyProgressStep);
      Notify(kNotifyProgressStep);
    }
    Notify(kNotifyProgressStep);
    return true;
  });
}

bool CloseWith(const Ref<ParamList>& params);

// Closes the accounting: first every subsystem still open before the date, in the cascade order
// (one refusal ends the closing; those closed before it stay closed), then the bookings.
bool CloseBooking(const Closing& c) {
  const double day = WholeDays(Variant(c.date));
  for (const char* name : kBookingCascade) {
    const Variant fixed = c.conn->Setting("DateFixed", name, TextEquals(name, "Wages") ? Variant(int32_t{0}) : Variant());
    if (WholeDays(fixed) < day) {
      c.params->Set("SystemName", Variant(std::string(name)));
      if (!CloseWith(c.params)) return false;
    }
  }

  const std::string before = " WHERE IsCertified=FALSE AND DealDate<" + SQLDate(Variant(c.date));
  bool certify = false;
  if (CountOf(c.server, "SELECT COUNT(*) AS C FROM BBooking" + before) > 0) {
    if (Ask(GetClosingText(2, {"", CStr(Variant(c.date))}), kButtonsQuestionYesNo) != kAnswerYes) return false;
    certify = true;
  }
  return InTransaction(c.conn, [&] {
    if (certify) {
      c.conn->Execute("UPDATE BBooking SET IsCertified=TRUE" + before, 4);
      Notify(kNotifyProgressStep);
    }
    c.conn->SetSetting("DateFixed", "Booking", Variant(static_cast<int32_t>(day)));
    return true;
  });
}

bool CloseWith(const Ref<ParamList>& params) {
  Closing c;
  c.params = params;
  c.conn = std::dynamic_pointer_cast<XALConnect>(Require(params).Item("XALConnect").AsObject());
  Require(c.conn);
  tClosingLangID = CLng(c.conn->Property(8));
  c.server = c.conn->Server();
  Require(c.server);
  c.system = CStr(params->Item("SystemName"));
  c.date = CDate(params->Item("CloseDate"));

  const bool booking = TextEquals(c.system, "Booking");
  const double accountingFixed = WholeDays(c.conn->Setting("DateFixed", "Booking", Variant(int32_t{0})));
  // The accounting is already closed beyond this date: nothing is left to do.
  if (!booking && accountingFixed > WholeDays(Variant(c.date))) return true;
  if (booking) return CloseBooking(c);
  const Subsystem* sys = FindSubsystem(c.system);
  if (!sys) return false;
  return CloseSubsystem(c, *sys);
}

}  // namespace

// Errors are trapped: any failure ends the closing with False and no message.
bool ClosePeriod(const Ref<ParamList>& pParams) {
  try {
    return CloseWith(pParams);
  } catch (const std::exception&) {
    return false;
  }
}

}  // namespace xal::server
