// SheetInfo: a sheet (a tab page) of a form: its caption per language, its filter, order and
// script, and an optional link to another form. The data sheets in aDS belong to the host and are
// not written with the sheet.
#pragma once

#include <cstdint>
#include <string>

#include "layout/lang_strings.h"
#include "layout/link_info.h"
#include "layout/property_bag.h"
#include "layout/script_writer.h"
#include "runtime/variant.h"

namespace xal {

class SheetInfo : public PropertyBag<SheetInfo> {
 public:
  // ---- Plain fields, in interface order -------------------------------------------------------
  int16_t serverID = 0;
  bool bLocked = false;
  std::string sExpr;
  std::string sClone;
  bool isLoaded = false;  // run-time state, not written
  bool needRefresh = false;
  bool isSingle = false;
  std::string sScript;
  std::string sFilter;
  std::string sOrder;
  Variant aDS;
  int32_t LangID = 0;

  // ---- Members with logic -------------------------------------------------------------------------
  // The link object, created empty on the first read when none is assigned.
  Ref<LinkInfo> LnkInfo();
  void SetLnkInfo(const Ref<LinkInfo>& link) { link_ = link; }
  std::string XALFormIndex() { return LnkInfo()->FormXALIndex; }
  void SetXALFormIndex(const std::string& index) { LnkInfo()->FormXALIndex = index; }
  int32_t lIDXALForms() { return LnkInfo()->FormID; }
  void SetlIDXALForms(int32_t) {}
  std::string sCaption() const { return captions_.Caption(LangID); }
  void SetsCaption(const std::string& text) { captions_.PutCaption(text, LangID); }
  // Always False, as the interface has it.
  bool AddLangString(const std::string& text, int32_t langID);
  std::string GetScript(std::string& sc, int16_t Tabs) const;
  void WriteScript(ScriptWriter& w) const;

 private:
  LangStrings captions_;
  Ref<LinkInfo> link_;
};

}  // namespace xal
