// DocumentSession: the host's side of a document form.
#include "host/document_session.h"

#include "host/param_list.h"
#include "host/schema.h"
#include "runtime/collection.h"
#include "runtime/convert.h"
#include "runtime/text.h"

namespace xal::host {

// ---------------------------------------------------------------------------------------------
// Opening and closing
// ---------------------------------------------------------------------------------------------

Ref<DocumentSession> DocumentSession::Open(const Ref<HostConnection>& conn, const std::string& docTable, int32_t id) {
  Ref<DocumentSession> s(new DocumentSession());
  s->conn_ = conn;
  s->docTable_ = docTable;
  Variant rowTable = conn->db().Scalar("SELECT RowTable FROM XALTable WHERE TableName = ?", {Variant(docTable)});
  if (!rowTable.IsString() || rowTable.AsString().empty())
    Raise(kErrInvalidCall, "Not a document kind: " + docTable);
  s->rowTable_ = rowTable.AsString();
  const std::string base = conn->BaseTable(docTable);
  const std::string headerSql = "SELECT * FROM " + QuoteName(docTable) + " WHERE ID = ?";
  s->header_ = conn->OpenRows(headerSql, docTable, base, {Variant(id)});
  if (id != 0 && s->header_->IsEOF()) Raise(kErrInvalidCall, docTable + " " + std::to_string(id) + " does not exist");
  // The header's owner holds its values as they were saved.
  s->savedHeader_ = conn->OpenRows(headerSql, docTable, "", {Variant(id)});
  s->header_->SetOwner(s->savedHeader_);
  if (id == 0) s->header_->AddNew();
  const std::string link = DocumentLinkColumn(s->rowTable_);
  std::string rowSql = "SELECT * FROM " + QuoteName(s->rowTable_) + " WHERE " + link + " = ?";
  for (const std::string& c : conn->db().TableColumns(s->rowTable_))
    if (TextEquals(c, "IDParentRow")) rowSql += " AND IDParentRow = 0";
  s->rows_ = conn->OpenRows(rowSql + " ORDER BY ID", s->rowTable_, s->rowTable_, {Variant(id)});
  s->rows_->SetOwner(s->header_);
  s->proxy_ = MakeRef<XALSBEproxy>();
  s->user_ = SimulatedUser::Create(std::weak_ptr<UserForm>(s));
  SimulatedUser::Attach(s->proxy_->Events(), s->user_);
  Ref<DataObject> header = s->header_, rows = s->rows_;
  s->proxy_->AddDataOB("DocData", header);
  s->proxy_->AddDataOB(s->rowTable_, rows);
  return s;
}

DocumentSession::~DocumentSession() { Close(); }

void DocumentSession::Close() {
  ReleaseDocFunc();
  if (proxy_) proxy_->Destroy();
  proxy_.reset();
  caches_.clear();
}

Ref<DataObject> DocumentSession::FormObject(const std::string& name) {
  if (TextEquals(name, "DocData") || TextEquals(name, docTable_)) return header_;
  if (TextEquals(name, rowTable_) || TextEquals(name, "Rows")) return rows_;
  return nullptr;
}

// ---------------------------------------------------------------------------------------------
// Sub-rows: component rows under "Next" and rows of other tables that name the row
// ---------------------------------------------------------------------------------------------

Ref<HostDataObject> DocumentSession::OpenSubRows(const std::string& link, const Variant& parentID) {
  if (TextEquals(link, "Next"))
    return conn_->OpenRows("SELECT * FROM " + QuoteName(rowTable_) + " WHERE IDParentRow = ? ORDER BY ID", rowTable_,
                           rowTable_, {parentID});
  const std::string fk = "ID" + rowTable_;
  bool linked = false;
  for (const std::string& c : conn_->db().TableColumns(link)) linked = linked || TextEquals(c, fk);
  if (!linked) Raise(kErrInvalidCall, "No rows of " + link + " name a row of " + rowTable_);
  return conn_->OpenRows("SELECT * FROM " + QuoteName(link) + " WHERE " + fk + " = ? ORDER BY ID", link, link, {parentID});
}

Ref<HostDataObject> DocumentSession::CachedRows(const std::string& table, const std::string& link, bool create) {
  if (!TextEquals(table, rowTable_) || !rows_ || rows_->IsEOF()) return nullptr;
  const auto key = std::make_pair(FoldCase(link), CLng(rows_->Bookmark()));
  auto it = caches_.find(key);
  if (it != caches_.end()) return it->second;
  if (!create) return nullptr;
  Variant parentID = rows_->RowState(kRowNotStored) ? Variant(-1) : rows_->Field("ID");
  Ref<HostDataObject> sub = OpenSubRows(link, parentID);
  sub->SetOwner(rows_);
  caches_.emplace(key, sub);
  return sub;
}

void DocumentSession::ReleaseCachedRows(const std::string& table, const std::string& link) {
  if (!TextEquals(table, rowTable_) || !rows_ || rows_->IsEOF()) return;
  caches_.erase(std::make_pair(FoldCase(link), CLng(rows_->Bookmark())));
}

// ---------------------------------------------------------------------------------------------
// Saving
// ---------------------------------------------------------------------------------------------

int32_t DocumentSession::Save() {
  header_->MoveFirst();
  header_->UpdateRow(false, false, false);
  const Variant docID = header_->Field("ID");
  const bool storeRows = TextEquals(rowTable_, "DDStoreDRow");
  const std::string link = DocumentLinkColumn(rowTable_);
  auto stamp = [&](HostDataObject& rows) {
    for (rows.MoveFirst(); !rows.IsEOF(); rows.MoveNext()) {
      if (rows.RowState(kRowMarkedDeleted)) continue;
      if (rows.HasColumn(link)) rows.SetField(link, docID);
      // Balances read the date and state from the store rows themselves.
      if (storeRows && TextEquals(rows.TableName(), "DDStoreDRow")) {
        rows.SetField("DocDate", header_->Field("DocDate"));
        rows.SetField("DealState", header_->Field("DealState"));
      }
    }
  };
  stamp(*rows_);
  std::map<int32_t, int32_t> serialToID;
  rows_->Save();
  // Bookmarks outlive saving, so sub-rows find the id their parent row was stored under.
  for (rows_->MoveFirst(); !rows_->IsEOF(); rows_->MoveNext())
    serialToID[CLng(rows_->Bookmark())] = CLng(rows_->Field("ID"));
  for (auto& [key, sub] : caches_) stamp(*sub);
  SaveSubRows(serialToID);
  savedHeader_ = conn_->OpenRows("SELECT * FROM " + QuoteName(docTable_) + " WHERE ID = ?", docTable_, "", {docID});
  header_->SetOwner(savedHeader_);
  rows_->MoveFirst();
  return CLng(docID);
}

void DocumentSession::SaveSubRows(const std::map<int32_t, int32_t>& serialToID) {
  for (auto it = caches_.begin(); it != caches_.end();) {
    auto parent = serialToID.find(it->first.second);
    HostDataObject& sub = *it->second;
    if (parent == serialToID.end()) {
      // The parent row was deleted: so are its sub-rows.
      for (sub.MoveFirst(); !sub.IsEOF();) sub.Delete();
      sub.Save();
      it = caches_.erase(it);
      continue;
    }
    const std::string fk = it->first.first == FoldCase("Next") ? "IDParentRow" : "ID" + rowTable_;
    for (sub.MoveFirst(); !sub.IsEOF(); sub.MoveNext())
      if (!sub.RowState(kRowMarkedDeleted)) sub.SetField(fk, Variant(parent->second));
    sub.Save();
    ++it;
  }
}

}  // namespace xal::host
