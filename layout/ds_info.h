// DSInfo: a data sheet, one document area of a form (the header, the rows, ...): its layout, its
// scripts, the grid of cells, the column cells, the browsers and an optional link to another form.
// It owns its language strings and its link; the cells and browsers are shared references held in
// Variant arrays that the host fills.
#pragma once

#include <cstdint>
#include <string>

#include "layout/lang_strings.h"
#include "layout/link_info.h"
#include "layout/property_bag.h"
#include "layout/script_writer.h"
#include "runtime/variant.h"

namespace xal {

class DSInfo : public PropertyBag<DSInfo> {
 public:
  // ---- Plain fields, in interface order -------------------------------------------------------
  int16_t serverID = 0;
  int32_t lID = 0;
  int32_t lType = 0;
  bool bList = false;
  bool bLocked = false;
  std::string sExpr;
  int16_t iPos = 0;
  int16_t iRows = 0;
  int16_t iCols = 0;
  int16_t iLHeight = 0;
  int16_t iBHeight = 0;
  int16_t iBSplitPos = 0;
  std::string sProgname;
  std::string sColWidth;
  std::string sValid;
  std::string sWhen;
  int16_t iLayout = 0;
  bool bHeader = false;
  bool bBrowser = false;
  int16_t iBrowmode = 0;
  int16_t iListmode = 0;
  std::string sListmaster;
  std::string sOnAddNew;
  std::string sOnDelete;
  bool bMultiRow = false;
  bool bAltStyle = false;
  bool isLoaded = false;  // run-time state, not written
  bool needRefresh = false;
  bool isSingle = false;
  Variant aCells;  // two-dimensional (rows, columns) array of Cellinfo, or Empty
  Variant aCS;     // one-dimensional array of Cellinfo, or Empty
  Variant aBrow;   // one-dimensional array of BrowInfo, or Empty
  std::string SkipMaster;
  int16_t U_SplitPos = 0;
  int32_t LangID = 0;
  std::string OnGetStyle;

  // ---- Members with logic -------------------------------------------------------------------------
  std::string sCaption() const { return captions_.Caption(LangID); }
  void SetsCaption(const std::string& text) { captions_.PutCaption(text, LangID); }
  // The link object, created empty on the first read when none is assigned.
  Ref<LinkInfo> LnkInfo();
  void SetLnkInfo(const Ref<LinkInfo>& link) { link_ = link; }
  // Two names for the link's FormXALIndex, and two for its FormID (which cannot be assigned here).
  std::string LinkXALIndex() { return LnkInfo()->FormXALIndex; }
  void SetLinkXALIndex(const std::string& index) { LnkInfo()->FormXALIndex = index; }
  std::string XALFormIndex() { return LnkInfo()->FormXALIndex; }
  void SetXALFormIndex(const std::string& index) { LnkInfo()->FormXALIndex = index; }
  int32_t lIDLinkForm() { return LnkInfo()->FormID; }
  void SetlIDLinkForm(int32_t) {}
  int32_t lIDXALForms() { return LnkInfo()->FormID; }
  void SetlIDXALForms(int32_t) {}

  // Appends the data sheet's script to `sc` and returns the whole text. Stops with error 13 at an
  // element of aCells or aCS that is not a Cellinfo, or of aBrow that is not a BrowInfo; the text
  // written up to there stays in `sc`.
  std::string GetScript(std::string& sc, int16_t Tabs) const;
  void WriteScript(ScriptWriter& w) const;

  // A generic property slot that the interface keeps for compatibility: it holds nothing.
  Variant Prop(const std::string& propName) const { return Variant(); }
  void SetProp(const std::string& propName, const Variant& value) {}

  // Always False, as the interface has it.
  bool AddLangString(const std::string& text, int32_t langID);

 private:
  void WriteCellGrid(ScriptWriter& w) const;
  void WriteBrowsers(ScriptWriter& w) const;

  LangStrings captions_;
  Ref<LinkInfo> link_;
};

}  // namespace xal
