// Benchmarks of the reference host: opening a stored document of 1,000 rows as a form does and
// reading five fields of every row; a dotted-path read ("GRArticle.Code") whose linked row is
// cached; and the stock-balance query over a million store rows, which must be answered through
// the (article, store) indexes rather than a scan. The databases are built once per process in
// temporary files and removed at exit.
#include <benchmark/benchmark.h>
#include <sqlite3.h>
#include <unistd.h>

#include <filesystem>
#include <memory>
#include <string>

#include "host/demo_db.h"
#include "host/document_session.h"
#include "host/kept_balances.h"
#include "runtime/convert.h"

namespace {

using namespace xal;
using namespace xal::host;

std::string TempDb(const std::string& name) {
  return (std::filesystem::temp_directory_path() / ("xal_bench_" + name + "_" + std::to_string(::getpid()) + ".db"))
      .string();
}

void RemoveDb(const std::string& path) {
  std::error_code ec;
  for (const char* suffix : {"", "-wal", "-shm"}) std::filesystem::remove(path + suffix, ec);
}

// The demo database with one more sales invoice of 1,000 rows.
struct LargeDocument {
  std::string path = TempDb("document");
  Ref<HostConnection> conn;
  int32_t id = 0;

  LargeDocument() {
    RemoveDb(path);
    conn = OpenDemoDatabase(path, 1);
    Database& db = conn->db();
    id = CLng(db.Scalar("SELECT max(ID) + 1 FROM GDocument"));
    db.ExecScript("BEGIN");
    db.Exec("INSERT INTO GDocument (ID, DocName, RefType, DocNo, DocDate, IDGRCompany, CompanyName, IDGRCurrency) "
            "SELECT ?, 'SDInvoice', 'SDInvoice', 1000, ?, ID, Name, IDGRCurrency FROM GRCompany WHERE Code = 'KASK'",
            {Variant(id), Variant(Date(DemoDay(2010, 3, 20)))});
    host::ResultSet goods = db.Query("SELECT ID, Name, IDGRUnit, IDGRTax FROM GRArticle WHERE ArticleType = 'G'");
    for (int i = 0; i < 1000; ++i) {
      const auto& a = goods.rows[static_cast<size_t>(i) % goods.rows.size()];
      const double q = 1 + i % 17, price = 1.25 + (i % 40) * 0.5;
      db.Exec("INSERT INTO SDInvoiceRow (IDDoc, RowNo, IDGRArticle, Name, IDGRUnit, IDGRTax, Quantity, BaseQuantity, "
              "UnitPrice, Price, Amount) VALUES (?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?)",
              {Variant(id), Variant(i + 1), a[0], a[1], a[2], a[3], Variant(q), Variant(q), Variant(price),
               Variant(price), Variant(q * price)});
    }
    db.ExecScript("COMMIT");
  }
  ~LargeDocument() {
    conn.reset();
    RemoveDb(path);
  }
};

LargeDocument& Document() {
  static LargeDocument doc;
  return doc;
}

void BM_HostOpenDocument1000Rows(benchmark::State& state) {
  LargeDocument& doc = Document();
  for (auto _ : state) {
    auto s = DocumentSession::Open(doc.conn, "SDInvoice", doc.id);
    Ref<HostDataObject> rows = s->Rows();
    int64_t n = 0;
    for (rows->MoveFirst(); !rows->IsEOF(); rows->MoveNext(), ++n) {
      benchmark::DoNotOptimize(rows->Field("IDGRArticle"));
      benchmark::DoNotOptimize(rows->Field("Name"));
      benchmark::DoNotOptimize(rows->Field("Quantity"));
      benchmark::DoNotOptimize(rows->Field("UnitPrice"));
      benchmark::DoNotOptimize(rows->Field("Amount"));
    }
    if (n != 1000) state.SkipWithError("the document did not open with its 1,000 rows");
    s->Close();
  }
  state.SetItemsProcessed(state.iterations() * 1000);
}
BENCHMARK(BM_HostOpenDocument1000Rows)->Unit(benchmark::kMillisecond);

void BM_HostDottedPathCached(benchmark::State& state) {
  LargeDocument& doc = Document();
  Ref<HostDataObject> rows =
      doc.conn->OpenRows("SELECT * FROM SDInvoiceRow WHERE IDDoc = ? ORDER BY ID", "SDInvoiceRow", "SDInvoiceRow",
                         {Variant(doc.id)});
  rows->MoveFirst();
  const Variant first = rows->Field("GRArticle.Code");  // reads the linked row into the cache
  if (!first.IsString() || first.AsString().empty()) state.SkipWithError("the row's article was not found");
  for (auto _ : state) benchmark::DoNotOptimize(rows->Field("GRArticle.Code"));
}
BENCHMARK(BM_HostDottedPathCached);

// A million store rows over 2,000 articles and 10 stores: receipts, issues and moves between
// stores, a few pre-reserved or reserved, dated over two years.
struct MillionRows {
  static constexpr int kArticles = 2000, kStores = 10, kRows = 1000000;
  std::string path = TempDb("stock");
  Ref<HostConnection> conn;
  std::string plan;

