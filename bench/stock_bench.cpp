// Benchmarks of the stock balance a row validation asks for on every quantity it checks: one
// article in one store with many store rows, in the file kind (sums over the rows, with and
// without closed periods) and in the server kind (the current balance row).
#include <benchmark/benchmark.h>

#include <unistd.h>

#include <filesystem>
#include <string>

#include "host/connection.h"
#include "host/kept_balances.h"
#include "runtime/dates.h"
#include "server/stock.h"

namespace {

// A database with `rows` movements of article 1 between outside, store 1 and store 2, spread
// over a year, and the flows before July closed into DBalanceStore.
xal::Ref<xal::host::HostConnection> StockDb(int32_t kind, int64_t rows, bool closed) {
  const auto path = std::filesystem::temp_directory_path() /
                    ("xal_stock_bench_" + std::to_string(::getpid()) + "_" + std::to_string(kind) + "_" +
                     std::to_string(rows) + (closed ? "_c" : "") + ".db");
  std::filesystem::remove(path);
  auto conn = xal::host::HostConnection::Open(path.string(), kind);
  const double start = xal::DateSerial(2009, 1, 1).serial;
  xal::host::LoadInBulk(*conn, [&](xal::host::Database& db) {
    for (int64_t i = 0; i < rows; ++i) {
      const char* sender = (i % 3 == 0) ? "NULL" : (i % 3 == 1 ? "1" : "2");
      const char* receiver = (i % 3 == 0) ? "1" : (i % 3 == 1 ? "2" : "NULL");
      db.Exec("INSERT INTO DDStoreDRow (IDDoc, IDGRArticle, IDSenderStore, IDReceiverStore, BaseQuantity, Cost, "
              "DocDate) VALUES (1, 1, " + std::string(sender) + ", " + receiver + ", ?, ?, ?)",
              {xal::Variant(double(1 + i % 5)), xal::Variant(double(2 + i % 7)),
               xal::Variant(xal::Date(start + double(i % 365)))});
    }
    if (!closed) return;
    const std::string d = std::to_string(static_cast<int>(xal::DateSerial(2009, 7, 1).serial));
    db.ExecScript("INSERT INTO DBalanceStore (DocDate, IDGRArticle, IDDRStore, DebitQFlow, CreditQFlow) "
                  "SELECT DocDate, IDGRArticle, St, total(DQ), total(CQ) FROM ("
                  "SELECT DocDate, IDGRArticle, IDReceiverStore St, BaseQuantity DQ, 0 CQ FROM DDStoreDRow "
                  "WHERE IDReceiverStore IS NOT NULL AND DocDate < " + d +
                  " UNION ALL SELECT DocDate, IDGRArticle, IDSenderStore, 0, BaseQuantity FROM DDStoreDRow "
                  "WHERE IDSenderStore IS NOT NULL AND DocDate < " + d + ") GROUP BY 1, 2, 3;");
  });
  if (closed) conn->SetSetting("DateFixed", "Store", xal::Variant(xal::DateSerial(2009, 7, 1)));
  return conn;
}

void BM_StockBalance(benchmark::State& state, int32_t kind, bool closed) {
  auto conn = StockDb(kind, state.range(0), closed);
  const xal::Ref<xal::XALConnect> c = conn;
  for (auto _ : state) benchmark::DoNotOptimize(xal::server::CountStockBalance(c, 1, 1));
  state.SetItemsProcessed(state.iterations() * state.range(0));
}

BENCHMARK_CAPTURE(BM_StockBalance, FileKind, 1, false)->Arg(1000)->Arg(20000)->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(BM_StockBalance, FileKindClosed, 1, true)->Arg(1000)->Arg(20000)->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(BM_StockBalance, ServerKind, 2, false)->Arg(1000)->Arg(20000)->Unit(benchmark::kMicrosecond);

}  // namespace
