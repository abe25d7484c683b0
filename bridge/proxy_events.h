// Events of the document proxy (interface "__XALSBEproxy"): every request that needs the host's
// form, data cache, menus, commands, reports or settings becomes one of these, raised
// synchronously. The host answers through the by-reference parameters; a handler that is not
// overridden leaves the answer at the start value the proxy put there.
//
// XAL_PROXY_EVENTS is the one list of the 28 events. Everything that names them is generated from
// it: the virtuals below, the forwarder to a generic sink, the type library's event table and the
// lines an event log writes. One line per event, in the interface's order (ids 1 to 25, then 27,
// 26, 28):
//   X(dispid, name, (C++ parameters), (parameter names), log)
// `log` says what a log line of the event shows, nullptr for an event no log records (the data
// plumbing: caches, settings, selection). Its form mirrors the line: parameter names separated
// by ",", "[Name]" for one left out when it is empty, and "->Name" for the answer shown after the
// call, e.g. "Prompt,Buttons,[Title]->RetVal" gives `MsgBox("Save?",4)->7`.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "bridge/host_model.h"
#include "runtime/events.h"
#include "runtime/variant.h"

// clang-format off
#define XAL_PROXY_EVENTS(X)                                                                                        \
  X(1, DoDataChanged, (), (), "")                                                                                   \
  X(2, DoReloadSheet, (int32_t NewID, bool& RetVal), (NewID, RetVal), "NewID")                                      \
  X(3, DoRefreshData, (const std::string& sWhat), (sWhat), "sWhat")                                                 \
  X(4, DoRefreshHeader, (const std::string& sWhat), (sWhat), "sWhat")                                               \
  X(5, DoRefreshBrowser, (const std::string& sWhat), (sWhat), "sWhat")                                              \
  X(6, DoRefreshRow, (), (), "")                                                                                    \
  X(7, DoMsgBox, (const std::string& Prompt, int32_t Buttons, const std::string& Title, int32_t& RetVal),           \
    (Prompt, Buttons, Title, RetVal), "Prompt,Buttons,[Title]->RetVal")                                             \
  X(8, DoInputBox, (const Ref<ParamList>& Params, int32_t Buttons, const std::string& Title, bool& RetVal),         \
    (Params, Buttons, Title, RetVal), "Title->RetVal")                                                              \
  X(9, DoCheckCache, (const std::string& sData, const std::string& sLink, bool& bExists),                          \
    (sData, sLink, bExists), nullptr)                                                                               \
  X(10, DoGetCache, (const std::string& sData, const std::string& sLink, Ref<DataObject>& obCache),                \
    (sData, sLink, obCache), nullptr)                                                                               \
  X(11, DoReleaseCache, (const std::string& sData, const std::string& sLink), (sData, sLink), nullptr)              \
  X(12, DoOnNewRow, (bool& RetVal), (RetVal), "")                                                                   \
  X(13, GetSettings, (const std::string& sKey, const Variant& vDefault, Variant& vRetVal),                          \
    (sKey, vDefault, vRetVal), nullptr)                                                                             \
  X(14, DoAddMenuItem, (const std::string& sCaption, const std::string& sFuncName, std::string& sCmdString,         \
                        bool fForceEdit, int16_t iShift, int16_t iKeyCode, const std::string& sMode),               \
    (sCaption, sFuncName, sCmdString, fForceEdit, iShift, iKeyCode, sMode), "sCaption,sFuncName")                  \
  X(15, DoAddCmdTarget, (const std::string& Cmd, const std::string& FuncName, bool ProcessAfterXAL, bool& RetVal), \
    (Cmd, FuncName, ProcessAfterXAL, RetVal), "Cmd,FuncName")                                                       \
  X(16, DoStatusMsg, (const std::string& Msg), (Msg), "Msg")                                                        \
  X(17, DoCmdExecute, (const std::string& Cmd, bool Posted, const Variant& Param), (Cmd, Posted, Param),            \
    "Cmd,[Param]")                                                                                                  \
  X(18, DoInvokeFunc, (const std::string& FuncName, Variant& RetVal), (FuncName, RetVal), "FuncName")              \
  X(19, GetSelBookmarks, (ObjectRef& SelBookmarks), (SelBookmarks), nullptr)                                        \
  X(20, DoShowForm, (const Variant& FormID, const std::string& Filter, const std::string& Order, bool Linked,       \
                     const Ref<DataObject>& DataOB, const std::string& OpenMode),                                   \
    (FormID, Filter, Order, Linked, DataOB, OpenMode), "FormID,Filter")                                             \
  X(21, GetObject, (const std::string& Name, int32_t Mode, Ref<DataObject>& DataOB), (Name, Mode, DataOB),          \
    "Name->DataOB")                                                                                                 \
  X(22, DoXALExecuteCB, (const Ref<DataObject>& DataOB, const std::string& FuncName,                                \
                         const Ref<ParamList>& FuncParms, const std::string& Caption, Variant& RetVal),             \
    (DataOB, FuncName, FuncParms, Caption, RetVal), "FuncName")                                                     \
  X(23, DoReloadLayout, (const Variant& Layout, const std::string& AreaName, Variant& RetVal),                      \
    (Layout, AreaName, RetVal), "AreaName")                                                                         \
  X(24, DoPrintReport, (int32_t ReportID, const Variant& Selection, Variant& RetVal), (ReportID, Selection, RetVal),\
    "ReportID")                                                                                                     \
  X(25, DoSendReport, (int32_t ReportID, const Variant& Selection, const std::string& Address,                      \
                       const std::string& AttachmentType, Variant& RetVal),                                         \
    (ReportID, Selection, Address, AttachmentType, RetVal), "ReportID,Address")                                     \
  X(27, DoSendMail, (Ref<ParamList>& Params, Variant& RetVal), (Params, RetVal), "")                                \
  X(26, Properties, (const std::string& Name, bool WriteEnabled, Variant& Value), (Name, WriteEnabled, Value),      \
    "Name")                                                                                                         \
  X(28, DoExportReport, (int32_t ReportID, const Variant& Selection, const std::string& Filename,                   \
                         Ref<ParamList>& Params, Variant& RetVal),                                                  \
    (ReportID, Selection, Filename, Params, RetVal), "ReportID,Filename")
