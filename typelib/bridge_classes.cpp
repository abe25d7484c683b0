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

// The proxy's events for the type library, from the one event list.
const EventInterfaceInfo& ProxyEventTable() {
  EventBuilder<E> b("__XALSBEproxy");
  auto paramsOf = [](int32_t dispid) {
    std::vector<Param> out;
    for (std::string& name : ProxyEventParams(*FindProxyEvent(dispid))) out.emplace_back(std::move(name));
    return out;
  };
#define XAL_DESCRIBE_PROXY_EVENT(dispid, name, params, names, log) b.Event<&E::name>(#name, dispid, paramsOf(dispid));
  XAL_PROXY_EVENTS(XAL_DESCRIBE_PROXY_EVENT)
#undef XAL_DESCRIBE_PROXY_EVENT
  return b.info();
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
  RegisterEventSource<P, E, XALSBEproxyEventForwarder>(b.info(), ProxyEventTable());
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
