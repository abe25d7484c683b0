// Benchmark of DocFunc's handler template: a handler that defers nothing, called as the form's
// script calls it, on a stored sales invoice of 10 rows — the cost of entering and leaving a
// handler (the rows' position remembered and restored, nothing refreshed). The target is under a
// microsecond. The database is built once per process in a temporary file and removed at exit.
#include <benchmark/benchmark.h>
#include <unistd.h>

#include <filesystem>
#include <string>

#include "docfunc/docfunc.h"
#include "host/demo_db.h"
#include "host/document_session.h"
#include "runtime/dispatch.h"

namespace {

using namespace xal;
using namespace xal::host;

struct TenRowInvoice {
  std::string path = (std::filesystem::temp_directory_path() /
                      ("xal_bench_docfunc_" + std::to_string(::getpid()) + ".db")).string();
  Ref<HostConnection> conn;
  Ref<DocumentSession> session;
  Ref<DocFunc> df;

  TenRowInvoice() {
    std::filesystem::remove(path);
    conn = OpenDemoDatabase(path, 1);
    session = DocumentSession::Open(conn, "SDInvoice");
    Ref<DataObject> rows = session->Rows();
    for (int i = 0; i < 10; ++i) {
      rows->AddNew();
      rows->SetField("Amount", Variant(i + 1));
    }
    rows->MoveFirst();
    df = MakeRef<DocFunc>();
    df->SetDoc(session->Proxy());
    df->SetDocData(session->Header());
    df->SetXALServer(conn->Server());
    df->Create();
    df->SetRowOB(rows);
  }
  ~TenRowInvoice() {
    df->Destroy();
    session->Close();
    session.reset();
    conn.reset();
    std::error_code ec;
    for (const char* suffix : {"", "-wal", "-shm"}) std::filesystem::remove(path + suffix, ec);
  }
};

TenRowInvoice& Invoice() {
  static TenRowInvoice doc;
  return doc;
}

// Enter, an empty body, leave: the template's own cost, called directly.
void BM_HandlerTemplate(benchmark::State& state) {
  DocFunc& df = *Invoice().df;
  for (auto _ : state) benchmark::DoNotOptimize(df.Doc_Show());
}
BENCHMARK(BM_HandlerTemplate);

// The same handler reached by name, as a script reaches it.
void BM_HandlerByName(benchmark::State& state) {
  ObjectRef df = Invoice().df;
  for (auto _ : state) benchmark::DoNotOptimize(Call(df, "Doc_Show"));
}
BENCHMARK(BM_HandlerByName);

}  // namespace
