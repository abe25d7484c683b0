// Type-library entries of the host bridge: the document proxy with its 28 events, the command
// status, the callback proxy with its 4 events, the UI object, and the object-mode enumeration.
#include "bridge/callback_proxy.h"
#include "bridge/cmd_stat.h"
#include "bridge/proxy.h"
#include "bridge/ui_object.h"
#include "runtime/binding.h"
#include "runtime/events.h"

namespace xal {
namespace {

using E = XALSBEproxyEvents;

// Lets a script host's generic sink receive the document proxy's events and answer them.
class ProxyEventsAdapter : public XALSBEproxyEvents {
 public:
  explicit ProxyEventsAdapter(std::shared_ptr<GenericSink> s) : s_(std::move(s)) {}
  void DoDataChanged() override { ForwardEvent(*s_, 1, "DoDataChanged"); }
  void DoReloadSheet(int32_t NewID, bool& RetVal) override { ForwardEvent(*s_, 2, "DoReloadSheet", NewID, RetVal); }
  void DoRefreshData(const std::string& sWhat) override { ForwardEvent(*s_, 3, "DoRefreshData", sWhat); }
  void DoRefreshHeader(const std::string& sWhat) override { ForwardEvent(*s_, 4, "DoRefreshHeader", sWhat); }
  void DoRefreshBrowser(const std::string& sWhat) override { ForwardEvent(*s_, 5, "DoRefreshBrowser", sWhat); }
  void DoRefreshRow() override { ForwardEvent(*s_, 6, "DoRefreshRow"); }
  void DoMsgBox(const std::string& Prompt, int32_t Buttons, const std::string& Title, int32_t& RetVal) override {
    ForwardEvent(*s_, 7, "DoMsgBox", Prompt, Buttons, Title, RetVal);
  }
  void DoInputBox(const Ref<ParamList>& Params, int32_t Buttons, const std::string& Title, bool& RetVal) override {
    ForwardEvent(*s_, 8, "DoInputBox", Params, Buttons, Title, RetVal);
  }
  void DoCheckCache(const std::string& sData, const std::string& sLink, bool& bExists) override {
    ForwardEvent(*s_, 9, "DoCheckCache", sData, sLink, bExists);
  }
  void DoGetCache(const std::string& sData, const std::string& sLink, Ref<DataObject>& obCache) override {
    ForwardEvent(*s_, 10, "DoGetCache", sData, sLink, obCache);
  }
  void DoReleaseCache(const std::string& sData, const std::string& sLink) override {
    ForwardEvent(*s_, 11, "DoReleaseCache", sData, sLink);
  }
  void DoOnNewRow(bool& RetVal) override { ForwardEvent(*s_, 12, "DoOnNewRow", RetVal); }
  void GetSettings(const std::string& sKey, const Variant& vDefault, Variant& vRetVal) override {
    ForwardEvent(*s_, 13, "GetSettings", sKey, vDefault, vRetVal);
  }
  void DoAddMenuItem(const std::string& sCaption, const std::string& sFuncName, std::string& sCmdString,
                     bool fForceEdit, int16_t iShift, int16_t iKeyCode, const std::string& sMode) override {
    ForwardEvent(*s_, 14, "DoAddMenuItem", sCaption, sFuncName, sCmdString, fForceEdit, iShift, iKeyCode, sMode);
  }
  void DoAddCmdTarget(const std::string& Cmd, const std::string& FuncName, bool ProcessAfterXAL,
                      bool& RetVal) override {
    ForwardEvent(*s_, 15, "DoAddCmdTarget", Cmd, FuncName, ProcessAfterXAL, RetVal);
  }
  void DoStatusMsg(const std::string& Msg) override { ForwardEvent(*s_, 16, "DoStatusMsg", Msg); }
  void DoCmdExecute(const std::string& Cmd, bool Posted, const Variant& Param) override {
    ForwardEvent(*s_, 17, "DoCmdExecute", Cmd, Posted, Param);
  }
  void DoInvokeFunc(const std::string& FuncName, Variant& RetVal) override {
    ForwardEvent(*s_, 18, "DoInvokeFunc", FuncName, RetVal);
  }
  void GetSelBookmarks(ObjectRef& SelBookmarks) override { ForwardEvent(*s_, 19, "GetSelBookmarks", SelBookmarks); }
  void DoShowForm(const Variant& FormID, const std::string& Filter, const std::string& Order, bool Linked,
                  const Ref<DataObject>& DataOB, const std::string& OpenMode) override {
    ForwardEvent(*s_, 20, "DoShowForm", FormID, Filter, Order, Linked, DataOB, OpenMode);
  }
  void GetObject(const std::string& Name, int32_t Mode, Ref<DataObject>& DataOB) override {
    ForwardEvent(*s_, 21, "GetObject", Name, Mode, DataOB);
  }
  void DoXALExecuteCB(const Ref<DataObject>& DataOB, const std::string& FuncName, const Ref<ParamList>& FuncParms,
                      const std::string& Caption, Variant& RetVal) override {
    ForwardEvent(*s_, 22, "DoXALExecuteCB", DataOB, FuncName, FuncParms, Caption, RetVal);
  }
  void DoReloadLayout(const Variant& Layout, const std::string& AreaName, Variant& RetVal) override {
    ForwardEvent(*s_, 23, "DoReloadLayout", Layout, AreaName, RetVal);
  }
  void DoPrintReport(int32_t ReportID, const Variant& Selection, Variant& RetVal) override {
    ForwardEvent(*s_, 24, "DoPrintReport", ReportID, Selection, RetVal);
  }
  void DoSendReport(int32_t ReportID, const Variant& Selection, const std::string& Address,
                    const std::string& AttachmentType, Variant& RetVal) override {
    ForwardEvent(*s_, 25, "DoSendReport", ReportID, Selection, Address, AttachmentType, RetVal);
  }
  void DoSendMail(Ref<ParamList>& Params, Variant& RetVal) override {
    ForwardEvent(*s_, 27, "DoSendMail", Params, RetVal);
  }
  void Properties(const std::string& Name, bool WriteEnabled, Variant& Value) override {
    ForwardEvent(*s_, 26, "Properties", Name, WriteEnabled, Value);
  }
  void DoExportReport(int32_t ReportID, const Variant& Selection, const std::string& Filename,
                      Ref<ParamList>& Params, Variant& RetVal) override {
    ForwardEvent(*s_, 28, "DoExportReport", ReportID, Selection, Filename, Params, RetVal);
  }

