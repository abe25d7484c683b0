// DocumentSession: the host's side of a document form.
#include "host/document_session.h"

#include "host/event_transcript.h"
#include "host/param_list.h"
#include "runtime/collection.h"
#include "runtime/convert.h"
#include "runtime/text.h"

namespace xal::host {

namespace {

std::string Q(const std::string& s) { return "\"" + s + "\""; }

// The column of a row table that names its document.
std::string DocLinkColumn(HostConnection& conn, const std::string& rowTable) {
  for (const std::string& c : conn.db().TableColumns(rowTable))
    if (TextEquals(c, "IDDoc")) return c;
  for (const std::string& c : conn.db().TableColumns(rowTable))
    if (TextEquals(c, "IDVDVoucher")) return c;
  return "IDDoc";
}

}  // namespace

// ---------------------------------------------------------------------------------------------
// The proxy's event sink: answers from the session and its policy
// ---------------------------------------------------------------------------------------------

class DocumentSession::Sink : public XALSBEproxyEvents {
 public:
  explicit Sink(const Ref<DocumentSession>& s) : session_(s) {}

  void DoMsgBox(const std::string& Prompt, int32_t Buttons, const std::string& Title, int32_t& RetVal) override {
    auto s = session_.lock();
    if (!s) return;
    AnswerPolicy& p = s->policy_;
    // An OK-only or information box has one answer: OK.
    if ((Buttons & 7) == 0) {
      RetVal = 1;
    } else if (!p.msgBoxAnswers.empty()) {
      RetVal = p.msgBoxAnswers.front();
      p.msgBoxAnswers.pop_front();
    } else {
      RetVal = p.msgBoxDefault;
    }
  }
  void DoInputBox(const Ref<ParamList>& Params, int32_t Buttons, const std::string& Title, bool& RetVal) override {
    auto s = session_.lock();
    if (!s) return;
    RetVal = s->policy_.inputBox && Params ? s->policy_.inputBox(*Params, Title) : s->policy_.inputBoxDefault;
  }
  void DoCheckCache(const std::string& sData, const std::string& sLink, bool& bExists) override {
    if (auto s = session_.lock()) bExists = s->CachedRows(sData, sLink, false) != nullptr;
  }
  void DoGetCache(const std::string& sData, const std::string& sLink, Ref<DataObject>& obCache) override {
    if (auto s = session_.lock()) obCache = s->CachedRows(sData, sLink, true);
  }
  void DoReleaseCache(const std::string& sData, const std::string& sLink) override {
    if (auto s = session_.lock()) s->ReleaseCachedRows(sData, sLink);
  }
  void DoOnNewRow(bool& RetVal) override { RetVal = true; }
  void GetSettings(const std::string& sKey, const Variant& vDefault, Variant& vRetVal) override {
    auto s = session_.lock();
    if (!s) return;
    auto it = s->policy_.settings.find(FoldCase(sKey));
    vRetVal = it != s->policy_.settings.end() ? it->second : (vDefault.IsMissing() ? Variant() : vDefault);
  }
  void DoAddMenuItem(const std::string& sCaption, const std::string& sFuncName, std::string& sCmdString, bool,
                     int16_t, int16_t, const std::string&) override {
    sCmdString = "@" + sFuncName;
  }
  void DoAddCmdTarget(const std::string& Cmd, const std::string& FuncName, bool, bool& RetVal) override {
    RetVal = true;
  }
  void DoInvokeFunc(const std::string& FuncName, Variant& RetVal) override {
    auto s = session_.lock();
    if (!s) return;
    auto it = s->policy_.functions.find(FoldCase(FuncName));
    if (it != s->policy_.functions.end()) RetVal = it->second;
  }
  void GetSelBookmarks(ObjectRef& SelBookmarks) override {
    auto s = session_.lock();
    if (!s) return;
    auto list = MakeRef<xal::Collection>();
    for (int32_t b : s->policy_.selectedBookmarks) list->items().Add(Variant(b));
    SelBookmarks = list;
  }
  void GetObject(const std::string& Name, int32_t, Ref<DataObject>& DataOB) override {
    auto s = session_.lock();
    if (!s) return;
    if (TextEquals(Name, "DocData") || TextEquals(Name, s->docTable_))
      DataOB = s->header_;
    else if (TextEquals(Name, s->rowTable_) || TextEquals(Name, "Rows"))
      DataOB = s->rows_;
  }

