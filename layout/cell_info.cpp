// Cellinfo: the derived names of a cell's binding, its type-dependent expression, its language
// and translation state, and its script lines.
#include "layout/cell_info.h"

#include <array>
#include <string_view>
#include <utility>
#include <vector>

#include "runtime/text.h"

namespace xal {

namespace {

// Person tables live in the ER area but their identifiers in the WR area, so a field reached
// through one of them is identified by the WR name.
constexpr std::array<std::pair<std::string_view, std::string_view>, 3> kIDFieldOfTable{{
    {"ERPerson", "IDWRPerson"},
    {"ERDisability", "IDWRDisability"},
    {"ERJob", "IDWRJob"},
}};

// Link types a cell gets when it is given an object to link to and has no link types yet.
constexpr int32_t kObjectLinkTypes = 20480;

// The identifier field behind a binding:
//  1. "@" pseudo-fields and names without a "." are their own identifier.
//  2. "Link_T.F" names the link table T itself.
//  3. "T.F" is identified by "ID" & T (with the person-table exceptions above).
//  4. "T.L.F" (two or more dots) by the link field "T.ID" of the first table.
std::string IDFieldOf(const std::string& expr) {
  const int32_t dot = InStr(expr, ".");
  if (Left(expr, 1) == "@" || dot == 0) return expr;
  if (TextEquals(Left(expr, 5), "Link_")) return Mid(expr, 6, dot - 6);
  if (InStr(dot + 1, expr, ".") != 0) return Left(expr, dot) + "ID";
  const std::string table = Left(expr, dot - 1);
  for (const auto& [name, idField] : kIDFieldOfTable)
    if (TextEquals(table, name)) return std::string(idField);
  return "ID" + table;
}

}  // namespace

// ---------------------------------------------------------------------------------------------
// Binding
// ---------------------------------------------------------------------------------------------

void Cellinfo::SetExpr(const std::string& value) {
  nnDerived_ = false;
  if (langID_ == 0 || CType != ctText) {
    expr_ = value;
    xExpr = IDFieldOf(value);
    return;
  }
  // A label shows text, not a field: once it has one, later texts are that text in the cell's
  // current language.
  if (!expr_.empty())
    AddLangString(value, langID_);
  else
    expr_ = value;
  xExpr = value;
}

std::string Cellinfo::Expr() const {
  if (CType == ctText) {
    const std::string text = captions_.Translation(langID_);
    return text.empty() ? expr_ : text;
  }
  if (translated_ == ctrNone || CType == ctList) return WithAmountMode(expr_);
  return HasLangSuffix() ? expr_ + LangSuffix : expr_;
}

// Currency fields come in three currencies (Amount, AmountBase, AmountRef); AmountMode picks one
// by being put in front of the last "Amount" of the name, or in front of the whole name.
std::string Cellinfo::WithAmountMode(const std::string& expr) const {
  if (CType == ctCurData) {
    const int32_t at = InStrRev(expr, "Amount", -1, CompareMode::Text);
    if (at > 1) return Left(expr, at - 1) + AmountMode + Mid(expr, at);
    return AmountMode + expr;
  }
  if (CType == ctRefCurData && TextEquals(AmountMode, "REF")) return "REF" + expr;
  return expr;
}

bool Cellinfo::HasLangSuffix() const { return Like(LangSuffix, "_???"); }

// The names a many-to-many cell needs, from a binding "T.F" or "T.L.F" and the Valuefilter V:
// the data field filtered by T[.L].V, the identifier field T[.L].ID under the same filter, the
// relation table T, its identifier filtered, and "ID" & the second part after the replacements.
const Cellinfo::NNNames& Cellinfo::DeriveNN() {
  if (nnDerived_) return nn_;
  std::vector<std::string> parts = Split(expr_, ".");
  if (parts.size() == 2 || parts.size() == 3) {
    parts.back() = valuefilter_;
    const std::string filter = Join(parts, ".");
    parts.back() = "ID";
    const std::string idField = Join(parts, ".");
    nn_.dataFld = "FILTER(" + expr_ + ";" + filter + ")";
    nn_.dataIDFld = "FILTER(" + idField + ";" + filter + ")";
    nn_.relTable = parts[0];
    nn_.relIDFld = "FILTER(" + parts[0] + ".ID;" + filter + ")";
    nn_.relNIDFld = "ID" + parts[1];
  } else {
    nn_ = NNNames{expr_, xExpr, {}, {}, {}};
  }
  nnDerived_ = true;
  return nn_;
}

// ---------------------------------------------------------------------------------------------
// Names, language and link
// ---------------------------------------------------------------------------------------------

void Cellinfo::SetObjectName(const std::string& name) {
  objectName_ = name;
  if (LinkTypes == 0) LinkTypes = kObjectLinkTypes;
}

bool Cellinfo::Skip() const { return RTSkip.IsEmpty() ? skip_ : CBool(RTSkip); }

std::string Cellinfo::ListShow() const {
  if (translated_ != ctrNone && CType == ctList && HasLangSuffix()) return listShow_ + LangSuffix;
  return listShow_;
}

// "*" marks the suffix of a translated cell as stale: the host works out the real one.
void Cellinfo::SetLangID(int32_t langID) {
  if (langID != langID_ && translated_ != ctrNone) LangSuffix = "*";
  langID_ = langID;
}

void Cellinfo::SetTranslated(int32_t mode) {
  if (mode == ctrNone)
    LangSuffix.clear();
  else if (mode != translated_)
    LangSuffix = "*";
  translated_ = mode;
}

bool Cellinfo::AddLangString(const std::string& text, int32_t langID) {
  captions_.Add(text, langID);
  return false;
}

Ref<LinkInfo> Cellinfo::LnkInfo() {
  if (!link_) link_ = MakeRef<LinkInfo>();
  return link_;
}

void Cellinfo::SetLinkFilter(const std::string& filter) {
  Ref<LinkInfo> link = LnkInfo();
  if (TextEquals(link->LinkFilter, filter)) return;
  link->LinkFilter = filter;
  needRefresh = true;
}

void Cellinfo::SetLinkOrder(const std::string& order) {
  Ref<LinkInfo> link = LnkInfo();
  if (TextEquals(link->LinkOrder, order)) return;
  link->LinkOrder = order;
  needRefresh = true;
}

// ---------------------------------------------------------------------------------------------
// Script
// ---------------------------------------------------------------------------------------------

std::string Cellinfo::GetScript(std::string& sc, int16_t Tabs) const {
  ScriptWriter w(sc, Tabs);
  WriteScript(w);
  return sc;
}

// A cell writes "=" without blanks (but for CType) and only what a stored form keeps: its
// run-time state, AmountMode, Visible and the data type are not written.
void Cellinfo::WriteScript(ScriptWriter& w) const {
  using Row = ScriptRow<Cellinfo>;
  static constexpr Row::Special kCType = [](const Cellinfo& c, ScriptWriter& out) {
    out.Line({".CType = ", ScriptWriter::Decimal(c.CType)});  // written even when 0
  };
  static constexpr Row::Special kDDWidth = [](const Cellinfo& c, ScriptWriter& out) {
    if (c.DDWidth > 100) out.Number(".DDWidth=", c.DDWidth);  // up to 100 is the default width
  };
  static constexpr Row::Special kCaption = [](const Cellinfo& c, ScriptWriter& out) {
    out.Text(".Caption=\"", c.captions_.base());
  };
  static constexpr Row::Special kLangStrings = [](const Cellinfo& c, ScriptWriter& out) {
    c.captions_.WriteLines(out);
  };
  static constexpr Row::Special kListLines = [](const Cellinfo& c, ScriptWriter& out) {
    if (c.CType != ctList) return;
    out.Text(".ListLink=\"", c.ListLink);
    out.Text(".ListShow=\"", c.listShow_);  // the stored text: the suffix is the host's business
    out.Text(".ListSave=\"", c.ListSave);
  };
  static const Row kRows[] = {
      {"", kCType},
      {".Expr=\"", &Cellinfo::expr_},
      {".Editable=True", &Cellinfo::Editable},
      {".LOID=", &Cellinfo::LOID},
      {".Valid=\"", &Cellinfo::Valid},
      {".When=\"", &Cellinfo::When},
      {".OnGetStyle=\"", &Cellinfo::OnGetStyle},
      {".Flags=", &Cellinfo::Flags},
      {".Mask=\"", &Cellinfo::Mask},
      {".Style=\"", &Cellinfo::Style},
      {".FStyle=\"", &Cellinfo::FStyle},
      {".Skip=True", &Cellinfo::skip_},  // the stored flag, not the run-time one
      {".RefreshItems=True", &Cellinfo::RefreshItems},
      {".Script=\"", &Cellinfo::Script},
      {".OnDisplay=\"", &Cellinfo::OnDisplay},
      {".Width=", &Cellinfo::Width},
      {"", kDDWidth},
      {".Height=", &Cellinfo::Height},
      {"", kCaption},
      {".Feature=\"", &Cellinfo::Feature},
      {".NoUTFilter=True", &Cellinfo::NoUTFilter},
      {"", kLangStrings},
      {".Translated=", &Cellinfo::translated_},
      {".ValueFilter=\"", &Cellinfo::valuefilter_},
      {".ScriptName=\"", &Cellinfo::ScriptName},
      {"", kListLines},
  };
  WriteRows<Cellinfo>(*this, kRows, w);
  WriteLinkBlock(w, link_.get());
}


void WriteCellList(ScriptWriter& w, const Variant& cells, std::string_view arrayVar, std::string_view cellVar) {
  w.Blank();
  const SafeArray& array = cells.AsArray();
  const int32_t upper = array.UBound(1);
  w.Line({"ReDim ", arrayVar, "(", ScriptWriter::Decimal(upper), ")"});
  w.Blank();
  int32_t packed = 0;  // dynamic cells and holes leave no gap in the written indices
  for (int64_t i = 0; i <= upper; ++i) {
    const Cellinfo* cell = ElementAs<Cellinfo>(array.At({static_cast<int32_t>(i)}));
    if (!cell || cell->Dynamic) continue;
    w.NewObjectBlock(cellVar, "Cellinfo", [&](ScriptWriter& inner) { cell->WriteScript(inner); });
    w.Line({"Set ", arrayVar, "(", ScriptWriter::Decimal(packed), ") = ", cellVar});
    w.Blank();
    ++packed;
  }
}

}  // namespace xal
