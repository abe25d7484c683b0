// Period closing. A subsystem (store, bank, purchase, sales, capital assets, booking orders,
// wages) is closed up to a date once its documents before that date are certified: the user is
// asked through the host callback to certify what is not, the subsystem's "DateFixed" setting is
// written and the host rebuilds the stored balances. Closing "Booking" first closes, in order,
// every subsystem still open before the date, then certifies the bookings themselves.
#include "server/period_closing.h"

#include <array>
#include <cmath>
#include <string>
#include <vector>

#include "collections/ui_strings.h"
#include "runtime/convert.h"
#include "runtime/text.h"
#include "runtime/trap.h"
#include "server/internal/transaction.h"
#include "server/module_state.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {

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

// The caller identifier the closing gives the host callback.
constexpr int32_t kCallerID = 77;
constexpr int32_t kButtonsExclamationOK = kMbOK + kMbExclamation;
constexpr int32_t kButtonsQuestionYesNo = kMbYesNo + kMbQuestion;

int32_t Ask(const std::string& prompt, int32_t buttons) {
  return Checked<IXALCallback>(CurrentCallback())->MsgBox(kCallerID, prompt, buttons, "", "", 0);
}

void Notify(int32_t kind, const Variant& value = Variant()) {
  Checked<IXALCallback>(CurrentCallback())->Notify(kCallerID, kind, "", value);
}

// ---------------------------------------------------------------------------------------------
// Helpers
// ---------------------------------------------------------------------------------------------

// A date or a stored setting as a whole number of days; Empty and Null count as day 0.
double WholeDays(const Variant& v) {
  return std::floor(ValueOr(v, Date()).serial);
}

int32_t CountOf(const Checked<XALServer>& server, const std::string& sql) {
  const Checked<DataObject> rs = server->OpenQuery(sql, kQueryForward, "", "");
  if (rs->IsEOF()) return 0;
  const Variant c = rs->Field("C");
  return ValueOr(c, 0);
}

struct Closing {
  Checked<ParamList> params;
  Checked<XALConnect> conn;
  Checked<XALServer> server;
  std::string system;
  Date date;
};

// Asks the host to rebuild the balance table `table` from the flows before the closing date.
void RebuildBalance(const Closing& c, const Checked<ParamList>& args, const char* table) {
  args->Set("Date", Variant(c.date));
  const Checked<DataObject> balance = c.server->OpenDataObject(table);
  balance->CallFunction("ComputeBalance", Variant(args.get()), 0);
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

  // The user has answered; what follows is written as one unit: a closing that fails half-way
  // must not leave a period marked closed over balances that were never rebuilt.
  return internal::InTransaction(*c.conn, [&] {
    if (certify) {
      Notify(kNotifyProgressStart, Variant(int32_t{4}));
      c.conn->Execute("UPDATE GDocument SET IsCertified = True WHERE IsCertified=False" + before, 0);
      Notify(kNotifyProgressStep);
    } else {
      Notify(kNotifyProgressStart, Variant(int32_t{3}));
    }
    c.conn->SetSetting("DateFixed", sys.name, Variant(static_cast<int32_t>(WholeDays(Variant(c.date)))));

    const Checked<ParamList> args = c.server->NewParamList();
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
      if (!CloseWith(c.params.get())) return false;
    }
  }

  const std::string before = " WHERE IsCertified=FALSE AND DealDate<" + SQLDate(Variant(c.date));
  bool certify = false;
  if (CountOf(c.server, "SELECT COUNT(*) AS C FROM BBooking" + before) > 0) {
    if (Ask(GetClosingText(2, {"", CStr(Variant(c.date))}), kButtonsQuestionYesNo) != kAnswerYes) return false;
    certify = true;
  }
  return internal::InTransaction(*c.conn, [&] {
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
  c.conn = std::dynamic_pointer_cast<XALConnect>(c.params->Item("XALConnect").AsObject());
  tClosingLangID = CLng(c.conn->Property(kConnPropLanguage));
  c.server = c.conn->Server();
  Require(c.server.get());  // the closing needs the server on every path
  c.system = CStr(c.params->Item("SystemName"));
  c.date = CDate(c.params->Item("CloseDate"));

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
  return TryOr([&] { return CloseWith(pParams); }, false);
}

}  // namespace xal::server
