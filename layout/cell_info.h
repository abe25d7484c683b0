// Cellinfo: one cell of a form — a field of a document area, a label, a check box, a list, a link
// to another form, a memo (its CType). It holds the layout, the data binding (Expr, from which the
// identifier field xExpr and the many-to-many names are derived), the scripts the host runs on
// display, validation and change, an optional link, and the cell's run-time state on the open form.
// The data sheet and browser that own a cell hold it by reference in their arrays.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "collections/value_texts.h"
#include "layout/enums.h"
#include "layout/lang_strings.h"
#include "layout/link_info.h"
#include "layout/property_bag.h"
#include "layout/script_writer.h"
#include "runtime/variant.h"

namespace xal {

class Cellinfo : public PropertyBag<Cellinfo> {
 public:
  // ---- Plain fields, in interface order -------------------------------------------------------
  int32_t CType = ctText;  // cellTypes
  std::string AmountMode;
  std::string LangSuffix;
  bool Editable = false;
  std::string Text;
  bool isChanged = false;
  bool isEditing = false;
  int32_t LOID = 0;
  std::string OnDisplay;
  std::string Valid;
  std::string When;
  bool isValid = false;
  std::string OnGetStyle;
  int32_t Flags = cfNone;  // cellFlags bits
  bool FromList = false;
  std::string Mask;
  int16_t DataWidth = 0;
  int32_t DataType = 0;  // the host's data-type enumeration
  std::string Style;
  std::string FStyle;
  Variant RTSkip;
  Variant ItemArray;
  bool ItemsInitialized = false;
  bool RefreshItems = false;
  Ref<ValueTexts> ValueList;
  bool needRefresh = false;
  int32_t lastRefreshed = 0;
  std::string Script;
  int32_t LinkTypes = 0;
  bool showIDFields = false;
  bool selectFolders = false;
  int16_t Width = 0;
  int16_t Height = 0;
  int16_t DDWidth = 0;
  int32_t RT_DDWidth = 0;
  std::string Feature;
  bool Visible = true;  // the one field that does not start at its type's zero value
  bool Shrink = false;
  std::string ListLink;
  std::string ListSave;
  bool Dynamic = false;  // built by the form at run time: never written as script
  ObjectRef GridCol;
  std::string xExpr;
  Variant OldValue;
  Variant Value;
  int32_t TempCType = ctText;  // cellTypes
  std::string CDOrder;
  std::string CDFilter;
  std::string RowFilter;
  bool SkipN1 = false;
  bool NoUTFilter = false;
  int32_t InputFilterID = 0;
  std::string InputFilter;
  int16_t Row = 0;
  int16_t Col = 0;
  bool isDDLoaded = false;
  bool Required = false;
  int32_t DispCType = ctText;  // cellTypes
  bool isLongText = false;
  std::string ScriptName;
  std::string Description;

  // ---- Properties with logic ----------------------------------------------------------------------
  std::string ObjectName() const { return objectName_; }
  // Also marks the cell as linkable (LinkTypes 20480) when no link types are set yet.
  void SetObjectName(const std::string& name);
  // The run-time skip (RTSkip as a boolean) when one is set, else the stored flag.
  bool Skip() const;
  void SetSkip(bool skip) { skip_ = skip; }
  // The stored text, followed by LangSuffix for a translated list cell with a suffix "_???".
  std::string ListShow() const;
  void SetListShow(const std::string& text) { listShow_ = text; }
  // The field the cell shows: the stored expression, adjusted by type (AmountMode for currency
  // data, LangSuffix for translated cells, the language text for labels).
  std::string Expr() const;
  // Stores the binding and derives xExpr from it; a label with a language set stores later texts
  // per language instead.
  void SetExpr(const std::string& value);
  std::string Caption() const { return captions_.Caption(langID_); }
  void SetCaption(const std::string& text) { captions_.PutCaption(text, langID_); }

  // Pass-throughs to the link object, which each of them creates when there is none.
  std::string LinkFilter() { return LnkInfo()->LinkFilter; }
  void SetLinkFilter(const std::string& filter);  // a change (in any letter case) sets needRefresh
  std::string LinkOrder() { return LnkInfo()->LinkOrder; }
  void SetLinkOrder(const std::string& order);    // likewise
  std::string LinkQuery() { return LnkInfo()->LinkQuery; }
  void SetLinkQuery(const std::string& query) { LnkInfo()->LinkQuery = query; }
  Ref<LinkInfo> LnkInfo();
  void SetLnkInfo(const Ref<LinkInfo>& link) { link_ = link; }
  std::string LinkXALIndex() { return LnkInfo()->FormXALIndex; }
  void SetLinkXALIndex(const std::string& index) { LnkInfo()->FormXALIndex = index; }
  int32_t IDLinkForm() { return LnkInfo()->FormID; }
  void SetIDLinkForm(int32_t) {}  // read-only in effect; the interface accepts the assignment
  int32_t LinkFType() { return LnkInfo()->FormType; }
  void SetLinkFType(int32_t type) { LnkInfo()->FormType = type; }

  int32_t LangID() const { return langID_; }
  void SetLangID(int32_t langID);  // a new language invalidates the suffix of a translated cell
  int32_t Translated() const { return translated_; }
  void SetTranslated(int32_t mode);  // cellTrans
  // Always False, as the interface has it.
  bool AddLangString(const std::string& text, int32_t langID);

  std::string GetScript(std::string& sc, int16_t Tabs) const;
  void WriteScript(ScriptWriter& w) const;

  std::string Valuefilter() const { return valuefilter_; }
  void SetValuefilter(const std::string& filter) { valuefilter_ = filter; }

  // Many-to-many names, derived from the expression on the first read after each write of Expr.
  std::string NN_DataFld() { return DeriveNN().dataFld; }
  std::string NN_DataIDFld() { return DeriveNN().dataIDFld; }
  std::string NN_RelTable() { return DeriveNN().relTable; }
  std::string NN_RelIDFld() { return DeriveNN().relIDFld; }
  std::string NN_RelNIDFld() { return DeriveNN().relNIDFld; }

  // The stored expression, without the adjustments of Expr.
  const std::string& StoredExpr() const { return expr_; }

 private:
  struct NNNames {
    std::string dataFld, dataIDFld, relTable, relIDFld, relNIDFld;
  };
  const NNNames& DeriveNN();
  std::string WithAmountMode(const std::string& expr) const;
  bool HasLangSuffix() const;

  std::string expr_;
  int32_t langID_ = 0;
  LangStrings captions_;  // the base caption and the per-language texts
  int32_t translated_ = ctrNone;
  bool skip_ = false;
  std::string objectName_;
  std::string listShow_;
  Ref<LinkInfo> link_;
  std::string valuefilter_;
  NNNames nn_;
  bool nnDerived_ = false;
};

// The column cells of a data sheet or browser: a blank line, "ReDim <arrayVar>(<upper bound>)", a
// blank line, then each cell that is neither empty nor Dynamic as a new object in <cellVar>, stored
// at the next packed index from 0. The caller writes the assignment of the array that follows.
// Raises error 13 for a non-array or an element that is not a Cellinfo.
void WriteCellList(ScriptWriter& w, const Variant& cells, std::string_view arrayVar, std::string_view cellVar);

}  // namespace xal
