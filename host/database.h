// A thin owner of one SQLite connection for the reference host: statements run with Variants
// bound as parameters, and result rows come back as Variants typed by the columns' declared types
// (DATE… → Date, CURRENCY… → Currency, BOOL… → Boolean), the way the original data layer typed
// them. SQL that SQLite rejects becomes a VbError carrying SQLite's message.
#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "runtime/text.h"
#include "runtime/variant.h"

struct sqlite3;
struct sqlite3_stmt;

namespace xal::host {

// How a column's values are typed when read back.
enum class ColumnKind { Auto, Date, Currency, Boolean, Integer, Real, Text };
ColumnKind KindFromDeclType(const char* decltype_);

struct ResultSet {
  std::vector<std::string> columns;
  std::vector<ColumnKind> kinds;
  std::vector<std::vector<Variant>> rows;
  // The table every column comes from, when they all come from one table (else empty).
  std::string sourceTable;
};

class Database {
 public:
  // Opens (creating when missing) a database file, or ":memory:".
  explicit Database(const std::string& path);
  ~Database();
  Database(const Database&) = delete;
  Database& operator=(const Database&) = delete;

  // Runs one or more statements without results (schema scripts).
  void ExecScript(std::string_view sql);
  // Runs one statement with parameters; returns the number of rows it changed.
  int64_t Exec(std::string_view sql, const std::vector<Variant>& params = {});
  ResultSet Query(std::string_view sql, const std::vector<Variant>& params = {});
  // The first column of the first row, or Null when there is none.
  Variant Scalar(std::string_view sql, const std::vector<Variant>& params = {});
  int64_t LastInsertId() const;
  bool TableExists(std::string_view name);
  // Column names of a table in order (case as declared); empty when the table does not exist.
  std::vector<std::string> TableColumns(std::string_view table);
  sqlite3* handle() const { return db_; }
  const std::string& path() const { return path_; }
  // What the schema's keeps_balances() answers: whether the triggers keep the current balances
  // (off only while a bulk load runs, see host/kept_balances.h).
  bool KeepsBalances() const { return keepsBalances_; }
  void SetKeepsBalances(bool on) { keepsBalances_ = on; }

 private:
  struct Stmt;
  void ClearStatements();
  sqlite3* db_ = nullptr;
  // Prepared statements by their text, kept for the next run of the same text (compiling a
  // statement with its triggers costs more than running it); out of the map while one runs.
  std::unordered_map<std::string, sqlite3_stmt*> statements_;
  std::string path_;
  bool keepsBalances_ = true;
};

// A name (table, column, alias) as an SQLite quoted identifier: between double quotes, each double
// quote inside doubled, so that any name the host is handed stays one name in the SQL it builds.
inline std::string QuoteName(std::string_view name) { return DoubleQuoted(name); }

// Converts a Variant to what SQLite stores: dates as serial days, currency as REAL, Booleans as
// -1/0, Empty and Null as NULL.
void BindVariant(sqlite3_stmt* stmt, int index, const Variant& v);
Variant ReadColumn(sqlite3_stmt* stmt, int index, ColumnKind kind);

}  // namespace xal::host
