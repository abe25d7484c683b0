// SheetInfo: the sheet's link (created on first read), its language strings and its script lines:
// caption, flags and texts, then the link block.
#include "layout/sheet_info.h"

namespace xal {

Ref<LinkInfo> SheetInfo::LnkInfo() {
  if (!link_) link_ = MakeRef<LinkInfo>();
  return link_;
}

bool SheetInfo::AddLangString(const std::string& text, int32_t langID) {
  captions_.Add(text, langID);
  return false;
}

std::string SheetInfo::GetScript(std::string& sc, int16_t Tabs) const {
  ScriptWriter w(sc, Tabs);
  WriteScript(w);
  return sc;
}

// sClone, aDS and the run-time flags stay out of the script.
void SheetInfo::WriteScript(ScriptWriter& w) const {
  using Row = ScriptRow<SheetInfo>;
  static constexpr Row::Special kCaption = [](const SheetInfo& s, ScriptWriter& out) {
    out.Text(".sCaption = \"", s.captions_.base());
    s.captions_.WriteLines(out);
  };
  static const Row kRows[] = {
      {"", kCaption},
      {".bLocked = True", &SheetInfo::bLocked},
      {".sExpr = \"", &SheetInfo::sExpr},
      {".sFilter = \"", &SheetInfo::sFilter},
      {".sOrder = \"", &SheetInfo::sOrder},
      {".sScript = \"", &SheetInfo::sScript},
  };
  w.Dim("Dim SIVar As Variant");
  WriteRows<SheetInfo>(*this, kRows, w);
  WriteLinkBlock(w, link_.get());
}

}  // namespace xal
