// The reference host's SQLite connection.
#include "host/database.h"

#include <sqlite3.h>

#include <cstring>
#include <limits>

#include "host/host_error.h"
#include "host/sql_functions.h"
#include "runtime/ascii.h"
#include "runtime/error.h"
#include "runtime/text.h"

namespace xal::host {

namespace {
[[noreturn]] void Fail(sqlite3* db, std::string_view sql) {
  std::string msg = db ? sqlite3_errmsg(db) : "cannot open database";
  Raise(kErrSql, msg + " [" + std::string(sql.substr(0, 400)) + "]");
}

// keeps_balances(): the switch of the kept-balance triggers, one per connection.
void KeepsBalancesFn(sqlite3_context* ctx, int, sqlite3_value**) {
  sqlite3_result_int(ctx, static_cast<const Database*>(sqlite3_user_data(ctx))->KeepsBalances() ? 1 : 0);
}
}  // namespace

// A prepared statement for one run: taken from the cache when its text is there, reset and handed
// back (or finalized, when the cache already holds another of the same text) when the run ends.
struct Database::Stmt {
  static constexpr size_t kMaxCached = 200;
  Database& owner;
  std::string text;
  sqlite3_stmt* s = nullptr;
  Stmt(Database& db, std::string_view sql) : owner(db), text(sql) {
    auto it = owner.statements_.find(text);
    if (it != owner.statements_.end()) {
      s = it->second;
      owner.statements_.erase(it);
      return;
    }
    const char* tail = nullptr;
    if (sqlite3_prepare_v3(owner.db_, sql.data(), static_cast<int>(sql.size()), SQLITE_PREPARE_PERSISTENT, &s,
                           &tail) != SQLITE_OK)
      Fail(owner.db_, sql);
    if (!s) Raise(kErrSql, "empty SQL statement");
  }
  ~Stmt() {
    sqlite3_reset(s);
    sqlite3_clear_bindings(s);
    if (owner.statements_.count(text)) {
      sqlite3_finalize(s);
      return;
    }
    if (owner.statements_.size() >= kMaxCached) owner.ClearStatements();
    owner.statements_.emplace(std::move(text), s);
  }
  void Bind(const std::vector<Variant>& params) {
    for (size_t i = 0; i < params.size(); ++i) BindVariant(s, static_cast<int>(i + 1), params[i]);
  }
};

void Database::ClearStatements() {
  for (auto& [text, stmt] : statements_) sqlite3_finalize(stmt);
  statements_.clear();
}

ColumnKind KindFromDeclType(const char* d) {
  if (!d) return ColumnKind::Auto;
  if (AsciiStartsWithNoCase(d, "DATE")) return ColumnKind::Date;
  if (AsciiStartsWithNoCase(d, "CURRENCY")) return ColumnKind::Currency;
  if (AsciiStartsWithNoCase(d, "BOOL")) return ColumnKind::Boolean;
  if (AsciiStartsWithNoCase(d, "INT")) return ColumnKind::Integer;
  if (AsciiStartsWithNoCase(d, "REAL") || AsciiStartsWithNoCase(d, "DOUBLE") || AsciiStartsWithNoCase(d, "FLOAT"))
    return ColumnKind::Real;
  if (AsciiStartsWithNoCase(d, "TEXT") || AsciiStartsWithNoCase(d, "VARCHAR") || AsciiStartsWithNoCase(d, "CHAR"))
    return ColumnKind::Text;
  return ColumnKind::Auto;
}

void BindVariant(sqlite3_stmt* stmt, int i, const Variant& v) {
  v.Visit(Overloaded{
      [&](std::monostate) { sqlite3_bind_null(stmt, i); },
      [&](NullValue) { sqlite3_bind_null(stmt, i); },
      [&](MissingValue) { sqlite3_bind_null(stmt, i); },
      [&](int16_t x) { sqlite3_bind_int(stmt, i, x); },
      [&](int32_t x) { sqlite3_bind_int(stmt, i, x); },
      [&](double x) { sqlite3_bind_double(stmt, i, x); },
      [&](Currency c) { sqlite3_bind_double(stmt, i, c.ToDouble()); },
      [&](Date d) { sqlite3_bind_double(stmt, i, d.serial); },
      [&](const std::string& s) { sqlite3_bind_text(stmt, i, s.data(), static_cast<int>(s.size()), SQLITE_TRANSIENT); },
      [&](bool b) { sqlite3_bind_int(stmt, i, b ? -1 : 0); },
      [&](const ObjectRef&) { Raise(kErrTypeMismatch, "an object cannot be stored in a column"); },
      [&](const SafeArray&) { Raise(kErrTypeMismatch, "an array cannot be stored in a column"); },
  });
}

Variant ReadColumn(sqlite3_stmt* stmt, int i, ColumnKind kind) {
  const int type = sqlite3_column_type(stmt, i);
  if (type == SQLITE_NULL) return Variant::Null();
  switch (kind) {
    case ColumnKind::Date: return Variant(Date(sqlite3_column_double(stmt, i)));
    case ColumnKind::Currency: return Variant(Currency::FromDouble(sqlite3_column_double(stmt, i)));
    case ColumnKind::Boolean: return Variant(sqlite3_column_double(stmt, i) != 0);
    default: break;
  }
  if (type == SQLITE_INTEGER && kind != ColumnKind::Real && kind != ColumnKind::Text) {
    int64_t x = sqlite3_column_int64(stmt, i);
    if (x >= std::numeric_limits<int32_t>::min() && x <= std::numeric_limits<int32_t>::max())
      return Variant(static_cast<int32_t>(x));
    return Variant(static_cast<double>(x));
  }
  if (type == SQLITE_INTEGER || type == SQLITE_FLOAT) {
    if (kind == ColumnKind::Text) {
      const char* t = reinterpret_cast<const char*>(sqlite3_column_text(stmt, i));
      return Variant(std::string(t ? t : ""));
    }
    return Variant(sqlite3_column_double(stmt, i));
  }
  const char* t = reinterpret_cast<const char*>(sqlite3_column_text(stmt, i));
  return Variant(std::string(t ? t : "", static_cast<size_t>(sqlite3_column_bytes(stmt, i))));
}

Database::Database(const std::string& path) : path_(path) {
  if (sqlite3_open_v2(path.c_str(), &db_, SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE | SQLITE_OPEN_FULLMUTEX,
                      nullptr) != SQLITE_OK) {
    std::string msg = db_ ? sqlite3_errmsg(db_) : "out of memory";
    sqlite3_close(db_);
    db_ = nullptr;
    Raise(kErrSql, "cannot open " + path + ": " + msg);
  }
  // Double-quoted text is never taken for a string literal: the translator turns the file
  // dialect's "x" into 'x' itself, so a stray one is an error instead of a silent guess.
  sqlite3_db_config(db_, SQLITE_DBCONFIG_DQS_DML, 0, nullptr);
  sqlite3_db_config(db_, SQLITE_DBCONFIG_DQS_DDL, 0, nullptr);
  sqlite3_busy_timeout(db_, 2000);
  RegisterSqlFunctions(db_);
  sqlite3_create_function_v2(db_, "keeps_balances", 0, SQLITE_UTF8 | SQLITE_INNOCUOUS, this, KeepsBalancesFn, nullptr,
                             nullptr, nullptr);
  ExecScript("PRAGMA foreign_keys = OFF; PRAGMA recursive_triggers = ON; PRAGMA journal_mode = WAL; PRAGMA synchronous = NORMAL;");
}

Database::~Database() {
  ClearStatements();
  sqlite3_close(db_);
}

void Database::ExecScript(std::string_view sql) {
  std::string text(sql);
  char* err = nullptr;
  if (sqlite3_exec(db_, text.c_str(), nullptr, nullptr, &err) != SQLITE_OK) {
    std::string msg = err ? err : "error";
    sqlite3_free(err);
    Raise(kErrSql, msg);
  }
}

int64_t Database::Exec(std::string_view sql, const std::vector<Variant>& params) {
  Stmt st(*this, sql);
  st.Bind(params);
  int rc;
  while ((rc = sqlite3_step(st.s)) == SQLITE_ROW) {
  }
  if (rc != SQLITE_DONE) Fail(db_, sql);
  return sqlite3_changes64(db_);
}

ResultSet Database::Query(std::string_view sql, const std::vector<Variant>& params) {
  Stmt st(*this, sql);
  st.Bind(params);
  ResultSet rs;
  const int n = sqlite3_column_count(st.s);
  bool oneTable = n > 0;
  for (int i = 0; i < n; ++i) {
    rs.columns.emplace_back(sqlite3_column_name(st.s, i));
    rs.kinds.push_back(KindFromDeclType(sqlite3_column_decltype(st.s, i)));
    const char* t = sqlite3_column_table_name(st.s, i);
    if (!t || (!rs.sourceTable.empty() && !TextEquals(rs.sourceTable, t)))
      oneTable = false;
    else if (rs.sourceTable.empty())
      rs.sourceTable = t;
  }
  if (!oneTable) rs.sourceTable.clear();
  int rc;
  while ((rc = sqlite3_step(st.s)) == SQLITE_ROW) {
    std::vector<Variant> row;
    row.reserve(static_cast<size_t>(n));
    for (int i = 0; i < n; ++i) row.push_back(ReadColumn(st.s, i, rs.kinds[static_cast<size_t>(i)]));
    rs.rows.push_back(std::move(row));
  }
  if (rc != SQLITE_DONE) Fail(db_, sql);
  return rs;
}

Variant Database::Scalar(std::string_view sql, const std::vector<Variant>& params) {
  ResultSet rs = Query(sql, params);
  if (rs.rows.empty() || rs.rows[0].empty()) return Variant::Null();
  return rs.rows[0][0];
}

int64_t Database::LastInsertId() const { return sqlite3_last_insert_rowid(db_); }

bool Database::TableExists(std::string_view name) {
  Variant n = Scalar("SELECT count(*) FROM sqlite_schema WHERE type IN ('table','view') AND name = ? COLLATE NOCASE",
                     {Variant(std::string(name))});
  return n.IsNumber() && n != Variant(0);
}

std::vector<std::string> Database::TableColumns(std::string_view table) {
  std::vector<std::string> cols;
  ResultSet rs = Query("SELECT name FROM pragma_table_info(?)", {Variant(std::string(table))});
  for (auto& r : rs.rows) cols.push_back(r[0].AsString());
  return cols;
}

}  // namespace xal::host
