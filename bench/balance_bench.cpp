// Benchmarks of the kept current balances: saving one store row costs the same in a young and in
// an old database, because the triggers add the row's part to its two keys instead of summing the
// table again. Both sizes run side by side; the databases are loaded once in bulk.
#include <benchmark/benchmark.h>

#include <unistd.h>

#include <filesystem>
#include <map>
#include <string>

#include "host/connection.h"
#include "host/kept_balances.h"

namespace {

// `rows` store rows over 1,000 articles and 3 stores (receipts, issues and movements; every 20th
// reserved, every 20th pre-reserved, every 50th a service), and a reservation relation on every
// tenth row. Kept open for the whole run.
xal::host::HostConnection& StoreDb(int64_t rows) {
  // The databases live for the whole run; their files go when it ends.
  struct OpenDb {
    xal::Ref<xal::host::HostConnection> conn;
    std::filesystem::path path;
    ~OpenDb() {
      conn.reset();
      std::error_code ec;
      for (const char* suffix : {"", "-wal", "-shm"}) std::filesystem::remove(path.string() + suffix, ec);
    }
  };
  static std::map<int64_t, OpenDb> open;
  OpenDb& db = open[rows];
  if (db.conn) return *db.conn;
  db.path = std::filesystem::temp_directory_path() /
            ("xal_balance_bench_" + std::to_string(::getpid()) + "_" + std::to_string(rows) + ".db");
  std::filesystem::remove(db.path);
  auto& conn = db.conn;
  conn = xal::host::HostConnection::Open(db.path.string(), xal::kDbServer);
  xal::host::LoadInBulk(*conn, [&](xal::host::Database& d) {
    d.Exec("WITH RECURSIVE n(i) AS (SELECT 0 UNION ALL SELECT i + 1 FROM n WHERE i + 1 < ?) "
           "INSERT INTO DDStoreDRow (IDDoc, IDGRArticle, ArticleType, DealState, IDSenderStore, IDReceiverStore, "
           "BaseQuantity, AltQuantity, Cost, DocDate) "
           "SELECT 1 + i / 10, 1 + i % 1000, CASE WHEN i % 50 = 7 THEN 'S' ELSE 'G' END, "
           "CASE i % 20 WHEN 3 THEN 'R' WHEN 4 THEN 'P' ELSE '' END, "
           "CASE i % 3 WHEN 0 THEN NULL ELSE 1 + i % 2 END, CASE i % 3 WHEN 1 THEN NULL ELSE 1 + (i + 1) % 3 END, "
           "1 + i % 5, i % 2, 2 + i % 7, 39814 + i % 365 FROM n",
           {xal::Variant(static_cast<double>(rows))});
    d.Exec("INSERT INTO DRStockReserveRel (IDDRStockReserve, IDDDStoreDRow, Quantity) "
           "SELECT 1 + ID % 500, ID, 1 FROM DDStoreDRow WHERE ID % 10 = 0");
  });
  return *conn;
}

// One movement row of a busy article between two stores: both keys of the current balances change.
void InsertStoreRow(xal::host::Database& db, int64_t doc) {
  db.Exec("INSERT INTO DDStoreDRow (IDDoc, IDGRArticle, ArticleType, IDSenderStore, IDReceiverStore, BaseQuantity, "
          "Cost, DocDate) VALUES (?, 7, 'G', 1, 2, 3, 6.5, 40179)",
          {xal::Variant(static_cast<double>(doc))});
}

// Each row saved on its own: the statement, its triggers and the commit.
void BM_InsertStoreRow(benchmark::State& state) {
  xal::host::Database& db = StoreDb(state.range(0)).db();
  for (auto _ : state) InsertStoreRow(db, state.iterations());
  state.SetItemsProcessed(state.iterations());
}

// Rows saved inside one transaction, as a document saves its rows: the statement and its triggers.
void BM_InsertStoreRowInTransaction(benchmark::State& state) {
  xal::host::Database& db = StoreDb(state.range(0)).db();
  db.ExecScript("BEGIN");
  for (auto _ : state) InsertStoreRow(db, state.iterations());
  db.ExecScript("ROLLBACK");
  state.SetItemsProcessed(state.iterations());
}

BENCHMARK(BM_InsertStoreRow)->Arg(1000)->Arg(1000000)->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_InsertStoreRowInTransaction)->Arg(1000)->Arg(1000000)->Unit(benchmark::kMicrosecond);

}  // namespace
