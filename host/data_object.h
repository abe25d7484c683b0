// The reference host's data object: the rows of a query or table held in memory with a current
// row, the way a form's data area works. Fields are read by name, by dotted path through linked
// tables ("Partner.Name": the field IDPartner, then GRCompany's row), or as "@" pseudo-fields that
// live only in memory with their row (they survive moves and bookmarks). Edits stay in memory
// until UpdateRow (the current row) or Save (every row) writes them to the table; rows added and
// not stored yet are in state 17, rows deleted and not yet removed in state 16.
// Ownership: the data object holds its connection; its owner is a weak reference.
#pragma once

#include <functional>
#include <string>
#include <unordered_map>
#include <vector>

#include "bridge/host_model.h"
#include "host/database.h"

namespace xal::host {

class HostConnection;
class HostDataObject;

// A named function of the host's data objects ("ActualRowCount", "GetBalance", …).
using DataObjectFunction = std::function<Variant(HostDataObject& self, const Variant& params, int32_t flags)>;
void RegisterDataObjectFunction(const std::string& name, DataObjectFunction fn);

class HostDataObject : public DataObject {
 public:
  HostDataObject(Ref<HostConnection> conn, std::string table, std::string writeTable, ResultSet rows);

  // ---- DataObject -------------------------------------------------------------------------------
  Variant Field(const std::string& name) override;
  void SetField(const std::string& name, const Variant& value) override;
  void MoveFirst() override;
  void MoveNext() override;
  // No current row: past the last row, or none at all.
  bool IsEOF() override { return current_ >= rows_.size(); }
  // Before the first row: the only way to stand there is a set without rows (nothing moves back).
  bool IsBOF() override { return rows_.empty(); }
  int32_t RowCount() override { return static_cast<int32_t>(rows_.size()); }
  int32_t FindFirst(const std::string& condition, int32_t mode) override;
  void AddNew() override;
  void Delete() override;
  Variant Bookmark() override;
  void GoToBookmark(const Variant& bookmark) override;
  void UpdateRow(bool a, bool b, bool c) override;
  bool RowState(int32_t state) override;
  Ref<DataObject> Owner() override { return owner_.lock(); }
  std::string TableName() override { return table_; }
  Variant Property(int32_t number) override;
  Variant CallFunction(const std::string& name, const Variant& params, int32_t flags) override;
  Variant RecordOperation(int32_t code, const Variant& arg) override;
  Ref<XALConnect> Connection() override;

  // ---- Host side --------------------------------------------------------------------------------
  Ref<HostConnection> HostConn() const { return conn_; }
  void SetOwner(const Ref<DataObject>& owner) { owner_ = owner; }
  const std::string& WriteTable() const { return writeTable_; }
  const std::vector<std::string>& Columns() const { return columns_; }
  // Takes the deletion mark off the current row, as the user's undelete does; it stays current.
  void Undelete();
  // Rows not marked deleted.
  int32_t ActualRowCount() const;
  // Writes every added, changed or deleted row to the table; deleted rows leave the set.
  void Save();
  // Whether the column exists (any letter case).
  bool HasColumn(const std::string& name) const { return ColumnIndex(name) >= 0; }
  // Reopens the data object over `rows` (columns and rows replaced, first row current), as a
  // named function does that answers with a row of its own ("GetBalance").
  void Reload(ResultSet rows);

 private:
  struct Row {
    std::vector<Variant> values;
    std::vector<bool> changed;
    std::unordered_map<std::string, Variant> pseudo;  // folded "@name" -> value
    bool isNew = false;
    bool isDeleted = false;
    int32_t serial = 0;  // the row's bookmark
  };

  int ColumnIndex(const std::string& name) const;
  int AddColumn(const std::string& name);
  Row& CurrentRow();
  Variant PathValue(const std::string& path);
  void WriteRow(Row& row);

  Ref<HostConnection> conn_;
  WeakRef<DataObject> owner_;
  std::string table_, writeTable_;
  std::vector<std::string> columns_;
  std::vector<ColumnKind> kinds_;
  std::unordered_map<std::string, int> columnIndex_;  // folded name -> index
  std::vector<Row> rows_;
  size_t current_ = 0;
  int32_t nextSerial_ = 1;
};

}  // namespace xal::host
