// Events of the document proxy (interface "__XALSBEproxy"): every request that needs the host's
// form, data cache, menus, commands, reports or settings becomes one of these, raised
// synchronously. The host answers through the by-reference parameters; a handler that is not
// overridden leaves the answer at the start value the proxy put there. Virtuals are in the
// interface's order: ids 1 to 25, then 27, 26, 28.
#pragma once

#include <string>

#include "bridge/host_model.h"
#include "runtime/variant.h"

namespace xal {

class XALSBEproxyEvents {
 public:
  virtual ~XALSBEproxyEvents() = default;
  virtual void DoDataChanged() {}                                                           // 1
  virtual void DoReloadSheet(int32_t NewID, bool& RetVal) {}                               // 2
  virtual void DoRefreshData(const std::string& sWhat) {}                                   // 3
  virtual void DoRefreshHeader(const std::string& sWhat) {}                                 // 4
  virtual void DoRefreshBrowser(const std::string& sWhat) {}                                // 5
  virtual void DoRefreshRow() {}                                                            // 6
  virtual void DoMsgBox(const std::string& Prompt, int32_t Buttons, const std::string& Title, int32_t& RetVal) {}  // 7
  virtual void DoInputBox(const Ref<ParamList>& Params, int32_t Buttons, const std::string& Title, bool& RetVal) {}  // 8
  virtual void DoCheckCache(const std::string& sData, const std::string& sLink, bool& bExists) {}  // 9
  virtual void DoGetCache(const std::string& sData, const std::string& sLink, Ref<DataObject>& obCache) {}  // 10
  virtual void DoReleaseCache(const std::string& sData, const std::string& sLink) {}       // 11
  virtual void DoOnNewRow(bool& RetVal) {}                                                  // 12
  virtual void GetSettings(const std::string& sKey, const Variant& vDefault, Variant& vRetVal) {}  // 13
  virtual void DoAddMenuItem(const std::string& sCaption, const std::string& sFuncName, std::string& sCmdString,
                             bool fForceEdit, int16_t iShift, int16_t iKeyCode, const std::string& sMode) {}  // 14
  virtual void DoAddCmdTarget(const std::string& Cmd, const std::string& FuncName, bool ProcessAfterXAL,
                              bool& RetVal) {}                                              // 15
  virtual void DoStatusMsg(const std::string& Msg) {}                                       // 16
  virtual void DoCmdExecute(const std::string& Cmd, bool Posted, const Variant& Param) {}  // 17
  virtual void DoInvokeFunc(const std::string& FuncName, Variant& RetVal) {}                // 18
  virtual void GetSelBookmarks(ObjectRef& SelBookmarks) {}                                  // 19
  virtual void DoShowForm(const Variant& FormID, const std::string& Filter, const std::string& Order, bool Linked,
                          const Ref<DataObject>& DataOB, const std::string& OpenMode) {}   // 20
  virtual void GetObject(const std::string& Name, int32_t Mode, Ref<DataObject>& DataOB) {}  // 21
  virtual void DoXALExecuteCB(const Ref<DataObject>& DataOB, const std::string& FuncName,
                              const Ref<ParamList>& FuncParms, const std::string& Caption, Variant& RetVal) {}  // 22
  virtual void DoReloadLayout(const Variant& Layout, const std::string& AreaName, Variant& RetVal) {}  // 23
  virtual void DoPrintReport(int32_t ReportID, const Variant& Selection, Variant& RetVal) {}  // 24
  virtual void DoSendReport(int32_t ReportID, const Variant& Selection, const std::string& Address,
                            const std::string& AttachmentType, Variant& RetVal) {}         // 25
  virtual void DoSendMail(Ref<ParamList>& Params, Variant& RetVal) {}                       // 27
  virtual void Properties(const std::string& Name, bool WriteEnabled, Variant& Value) {}    // 26
  virtual void DoExportReport(int32_t ReportID, const Variant& Selection, const std::string& Filename,
                              Ref<ParamList>& Params, Variant& RetVal) {}                   // 28
};

// Object modes of GetObject; the proxy itself only passes obmDefault.
enum EnuObjectModes : int32_t { obmDefault = 0, obmCached = 1, obmNotCached = 2 };

}  // namespace xal
