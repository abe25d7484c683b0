// CSInfo: a column set entry, one column of a list view: its caption, binding, width, scripts and
// link. A plain property bag that also writes itself as script text.
#pragma once

#include <cstdint>
#include <string>

#include "layout/property_bag.h"
#include "layout/script_writer.h"

namespace xal {

class CSInfo : public PropertyBag<CSInfo> {
 public:
  std::string sCaption;
  int32_t lType = 0;
  std::string sExpr;
  int16_t iWidth = 0;
  bool bLocked = false;
  std::string sValid;
  std::string sWhen;
  int16_t iPos = 0;
  bool bSkip = false;
  bool bRefresh = false;
  std::string sScript;
  int32_t lLinkFType = 0;
  int32_t lIDLinkForm = 0;
  std::string LinkXALIndex;

  // Appends the column set's lines (no Dim lines) to `sc` and returns the whole text.
  std::string GetScript(std::string& sc, int16_t Tabs) const;
  void WriteScript(ScriptWriter& w) const;
};

}  // namespace xal
