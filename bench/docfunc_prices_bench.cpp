// The price of one document row, as every quantity change and every row recomputation asks for
// it: FillPrice walks a five-list chain (two lists out of date, two without the article, the
// fifth with the price and its quantity steps) after the company-price query finds nothing. The
// same call runs on a price register of 100 rows and of 100,000 rows (with as many quantity
// steps and a tenth as many company prices); the setup prints the query plan of every statement
// one call sends and refuses to run when a large table is scanned instead of searched.
#include <benchmark/benchmark.h>
#include <sqlite3.h>

#include <filesystem>
#include <map>
#include <set>
#include <string>

#include "docfunc/docfunc.h"
#include "host/connection.h"
#include "host/demo_db.h"
#include "host/document_session.h"
#include "runtime/convert.h"

namespace {

using xal::Variant;
using xal::host::DemoDay;

// The tables that grow with the register; a plan that scans one of them is a missing index.
constexpr const char* kLargeTables[] = {"GRPriceListRel", "GRPriceLQuantity", "GRCPriceListRel", "GRCPriceLCompany"};

struct PriceDb {
  xal::Ref<xal::host::HostConnection> conn;
  xal::Ref<xal::host::DocumentSession> session;
  xal::Ref<xal::DocFunc> df;
  xal::Ref<xal::DataObject> rows;
  std::string error;  // why the benchmark cannot run
};

void Fill(xal::host::Database& db, int64_t rows) {
  db.ExecScript(
      "BEGIN;"
      "INSERT INTO GRUnit (ID, Code, IDFirst, Relation) VALUES (1, 'pcs', 0, 1);"
      "INSERT INTO GRArticle (ID, Code, IDGRUnit) VALUES (1, 'A1', 1);"
      "INSERT INTO GRCompany (ID, Code) VALUES (1, 'C1'), (2, 'C2');"
      "INSERT INTO GRPriceList (ID, IDFirst, BeginDate, EndDate) VALUES"
      " (1, 2, " + std::to_string(DemoDay(2008, 1, 1)) + ", " + std::to_string(DemoDay(2008, 12, 31)) + "),"
      " (2, 3, " + std::to_string(DemoDay(2009, 1, 1)) + ", " + std::to_string(DemoDay(2009, 12, 31)) + "),"
      " (3, 4, " + std::to_string(DemoDay(2010, 1, 1)) + ", 0), (4, 5, 0, 0), (5, 0, 0, 0);"
      "INSERT INTO GRPriceListRel (ID, IDGRPriceList, IDGRArticle, IDGRUnit, Price) VALUES"
      " (1, 1, 1, 1, 9), (2, 5, 1, 1, 20);"
      "INSERT INTO GRPriceLQuantity (IDGRPriceListRel, Quantity, Price) VALUES (2, 10, 19), (2, 50, 18), (2, 100, 17);"
      "INSERT INTO GRCPriceList (ID, IsCertified) VALUES (1, -1);"
      "INSERT INTO GRCPriceLCompany (IDGRCPriceList, IDGRCompany) VALUES (1, 2);");
  // The other articles: each priced in all five lists, each price with one quantity step.
  sqlite3* h = db.handle();
  sqlite3_stmt *rel = nullptr, *step = nullptr, *company = nullptr;
  sqlite3_prepare_v2(h, "INSERT INTO GRPriceListRel (ID, IDGRPriceList, IDGRArticle, IDGRUnit, Price) "
                        "VALUES (?, ?, ?, 1, ?)", -1, &rel, nullptr);
  sqlite3_prepare_v2(h, "INSERT INTO GRPriceLQuantity (IDGRPriceListRel, Quantity, Price) VALUES (?, 20, ?)", -1,
                     &step, nullptr);
  sqlite3_prepare_v2(h, "INSERT INTO GRCPriceListRel (IDGRCPriceList, IDGRArticle, IDGRUnit, Price) "
                        "VALUES (1, ?, 1, ?)", -1, &company, nullptr);
  for (int64_t i = 0; i < rows - 2; ++i) {
    const int64_t id = 3 + i, article = 2 + i / 5;
    sqlite3_bind_int64(rel, 1, id);
    sqlite3_bind_int64(rel, 2, 1 + i % 5);
    sqlite3_bind_int64(rel, 3, article);
    sqlite3_bind_double(rel, 4, 1.0 + static_cast<double>(i % 97));
    sqlite3_step(rel);
    sqlite3_reset(rel);
    sqlite3_bind_int64(step, 1, id);
    sqlite3_bind_double(step, 2, 0.5 + static_cast<double>(i % 97));
    sqlite3_step(step);
    sqlite3_reset(step);
    if (i % 10 != 0) continue;
    sqlite3_bind_int64(company, 1, article);
    sqlite3_bind_double(company, 2, 1.0 + static_cast<double>(i % 89));
    sqlite3_step(company);
    sqlite3_reset(company);
  }
  for (sqlite3_stmt* s : {rel, step, company}) sqlite3_finalize(s);
  db.ExecScript("COMMIT");
}

// Every statement the next call of `call` sends to SQLite (the host's probes left out).
template <class F>
std::set<std::string> StatementsOf(xal::host::Database& db, F&& call) {
  std::set<std::string> seen;
  sqlite3_trace_v2(
      db.handle(), SQLITE_TRACE_STMT,
      [](unsigned, void* ctx, void* stmt, void*) {
        char* sql = sqlite3_expanded_sql(static_cast<sqlite3_stmt*>(stmt));
        if (sql) static_cast<std::set<std::string>*>(ctx)->insert(sql);
        sqlite3_free(sql);
        return 0;
      },
      &seen);
  call();
  sqlite3_trace_v2(db.handle(), 0, nullptr, nullptr);
  std::erase_if(seen, [](const std::string& s) { return s.ends_with(") WHERE 0"); });
  return seen;
}

// Whether the plan line "SCAN name" reads a large table (by its name or its alias in `sql`).
bool ScansLargeTable(const std::string& sql, const std::string& line) {
  if (line.rfind("SCAN ", 0) != 0) return false;
  const std::string name = line.substr(5, line.find(' ', 5) - 5);
  for (const char* t : kLargeTables) {
    const std::string table(t);
    if (name == table || sql.find(table + " " + name + " ") != std::string::npos ||
        sql.find(table + " " + name + ")") != std::string::npos)
      return true;
  }
  return false;
}

// Prints each statement with its plan; returns the first statement that scans a large table.
std::string CheckPlans(xal::host::Database& db, const std::set<std::string>& statements) {
  std::string bad;
  for (const std::string& sql : statements) {
    std::printf("  %s\n", sql.c_str());
    for (auto& r : db.Query("EXPLAIN QUERY PLAN " + sql).rows) {
      const std::string line = xal::CStr(r.back());
      std::printf("    %s\n", line.c_str());
      if (bad.empty() && ScansLargeTable(sql, line)) bad = sql;
    }
  }
  return bad;
}

PriceDb& Open(int32_t kind, int64_t rows) {
  static std::map<std::pair<int32_t, int64_t>, PriceDb> dbs;
  PriceDb& p = dbs[{kind, rows}];
  if (p.df) return p;
  const auto path = std::filesystem::temp_directory_path() /
                    ("xal_prices_bench_" + std::to_string(kind) + "_" + std::to_string(rows) + ".db");
  std::filesystem::remove(path);
  p.conn = xal::host::HostConnection::Open(path.string(), kind);
  Fill(p.conn->db(), rows);
  p.session = xal::host::DocumentSession::Open(p.conn, "SDInvoice");
  xal::Ref<xal::DataObject> header = p.session->Header();
  header->SetField("DocDate", Variant(xal::Date(DemoDay(2010, 3, 15))));
  header->SetField("IDGRCompany", Variant(1));
  header->SetField("IDGRPriceList", Variant(1));
  p.rows = p.session->Rows();
  p.rows->AddNew();
  p.rows->SetField("IDGRArticle", Variant(1));
  p.rows->SetField("BaseQuantity", Variant(60.0));
  p.df = xal::MakeRef<xal::DocFunc>();
  p.df->SetDoc(p.session->Proxy());
  p.df->SetDocData(header);
  p.df->SetXALServer(p.conn->Server());
  p.df->Create();
  p.df->SetRowOB(p.rows);
  std::printf("Query plans of one FillPrice, kind %d, %lld price rows:\n", kind, static_cast<long long>(rows));
  const auto statements = StatementsOf(p.conn->db(), [&] { p.df->FillPrice(p.rows); });
  const std::string scan = CheckPlans(p.conn->db(), statements);
  if (!scan.empty()) p.error = "a large table is scanned: " + scan;
  // The fifth list's step from 50 on.
  if (xal::CDbl(p.rows->Field("UnitPrice")) != 18 || xal::CLng(p.rows->Field("IDGRPriceList")) != 5)
    p.error = "FillPrice did not find the price of the fifth list's quantity step";
  return p;
}

void BM_FillPrice(benchmark::State& state, int32_t kind) {
  PriceDb& p = Open(kind, state.range(0));
  if (!p.error.empty()) {
    state.SkipWithError(p.error.c_str());
    return;
  }
  for (auto _ : state) benchmark::DoNotOptimize(p.df->FillPrice(p.rows));
}

BENCHMARK_CAPTURE(BM_FillPrice, FileKind, 1)->Arg(100)->Arg(100000)->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(BM_FillPrice, ServerKind, 2)->Arg(100)->Arg(100000)->Unit(benchmark::kMicrosecond);

}  // namespace
