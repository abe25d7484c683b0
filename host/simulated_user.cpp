// SimulatedUser: answers the document proxy's events as a person at the form would, from its
// policy and its form; Attach adds the transcript of every event.
#include "host/simulated_user.h"

#include "host/event_transcript.h"
#include "runtime/trap.h"

#include "runtime/collection.h"
#include "runtime/convert.h"
#include "runtime/text.h"

namespace xal::host {

namespace {

// ---------------------------------------------------------------------------------------------
// The event handlers: the answers. The transcript lines come from the event list's log column
// (event_transcript.cpp), written by a sink that Attach connects after this one.
// ---------------------------------------------------------------------------------------------

class EventAnswers final : public SimulatedUser {
 public:
  explicit EventAnswers(std::weak_ptr<UserForm> form) : SimulatedUser(std::move(form)) {}

  void DoMsgBox(const std::string& Prompt, int32_t Buttons, const std::string& Title, int32_t& RetVal) override {
    // An OK-only or information box has one answer: OK.
    if ((Buttons & kMbButtonsMask) == kMbOK) {
      RetVal = kAnswerOK;
    } else if (!policy_.msgBoxAnswers.empty()) {
      RetVal = policy_.msgBoxAnswers.front();
      policy_.msgBoxAnswers.pop_front();
    } else {
      RetVal = policy_.msgBoxDefault;
    }
  }
  void DoInputBox(const Ref<ParamList>& Params, int32_t Buttons, const std::string& Title, bool& RetVal) override {
    RetVal = policy_.inputBox && Params ? policy_.inputBox(*Params, Title) : policy_.inputBoxDefault;
  }
  void DoCheckCache(const std::string& sData, const std::string& sLink, bool& bExists) override {
    if (auto f = form_.lock()) bExists = f->FormCache(sData, sLink, false) != nullptr;
  }
  void DoGetCache(const std::string& sData, const std::string& sLink, Ref<DataObject>& obCache) override {
    if (auto f = form_.lock()) obCache = f->FormCache(sData, sLink, true);
  }
  void DoReleaseCache(const std::string& sData, const std::string& sLink) override {
    if (auto f = form_.lock()) f->ReleaseFormCache(sData, sLink);
  }
  // A row is new until it is stored: the form's rows on a row in state 17.
  void DoOnNewRow(bool& RetVal) override {
    auto f = form_.lock();
    Ref<DataObject> rows = f ? f->FormObject("Rows") : nullptr;
    RetVal = rows && TryOr([&] { return !rows->IsEOF() && rows->RowState(kRowNotStored); }, false);
  }
  void GetSettings(const std::string& sKey, const Variant& vDefault, Variant& vRetVal) override {
    auto it = policy_.settings.find(FoldCase(sKey));
    vRetVal = it != policy_.settings.end() ? it->second : (vDefault.IsMissing() ? Variant() : vDefault);
  }
  void DoAddMenuItem(const std::string& sCaption, const std::string& sFuncName, std::string& sCmdString, bool,
                     int16_t, int16_t, const std::string&) override {
    sCmdString = "@" + sFuncName;
  }
  void DoAddCmdTarget(const std::string& Cmd, const std::string& FuncName, bool, bool& RetVal) override {
    RetVal = true;
  }
  void DoInvokeFunc(const std::string& FuncName, Variant& RetVal) override {
    auto it = policy_.functions.find(FoldCase(FuncName));
    if (it != policy_.functions.end()) RetVal = it->second;
  }
  void GetSelBookmarks(ObjectRef& SelBookmarks) override {
    auto list = MakeRef<xal::Collection>();
    for (int32_t b : policy_.selectedBookmarks) list->items().Add(Variant(b));
    SelBookmarks = list;
  }
  void GetObject(const std::string& Name, int32_t, Ref<DataObject>& DataOB) override {
    if (auto f = form_.lock())
      if (Ref<DataObject> found = f->FormObject(Name)) DataOB = found;
  }
};

}  // namespace

std::shared_ptr<SimulatedUser> SimulatedUser::Create(std::weak_ptr<UserForm> form) {
  return std::make_shared<EventAnswers>(std::move(form));
}

void SimulatedUser::Attach(EventSource<XALSBEproxyEvents>& events, const std::shared_ptr<SimulatedUser>& user) {
  events.Connect(user);
  // The transcript listens after the answers, so its lines show them.
  std::weak_ptr<SimulatedUser> weak = user;
  events.Connect(std::make_shared<XALSBEproxyEventForwarder>(MakeRef<ProxyEventTranscript>([weak](std::string line) {
    if (auto alive = weak.lock()) alive->Log(std::move(line));
  })));
}

// ---------------------------------------------------------------------------------------------
// Answers and transcript
// ---------------------------------------------------------------------------------------------

void SimulatedUser::SetSettingAnswer(const std::string& key, const Variant& value) {
  policy_.settings[FoldCase(key)] = value;
}

void SimulatedUser::SetFunctionAnswer(const std::string& name, const Variant& value) {
  policy_.functions[FoldCase(name)] = value;
}

void SimulatedUser::SetInputBoxAnswer(bool confirm, const Variant& values) {
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

std::string SimulatedUser::TranscriptText() const {
  std::string out;
  for (const auto& line : transcript_) out += (out.empty() ? "" : "; ") + line;
  return out;
}

}  // namespace xal::host
