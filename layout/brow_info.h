// BrowInfo: a browser (a grid of rows) on a data sheet — its data source, filter, order and
// scripts, its tree view, and the array of its column cells. It keeps its caption per language
// like the other definitions and writes itself as script text.
#pragma once

#include <cstdint>
#include <string>

#include "layout/lang_strings.h"
#include "layout/property_bag.h"
#include "layout/script_writer.h"
#include "runtime/variant.h"

namespace xal {

class BrowInfo : public PropertyBag<BrowInfo> {
 public:
  // ---- Plain fields, in interface order -------------------------------------------------------
  int32_t LOID = 0;
  std::string Expr;
  std::string sClone;
  std::string DataFilter;
  std::string DataOrder;
  bool Locked = false;
  std::string Valid;
  std::string When;
  std::string OnGetStyle;
  int16_t Pos = 0;
  std::string ProgName;
  bool AltStyle = false;
  bool MultiRow = false;
  std::string Master;
  std::string SkipMaster;
  std::string OnAddNew;
  std::string OnDelete;
  bool Loaded = false;
  Variant CIArray;  // one-dimensional array of Cellinfo, or Empty
  int16_t XALBrowNr = 0;
  std::string Filter;
  std::string DefaultData;
  std::string SheetName;
  std::string DocName;
  int16_t DocNr = 0;
  bool AlreadyUpdated = false;
  std::string TreeSrc;
  std::string TreeName;
  std::string TreeFields;
  bool ShowTree = false;
  int32_t MaxRows = 0;
  int32_t LangID = 0;

  // ---- Members with logic -------------------------------------------------------------------------
  // The number of columns: the elements of CIArray before the first Empty one; 0 without an array.
  int32_t ColCount() const;
  std::string Caption() const { return captions_.Caption(LangID); }
  void SetCaption(const std::string& text) { captions_.PutCaption(text, LangID); }
  // Always False, as the interface has it.
  bool AddLangString(const std::string& text, int32_t langID);
  std::string GetScript(std::string& sc, int16_t Tabs) const;
  void WriteScript(ScriptWriter& w) const;

 private:
  LangStrings captions_;
};

}  // namespace xal
