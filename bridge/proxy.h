// XALSBEproxy: the document as a script sees it. It turns every request for the host's form, data
// cache, menus, commands, reports and settings into one synchronous event (XALSBEproxyEvents) and
// returns the host's by-reference answer, and it keeps four registries that scripts and the
// document logic share for the life of a document: data objects, UI objects, free values and value
// lists per field, all keyed by name in any letter case.
// Ownership: the proxy holds Refs to everything registered with it, to its Parent, Cell and
// ActiveCell, and to its event sinks; Destroy drops them all, which breaks the cycles between
// documents, proxies and data objects.
#pragma once

#include <memory>
#include <string>

#include "bridge/host_model.h"
#include "bridge/proxy_events.h"
#include "bridge/ui_object.h"
#include "collections/value_texts.h"
#include "runtime/collection.h"
#include "runtime/events.h"

namespace xal {

class XALSBEproxy : public Object {
 public:
  XALSBEproxy();

  // ---- Plain state ------------------------------------------------------------------------------
  int32_t CellType() const { return cellType_; }
  void SetCellType(int32_t t) { cellType_ = t; }
  Ref<XALSBEproxy> Parent() const { return parent_; }
  void SetParent(const Ref<XALSBEproxy>& p) { parent_ = p; }
  std::string LinkIDList() const { return linkIDList_; }
  void SetLinkIDList(const std::string& s) { linkIDList_ = s; }
  std::string Text() const { return text_; }
  void SetText(const std::string& s) { text_ = s; }
  // Stored as text: 12.5 is kept and read back as "12.5".
  Variant Value() const { return Variant(value_); }
  void SetValue(const Variant& v);
  // The cell of the running script and the focused cell (Cellinfo objects of the layout).
  ObjectRef Cell() const { return cell_; }
  void SetCell(const ObjectRef& c) { cell_ = c; }
  ObjectRef ActiveCell() const { return activeCell_; }
  void SetActiveCell(const ObjectRef& c) { activeCell_ = c; }
  // Cell.ItemArray when a Cell is assigned; otherwise ignored / Empty.
  void SetItemArray(const Variant& items);
  Variant ItemArray() const;

  // ---- Registries -------------------------------------------------------------------------------
  Ref<xal::DataObject> DataObject(const std::string& Name = "DocData");
  void AddDataOB(const std::string& Name, Ref<xal::DataObject>& OB);
  ObjectRef UIObject(const std::string& Name) const;
  void AddUIOB(const std::string& Name, const Ref<IXALUIObject>& OB);
  Variant Values(const std::string& Key) const;
  void SetValues(const std::string& Key, const Variant& value);
  Ref<Collection> CValues() const { return values_; }
  Ref<ValueTexts> ValueLists(const std::string& FieldName);
  Ref<Collection> CValuelists();
  ObjectRef GetISDObject() const { return nullptr; }

  // ---- Forwarding to the host (one event each) --------------------------------------------------
  Ref<xal::DataObject> CachedRows(const std::string& DataObName, const std::string& LinkName);
  bool CheckCachedRows(const std::string& DataObName, const std::string& LinkName);
  void FreeCachedRows(const std::string& DataObName, const std::string& LinkName);
  ObjectRef SelBookmarks();
  bool ReloadLayout(const Variant& Layout, const std::string& Name);
  bool ReloadSheet(int32_t NewID);
  void DataChanged();
  void RefreshData(const std::string& sWhat);
  void RefreshHeader(const std::string& sWhat);
  void RefreshBrowser(const std::string& sWhat);
  void RefreshRow();
  bool OnNewRow();
  int32_t MsgBox(const std::string& Prompt, int32_t Buttons, const std::string& Title);
  bool InputBox(const Ref<ParamList>& Params, int32_t Buttons, const std::string& Title);
  Variant Settings(const std::string& Key, const Variant& Default);
  std::string AddMenuItem(const std::string& Caption, const std::string& FuncName, bool ForceEdit, int16_t Shift,
                          int16_t KeyCode, const std::string& Mode);
  bool AddCmdTarget(const std::string& Cmd, const std::string& FuncName, bool ProcessAfterXAL);
  void StatusMsg(const std::string& Msg);
  void CmdExecute(const std::string& Cmd, const Variant& Param);
  void CmdPost(const std::string& Cmd);
  Variant InvokeFunc(const std::string& FuncName);
  void ShowForm(const Variant& FormID, const std::string& Filter, const std::string& Order, bool Linked,
                const Ref<xal::DataObject>& DataOB, const std::string& OpenMode);
  Variant XALExecuteCB(const Ref<xal::DataObject>& DataOB, const std::string& FuncName,
                       const Ref<ParamList>& FuncParms, const std::string& Caption);
  Variant PrintReport(int32_t ReportID, const Variant& Selection);
  Variant SendReport(int32_t ReportID, const Variant& Selection, const std::string& Address,
                     const std::string& AttachmentType);
  Variant Properties(const std::string& Name);
  Variant SendMail(Ref<ParamList>& Params);
  Variant ExportReport(int32_t ReportID, const Variant& Selection, const std::string& Filename,
                       Ref<ParamList>& Params);

  // Releases every reference the proxy holds — registries, Parent, Cell, ActiveCell and the
  // event sinks (a host sink usually refers back to the document). The proxy is not used after.
  void Destroy();

  EventSource<XALSBEproxyEvents>& Events() { return events_; }

 private:
  int32_t cellType_ = 0;
  Ref<XALSBEproxy> parent_;
  std::string linkIDList_, text_, value_;
  ObjectRef cell_, activeCell_;
  std::unique_ptr<KeyedCollection<Ref<xal::DataObject>>> dataObjects_;
  std::unique_ptr<KeyedCollection<Ref<IXALUIObject>>> uiObjects_;
  Ref<Collection> values_;
  Ref<Collection> valueLists_;  // created on first use
  EventSource<XALSBEproxyEvents> events_;
};

}  // namespace xal