 private:
  WeakRef<DocumentSession> session_;
};

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
  const std::string headerSql = "SELECT * FROM " + Q(docTable) + " WHERE ID = ?";
  s->header_ = conn->OpenRows(headerSql, docTable, base, {Variant(id)});
  if (id != 0 && s->header_->IsEOF()) Raise(kErrInvalidCall, docTable + " " + std::to_string(id) + " does not exist");
  // The header's owner holds its values as they were saved.
  s->savedHeader_ = conn->OpenRows(headerSql, docTable, "", {Variant(id)});
  s->header_->SetOwner(s->savedHeader_);
  if (id == 0) s->header_->AddNew();
  const std::string link = DocLinkColumn(*conn, s->rowTable_);
  std::string rowSql = "SELECT * FROM " + Q(s->rowTable_) + " WHERE " + link + " = ?";
  for (const std::string& c : conn->db().TableColumns(s->rowTable_))
    if (TextEquals(c, "IDParentRow")) rowSql += " AND IDParentRow = 0";
  s->rows_ = conn->OpenRows(rowSql + " ORDER BY ID", s->rowTable_, s->rowTable_, {Variant(id)});
  s->rows_->SetOwner(s->header_);
  s->proxy_ = MakeRef<XALSBEproxy>();
  s->sink_ = std::make_shared<Sink>(s);
  s->proxy_->Events().Connect(s->sink_);
  // The transcript listens after the answers, so its lines show them.
  WeakRef<DocumentSession> weak = s;
  s->proxy_->Events().Connect(std::make_shared<XALSBEproxyEventForwarder>(
      MakeRef<ProxyEventTranscript>([weak](std::string line) {
        if (auto alive = weak.lock()) alive->Record(std::move(line));
      })));
  Ref<DataObject> header = s->header_, rows = s->rows_;
  s->proxy_->AddDataOB("DocData", header);
  s->proxy_->AddDataOB(s->rowTable_, rows);
  return s;
}

DocumentSession::~DocumentSession() { Close(); }

void DocumentSession::Close() {
  if (proxy_) proxy_->Destroy();
  proxy_.reset();
  caches_.clear();
  sink_.reset();
}

void DocumentSession::SetSettingAnswer(const std::string& key, const Variant& value) {
  policy_.settings[FoldCase(key)] = value;
}

void DocumentSession::SetFunctionAnswer(const std::string& name, const Variant& value) {
  policy_.functions[FoldCase(name)] = value;
}

void DocumentSession::SetInputBoxAnswer(bool confirm, const Variant& values) {
  std::vector<std::pair<std::string, Variant>> pairs;
  if (values.IsObject()) {
    if (auto list = std::dynamic_pointer_cast<ParamList>(values.AsObject()))
      for (int32_t i = 1; i <= list->Count(); ++i) pairs.emplace_back(list->NameAt(i), list->Item(list->NameAt(i)));
  } else if (values.IsArray()) {
    const auto& items = values.AsArray().Elements();
    for (size_t i = 0; i + 1 < items.size(); i += 2) pairs.emplace_back(CStr(items[i]), items[i + 1]);
  }
  policy_.inputBox = [confirm, pairs](ParamList& p, const std::string&) {
    for (const auto& [name, value] : pairs) p.Set(name, value);
    return confirm;
  };
}

std::string DocumentSession::TranscriptText() const {
  std::string out;
  for (const auto& line : transcript_) out += (out.empty() ? "" : "; ") + line;
  return out;
}

// ---------------------------------------------------------------------------------------------
// Sub-rows: component rows under "Next" and rows of other tables that name the row
// ---------------------------------------------------------------------------------------------

Ref<HostDataObject> DocumentSession::OpenSubRows(const std::string& link, const Variant& parentID) {
  if (TextEquals(link, "Next"))
    return conn_->OpenRows("SELECT * FROM " + Q(rowTable_) + " WHERE IDParentRow = ? ORDER BY ID", rowTable_,
                           rowTable_, {parentID});
  const std::string fk = "ID" + rowTable_;
  bool linked = false;
  for (const std::string& c : conn_->db().TableColumns(link)) linked = linked || TextEquals(c, fk);
  if (!linked) Raise(kErrInvalidCall, "No rows of " + link + " name a row of " + rowTable_);
  return conn_->OpenRows("SELECT * FROM " + Q(link) + " WHERE " + fk + " = ? ORDER BY ID", link, link, {parentID});
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
  const std::string link = DocLinkColumn(*conn_, rowTable_);
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
  savedHeader_ = conn_->OpenRows("SELECT * FROM " + Q(docTable_) + " WHERE ID = ?", docTable_, "", {docID});
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