 private:
  std::shared_ptr<GenericSink> s_;
};

class CallbackEventsAdapter : public XALCBProxyEvents {
 public:
  explicit CallbackEventsAdapter(std::shared_ptr<GenericSink> s) : s_(std::move(s)) {}
  void CallBack(int32_t callerID, const std::string& sCommand, const std::string& sMessage, const Variant& vParam,
                Variant& Result) override {
    ForwardEvent(*s_, 1, "CallBack", callerID, sCommand, sMessage, vParam, Result);
  }
  void InputBox(int32_t callerID, Ref<ParamList>& Params, int32_t Buttons, const std::string& Title,
                bool& Result) override {
    ForwardEvent(*s_, 2, "InputBox", callerID, Params, Buttons, Title, Result);
  }
  void MsgBox(int32_t callerID, const std::string& Prompt, int32_t Buttons, const std::string& Title,
              const std::string& Helpfile, int32_t Context, int32_t& Result) override {
    ForwardEvent(*s_, 3, "MsgBox", callerID, Prompt, Buttons, Title, Helpfile, Context, Result);
  }
  void Notify(int32_t callerID, int32_t eNotify, const std::string& sMessage, const Variant& vParam,
              bool& Result) override {
    ForwardEvent(*s_, 4, "Notify", callerID, eNotify, sMessage, vParam, Result);
  }

