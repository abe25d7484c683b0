// Benchmarks of the document totals: one row edit as the form makes it (WAmount, the new
// "Amount", VAmount, and the totals when the handler leaves) on stored sales invoices of 10 and
// of 1,000 rows without column totals — the edit must cost the same on both, since the
// incremental pass does not walk the rows (targets: the 1,000-row edit within 1.2 times the
// 10-row edit and under a millisecond) — and RecomputeDocAmounts over 1,000 rows (under 50 ms).
// The demo database is built once per process in a temporary file and removed at exit.
#include <benchmark/benchmark.h>
#include <unistd.h>

#include <filesystem>
#include <map>
#include <memory>
#include <string>

#include "docfunc/docfunc.h"
#include "host/demo_db.h"
#include "host/document_session.h"
#include "runtime/dispatch.h"

namespace {

using namespace xal;
using namespace xal::host;

struct DemoFile {
  std::string path = (std::filesystem::temp_directory_path() /
                      ("xal_bench_amounts_" + std::to_string(::getpid()) + ".db")).string();
  Ref<HostConnection> conn;
  DemoFile() {
    std::filesystem::remove(path);
    conn = OpenDemoDatabase(path, 1);
  }
  ~DemoFile() {
    conn.reset();
    std::error_code ec;
    for (const char* suffix : {"", "-wal", "-shm"}) std::filesystem::remove(path + suffix, ec);
  }
};

DemoFile& Demo() {
  static DemoFile db;
  return db;
}

// A stored invoice of `rows` rows to company KASK, opened as a form with its DocFunc wired and
// its totals built.
struct Invoice {
  Ref<DocumentSession> session;
  ObjectRef df;

  explicit Invoice(int rows) {
    const Ref<HostConnection>& conn = Demo().conn;
    auto draft = DocumentSession::Open(conn, "SDInvoice");
    draft->Header()->SetField("IDGRCompany", Variant(10));
    draft->Header()->SetField("IDGRPriceList", Variant(1));
    draft->Header()->SetField("DocDate", Variant(Date(DemoDay(2010, 3, 1))));
    Ref<DataObject> data = draft->Rows();
    for (int i = 0; i < rows; ++i) {
      data->AddNew();
      for (const auto& [name, value] :
           {std::pair<const char*, Variant>{"IDGRArticle", Variant(1 + i % 13)}, {"IDGRUnit", Variant(1)},
            {"IDGRTax", Variant(1 + i % 2)}, {"Quantity", Variant(2.0)}, {"BaseQuantity", Variant(2.0)},
            {"UnitPrice", Variant(Currency::FromDouble(3.75))}, {"Amount", Variant(Currency::FromDouble(7.5))}})
        data->SetField(name, value);
    }
    const int32_t id = draft->Save();
    draft->Close();
    session = DocumentSession::Open(conn, "SDInvoice", id);
    df = CreateObject("DocFunc");
    for (const auto& [name, value] : {std::pair<const char*, ObjectRef>{"Doc", session->Proxy()},
                                      {"DocData", session->Header()}, {"XALServer", conn->Server()}}) {
      std::vector<Variant> args{Variant(value)};
      Invoke(df, name, MemberKind::PutRef, args);
    }
    Call(df, "Create");
    std::vector<Variant> rowsArg{Variant(ObjectRef(session->Rows()))};
    Invoke(df, "SetRowOB", MemberKind::Method, rowsArg);
    Call(df, "AdjustAllAmounts");
  }
};

Invoice& InvoiceOf(int rows) {
  static std::map<int, std::unique_ptr<Invoice>> invoices;
  auto& invoice = invoices[rows];
  if (!invoice) invoice = std::make_unique<Invoice>(rows);
  return *invoice;
}

// One edit of the amount of a row in the middle of the document, as the form makes it.
void BM_RowAmountEdit(benchmark::State& state) {
  Invoice& invoice = InvoiceOf(static_cast<int>(state.range(0)));
  Ref<DataObject> rows = invoice.session->Rows();
  rows->MoveFirst();
  for (int64_t i = 0; i < state.range(0) / 2; ++i) rows->MoveNext();
  int64_t cents = 750;
  for (auto _ : state) {
    Call(invoice.df, "WAmount");
    cents = cents == 750 ? 1250 : 750;
    rows->SetField("Amount", Variant(Currency::FromRaw(cents * 100)));
    benchmark::DoNotOptimize(Call(invoice.df, "VAmount"));
    invoice.session->ClearTranscript();
  }
}
BENCHMARK(BM_RowAmountEdit)->Arg(10)->Arg(1000)->Unit(benchmark::kMicrosecond);

// Every row's amount from its price again, then the totals in full.
void BM_RecomputeDocAmounts(benchmark::State& state) {
  Invoice& invoice = InvoiceOf(static_cast<int>(state.range(0)));
  for (auto _ : state) {
    benchmark::DoNotOptimize(Call(invoice.df, "RecomputeDocAmounts"));
    invoice.session->ClearTranscript();
  }
}
BENCHMARK(BM_RecomputeDocAmounts)->Arg(1000)->Unit(benchmark::kMillisecond);

}  // namespace
