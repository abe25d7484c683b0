// The simulated user in front of a document form: the event sink that stands in for a person at
// the host's form. Connected to a document proxy it answers every proxy event — message boxes and
// input boxes by a programmable policy, settings, function results and selected bookmarks from
// that policy, data objects and cached sub-rows from the form it sits in front of — and writes one
// transcript line per event, so that a test can script the user's answers and compare the whole
// conversation: `MsgBox("Save?",4)->6; StatusMsg(""); RefreshHeader("")`.
// Ownership: the proxy (or whoever connects it) owns the user; the user refers to its form weakly
// and, once the form is gone or when it has none, answers as a form without data objects.
#pragma once

#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "bridge/host_model.h"
#include "bridge/proxy_events.h"
#include "runtime/variant.h"

namespace xal::host {

// How the simulated user answers. Unset answers use the defaults given.
struct AnswerPolicy {
  std::deque<int32_t> msgBoxAnswers;          // taken in order; then `msgBoxDefault`
  int32_t msgBoxDefault = kAnswerYes;
  std::function<bool(ParamList& params, const std::string& title)> inputBox;  // fills params; result
  bool inputBoxDefault = false;                // Cancel
  std::map<std::string, Variant> settings;     // folded key -> answer; missing keys answer the default
  std::map<std::string, Variant> functions;    // InvokeFunc answers by folded name
  std::vector<int32_t> selectedBookmarks;      // what GetSelBookmarks hands out
};

// What the simulated user asks of the form it sits in front of.
class UserForm {
 public:
  virtual ~UserForm() = default;
  // The form's data object called `name` (any letter case); nullptr when the form has none.
  virtual Ref<DataObject> FormObject(const std::string& name) = 0;
  // The cached sub-rows of data `table` under `link` for its current row, created when `create`;
  // nullptr when there are none.
  virtual Ref<DataObject> FormCache(const std::string& table, const std::string& link, bool create) = 0;
  virtual void ReleaseFormCache(const std::string& table, const std::string& link) = 0;
};

// The sink to connect to a proxy's Events(). Its event handlers live in simulated_user.cpp, one
// per event of XALSBEproxyEvents; this class holds what they answer from and what they record.
class SimulatedUser : public XALSBEproxyEvents {
 public:
  // A user in front of `form` (none: every look-up of the form answers Nothing).
  static std::shared_ptr<SimulatedUser> Create(std::weak_ptr<UserForm> form = {});
  // Connects `user` to a proxy's events together with the sink that writes its transcript.
  static void Attach(EventSource<XALSBEproxyEvents>& events, const std::shared_ptr<SimulatedUser>& user);

  AnswerPolicy& Policy() { return policy_; }

  // Every event as one line, in the order raised.
  const std::vector<std::string>& Transcript() const { return transcript_; }
  std::string TranscriptText() const;  // the lines joined with "; "
  void ClearTranscript() { transcript_.clear(); }

  // Answers for scripts: the next MsgBox answer, a setting, a function's answer, and an input box
  // that confirms (or not) after copying `values` (a ParamList, or an array of name/value pairs)
  // into the caller's list.
  void AddMsgBoxAnswer(int32_t answer) { policy_.msgBoxAnswers.push_back(answer); }
  void SetSettingAnswer(const std::string& key, const Variant& value);
  void SetFunctionAnswer(const std::string& name, const Variant& value);
  void SetInputBoxAnswer(bool confirm, const Variant& values);

 protected:
  explicit SimulatedUser(std::weak_ptr<UserForm> form) : form_(std::move(form)) {}
  void Log(std::string line) { transcript_.push_back(std::move(line)); }

  std::weak_ptr<UserForm> form_;
  AnswerPolicy policy_;
  std::vector<std::string> transcript_;
};

}  // namespace xal::host