 private:
  std::shared_ptr<GenericSink> s_;
};

const EventInterfaceInfo& ProxyEventTable() {
  return EventBuilder<E>("__XALSBEproxy")
      .Event<&E::DoDataChanged>("DoDataChanged", 1)
      .Event<&E::DoReloadSheet>("DoReloadSheet", 2, {Param("NewID"), Param("RetVal")})
      .Event<&E::DoRefreshData>("DoRefreshData", 3, {Param("sWhat")})
      .Event<&E::DoRefreshHeader>("DoRefreshHeader", 4, {Param("sWhat")})
      .Event<&E::DoRefreshBrowser>("DoRefreshBrowser", 5, {Param("sWhat")})
      .Event<&E::DoRefreshRow>("DoRefreshRow", 6)
      .Event<&E::DoMsgBox>("DoMsgBox", 7, {Param("Prompt"), Param("Buttons"), Param("Title"), Param("RetVal")})
      .Event<&E::DoInputBox>("DoInputBox", 8, {Param("Params"), Param("Buttons"), Param("Title"), Param("RetVal")})
      .Event<&E::DoCheckCache>("DoCheckCache", 9, {Param("sData"), Param("sLink"), Param("bExists")})
      .Event<&E::DoGetCache>("DoGetCache", 10, {Param("sData"), Param("sLink"), Param("obCache")})
      .Event<&E::DoReleaseCache>("DoReleaseCache", 11, {Param("sData"), Param("sLink")})
      .Event<&E::DoOnNewRow>("DoOnNewRow", 12, {Param("RetVal")})
      .Event<&E::GetSettings>("GetSettings", 13, {Param("sKey"), Param("vDefault"), Param("vRetVal")})
      .Event<&E::DoAddMenuItem>("DoAddMenuItem", 14, {Param("sCaption"), Param("sFuncName"), Param("sCmdString"),
                                                      Param("fForceEdit"), Param("iShift"), Param("iKeyCode"),
                                                      Param("sMode")})
      .Event<&E::DoAddCmdTarget>("DoAddCmdTarget", 15,
                                 {Param("Cmd"), Param("FuncName"), Param("ProcessAfterXAL"), Param("RetVal")})
      .Event<&E::DoStatusMsg>("DoStatusMsg", 16, {Param("Msg")})
      .Event<&E::DoCmdExecute>("DoCmdExecute", 17, {Param("Cmd"), Param("Posted"), Param("Param")})
      .Event<&E::DoInvokeFunc>("DoInvokeFunc", 18, {Param("FuncName"), Param("RetVal")})
      .Event<&E::GetSelBookmarks>("GetSelBookmarks", 19, {Param("SelBookmarks")})
      .Event<&E::DoShowForm>("DoShowForm", 20, {Param("FormID"), Param("Filter"), Param("Order"), Param("Linked"),
                                                Param("DataOB"), Param("OpenMode")})
      .Event<&E::GetObject>("GetObject", 21, {Param("Name"), Param("Mode"), Param("DataOB")})
      .Event<&E::DoXALExecuteCB>("DoXALExecuteCB", 22, {Param("DataOB"), Param("FuncName"), Param("FuncParms"),
                                                        Param("Caption"), Param("RetVal")})
      .Event<&E::DoReloadLayout>("DoReloadLayout", 23, {Param("Layout"), Param("AreaName"), Param("RetVal")})
      .Event<&E::DoPrintReport>("DoPrintReport", 24, {Param("ReportID"), Param("Selection"), Param("RetVal")})
      .Event<&E::DoSendReport>("DoSendReport", 25, {Param("ReportID"), Param("Selection"), Param("Address"),
                                                    Param("AttachmentType"), Param("RetVal")})
      .Event<&E::DoSendMail>("DoSendMail", 27, {Param("Params"), Param("RetVal")})
      .Event<&E::Properties>("Properties", 26, {Param("Name"), Param("WriteEnabled"), Param("Value")})
      .Event<&E::DoExportReport>("DoExportReport", 28, {Param("ReportID"), Param("Selection"), Param("Filename"),
                                                        Param("Params"), Param("RetVal")})
      .info();
}

void RegisterProxy() {
  using P = XALSBEproxy;
  ClassBuilder<P> b("XALSBEproxy");
  b.Creatable()
      .Get<&P::CellType>("CellType")
      .Put<&P::SetCellType>("CellType", {Param("Value")})
      .Get<&P::Parent>("Parent")
      .PutRef<&P::SetParent>("Parent", {Param("Value")})
      .Get<&P::LinkIDList>("LinkIDList")
      .Get<&P::Text>("Text")
      .Get<&P::Value>("Value").Default()
      .Put<&P::SetItemArray>("ItemArray", {Param("Value")})
      .Get<&P::ItemArray>("ItemArray")
      .Get<&P::DataObject>("DataObject", {Def("Name", "DocData")})
      .Method<&P::CachedRows>("CachedRows", {Param("DataObName"), Param("LinkName")})
      .Method<&P::CheckCachedRows>("CheckCachedRows", {Param("DataObName"), Param("LinkName")})
      .Method<&P::FreeCachedRows>("FreeCachedRows", {Param("DataObName"), Param("LinkName")})
      .Get<&P::Values>("Values", {Param("Key")})
      .Put<&P::SetValues>("Values", {Param("Key"), Param("Value")})
      .PutRef<&P::SetValues>("Values", {Param("Key"), Param("Value")})
      .Get<&P::CValues>("CValues")
      .Get<&P::ValueLists>("ValueLists", {Param("FieldName")})
      .Get<&P::CValuelists>("CValuelists")
      .Get<&P::UIObject>("UIObject", {Param("Name")})
      .Get<&P::SelBookmarks>("SelBookmarks")
      .Method<&P::ReloadLayout>("ReloadLayout", {Param("Layout"), Opt("Name")})
      .Method<&P::ReloadSheet>("ReloadSheet", {Param("NewID")})
      .Method<&P::GetISDObject>("GetISDObject")
      .Method<&P::DataChanged>("DataChanged")
      .Method<&P::RefreshData>("RefreshData", {Def("sWhat", "")})
      .Method<&P::RefreshHeader>("RefreshHeader", {Opt("sWhat")})
      .Method<&P::RefreshBrowser>("RefreshBrowser", {Opt("sWhat")})
      .Method<&P::RefreshRow>("RefreshRow")
      .Method<&P::OnNewRow>("OnNewRow")
      .Get<&P::ActiveCell>("ActiveCell")
      .Get<&P::Cell>("Cell")
      .Method<&P::MsgBox>("MsgBox", {Param("Prompt"), Opt("Buttons"), Opt("Title")})
      .Method<&P::InputBox>("InputBox", {Param("Params"), Def("Buttons", 1), Opt("Title")})
      .Method<&P::Settings>("Settings", {Param("Key"), Opt("Default")})
      .Method<&P::AddMenuItem>("AddMenuItem", {Param("Caption"), Param("FuncName"), Def("ForceEdit", false),
                                               Def("Shift", int16_t{0}), Def("KeyCode", int16_t{0}), Opt("Mode")})
      .Method<&P::AddCmdTarget>("AddCmdTarget", {Param("Cmd"), Param("FuncName"), Opt("ProcessAfterXAL")})
      .Method<&P::StatusMsg>("StatusMsg", {Param("Msg")})
      .Method<&P::CmdExecute>("CmdExecute", {Param("Cmd"), Opt("Param")})
      .Method<&P::CmdPost>("CmdPost", {Param("Cmd")})
      .Method<&P::InvokeFunc>("InvokeFunc", {Param("FuncName")})
      .Method<&P::ShowForm>("ShowForm", {Param("FormID"), Opt("Filter"), Opt("Order"), Opt("Linked"), Opt("DataOB"),
                                         Opt("OpenMode")})
      .Method<&P::XALExecuteCB>("XALExecuteCB", {Param("DataOB"), Param("FuncName"), Opt("FuncParms"), Opt("Caption")})
      .Method<&P::PrintReport>("PrintReport", {Param("ReportID"), Opt("Selection")})
      .Method<&P::SendReport>("SendReport", {Param("ReportID"), Opt("Selection"), Opt("Address"), Opt("AttachmentType")})
      .PutRef<&P::SetCell>("Cell", {Param("Value")})
      .PutRef<&P::SetActiveCell>("ActiveCell", {Param("Value")})
      .Method<&P::AddDataOB>("AddDataOB", {Param("Name"), Param("OB")})
      .Method<&P::AddUIOB>("AddUIOB", {Param("Name"), Param("OB")})
      .Put<&P::SetLinkIDList>("LinkIDList", {Param("Value")})
      .Put<&P::SetText>("Text", {Param("Value")})
      .Put<&P::SetValue>("Value", {Param("Value")})
      .Method<&P::Destroy>("Destroy")
      .Method<&P::Properties>("Properties", {Param("Name")})
      .Method<&P::SendMail>("SendMail", {Param("Params")})
      .Method<&P::ExportReport>("ExportReport", {Param("ReportID"), Opt("Selection"), Opt("Filename"), Opt("Params")});
  RegisterEventSource<P, E, ProxyEventsAdapter>(b.info(), ProxyEventTable());
}

void RegisterCmdStat() {
  ClassBuilder<CmdStat>("CmdStat").Creatable()
      .Get<&CmdStat::Doc>("Doc")
      .PutRef<&CmdStat::SetDoc>("Doc", {Param("Value")})
      .Method<&CmdStat::Message>("Message", {Param("Msg"), Opt("MsgType")})
      .Method<&CmdStat::Execute>("Execute", {Param("Cmd"), Opt("Param")})
      .Method<&CmdStat::Post>("Post", {Param("Cmd")});
}

void RegisterCallbackProxy() {
  using C = XALCBProxyEvents;
  const auto& events =
      EventBuilder<C>("__XALCBProxy")
          .Event<&C::CallBack>("CallBack", 1, {Param("callerID"), Param("sCommand"), Param("sMessage"), Param("vParam"),
                                               Param("Result")})
          .Event<&C::InputBox>("InputBox", 2, {Param("callerID"), Param("Params"), Param("Buttons"), Param("Title"),
                                               Param("Result")})
          .Event<&C::MsgBox>("MsgBox", 3, {Param("callerID"), Param("Prompt"), Param("Buttons"), Param("Title"),
                                           Param("Helpfile"), Param("Context"), Param("Result")})
          .Event<&C::Notify>("Notify", 4, {Param("callerID"), Param("eNotify"), Param("sMessage"), Param("vParam"),
                                           Param("Result")})
          .info();
  ClassBuilder<XALCBProxy> b("XALCBProxy");
  b.Creatable()
      .Interface("IXALCallback")
      .Method<&XALCBProxy::CallBack>("CallBack", {Param("callerID"), Param("sCommand"), Param("sMessage"), Param("vParam")})
      .Method<&XALCBProxy::Notify>("Notify", {Param("callerID"), Param("eNotify"), Param("sMessage"), Param("vParam")})
      .Method<&XALCBProxy::MsgBox>("MsgBox", {Param("callerID"), Param("Prompt"), Param("Buttons"), Param("Title"),
                                              Param("Helpfile"), Param("Context")})
      .Method<&XALCBProxy::InputBox>("InputBox", {Param("callerID"), Param("Params"), Param("Buttons"), Param("Title")});
  RegisterEventSource<XALCBProxy, C, CallbackEventsAdapter>(b.info(), events);
}

void RegisterUIObject() {
  ClassBuilder<IXALUIObject>("IXALUIObject").Creatable()
      .Interface("IXALUIObject")
      .Get<&IXALUIObject::Properties>("Properties", {Param("Name")})
      .Put<&IXALUIObject::SetProperties>("Properties", {Param("Name"), Param("Value")})
      .PutRef<&IXALUIObject::SetProperties>("Properties", {Param("Name"), Param("Value")});
  TypeRegistry::Instance().AddEnum(EnumInfo{"EnuObjectModes", {{"obmDefault", 0}, {"obmCached", 1}, {"obmNotCached", 2}}});
}

const bool kRegistered = (RegisterProxy(), RegisterCmdStat(), RegisterCallbackProxy(), RegisterUIObject(), true);

}  // namespace
}  // namespace xal
