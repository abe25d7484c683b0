// MDInfo: the form's script, one sheet after the other in the variable MDVar. Sheets are reached by
// name, as the form has always called them, so the form does not depend on the sheet's class.
#include "layout/md_info.h"

#include <vector>

#include "runtime/convert.h"
#include "runtime/dispatch.h"

namespace xal {

namespace {

// The sheet writes itself by name with the text so far; the text it returns is the text from then on.
void WriteSheet(ScriptWriter& w, const Variant& sheet) {
  if (!sheet.IsObject()) Raise(kErrObjectRequired);
  std::vector<Variant> args{Variant(w.text()), Variant(w.tabs())};
  Variant result = Invoke(sheet.AsObject(), "GetScript", MemberKind::Method, args);
  w.text() = CStr(result);
}

}  // namespace

std::string MDInfo::GetScript(std::string& sc, int16_t Tabs) const {
  ScriptWriter w(sc, Tabs);
  WriteScript(w);
  return sc;
}

void MDInfo::WriteScript(ScriptWriter& w) const {
  w.Dim("Dim SI As Object");
  w.Dim("Dim MDVar As Variant");
  if (aSI.IsEmpty()) return;
  w.Blank();
  const SafeArray& sheets = aSI.AsArray();
  const int32_t upper = sheets.UBound(1);
  w.Line({"ReDim MDVar(", ScriptWriter::Decimal(upper), ")"});
  w.Blank();
  for (int64_t i = 0; i <= upper; ++i) {
    const Variant& sheet = sheets.At({static_cast<int32_t>(i)});
    if (sheet.IsEmpty()) continue;
    w.NewObjectBlock("SI", "SheetInfo", [&](ScriptWriter& inner) { WriteSheet(inner, sheet); });
    w.Line({"Set MDVar(", ScriptWriter::Decimal(i), ") = SI"});
    w.Blank();
  }
  w.Line(".aSI = MDVar");
}

}  // namespace xal
