// The host's side of one document form: opens a document kind (new, or stored by id) with its
// header and row data objects, creates and wires the document proxy, registers the form's data
// objects, answers every proxy event — cached component rows under "Next" and reservation
// sub-rows per row, settings, selected bookmarks, object look-ups, questions and input boxes by a
// programmable policy — records each event in a transcript, and saves the document (header,
// rows, sub-rows, and the header's date and state copied into store rows for the balances).
// Ownership: the session owns the proxy, the data objects and the caches; the proxy's event sink
// refers back to the session weakly; Close() destroys the proxy and breaks every cycle.
#pragma once

#include <deque>
#include <functional>
#include <map>
#include <string>
#include <vector>

#include "bridge/proxy.h"
#include "host/connection.h"
#include "host/data_object.h"

namespace xal::host {

// How the simulated user answers. Unset answers use the defaults given.
struct AnswerPolicy {
  std::deque<int32_t> msgBoxAnswers;          // taken in order; then `msgBoxDefault`
  int32_t msgBoxDefault = 6;                   // Yes
  std::function<bool(ParamList& params, const std::string& title)> inputBox;  // fills params; result
  bool inputBoxDefault = false;                // Cancel
  std::map<std::string, Variant> settings;     // folded key -> answer; missing keys answer the default
  std::map<std::string, Variant> functions;    // InvokeFunc answers by folded name
  std::vector<int32_t> selectedBookmarks;      // what GetSelBookmarks hands out
};

class DocumentSession : public Object {
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
  AnswerPolicy& Policy() { return policy_; }

  // Every event as one line: `MsgBox("Save?",4)->6`, `StatusMsg("")`, `RefreshHeader("")`, …
  const std::vector<std::string>& Transcript() const { return transcript_; }
  std::string TranscriptText() const;  // the lines joined with "; "
  void ClearTranscript() { transcript_.clear(); }

  // Answers for scripts and `xal session`: the next MsgBox answer, a setting, a function's
  // answer, and an input box that confirms (or not) after copying `values` (a ParamList or an
  // array of name/value pairs) into the caller's list.
  void AddMsgBoxAnswer(int32_t answer) { policy_.msgBoxAnswers.push_back(answer); }
  void SetSettingAnswer(const std::string& key, const Variant& value);
  void SetFunctionAnswer(const std::string& name, const Variant& value);
  void SetInputBoxAnswer(bool confirm, const Variant& values);

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

 private:
  class Sink;
  friend class Sink;
  DocumentSession() = default;
  void Record(std::string line) { transcript_.push_back(std::move(line)); }
  Ref<HostDataObject> OpenSubRows(const std::string& link, const Variant& parentID);
  void SaveSubRows(const std::map<int32_t, int32_t>& serialToID);
  void ReleaseDocFunc();

  Ref<HostConnection> conn_;
  std::string docTable_, rowTable_;
  Ref<XALSBEproxy> proxy_;
  ObjectRef docFunc_;
  Ref<HostDataObject> header_, rows_, savedHeader_;
  std::shared_ptr<Sink> sink_;
  AnswerPolicy policy_;
  std::vector<std::string> transcript_;
  // Sub-rows by (folded link, parent row bookmark).
  std::map<std::pair<std::string, int32_t>, Ref<HostDataObject>> caches_;
};

}  // namespace xal::host
