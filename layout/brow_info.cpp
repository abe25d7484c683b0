// BrowInfo: how many columns a browser has, and its script lines — its properties, then its
// column cells rebuilt in the variable aVar with packed indices.
#include "layout/brow_info.h"

#include "layout/cell_info.h"

namespace xal {

int32_t BrowInfo::ColCount() const {
  if (!CIArray.IsArray()) return 0;
  int32_t count = 0;
  for (const Variant& element : CIArray.AsArray().Elements()) {
    if (element.IsEmpty()) break;
    ++count;
  }
  return count;
}

bool BrowInfo::AddLangString(const std::string& text, int32_t langID) {
  captions_.Add(text, langID);
  return false;
}

std::string BrowInfo::GetScript(std::string& sc, int16_t Tabs) const {
  ScriptWriter w(sc, Tabs);
  WriteScript(w);
  return sc;
}

void BrowInfo::WriteScript(ScriptWriter& w) const {
  using Row = ScriptRow<BrowInfo>;
  static constexpr Row::Special kCaption = [](const BrowInfo& b, ScriptWriter& out) {
    out.Text(".Caption = \"", b.captions_.base());
    b.captions_.WriteLines(out);
  };
  static const Row kRows[] = {
      {".LOID = ", &BrowInfo::LOID},
      {"", kCaption},
      {".Expr = \"", &BrowInfo::Expr},
      {".DataFilter = \"", &BrowInfo::DataFilter},
      {".DataOrder = \"", &BrowInfo::DataOrder},
      {".Locked = True", &BrowInfo::Locked},
      {".Valid = \"", &BrowInfo::Valid},
      {".OnGetStyle=\"", &BrowInfo::OnGetStyle},
      {".When = \"", &BrowInfo::When},
      {".Pos = ", &BrowInfo::Pos},
      {".Progname = \"", &BrowInfo::ProgName},
      {".AltStyle = True", &BrowInfo::AltStyle},
      {".MultiRow = True", &BrowInfo::MultiRow},
      {".Master = \"", &BrowInfo::Master},
      {".SkipMaster = \"", &BrowInfo::SkipMaster},
      {".OnAddNew = \"", &BrowInfo::OnAddNew},
      {".OnDelete = \"", &BrowInfo::OnDelete},
      {".TreeSrc = \"", &BrowInfo::TreeSrc},
      {".TreeName = \"", &BrowInfo::TreeName},
      {".TreeFields = \"", &BrowInfo::TreeFields},
  };
  w.Dim("Dim BI As Object");
  w.Dim("Dim aVar As Variant");
  WriteRows<BrowInfo>(*this, kRows, w);
  if (CIArray.IsEmpty()) return;
  WriteCellList(w, CIArray, "aVar", "BI");
  w.Line(".CIArray = aVar");
}

}  // namespace xal