  MillionRows() {
    RemoveDb(path);
    conn = HostConnection::Open(path, 1);
    Database& db = conn->db();
    // The rows go in with the balance upkeep off and the balances are built once at the end. Nor
    // does the file need a journal; a large page cache keeps the index pages of the load in memory.
    db.ExecScript("PRAGMA journal_mode = OFF; PRAGMA synchronous = OFF; PRAGMA cache_size = -131072;");
    LoadInBulk(*conn, [&](Database&) {
      sqlite3_stmt* st = nullptr;
      sqlite3_prepare_v2(db.handle(),
                         "INSERT INTO DDStoreDRow (IDDoc, IDGRArticle, ArticleType, DealState, DocDate, Quantity, "
                         "BaseQuantity, Cost, IDReceiverStore, IDSenderStore) VALUES (?, ?, 'G', ?, ?, ?, ?, ?, ?, ?)",
                         -1, &st, nullptr);
      uint64_t seed = 0x9E3779B97F4A7C15ull;
      auto next = [&seed](uint32_t bound) {
        seed = seed * 6364136223846793005ull + 1442695040888963407ull;
        return static_cast<uint32_t>(seed >> 33) % bound;
      };
      const int32_t firstDay = DemoDay(2009, 1, 1);
      for (int i = 0; i < kRows; ++i) {
        const uint32_t kind = next(10), state = next(20);
        const int store = 1 + static_cast<int>(next(kStores));
        const double q = 1 + next(100);
        sqlite3_bind_int(st, 1, 1 + i / 50);
        sqlite3_bind_int(st, 2, 1 + static_cast<int>(next(kArticles)));
        sqlite3_bind_text(st, 3, state == 0 ? "P" : state == 1 ? "R" : "", -1, SQLITE_STATIC);
        sqlite3_bind_double(st, 4, firstDay + i / 1400);
        sqlite3_bind_double(st, 5, q);
        sqlite3_bind_double(st, 6, q);
        sqlite3_bind_double(st, 7, q * 2.5);
        // 7 in 10 receipts, 2 issues, 1 a move to the next store.
        if (kind < 7 || kind == 9) sqlite3_bind_int(st, 8, kind == 9 ? store % kStores + 1 : store);
        else sqlite3_bind_null(st, 8);
        if (kind >= 7) sqlite3_bind_int(st, 9, store);
        else sqlite3_bind_null(st, 9);
        sqlite3_step(st);
        sqlite3_reset(st);
      }
      sqlite3_finalize(st);
    });
    db.ExecScript("ANALYZE;");
    for (auto& r : db.Query(std::string("EXPLAIN QUERY PLAN ") + kQuery).rows) plan += CStr(r.back()) + "\n";
  }
  ~MillionRows() {
    conn.reset();
    RemoveDb(path);
  }

  // The file database's stock of one article in one store: receipts less issues, leaving out
  // services and pre-reservations.
  static constexpr const char* kQuery =
      "SELECT SUM(I.BaseQuantity) AS Q FROM DDStoreDRow I WHERE I.IDGRArticle = ? AND I.ArticleType <> 'S' "
      "AND I.DealState <> 'P' AND I.IDReceiverStore = ? "
      "UNION ALL SELECT -SUM(O.BaseQuantity) AS Q FROM DDStoreDRow O WHERE O.IDGRArticle = ? "
      "AND O.ArticleType <> 'S' AND O.DealState <> 'P' AND O.IDSenderStore = ?";

  // Both sides must be searched through the (article, store) indexes.
  bool PlanUsesIndexes() const {
    return plan.find("SCAN") == std::string::npos && plan.find("DDStoreDRow_ArtRecv") != std::string::npos &&
           plan.find("DDStoreDRow_ArtSend") != std::string::npos;
  }
};

MillionRows& Stock() {
  static MillionRows rows;
  return rows;
}

void BM_HostStockBalance1MRows(benchmark::State& state) {
  MillionRows& m = Stock();
  if (!m.PlanUsesIndexes()) {
    state.SkipWithError(("the stock query is not answered through the indexes:\n" + m.plan).c_str());
    return;
  }
  Database& db = m.conn->db();
  int article = 1, store = 1;
  double total = 0;
  for (auto _ : state) {
    host::ResultSet rs = db.Query(MillionRows::kQuery, {Variant(article), Variant(store), Variant(article),
                                                        Variant(store)});
    for (auto& r : rs.rows) total += r[0].IsNull() ? 0.0 : CDbl(r[0]);
    article = (article + 6) % MillionRows::kArticles + 1;
    store = store % MillionRows::kStores + 1;
  }
  benchmark::DoNotOptimize(total);
}
BENCHMARK(BM_HostStockBalance1MRows)->Unit(benchmark::kMicrosecond);

// The server's answer to the same question: one row of the kept balance by its key.
void BM_HostStockBalanceKept(benchmark::State& state) {
  MillionRows& m = Stock();
  Database& db = m.conn->db();
  int article = 1, store = 1;
  double total = 0;
  for (auto _ : state) {
    host::ResultSet rs =
        db.Query("SELECT Quantity + RQuantity FROM DCurBalanceStore WHERE IDGRArticle = ? AND IDDRStore = ?",
                 {Variant(article), Variant(store)});
    if (!rs.rows.empty()) total += CDbl(rs.rows[0][0]);
    article = (article + 6) % MillionRows::kArticles + 1;
    store = store % MillionRows::kStores + 1;
  }
  benchmark::DoNotOptimize(total);
}
BENCHMARK(BM_HostStockBalanceKept)->Unit(benchmark::kMicrosecond);

}  // namespace
