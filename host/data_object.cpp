// HostDataObject: rows in memory, current row, dotted paths, pseudo-fields, write-back.
#include "host/data_object.h"

#include <sqlite3.h>

#include <mutex>

#include "host/connection.h"
#include "host/host_error.h"
#include "host/sql_translator.h"
#include "runtime/convert.h"
#include "runtime/text.h"

namespace xal::host {

namespace {

constexpr int32_t kErrItemNotFound = 3265;  // "Item not found in this collection."
constexpr int32_t kErrNoCurrentRecord = 3021;
constexpr int32_t kErrReadOnly = 3027;
constexpr int32_t kErrBadBookmark = 3159;

[[noreturn]] void NoSuchField(const std::string& name) {
  Raise(kErrItemNotFound, "Item not found in this collection: " + name);
}

std::unordered_map<std::string, DataObjectFunction>& Functions() {
  static std::unordered_map<std::string, DataObjectFunction> functions;
  return functions;
}

// A value assigned to a field takes the column's type, as the original data layer converted it.
Variant Coerce(const Variant& v, ColumnKind kind) {
  if (v.IsNull() || v.IsEmpty()) return Variant::Null();
  switch (kind) {
    case ColumnKind::Date: return Variant(CDate(v));
    case ColumnKind::Currency: return Variant(CCur(v));
    case ColumnKind::Boolean: return Variant(CBool(v));
    case ColumnKind::Integer: {
      double d = CDbl(v);
      if (d == static_cast<double>(static_cast<int32_t>(d))) return Variant(static_cast<int32_t>(d));
      return Variant(d);
    }
    case ColumnKind::Real: return Variant(CDbl(v));
    case ColumnKind::Text: return Variant(CStr(v));
    case ColumnKind::Auto: return v;
  }
  return v;
}

}  // namespace

void RegisterDataObjectFunction(const std::string& name, DataObjectFunction fn) {
  Functions()[FoldCase(name)] = std::move(fn);
}

HostDataObject::HostDataObject(Ref<HostConnection> conn, std::string table, std::string writeTable, ResultSet rs)
    : conn_(std::move(conn)), table_(std::move(table)), writeTable_(std::move(writeTable)) {
  Reload(std::move(rs));
}

void HostDataObject::Reload(ResultSet rs) {
  columns_ = std::move(rs.columns);
  kinds_ = std::move(rs.kinds);
  columnIndex_.clear();
  rows_.clear();
  for (size_t i = 0; i < columns_.size(); ++i) columnIndex_.emplace(FoldCase(columns_[i]), static_cast<int>(i));
  rows_.reserve(rs.rows.size());
  for (auto& values : rs.rows) {
    Row r;
    r.changed.assign(values.size(), false);
    r.values = std::move(values);
    r.serial = nextSerial_++;
    rows_.push_back(std::move(r));
  }
  current_ = 0;
}

int HostDataObject::ColumnIndex(const std::string& name) const {
  auto it = columnIndex_.find(FoldCase(name));
  return it == columnIndex_.end() ? -1 : it->second;
}

HostDataObject::Row& HostDataObject::CurrentRow() {
  if (IsEOF()) Raise(kErrNoCurrentRecord, "No current record.");
  return rows_[current_];
}

// ---------------------------------------------------------------------------------------------
// Fields
// ---------------------------------------------------------------------------------------------

Variant HostDataObject::Field(const std::string& name) {
  if (name.empty()) NoSuchField(name);
  if (IsEOF()) return Variant();
  Row& row = rows_[current_];
  if (name[0] == '@') {
    auto it = row.pseudo.find(FoldCase(name));
    return it == row.pseudo.end() ? Variant() : it->second;
  }
  int i = ColumnIndex(name);
  if (i >= 0) return row.values[static_cast<size_t>(i)];
  if (name.find('.') != std::string::npos) return PathValue(name);
  NoSuchField(name);
}

// "Link.Link.Field": each link names the field that holds the next row's id ("ID" + link, or
// an alias from the link table); a missing id or row makes the whole path Empty.
Variant HostDataObject::PathValue(const std::string& path) {
  std::vector<std::string> parts = Split(path, ".");
  std::string idField, table;
  if (!conn_->ResolveLink(parts[0], idField, table)) NoSuchField(path);
  Variant id = Field(idField);
  const LinkedRow* rec = nullptr;
  for (size_t i = 0;; ++i) {
    if (id.IsNull() || id.IsEmpty()) return Variant();
    int32_t n = CLng(id);
    if (n == 0) return Variant();
    rec = conn_->LinkedRecord(table, n);
    if (!rec) return Variant();
    if (i + 2 == parts.size()) break;
    if (!conn_->ResolveLink(parts[i + 1], idField, table)) NoSuchField(path);
    auto it = rec->fields.find(FoldCase(idField));
    if (it == rec->fields.end()) NoSuchField(path);
    id = it->second;
  }
  auto it = rec->fields.find(FoldCase(parts.back()));
  if (it == rec->fields.end()) NoSuchField(path);
  return it->second;
}

void HostDataObject::SetField(const std::string& name, const Variant& value) {
  if (name.empty()) NoSuchField(name);
  Row& row = CurrentRow();
  if (name[0] == '@') {
    row.pseudo[FoldCase(name)] = value;
    return;
  }
  int i = ColumnIndex(name);
  if (i < 0) NoSuchField(name);
  const size_t k = static_cast<size_t>(i);
  row.values[k] = Coerce(value, kinds_[k]);
  row.changed[k] = true;
}

// ---------------------------------------------------------------------------------------------
// Navigation
// ---------------------------------------------------------------------------------------------

void HostDataObject::MoveFirst() {
  current_ = 0;
}

void HostDataObject::MoveNext() {
  if (current_ < rows_.size()) ++current_;
}

// Without a current row there is nothing to mark: Empty, which GoToBookmark refuses.
Variant HostDataObject::Bookmark() { return IsEOF() ? Variant() : Variant(rows_[current_].serial); }

void HostDataObject::GoToBookmark(const Variant& bookmark) {
  int32_t serial = CLng(bookmark);
  for (size_t i = 0; i < rows_.size(); ++i)
    if (rows_[i].serial == serial) {
      current_ = i;
      return;
    }
  Raise(kErrBadBookmark, "Not a valid bookmark.");
}

// The condition is evaluated by SQLite over each row's values, so any expression the component
// writes ("ID=5", "Code='A' AND Qty>0") means what it means in a query.
int32_t HostDataObject::FindFirst(const std::string& condition, int32_t) {
  std::string select = "SELECT (" + conn_->Translate(condition) + ") FROM (SELECT ";
  for (size_t i = 0; i < columns_.size(); ++i) select += (i ? ", ?" : "?") + std::to_string(i + 1) + " AS " + QuoteName(columns_[i]);
  select += columns_.empty() ? "1)" : ")";
  sqlite3* db = conn_->db().handle();
  sqlite3_stmt* stmt = nullptr;
  if (sqlite3_prepare_v2(db, select.c_str(), -1, &stmt, nullptr) != SQLITE_OK) {
    std::string msg = sqlite3_errmsg(db);
    sqlite3_finalize(stmt);
    Raise(kErrSql, msg + " [" + condition + "]");
  }
  int32_t result = 1;
  for (size_t r = 0; r < rows_.size() && result != 0; ++r) {
    sqlite3_reset(stmt);
    for (size_t i = 0; i < columns_.size(); ++i) BindVariant(stmt, static_cast<int>(i + 1), rows_[r].values[i]);
    if (sqlite3_step(stmt) == SQLITE_ROW && sqlite3_column_type(stmt, 0) != SQLITE_NULL &&
        sqlite3_column_double(stmt, 0) != 0) {
      current_ = r;
      result = 0;
    }
  }
  sqlite3_finalize(stmt);
  return result;
}

// ---------------------------------------------------------------------------------------------
// Editing and write-back
// ---------------------------------------------------------------------------------------------

void HostDataObject::AddNew() {
  Row r;
  r.values.assign(columns_.size(), Variant::Null());
  r.changed.assign(columns_.size(), false);
  r.isNew = true;
  r.serial = nextSerial_++;
  rows_.push_back(std::move(r));
  current_ = rows_.size() - 1;
}

void HostDataObject::Delete() {
  CurrentRow().isDeleted = true;
  MoveNext();
}

void HostDataObject::Undelete() { CurrentRow().isDeleted = false; }

bool HostDataObject::RowState(int32_t state) {
  if (IsEOF()) return false;
  const Row& r = rows_[current_];
  if (state == kRowMarkedDeleted) return r.isDeleted;
  if (state == kRowNotStored) return r.isNew;
  return false;
}

int32_t HostDataObject::ActualRowCount() const {
  int32_t n = 0;
  for (const auto& r : rows_) n += r.isDeleted ? 0 : 1;
  return n;
}

void HostDataObject::WriteRow(Row& row) {
  if (writeTable_.empty()) Raise(kErrReadOnly, "Cannot update. Database or object is read-only.");
  Database& db = conn_->db();
  const int id = ColumnIndex("ID");
  if (row.isDeleted) {
    if (!row.isNew && id >= 0) db.Exec("DELETE FROM " + QuoteName(writeTable_) + " WHERE ID = ?", {row.values[size_t(id)]});
  } else if (row.isNew) {
    std::vector<std::string> stored = db.TableColumns(writeTable_);
    std::string cols, marks;
    std::vector<Variant> params;
    for (const std::string& c : stored) {
      int i = ColumnIndex(c);
      Variant v = i >= 0 ? row.values[size_t(i)] : Variant::Null();
      // A document kind stored in the common header table is known by its DocName.
      if (TextEquals(c, "DocName") && (v.IsNull() || v == Variant("")) && !TextEquals(table_, writeTable_))
        v = Variant(table_);
      if (v.IsNull()) continue;
      cols += (cols.empty() ? "" : ", ") + QuoteName(c);
      marks += marks.empty() ? "?" : ", ?";
      params.push_back(v);
    }
    std::string sql = cols.empty() ? "INSERT INTO " + QuoteName(writeTable_) + " DEFAULT VALUES"
                                   : "INSERT INTO " + QuoteName(writeTable_) + " (" + cols + ") VALUES (" + marks + ")";
    db.Exec(sql, params);
    Variant newID = id >= 0 && !row.values[size_t(id)].IsNull() ? row.values[size_t(id)]
                                                                 : Variant(static_cast<int32_t>(db.LastInsertId()));
    // Read the stored row back so that defaults the table filled in are seen.
    ResultSet back = db.Query("SELECT * FROM " + QuoteName(writeTable_) + " WHERE ID = ?", {newID});
    if (!back.rows.empty())
      for (size_t k = 0; k < back.columns.size(); ++k) {
        int i = ColumnIndex(back.columns[k]);
        if (i >= 0) row.values[size_t(i)] = back.rows[0][k];
      }
    row.isNew = false;
  } else if (id >= 0) {
    std::string sets;
    std::vector<Variant> params;
    for (size_t k = 0; k < columns_.size(); ++k)
      if (row.changed[k] && static_cast<int>(k) != id) {
        sets += (sets.empty() ? "" : ", ") + QuoteName(columns_[k]) + " = ?";
        params.push_back(row.values[k]);
      }
    if (!sets.empty()) {
      params.push_back(row.values[size_t(id)]);
      db.Exec("UPDATE " + QuoteName(writeTable_) + " SET " + sets + " WHERE ID = ?", params);
    }
  }
  row.changed.assign(columns_.size(), false);
  conn_->InvalidateLinks();
}

void HostDataObject::UpdateRow(bool, bool, bool) {
  Row& row = CurrentRow();
  WriteRow(row);
  if (row.isDeleted) rows_.erase(rows_.begin() + static_cast<std::ptrdiff_t>(current_));
}

void HostDataObject::Save() {
  for (auto& r : rows_) WriteRow(r);
  std::erase_if(rows_, [](const Row& r) { return r.isDeleted; });
  if (current_ > rows_.size()) current_ = rows_.size();
}

// ---------------------------------------------------------------------------------------------
// Properties, named functions, record operations
// ---------------------------------------------------------------------------------------------

Variant HostDataObject::Property(int32_t number) {
  if (number == kPropTableName) return Variant(table_);
  if (number == kPropLastError) return Variant(conn_->LastError());
  return Variant();
}

Variant HostDataObject::CallFunction(const std::string& name, const Variant& params, int32_t flags) {
  auto it = Functions().find(FoldCase(name));
  if (it == Functions().end()) Raise(kErrNoMember, "The data object has no function " + name);
  return it->second(*this, params, flags);
}

Ref<XALConnect> HostDataObject::Connection() { return conn_; }

}  // namespace xal::host
