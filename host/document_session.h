// The host's side of one document form: opens a document kind (new, or stored by id) with its
// header and row data objects, creates and wires the document proxy, registers the form's data
// objects, puts a simulated user (host/simulated_user.h) in front of the form to answer the proxy's
// events, keeps the cached component rows under "Next" and the reservation sub-rows per row, and
// saves the document (header, rows, sub-rows, and the header's date and state copied into store
// rows for the balances).
// Ownership: the session owns the proxy, the data objects, the caches and the simulated user; the
// user refers back to the session weakly; Close() destroys the proxy and breaks every cycle.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "bridge/proxy.h"
#include "host/connection.h"
#include "host/data_object.h"
#include "host/simulated_user.h"

namespace xal::host {

class DocumentSession : public Object, public UserForm {
 public:
  // Opens the document kind `docTable` ("SDInvoice"); `id` 0 starts a new document.
  static Ref<DocumentSession> Open(const Ref<HostConnection>& conn, const std::string& docTable, int32_t id = 0);
  ~DocumentSession() override;

  Ref<XALSBEproxy> Proxy() const { return proxy_; }
  Ref<HostDataObject> Header() const { return header_; }
  Ref<HostDataObject> Rows() const { return rows_; }
  Ref<HostConnection> Connection() const { return conn_; }
  const std::string& DocTable() const { return docTable_; }
  const std::string& RowTable() const { return rowTable_; }
  // The simulated user at the form, its answers and its transcript of every event
  // (`MsgBox("Save?",4)->6`, `StatusMsg("")`, `RefreshHeader("")`, …).
  SimulatedUser& User() { return *user_; }
  AnswerPolicy& Policy() { return user_->Policy(); }
  const std::vector<std::string>& Transcript() const { return user_->Transcript(); }
  std::string TranscriptText() const { return user_->TranscriptText(); }
  void ClearTranscript() { user_->ClearTranscript(); }

  // Answers for scripts and `xal session` (see SimulatedUser).
  void AddMsgBoxAnswer(int32_t answer) { user_->AddMsgBoxAnswer(answer); }
  void SetSettingAnswer(const std::string& key, const Variant& value) { user_->SetSettingAnswer(key, value); }
  void SetFunctionAnswer(const std::string& name, const Variant& value) { user_->SetFunctionAnswer(name, value); }
  void SetInputBoxAnswer(bool confirm, const Variant& values) { user_->SetInputBoxAnswer(confirm, values); }

  // The form's document logic, wired on first use (Create, the rows bound, Doc_Initialize).
  ObjectRef DocFunc();

  // Writes the header, the rows and the cached sub-rows; returns the document's id.
  int32_t Save();
  // Destroys the proxy and releases the data objects; the session is not used afterwards.
  void Close();

  // The cached sub-rows of the rows' current row under `link` ("Next" or a reservation table),
  // created on first use; nullptr when the rows have no current row.
  Ref<HostDataObject> CachedRows(const std::string& table, const std::string& link, bool create);
  void ReleaseCachedRows(const std::string& table, const std::string& link);

  // ---- UserForm: what the simulated user sees of the form ----------------------------------------
  // "DocData" or the document table: the header; the row table or "Rows": the rows.
  Ref<DataObject> FormObject(const std::string& name) override;
  Ref<DataObject> FormCache(const std::string& table, const std::string& link, bool create) override {
    return CachedRows(table, link, create);
  }
  void ReleaseFormCache(const std::string& table, const std::string& link) override {
    ReleaseCachedRows(table, link);
  }

 private:
  DocumentSession() = default;
  Ref<HostDataObject> OpenSubRows(const std::string& link, const Variant& parentID);
  void SaveSubRows(const std::map<int32_t, int32_t>& serialToID);
  void ReleaseDocFunc();

  Ref<HostConnection> conn_;
  std::string docTable_, rowTable_;
  Ref<XALSBEproxy> proxy_;
  ObjectRef docFunc_;
  Ref<HostDataObject> header_, rows_, savedHeader_;
  std::shared_ptr<SimulatedUser> user_;
  // Sub-rows by (folded link, parent row bookmark).
  std::map<std::pair<std::string, int32_t>, Ref<HostDataObject>> caches_;
};

}  // namespace xal::host
