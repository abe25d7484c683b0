// DSInfo: the data sheet's script — its properties, its link, the cell grid, the column cells and
// the browsers, each array rebuilt in the variable DSVar and then assigned.
#include "layout/ds_info.h"

#include "layout/brow_info.h"
#include "layout/cell_info.h"

namespace xal {

Ref<LinkInfo> DSInfo::LnkInfo() {
  if (!link_) link_ = MakeRef<LinkInfo>();
  return link_;
}

bool DSInfo::AddLangString(const std::string& text, int32_t langID) {
  captions_.Add(text, langID);
  return false;
}

std::string DSInfo::GetScript(std::string& sc, int16_t Tabs) const {
  ScriptWriter w(sc, Tabs);
  WriteScript(w);
  return sc;
}

void DSInfo::WriteScript(ScriptWriter& w) const {
  using Row = ScriptRow<DSInfo>;
  static constexpr Row::Special kCaption = [](const DSInfo& d, ScriptWriter& out) {
    out.Text(".sCaption = \"", d.captions_.base());
    d.captions_.WriteLines(out);
  };
  static const Row kRows[] = {
      {".lID = ", &DSInfo::lID},
      {"", kCaption},
      {".lType = ", &DSInfo::lType},
      {".bList = True", &DSInfo::bList},
      {".bLocked = True", &DSInfo::bLocked},
      {".sExpr = \"", &DSInfo::sExpr},
      {".iPos = ", &DSInfo::iPos},
      {".iRows = ", &DSInfo::iRows},
      {".iCols = ", &DSInfo::iCols},
      {".iLHeight = ", &DSInfo::iLHeight},
      {".iBHeight = ", &DSInfo::iBHeight},
      {".iBSplitPos = ", &DSInfo::iBSplitPos},
      {".sProgname = \"", &DSInfo::sProgname},
      {".sColWidth = \"", &DSInfo::sColWidth},
      {".sValid = \"", &DSInfo::sValid},
      {".sWhen = \"", &DSInfo::sWhen},
      {".OnGetStyle=\"", &DSInfo::OnGetStyle},
      {".iLayout = ", &DSInfo::iLayout},
      {".bHeader = True", &DSInfo::bHeader},
      {".bBrowser = True", &DSInfo::bBrowser},
      {".iBrowmode = ", &DSInfo::iBrowmode},
      {".iListmode = ", &DSInfo::iListmode},
      {".sListmaster = \"", &DSInfo::sListmaster},
      {".sOnAddNew = \"", &DSInfo::sOnAddNew},
      {".sOnDelete = \"", &DSInfo::sOnDelete},
      {".SkipMaster = \"", &DSInfo::SkipMaster},
      {".bAltStyle = True", &DSInfo::bAltStyle},
      {".bMultiRow = True", &DSInfo::bMultiRow},
  };
  w.Dim("Dim CI As Object");
  w.Dim("Dim DSVar As Variant");
  WriteRows<DSInfo>(*this, kRows, w);
  WriteLinkBlock(w, link_.get());  // the field itself: writing never creates the link
  if (!aCells.IsEmpty()) WriteCellGrid(w);
  if (!aCS.IsEmpty()) {
    WriteCellList(w, aCS, "DSVar", "CI");
    w.Line(".aCS = DSVar");
  }
  if (!aBrow.IsEmpty()) WriteBrowsers(w);
}

// The grid keeps every cell at its row and column; holes and dynamic cells are left out and
// come back as Empty elements of the rebuilt array.
void DSInfo::WriteCellGrid(ScriptWriter& w) const {
  w.Blank();
  const SafeArray& grid = aCells.AsArray();
  const int32_t rows = grid.UBound(1), cols = grid.UBound(2);
  w.Line({"ReDim DSVar(", ScriptWriter::Decimal(rows), ",", ScriptWriter::Decimal(cols), ")"});
  w.Blank();
  for (int64_t r = 0; r <= rows; ++r) {
    for (int64_t c = 0; c <= cols; ++c) {
      const Cellinfo* cell = ElementAs<Cellinfo>(grid.At({static_cast<int32_t>(r), static_cast<int32_t>(c)}));
      if (!cell || cell->Dynamic) continue;
      w.NewObjectBlock("CI", "Cellinfo", [&](ScriptWriter& inner) { cell->WriteScript(inner); });
      w.Line({"Set DSVar(", ScriptWriter::Decimal(r), ",", ScriptWriter::Decimal(c), ") = CI"});
      w.Blank();
    }
  }
  w.Line(".aCells = DSVar");
}

// Browsers keep their own indices (no packing): a browser is never dynamic.
void DSInfo::WriteBrowsers(ScriptWriter& w) const {
  w.Blank();
  const SafeArray& browsers = aBrow.AsArray();
  const int32_t upper = browsers.UBound(1);
  w.Line({"ReDim DSVar(", ScriptWriter::Decimal(upper), ")"});
  w.Blank();
  for (int64_t i = 0; i <= upper; ++i) {
    const BrowInfo* browser = ElementAs<BrowInfo>(browsers.At({static_cast<int32_t>(i)}));
    if (!browser) continue;
    // The class name is written as the stored forms have it; the script language ignores case.
    w.NewObjectBlock("CI", "Browinfo", [&](ScriptWriter& inner) { browser->WriteScript(inner); });
    w.Line({"Set DSVar(", ScriptWriter::Decimal(i), ") = CI"});
    w.Blank();
  }
  w.Line(".aBrow = DSVar");
}

}  // namespace xal