// clang-format on

namespace xal {

class XALSBEproxyEvents {
 public:
  virtual ~XALSBEproxyEvents() = default;
#define XAL_DECLARE_PROXY_EVENT(dispid, name, params, names, log) virtual void name params {}
  XAL_PROXY_EVENTS(XAL_DECLARE_PROXY_EVENT)
#undef XAL_DECLARE_PROXY_EVENT
};

// Hands every event to a generic sink as (dispid, name, arguments) and copies its answers back:
// how script hosts and event logs receive the proxy's events.
class XALSBEproxyEventForwarder : public XALSBEproxyEvents {
 public:
  explicit XALSBEproxyEventForwarder(std::shared_ptr<GenericSink> sink) : sink_(std::move(sink)) {}
#define XAL_PROXY_EVENT_ARGS(...) __VA_OPT__(, ) __VA_ARGS__
#define XAL_FORWARD_PROXY_EVENT(dispid, name, params, names, log) \
  void name params override { ForwardEvent(*sink_, dispid, #name XAL_PROXY_EVENT_ARGS names); }
  XAL_PROXY_EVENTS(XAL_FORWARD_PROXY_EVENT)
#undef XAL_FORWARD_PROXY_EVENT
#undef XAL_PROXY_EVENT_ARGS

 private:
  std::shared_ptr<GenericSink> sink_;
};

// One event of the list as data.
struct ProxyEventEntry {
  int32_t dispid;
  const char* name;
  const char* params;  // the parameter names as written in the list: "(NewID, RetVal)"
  const char* log;     // what a log line shows; nullptr: not logged
};

inline constexpr ProxyEventEntry kProxyEvents[] = {
#define XAL_PROXY_EVENT_ENTRY(dispid, name, params, names, log) {dispid, #name, #names, log},
    XAL_PROXY_EVENTS(XAL_PROXY_EVENT_ENTRY)
#undef XAL_PROXY_EVENT_ENTRY
};

// The entry of an event id; nullptr for an id the interface does not have.
const ProxyEventEntry* FindProxyEvent(int32_t dispid);
// The parameter names of an event, in order.
std::vector<std::string> ProxyEventParams(const ProxyEventEntry& event);

// Object modes of GetObject; the proxy itself only passes obmDefault.
enum EnuObjectModes : int32_t { obmDefault = 0, obmCached = 1, obmNotCached = 2 };

}  // namespace xal
