// XALSBEproxy: registries and forwarding of requests to the host as events.
#include "bridge/proxy.h"

#include "runtime/convert.h"
#include "runtime/dispatch.h"
#include "runtime/trap.h"

// The registries and the proxy's own bookkeeping ignore every error (TryStep), as a script expects
// of them; that includes whatever the host's GetObject handler raises.

namespace xal {

XALSBEproxy::XALSBEproxy()
    : dataObjects_(std::make_unique<KeyedCollection<Ref<xal::DataObject>>>()),
      uiObjects_(std::make_unique<KeyedCollection<Ref<IXALUIObject>>>()),
      values_(MakeRef<Collection>()) {}

// ---------------------------------------------------------------------------------------------
// Plain state
// ---------------------------------------------------------------------------------------------

void XALSBEproxy::SetValue(const Variant& v) { value_ = CStr(v); }

void XALSBEproxy::SetItemArray(const Variant& items) {
  if (cell_) PutProperty(cell_, "ItemArray", items);
}

Variant XALSBEproxy::ItemArray() const { return cell_ ? GetProperty(cell_, "ItemArray") : Variant(); }

// ---------------------------------------------------------------------------------------------
// Registries
// ---------------------------------------------------------------------------------------------

Ref<xal::DataObject> XALSBEproxy::DataObject(const std::string& Name) {
  Ref<xal::DataObject> result;
  TryStep([&] {
    if (dataObjects_)
      if (auto* found = dataObjects_->Find(Name)) {
        result = *found;
        return;
      }
    Ref<xal::DataObject> answer;
    events_.Raise(&XALSBEproxyEvents::GetObject, Name, int32_t{obmDefault}, answer);
    // Nothing answered: nothing is registered, so the next look-up asks the host again.
    if (!answer) return;
    AddDataOB(Name, answer);
    result = answer;
  });
  return result;
}

void XALSBEproxy::AddDataOB(const std::string& Name, Ref<xal::DataObject>& OB) {
  TryStep([&] {
    if (!dataObjects_) return;
    dataObjects_->RemoveKey(Name);
    dataObjects_->Add(OB, Name);
  });
}

ObjectRef XALSBEproxy::UIObject(const std::string& Name) const {
  if (!uiObjects_) return nullptr;
  const Ref<IXALUIObject>* found = uiObjects_->Find(Name);
  return found ? *found : nullptr;
}

void XALSBEproxy::AddUIOB(const std::string& Name, const Ref<IXALUIObject>& OB) {
  TryStep([&] {
    if (!uiObjects_) return;
    uiObjects_->RemoveKey(Name);
    uiObjects_->Add(OB, Name);
  });
}

Variant XALSBEproxy::Values(const std::string& Key) const {
  if (!values_) return Variant();
  const Variant* found = values_->items().Find(Key);
  return found ? *found : Variant();
}

void XALSBEproxy::SetValues(const std::string& Key, const Variant& value) {
  TryStep([&] {
    if (!values_) return;
    values_->items().RemoveKey(Key);
    values_->items().Add(value, Key);
  });
}

Ref<ValueTexts> XALSBEproxy::ValueLists(const std::string& FieldName) {
  Ref<ValueTexts> result;
  if (FieldName.empty()) return result;
  TryStep([&] {
    Ref<Collection> lists = CValuelists();
    if (const Variant* found = lists->items().Find(FieldName)) {
      result = std::dynamic_pointer_cast<ValueTexts>(found->AsObject());
      return;
    }
    result = MakeRef<ValueTexts>();
    result->SetName(FieldName);
    lists->items().Add(Variant(result), FieldName);
  });
  return result;
}

Ref<Collection> XALSBEproxy::CValuelists() {
  if (!valueLists_) valueLists_ = MakeRef<Collection>();
  return valueLists_;
}

// ---------------------------------------------------------------------------------------------
// Forwarding: each method raises one event and returns the answer, or its start value
// ---------------------------------------------------------------------------------------------

Ref<xal::DataObject> XALSBEproxy::CachedRows(const std::string& DataObName, const std::string& LinkName) {
  Ref<xal::DataObject> answer;
  events_.Raise(&XALSBEproxyEvents::DoGetCache, DataObName, LinkName, answer);
  return answer;
}

bool XALSBEproxy::CheckCachedRows(const std::string& DataObName, const std::string& LinkName) {
  bool exists = false;
  events_.Raise(&XALSBEproxyEvents::DoCheckCache, DataObName, LinkName, exists);
  return exists;
}

void XALSBEproxy::FreeCachedRows(const std::string& DataObName, const std::string& LinkName) {
  events_.Raise(&XALSBEproxyEvents::DoReleaseCache, DataObName, LinkName);
}

ObjectRef XALSBEproxy::SelBookmarks() {
  ObjectRef answer;
  events_.Raise(&XALSBEproxyEvents::GetSelBookmarks, answer);
  return answer;
}

bool XALSBEproxy::ReloadLayout(const Variant& Layout, const std::string& Name) {
  // The answer stands for the method's own result: False until the host sets it.
  Variant answer(false);
  events_.Raise(&XALSBEproxyEvents::DoReloadLayout, Layout, Name, answer);
  return TryOr([&] { return CBool(answer); }, false);
}

bool XALSBEproxy::ReloadSheet(int32_t NewID) {
  bool answer = false;
  events_.Raise(&XALSBEproxyEvents::DoReloadSheet, NewID, answer);
  return answer;
}

void XALSBEproxy::DataChanged() { events_.Raise(&XALSBEproxyEvents::DoDataChanged); }
void XALSBEproxy::RefreshData(const std::string& sWhat) { events_.Raise(&XALSBEproxyEvents::DoRefreshData, sWhat); }
void XALSBEproxy::RefreshHeader(const std::string& sWhat) {
  events_.Raise(&XALSBEproxyEvents::DoRefreshHeader, sWhat);
}
void XALSBEproxy::RefreshBrowser(const std::string& sWhat) {
  events_.Raise(&XALSBEproxyEvents::DoRefreshBrowser, sWhat);
}
void XALSBEproxy::RefreshRow() { events_.Raise(&XALSBEproxyEvents::DoRefreshRow); }

bool XALSBEproxy::OnNewRow() {
  bool answer = false;
  events_.Raise(&XALSBEproxyEvents::DoOnNewRow, answer);
  return answer;
}

int32_t XALSBEproxy::MsgBox(const std::string& Prompt, int32_t Buttons, const std::string& Title) {
  int32_t answer = 0;
  events_.Raise(&XALSBEproxyEvents::DoMsgBox, Prompt, Buttons, Title, answer);
  return answer;
}

bool XALSBEproxy::InputBox(const Ref<ParamList>& Params, int32_t Buttons, const std::string& Title) {
  bool answer = false;
  events_.Raise(&XALSBEproxyEvents::DoInputBox, Params, Buttons, Title, answer);
  return answer;
}

Variant XALSBEproxy::Settings(const std::string& Key, const Variant& Default) {
  // The default goes to the host as it came; the proxy never applies it itself.
  Variant answer;
  events_.Raise(&XALSBEproxyEvents::GetSettings, Key, Default, answer);
  return answer;
}

std::string XALSBEproxy::AddMenuItem(const std::string& Caption, const std::string& FuncName, bool ForceEdit,
                                     int16_t Shift, int16_t KeyCode, const std::string& Mode) {
  std::string cmd;
  events_.Raise(&XALSBEproxyEvents::DoAddMenuItem, Caption, FuncName, cmd, ForceEdit, Shift, KeyCode, Mode);
  return cmd;
}

bool XALSBEproxy::AddCmdTarget(const std::string& Cmd, const std::string& FuncName, bool ProcessAfterXAL) {
  bool answer = false;
  events_.Raise(&XALSBEproxyEvents::DoAddCmdTarget, Cmd, FuncName, ProcessAfterXAL, answer);
  return answer;
}

void XALSBEproxy::StatusMsg(const std::string& Msg) { events_.Raise(&XALSBEproxyEvents::DoStatusMsg, Msg); }

void XALSBEproxy::CmdExecute(const std::string& Cmd, const Variant& Param) {
  events_.Raise(&XALSBEproxyEvents::DoCmdExecute, Cmd, false, Param);
}

void XALSBEproxy::CmdPost(const std::string& Cmd) {
  events_.Raise(&XALSBEproxyEvents::DoCmdExecute, Cmd, true, Variant());
}

Variant XALSBEproxy::InvokeFunc(const std::string& FuncName) {
  Variant answer;
  events_.Raise(&XALSBEproxyEvents::DoInvokeFunc, FuncName, answer);
  return answer;
}

void XALSBEproxy::ShowForm(const Variant& FormID, const std::string& Filter, const std::string& Order, bool Linked,
                           const Ref<xal::DataObject>& DataOB, const std::string& OpenMode) {
  events_.Raise(&XALSBEproxyEvents::DoShowForm, FormID, Filter, Order, Linked, DataOB, OpenMode);
}

Variant XALSBEproxy::XALExecuteCB(const Ref<xal::DataObject>& DataOB, const std::string& FuncName,
                                  const Ref<ParamList>& FuncParms, const std::string& Caption) {
  Variant answer;
  events_.Raise(&XALSBEproxyEvents::DoXALExecuteCB, DataOB, FuncName, FuncParms, Caption, answer);
  return answer;
}

Variant XALSBEproxy::PrintReport(int32_t ReportID, const Variant& Selection) {
  Variant answer;
  events_.Raise(&XALSBEproxyEvents::DoPrintReport, ReportID, Selection, answer);
  return answer;
}

Variant XALSBEproxy::SendReport(int32_t ReportID, const Variant& Selection, const std::string& Address,
                                const std::string& AttachmentType) {
  Variant answer;
  events_.Raise(&XALSBEproxyEvents::DoSendReport, ReportID, Selection, Address, AttachmentType, answer);
  return answer;
}

Variant XALSBEproxy::Properties(const std::string& Name) {
  Variant answer;
  events_.Raise(&XALSBEproxyEvents::Properties, Name, false, answer);
  return answer;
}

Variant XALSBEproxy::SendMail(Ref<ParamList>& Params) {
  Variant answer;
  events_.Raise(&XALSBEproxyEvents::DoSendMail, Params, answer);
  return answer;
}

Variant XALSBEproxy::ExportReport(int32_t ReportID, const Variant& Selection, const std::string& Filename,
                                  Ref<ParamList>& Params) {
  Variant answer;
  events_.Raise(&XALSBEproxyEvents::DoExportReport, ReportID, Selection, Filename, Params, answer);
  return answer;
}

// ---------------------------------------------------------------------------------------------
// Lifecycle
// ---------------------------------------------------------------------------------------------

void XALSBEproxy::Destroy() {
  cell_.reset();
  activeCell_.reset();
  dataObjects_.reset();
  uiObjects_.reset();
  values_.reset();
  valueLists_.reset();
  parent_.reset();
  events_.Clear();
}

}  // namespace xal
