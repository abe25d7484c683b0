// SimulatedUser: answers the document proxy's events as a person at the form would, from its
// policy and its form, and records one transcript line per event.
#include "host/simulated_user.h"

#include "runtime/collection.h"
#include "runtime/convert.h"
#include "runtime/text.h"

namespace xal::host {

namespace {

// An event argument as a transcript shows it: text quoted, objects as <object> or Nothing.
std::string ArgText(const Variant& v) {
  if (v.IsString()) return "\"" + v.AsString() + "\"";
  if (v.IsObject()) return v.AsObject() ? "<object>" : "Nothing";
  if (v.IsEmpty() || v.IsMissing()) return "";
  try {
    return CStr(v);
  } catch (const VbError&) {
    return VarTypeName(v.Type());
  }
}

// ---------------------------------------------------------------------------------------------
// The event handlers: one transcript line each
// ---------------------------------------------------------------------------------------------

class EventAnswers final : public SimulatedUser {
 public:
  explicit EventAnswers(std::weak_ptr<UserForm> form) : SimulatedUser(std::move(form)) {}

  void DoDataChanged() override { Log("DataChanged()"); }
  void DoReloadSheet(int32_t NewID, bool& RetVal) override { Log("ReloadSheet(" + std::to_string(NewID) + ")"); }
  void DoRefreshData(const std::string& s) override { Log("RefreshData(\"" + s + "\")"); }
  void DoRefreshHeader(const std::string& s) override { Log("RefreshHeader(\"" + s + "\")"); }
  void DoRefreshBrowser(const std::string& s) override { Log("RefreshBrowser(\"" + s + "\")"); }
  void DoRefreshRow() override { Log("RefreshRow()"); }
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
    Log("MsgBox(\"" + Prompt + "\"," + std::to_string(Buttons) + (Title.empty() ? "" : ",\"" + Title + "\"") +
        ")->" + std::to_string(RetVal));
  }
  void DoInputBox(const Ref<ParamList>& Params, int32_t Buttons, const std::string& Title, bool& RetVal) override {
    RetVal = policy_.inputBox && Params ? policy_.inputBox(*Params, Title) : policy_.inputBoxDefault;
    Log("InputBox(\"" + Title + "\")->" + (RetVal ? "True" : "False"));
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
  void DoOnNewRow(bool& RetVal) override {
    RetVal = true;
    Log("OnNewRow()");
  }
  void GetSettings(const std::string& sKey, const Variant& vDefault, Variant& vRetVal) override {
    auto it = policy_.settings.find(FoldCase(sKey));
    vRetVal = it != policy_.settings.end() ? it->second : (vDefault.IsMissing() ? Variant() : vDefault);
  }
  void DoAddMenuItem(const std::string& sCaption, const std::string& sFuncName, std::string& sCmdString, bool,
                     int16_t, int16_t, const std::string&) override {
    sCmdString = "@" + sFuncName;
    Log("AddMenuItem(\"" + sCaption + "\",\"" + sFuncName + "\")");
  }
  void DoAddCmdTarget(const std::string& Cmd, const std::string& FuncName, bool, bool& RetVal) override {
    RetVal = true;
    Log("AddCmdTarget(\"" + Cmd + "\",\"" + FuncName + "\")");
  }
  void DoStatusMsg(const std::string& Msg) override { Log("StatusMsg(\"" + Msg + "\")"); }
  void DoCmdExecute(const std::string& Cmd, bool Posted, const Variant& Param) override {
    Log(std::string(Posted ? "CmdPost" : "CmdExecute") + "(\"" + Cmd + "\"" +
        (Param.IsEmpty() || Param.IsMissing() ? "" : "," + ArgText(Param)) + ")");
  }
  void DoInvokeFunc(const std::string& FuncName, Variant& RetVal) override {
    auto it = policy_.functions.find(FoldCase(FuncName));
    if (it != policy_.functions.end()) RetVal = it->second;
    Log("InvokeFunc(\"" + FuncName + "\")");
  }
  void GetSelBookmarks(ObjectRef& SelBookmarks) override {
    auto list = MakeRef<xal::Collection>();
    for (int32_t b : policy_.selectedBookmarks) list->items().Add(Variant(b));
    SelBookmarks = list;
  }
  void DoShowForm(const Variant& FormID, const std::string& Filter, const std::string&, bool,
                  const Ref<DataObject>&, const std::string&) override {
    Log("ShowForm(" + ArgText(FormID) + ",\"" + Filter + "\")");
  }
  void GetObject(const std::string& Name, int32_t, Ref<DataObject>& DataOB) override {
    if (auto f = form_.lock())
      if (Ref<DataObject> found = f->FormObject(Name)) DataOB = found;
    Log("GetObject(\"" + Name + "\")" + (DataOB ? "" : "->Nothing"));
  }
  void DoXALExecuteCB(const Ref<DataObject>&, const std::string& FuncName, const Ref<ParamList>&,
                      const std::string&, Variant&) override {
    Log("XALExecuteCB(\"" + FuncName + "\")");
  }
  void DoReloadLayout(const Variant&, const std::string& AreaName, Variant&) override {
    Log("ReloadLayout(\"" + AreaName + "\")");
  }
  void DoPrintReport(int32_t ReportID, const Variant&, Variant&) override {
    Log("PrintReport(" + std::to_string(ReportID) + ")");
  }
  void DoSendReport(int32_t ReportID, const Variant&, const std::string& Address, const std::string&,
                    Variant&) override {
    Log("SendReport(" + std::to_string(ReportID) + ",\"" + Address + "\")");
  }
  void DoSendMail(Ref<ParamList>&, Variant&) override { Log("SendMail()"); }
  void Properties(const std::string& Name, bool, Variant&) override { Log("Properties(\"" + Name + "\")"); }
  void DoExportReport(int32_t ReportID, const Variant&, const std::string& Filename, Ref<ParamList>&,
                      Variant&) override {
    Log("ExportReport(" + std::to_string(ReportID) + ",\"" + Filename + "\")");
  }
};

}  // namespace

std::shared_ptr<SimulatedUser> SimulatedUser::Create(std::weak_ptr<UserForm> form) {
  return std::make_shared<EventAnswers>(std::move(form));
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
