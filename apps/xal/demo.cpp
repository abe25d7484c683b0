// The demo run: value semantics, late-bound calls and events, and the demo database (companies,
// articles, stock per store, currency rates, a stored invoice opened as a document), printed as
// a short report.
#include "apps/xal/demo.h"

#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>

#include "host/demo_db.h"
#include "host/document_session.h"
#include "runtime/convert.h"
#include "runtime/dates.h"
#include "runtime/dispatch.h"
#include "runtime/events.h"
#include "runtime/format.h"
#include "runtime/locale.h"
#include "runtime/member_table.h"

namespace xal::app {

namespace {

// A script host's sink: prints each event and answers questions with "Yes".
class PrintingSink : public GenericSink {
 public:
  explicit PrintingSink(std::ostream& out) : out_(out) {}
  void OnEvent(int32_t dispid, const std::string& name, std::span<Variant> args) override {
    out_ << "    event " << name << " (" << dispid << ")";
    for (const auto& a : args) out_ << " " << DebugString(a);
    out_ << "\n";
    if (name == "Question") args[1] = Variant("Yes");
  }

 private:
  std::ostream& out_;
};

void Values(std::ostream& out) {
  out << "Values as the document scripts see them\n";
  struct Row {
    const char* what;
    std::string text;
  };
  const Row rows[] = {
      {"CStr(0.1 + 0.2)", CStr(Variant(0.1 + 0.2))},
      {"CStr(1 / 3)", CStr(Variant(1.0 / 3.0))},
      {"Format(2.675, \"0.00\")", Format(Variant(2.675), "0.00")},
      {"Format(1234.5, \"#,##0.00\")", Format(Variant(1234.5), "#,##0.00")},
      {"CLng(2.5), CLng(3.5)", CStr(Variant(CLng(Variant(2.5)))) + ", " + CStr(Variant(CLng(Variant(3.5))))},
      {"CCur(10 / 3)", CStr(Variant(CCur(Variant(10.0 / 3.0))))},
  };
  for (const auto& r : rows) out << "  " << r.what << " = " << r.text << "\n";
  ScopedLocale estonian{RuntimeLocale{",", "\u00A0", DateOrder::DayMonthYear, "True", "False"}};
  out << "  with \",\" as decimal separator: Format(1234.5, \"#,##0.00\") = " << Format(Variant(1234.5), "#,##0.00")
      << "\n";
}

void LateBound(std::ostream& out) {
  out << "Late-bound calls by name\n";
  ObjectRef probe = CreateObject("XALProbe");
  const ClassInfo* cls = ClassOf(*probe);
  auto sink = std::make_shared<PrintingSink>(out);
  uint32_t cookie = cls->ConnectGeneric(*probe, sink);
  PutProperty(probe, "name", Variant("demo"));
  out << "  Name = " << CStr(GetProperty(probe, "NAME")) << "\n";
  std::vector<Variant> args{Variant(40)};
  // Each call runs before its line is printed, so the events it raises come first.
  const std::string sum = CStr(Invoke(probe, "Add", MemberKind::Method, args));
  out << "  Add(40) with b left out = " << sum << "\n";
  std::vector<Variant> byref{Variant("total"), Variant(": 42")};
  Invoke(probe, "Append", MemberKind::Method, byref);
  out << "  Append(ByRef \"total\", \": 42\") leaves \"" << CStr(byref[0]) << "\"\n";
  const std::string answer = CStr(Call(probe, "Ask", {Variant("Continue?")}));
  out << "  Ask(\"Continue?\") = " << answer << "\n";
  try {
    Call(probe, "NoSuchMember");
  } catch (const VbError& e) {
    out << "  NoSuchMember -> error " << e.number() << ": " << e.description() << "\n";
  }
  cls->DisconnectGeneric(*probe, cookie);
}

// Text padded to a width in characters (not bytes: the names are Estonian and Latvian).
std::string Pad(const std::string& s, size_t width) {
  size_t chars = 0;
  for (unsigned char c : s) chars += (c & 0xC0) != 0x80 ? 1 : 0;
  return chars >= width ? s : s + std::string(width - chars, ' ');
}

std::string Fixed(const Variant& v, int decimals) {
  char buf[64];
  std::snprintf(buf, sizeof buf, "%.*f", decimals, ValueOr(v, 0.0));
  return buf;
}

std::string IsoDate(const Variant& v) {
  const DateParts p = SplitDate(CDate(v));
  char buf[16];
  std::snprintf(buf, sizeof buf, "%04d-%02d-%02d", p.year, p.month, p.day);
  return buf;
}

// The server functions a document script calls, reached by name as the script reaches them.
void ServerCalls(std::ostream& out, const Ref<host::HostConnection>& conn, const Ref<host::HostDataObject>& h,
                 const Ref<host::HostDataObject>& rows) {
  ObjectRef sf = CreateObject("ServerFunctions");
  const Variant total = h->Field("TotalAmount");
  out << "  Server functions on it\n";
  out << "    in words: " << CStr(Call(sf, "VerbalSum", {total, Variant("EST"), Variant("EEK")})) << "\n";
  out << "    in words: " << CStr(Call(sf, "VerbalSum", {total, Variant("ENG"), Variant("USD")})) << "\n";
  for (rows->MoveFirst(); !rows->IsEOF(); rows->MoveNext()) {
    const Variant article = rows->Field("IDGRArticle");
    const double stock = CDbl(Call(sf, "CountStockBalance", {Variant(ObjectRef(conn)), article}));
    const Variant price = Call(sf, "GetCompanyPrice",
                               {Variant(ObjectRef(conn)), article, h->Field("IDGRCompany"), h->Field("DocDate")});
    out << "    " << Pad(CStr(rows->Field("GRArticle.Code")), 13) << "in stock " << Fixed(Variant(stock), 2)
        << ", the customer's price " << Fixed(price, 2) << "\n";
  }
}

void Companies(std::ostream& out, host::Database& db) {
  host::ResultSet companies = db.Query(
      "SELECT C.Code, C.Name, C.CreditLimit, Y.Code, T.Name, P.Name, C.IDGRTermPaymentP FROM GRCompany C "
      "LEFT JOIN GRCurrency Y ON Y.ID = C.IDGRCurrency LEFT JOIN GRTermPayment T ON T.ID = C.IDGRTermPayment "
      "LEFT JOIN GRTermPayment P ON P.ID = C.IDGRTermPaymentP ORDER BY C.ID");
  out << "  Companies (" << companies.rows.size() << ")\n";
  for (const auto& r : companies.rows) {
    const bool supplier = CLng(r[6]) != 0;
    out << "    " << Pad(r[0].AsString(), 10) << Pad(r[1].AsString(), 30) << Pad(r[3].AsString(), 5);
    if (supplier)
      out << "supplier, pays in " << r[5].AsString();
    else if (!r[4].IsNull())
      out << "customer, " << r[4].AsString() << ", credit limit " << Fixed(r[2], 2);
    else
      out << "the owner";
    out << "\n";
  }
}

void Articles(std::ostream& out, host::Database& db) {
  host::ResultSet articles = db.Query(
      "SELECT A.Code, A.Name, A.ArticleType, U.Code, T.TaxPercent, A.IsLot, A.IsSerial, "
      "(SELECT count(*) FROM GRArtCompletion C JOIN GRArtCompletionRow R ON R.IDGRArtCompletion = C.ID "
      "WHERE C.IDGRArticle = A.ID) FROM GRArticle A LEFT JOIN GRUnit U ON U.ID = A.IDGRUnit "
      "LEFT JOIN GRTax T ON T.ID = A.IDGRTax ORDER BY A.ID");
  out << "  Articles (" << articles.rows.size() << ")\n";
  for (const auto& r : articles.rows) {
    const std::string type = r[2].AsString();
    out << "    " << Pad(r[0].AsString(), 13) << Pad(r[1].AsString(), 30) << Pad(r[3].AsString(), 4)
        << (type == "S" ? "service" : type == "P" ? "set of " + CStr(r[7]) + " components" : "goods") << ", VAT "
        << Fixed(r[4], 0) << "%" << (CBool(r[5]) ? ", kept by lot" : "") << (CBool(r[6]) ? ", kept by serial" : "")
        << "\n";
  }
}

void Stock(std::ostream& out, host::Database& db) {
  host::ResultSet stock = db.Query(
      "SELECT S.Code, S.Name, A.Code, A.Name, B.Quantity, B.RQuantity, B.PQuantity, U.Code, B.Cost "
      "FROM DCurBalanceStore B JOIN DRStore S ON S.ID = B.IDDRStore JOIN GRArticle A ON A.ID = B.IDGRArticle "
      "LEFT JOIN GRUnit U ON U.ID = A.IDGRUnit ORDER BY S.ID, A.Code");
  out << "  Stock per store (current balances, at average cost)\n";
  std::string store;
  for (const auto& r : stock.rows) {
    if (r[0].AsString() != store) {
      store = r[0].AsString();
      out << "    " << store << " - " << r[1].AsString() << "\n";
    }
    out << "      " << Pad(r[2].AsString(), 13) << Pad(r[3].AsString(), 30) << Fixed(r[4], 2) << " "
        << r[7].AsString() << " at " << Fixed(r[8], 4);
    if (CDbl(r[5]) != 0) out << ", reserved " << Fixed(Variant(-CDbl(r[5])), 2);
    if (CDbl(r[6]) != 0) out << ", pre-reserved " << Fixed(r[6], 2);
    out << "\n";
  }
}

void Currencies(std::ostream& out, host::HostConnection& conn) {
  host::ResultSet rates = conn.db().Query(
      "SELECT C.Code, C.FixedRate, C.DivThreshold, C.IsTriangulation, V.ChangeDate, V.ConversionRate "
      "FROM GRCurrency C "
      "LEFT JOIN GRCurValue V ON V.IDGRCurrency = C.ID AND V.ChangeDate = (SELECT max(ChangeDate) FROM GRCurValue "
      "WHERE IDGRCurrency = C.ID) ORDER BY C.ID");
  out << "  Currencies (base " << CStr(conn.Setting("GRCurrency", "BaseCurrency", Variant(0)))
      << ", stock closed before " << IsoDate(conn.Setting("DateFixed", "Store", Variant(0))) << ")\n";
  for (const auto& r : rates.rows) {
    out << "    " << Pad(r[0].AsString(), 5);
    if (!r[4].IsNull())
      out << "latest rate " << Fixed(r[5], 4) << " of " << IsoDate(r[4]);
    else
      out << "fixed rate " << CStr(r[1]);
    out << (CBool(r[3]) ? " (triangulation)" : "") << "\n";
  }
}

// The sales invoice with the most rows, opened as a document form opens it.
void Invoice(std::ostream& out, const Ref<host::HostConnection>& conn) {
  const Variant id = conn->db().Scalar(
      "SELECT D.ID FROM SDInvoice D ORDER BY (SELECT count(*) FROM SDInvoiceRow R WHERE R.IDDoc = D.ID) DESC, D.ID "
      "LIMIT 1");
  if (id.IsNull()) return;
  auto s = host::DocumentSession::Open(conn, "SDInvoice", CLng(id));
  Ref<host::HostDataObject> h = s->Header();
  out << "  Sales invoice " << CStr(h->Field("DocNo")) << " of " << IsoDate(h->Field("DocDate"))
      << ", opened as a document\n";
  out << "    customer " << CStr(h->Field("GRCompany.Name")) << ", " << CStr(h->Field("CompanyAddr")) << "\n";
  out << "    terms " << CStr(h->Field("GRTermPayment.Name")) << ", due " << IsoDate(h->Field("PromptDate"))
      << ", currency " << CStr(h->Field("GRCurrency.Code")) << "\n";
  Ref<host::HostDataObject> rows = s->Rows();
  for (rows->MoveFirst(); !rows->IsEOF(); rows->MoveNext())
    out << "    " << Pad(CStr(rows->Field("GRArticle.Code")), 13) << Pad(CStr(rows->Field("Name")), 30)
        << Fixed(rows->Field("Quantity"), 2) << " " << Pad(CStr(rows->Field("GRUnit.Code")), 3) << " x "
        << Fixed(rows->Field("UnitPrice"), 2) << " = " << Fixed(rows->Field("Amount"), 2) << ", VAT "
        << Fixed(rows->Field("GRTax.TaxPercent"), 0) << "% " << Fixed(rows->Field("TaxAmount"), 2) << "\n";
  out << "    VAT " << Fixed(h->Field("TaxAmount"), 2) << ", total " << Fixed(h->Field("TotalAmount"), 2) << "\n";
  ServerCalls(out, conn, h, rows);
  s->Close();
}

// The demo database in $XAL_DEMO_DB (kept), or in a temporary file removed afterwards.
void DemoDatabase(std::ostream& out) {
  const char* env = std::getenv("XAL_DEMO_DB");
  const bool keep = env && *env;
  const std::string path = keep ? std::string(env)
                                : (std::filesystem::temp_directory_path() /
                                   ("xal_demo_" + std::to_string(::getpid()) + ".db")).string();
  {
    Ref<host::HostConnection> conn = host::OpenDemoDatabase(path, 1);
    out << "The demo database (" << path << ")\n";
    Companies(out, conn->db());
    Articles(out, conn->db());
    Stock(out, conn->db());
    Currencies(out, *conn);
    Invoice(out, conn);
  }
  if (!keep) {
    std::error_code ec;
    for (const char* suffix : {"", "-wal", "-shm"}) std::filesystem::remove(path + suffix, ec);
  }
}

}  // namespace

int RunDemo(std::ostream& out) {
  Values(out);
  LateBound(out);
  DemoDatabase(out);
  out << "Type library: " << TypeRegistry::Instance().classes().size() << " classes (xal typelib lists them)\n";
  return 0;
}

}  // namespace xal::app
