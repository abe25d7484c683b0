// CSInfo: the column set's script lines, every written field in interface order. A column set has
// no arrays and no link object of its own, so its text is a flat list of assignments.
#include "layout/cs_info.h"

namespace xal {

std::string CSInfo::GetScript(std::string& sc, int16_t Tabs) const {
  ScriptWriter w(sc, Tabs);
  WriteScript(w);
  return sc;
}

void CSInfo::WriteScript(ScriptWriter& w) const {
  using Row = ScriptRow<CSInfo>;
  static const Row kRows[] = {
      {".sCaption = \"", &CSInfo::sCaption},
      {".lType = ", &CSInfo::lType},
      {".sExpr = \"", &CSInfo::sExpr},
      {".iWidth = ", &CSInfo::iWidth},
      {".bLocked = True", &CSInfo::bLocked},
      {".sValid = \"", &CSInfo::sValid},
      {".sWhen = \"", &CSInfo::sWhen},
      {".iPos = ", &CSInfo::iPos},
      {".bSkip = True", &CSInfo::bSkip},
      {".bRefresh = True", &CSInfo::bRefresh},
      {".sScript = \"", &CSInfo::sScript},
      {".lLinkFType = ", &CSInfo::lLinkFType},
      {".LinkXALIndex = \"", &CSInfo::LinkXALIndex},
      {".lIDLinkForm = ", &CSInfo::lIDLinkForm},
  };
  WriteRows<CSInfo>(*this, kRows, w);
}

}  // namespace xal
