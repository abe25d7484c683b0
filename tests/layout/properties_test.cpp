// The properties of the layout definitions that carry logic: a cell's binding and the names
// derived from it, its type-dependent expression, skip, object name, list text, language and
// translation state, link pass-throughs; captions per language; LinkInfo.Value and Clone;
// BrowInfo.ColCount; the type-library entries and enumerations.
#include <gtest/gtest.h>

#include "layout/brow_info.h"
#include "layout/cell_info.h"
#include "layout/ds_info.h"
#include "layout/link_info.h"
#include "layout/sheet_info.h"
#include "layout_test_util.h"
#include "runtime/dispatch.h"

namespace xal {
namespace {

using testing::ErrorOf;
using testing::Vec;

// ---------------------------------------------------------------------------------------------
// Cellinfo.Expr and xExpr
// ---------------------------------------------------------------------------------------------

TEST(CellExpr, WritingDerivesTheIdentifierField) {
  struct Case {
    const char* expr;
    const char* xExpr;
  };
  const Case cases[] = {
      {"GRCompany.Name", "IDGRCompany"},
      {"Link_GRArticle.Code", "GRArticle"},
      {"LINK_GRArticle.Code", "GRArticle"},         // the prefix in any case
      {"Link_A.B.C", "A"},                           // the link rule comes before the dot count
      {"GDocument.GRCompany.Name", "GDocument.ID"},  // two or more dots: the first table's ID
      {"A.B.C.D", "A.ID"},
      {"@UnitPrice", "@UnitPrice"},
      {"@A.B.C", "@A.B.C"},  // pseudo-fields are copied, dots and all
      {"ERJob.Name", "IDWRJob"},
      {"erjob.Anything", "IDWRJob"},
      {"ERPerson.Code", "IDWRPerson"},
      {"ERDisability.Kind", "IDWRDisability"},
      {"ERJob.A.B", "ERJob.ID"},  // the person mapping is for one dot only
      {"ERJobs.Name", "IDERJobs"},
      {"Quantity", "Quantity"},
      {"", ""},
      {".Name", "ID"},  // an empty table before the dot
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.expr);
    Cellinfo cell;
    cell.CType = ctData;
    cell.xExpr = "stale";
    cell.SetExpr(c.expr);
    EXPECT_EQ(cell.xExpr, c.xExpr);
    EXPECT_EQ(cell.Expr(), c.expr);
  }
}

TEST(CellExpr, LabelWithLanguageKeepsTextsPerLanguage) {
  Cellinfo label;  // ctText
  label.SetLangID(4);
  label.SetExpr("Kogus");  // nothing stored yet: this is the expression
  EXPECT_EQ(label.StoredExpr(), "Kogus");
  EXPECT_EQ(label.xExpr, "Kogus");
  label.SetExpr("Hulk");  // now stored for language 4
  EXPECT_EQ(label.StoredExpr(), "Kogus");
  EXPECT_EQ(label.xExpr, "Hulk");
  EXPECT_EQ(label.Expr(), "Hulk");
  label.SetLangID(3);
  label.SetExpr("Quantity");
  EXPECT_EQ(label.Expr(), "Quantity");
  label.SetLangID(5);
  EXPECT_EQ(label.Expr(), "Quantity");  // third language falls back to English
  label.SetLangID(0);
  EXPECT_EQ(label.Expr(), "Kogus");

  // With LangID 0 every write replaces the expression; so does any write to a non-text cell.
  Cellinfo data;
  data.CType = ctData;
  data.SetLangID(4);
  data.SetExpr("A.B");
  data.SetExpr("C.D");
  EXPECT_EQ(data.StoredExpr(), "C.D");
  EXPECT_EQ(data.xExpr, "IDC");
}

TEST(CellExpr, ReadingAdjustsByCellType) {
  struct Case {
    const char* name;
    int32_t type;
    int32_t translated;
    const char* amountMode;
    const char* langSuffix;
    const char* expr;
    const char* read;
  };
  const Case cases[] = {
      {"currency: mode before the last Amount", ctCurData, ctrNone, "Base", "", "RowAmount", "RowBaseAmount"},
      {"currency: the last of two", ctCurData, ctrNone, "Base", "", "AmountX.Amount", "AmountX.BaseAmount"},
      {"currency: Amount in any case", ctCurData, ctrNone, "Base", "", "rowamount", "rowBaseamount"},
      {"currency: Amount at position 1", ctCurData, ctrNone, "Base", "", "Amount", "BaseAmount"},
      {"currency: no Amount", ctCurData, ctrNone, "Ref", "", "Qty", "RefQty"},
      {"currency, translated: suffix instead of mode", ctCurData, ctrOnRead, "Base", "_eng", "Amount", "Amount_eng"},
      {"ref currency with REF", ctRefCurData, ctrNone, "REF", "", "Sum", "REFSum"},
      {"ref currency with ref", ctRefCurData, ctrNone, "ref", "", "Sum", "REFSum"},
      {"ref currency otherwise", ctRefCurData, ctrNone, "Base", "", "Sum", "Sum"},
      {"other types unchanged", ctData, ctrNone, "Base", "_eng", "Name", "Name"},
      {"translated: suffix _???", ctData, ctrOnRead, "", "_eng", "Name", "Name_eng"},
      {"translated: stale suffix", ctData, ctrOnRW, "", "*", "Name", "Name"},
      {"translated: two-letter suffix", ctData, ctrOnRead, "", "_en", "Name", "Name"},
      {"translated list: no suffix", ctList, ctrOnRead, "Base", "_eng", "Name", "Name"},
      {"text cell: stored expression", ctText, ctrOnRead, "Base", "_eng", "Label", "Label"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    Cellinfo cell;
    cell.CType = c.type;
    cell.SetExpr(c.expr);
    cell.SetTranslated(c.translated);
    cell.AmountMode = c.amountMode;
    cell.LangSuffix = c.langSuffix;
    EXPECT_EQ(cell.Expr(), c.read);
  }
}

// ---------------------------------------------------------------------------------------------
// Many-to-many names
// ---------------------------------------------------------------------------------------------

TEST(CellNN, NamesFromTheBinding) {
  struct Case {
    const char* expr;
    const char* dataFld;
    const char* dataIDFld;
    const char* relTable;
    const char* relIDFld;
    const char* relNIDFld;
  };
  const Case cases[] = {
      {"A.B.C", "FILTER(A.B.C;A.B.V)", "FILTER(A.B.ID;A.B.V)", "A", "FILTER(A.ID;A.B.V)", "IDB"},
      {"A.B", "FILTER(A.B;A.V)", "FILTER(A.ID;A.V)", "A", "FILTER(A.ID;A.V)", "IDID"},
      {"Name", "Name", "Name", "", "", ""},                  // one part: the expression and xExpr
      {"A.B.C.D", "A.B.C.D", "A.ID", "", "", ""},            // four parts likewise
      {"", "", "", "", "", ""},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.expr);
    Cellinfo cell;
    cell.CType = ctNNData;
    cell.SetValuefilter("V");
    cell.SetExpr(c.expr);
    EXPECT_EQ(cell.NN_DataFld(), c.dataFld);
    EXPECT_EQ(cell.NN_DataIDFld(), c.dataIDFld);
    EXPECT_EQ(cell.NN_RelTable(), c.relTable);
    EXPECT_EQ(cell.NN_RelIDFld(), c.relIDFld);
    EXPECT_EQ(cell.NN_RelNIDFld(), c.relNIDFld);
  }
}

TEST(CellNN, DerivedOnceAfterEachWriteOfExpr) {
  Cellinfo cell;
  cell.CType = ctNNLink;
  cell.SetValuefilter("V");
  cell.SetExpr("A.B.C");
  EXPECT_EQ(cell.NN_DataFld(), "FILTER(A.B.C;A.B.V)");
  cell.SetValuefilter("W");  // no new derivation until Expr is written
  EXPECT_EQ(cell.NN_RelIDFld(), "FILTER(A.ID;A.B.V)");
  cell.SetExpr("A.B.C");
  EXPECT_EQ(cell.NN_RelIDFld(), "FILTER(A.ID;A.B.W)");
}

// ---------------------------------------------------------------------------------------------
// Skip, ObjectName, ListShow, LangID, Translated
// ---------------------------------------------------------------------------------------------

TEST(CellState, SkipPrefersTheRunTimeValue) {
  Cellinfo cell;
  EXPECT_FALSE(cell.Skip());
  cell.SetSkip(true);
  EXPECT_TRUE(cell.Skip());
  cell.RTSkip = Variant(0);
  EXPECT_FALSE(cell.Skip());
  cell.RTSkip = Variant("True");
  cell.SetSkip(false);
  EXPECT_TRUE(cell.Skip());
  EXPECT_EQ(cell.RTSkip, Variant("True"));  // put leaves the run-time value alone
  cell.RTSkip = Variant("abc");
  EXPECT_EQ(ErrorOf([&] { cell.Skip(); }), kErrTypeMismatch);
}

TEST(CellState, ObjectNameSetsLinkTypesOnlyWhenUnset) {
  Cellinfo cell;
  cell.SetObjectName("GRCompany");
  EXPECT_EQ(cell.ObjectName(), "GRCompany");
  EXPECT_EQ(cell.LinkTypes, 20480);
  Cellinfo other;
  other.LinkTypes = 5;
  other.SetObjectName("X");
  EXPECT_EQ(other.LinkTypes, 5);
}

TEST(CellState, ListShowSuffixForTranslatedLists) {
  Cellinfo cell;
  cell.CType = ctList;
  cell.SetListShow("Name");
  EXPECT_EQ(cell.ListShow(), "Name");  // not translated
  cell.SetTranslated(ctrOnRead);
  cell.LangSuffix = "_est";
  EXPECT_EQ(cell.ListShow(), "Name_est");
  cell.LangSuffix = "_e\xC3\xB5t";  // three characters, one of them two bytes long
  EXPECT_EQ(cell.ListShow(), "Name_e\xC3\xB5t");
  cell.LangSuffix = "est";
  EXPECT_EQ(cell.ListShow(), "Name");
  cell.LangSuffix = "_est";
  cell.CType = ctCombo;
  EXPECT_EQ(cell.ListShow(), "Name");
}

TEST(CellState, LanguageAndTranslationMarkTheSuffix) {
  Cellinfo cell;
  cell.LangSuffix = "_eng";
  cell.SetLangID(4);  // not translated: the suffix stays
  EXPECT_EQ(cell.LangSuffix, "_eng");
  EXPECT_EQ(cell.LangID(), 4);

  cell.SetTranslated(ctrOnRead);  // from none to a mode
  EXPECT_EQ(cell.LangSuffix, "*");
  cell.LangSuffix = "_eng";
  cell.SetTranslated(ctrOnRead);  // the same mode again changes nothing
  EXPECT_EQ(cell.LangSuffix, "_eng");
  cell.SetLangID(4);  // the same language
  EXPECT_EQ(cell.LangSuffix, "_eng");
  cell.SetLangID(3);  // another language
  EXPECT_EQ(cell.LangSuffix, "*");
  cell.LangSuffix = "_eng";
  cell.SetTranslated(ctrOnRW);
  EXPECT_EQ(cell.LangSuffix, "*");
  cell.SetTranslated(ctrNone);
  EXPECT_EQ(cell.LangSuffix, "");
  EXPECT_EQ(cell.Translated(), ctrNone);
}

TEST(CellState, NewCellIsVisibleAndOtherwiseEmpty) {
  Cellinfo cell;
  EXPECT_TRUE(cell.Visible);
  EXPECT_EQ(cell.CType, ctText);
  EXPECT_FALSE(cell.Editable);
  EXPECT_TRUE(cell.Value.IsEmpty());
  EXPECT_EQ(cell.ValueList, nullptr);
  EXPECT_EQ(cell.Caption(), "");
}

// ---------------------------------------------------------------------------------------------
// Link pass-throughs
// ---------------------------------------------------------------------------------------------

TEST(CellLink, FilterAndOrderMarkARefreshOnlyWhenTheyChange) {
  Cellinfo cell;
  cell.SetLinkFilter("a=1");
  EXPECT_TRUE(cell.needRefresh);
  EXPECT_EQ(cell.LnkInfo()->LinkFilter, "a=1");
  cell.needRefresh = false;
  cell.SetLinkFilter("A=1");  // equal in another letter case
  EXPECT_FALSE(cell.needRefresh);
  EXPECT_EQ(cell.LinkFilter(), "a=1");
  cell.SetLinkOrder("Code");
  EXPECT_TRUE(cell.needRefresh);
  cell.needRefresh = false;
  cell.SetLinkOrder("CODE");
  EXPECT_FALSE(cell.needRefresh);
  cell.SetLinkOrder("Name");
  EXPECT_TRUE(cell.needRefresh);
  EXPECT_EQ(cell.LinkOrder(), "Name");

  cell.needRefresh = false;
  cell.SetLinkQuery("q");  // no refresh test for the query
  EXPECT_FALSE(cell.needRefresh);
  EXPECT_EQ(cell.LnkInfo()->LinkQuery, "q");
  cell.SetLinkXALIndex("IDX");
  EXPECT_EQ(cell.LnkInfo()->FormXALIndex, "IDX");
  cell.SetLinkFType(7);
  EXPECT_EQ(cell.LnkInfo()->FormType, 7);
  EXPECT_EQ(cell.LinkFType(), 7);
  cell.LnkInfo()->FormID = 12;
  cell.SetIDLinkForm(99);  // no effect
  EXPECT_EQ(cell.IDLinkForm(), 12);
}

TEST(CellLink, ReadingAPassThroughCreatesTheLink) {
  for (const auto& read : std::vector<std::function<void(Cellinfo&)>>{
           [](Cellinfo& c) { c.LinkFilter(); }, [](Cellinfo& c) { c.LinkOrder(); },
           [](Cellinfo& c) { c.LinkQuery(); }, [](Cellinfo& c) { c.LinkXALIndex(); },
           [](Cellinfo& c) { c.IDLinkForm(); }, [](Cellinfo& c) { c.LinkFType(); }}) {
    Cellinfo cell;
    read(cell);
    std::string sc;
    EXPECT_EQ(cell.GetScript(sc, 0), ".CType = 0\r\nWith .LnkInfo\r\nEnd With\r\n");
  }
  Cellinfo cell;
  cell.SetIDLinkForm(3);  // a write that has no effect creates nothing either
  std::string sc;
  EXPECT_EQ(cell.GetScript(sc, 0), ".CType = 0\r\n");
}

TEST(CellLink, AssignedLinkIsSharedNotCopied) {
  auto link = MakeRef<LinkInfo>();
  Cellinfo cell;
  cell.SetLnkInfo(link);
  cell.SetLinkXALIndex("X");
  EXPECT_EQ(link->FormXALIndex, "X");
  EXPECT_EQ(cell.LnkInfo(), link);
}

TEST(DataSheetLink, PassThroughs) {
  DSInfo ds;
  ds.SetLinkXALIndex("A");
  EXPECT_EQ(ds.XALFormIndex(), "A");
  ds.SetXALFormIndex("B");
  EXPECT_EQ(ds.LinkXALIndex(), "B");
  ds.LnkInfo()->FormID = 42;
  ds.SetlIDLinkForm(1);
  ds.SetlIDXALForms(2);
  EXPECT_EQ(ds.lIDLinkForm(), 42);
  EXPECT_EQ(ds.lIDXALForms(), 42);
  EXPECT_TRUE(ds.Prop("anything").IsEmpty());
  ds.SetProp("anything", Variant(5));
  EXPECT_TRUE(ds.Prop("anything").IsEmpty());

  SheetInfo sheet;
  sheet.SetXALFormIndex("S");
  EXPECT_EQ(sheet.LnkInfo()->FormXALIndex, "S");
  sheet.SetlIDXALForms(3);
  EXPECT_EQ(sheet.lIDXALForms(), 0);

  // Writing the number alone creates no link.
  DSInfo fresh;
  fresh.SetlIDLinkForm(1);
  std::string sc;
  EXPECT_EQ(fresh.GetScript(sc, 0), "Dim CI As Object\r\nDim DSVar As Variant\r\n");
}

// ---------------------------------------------------------------------------------------------
// Captions per language
// ---------------------------------------------------------------------------------------------

TEST(Captions, FallbackByLanguage) {
  struct Case {
    const char* name;
    std::vector<std::pair<int32_t, std::string>> strings;
    int32_t langID;
    const char* caption;
  };
  const Case cases[] = {
      {"no list", {}, 3, "Base"},
      {"own language", {{3, "En"}, {4, "Et"}}, 4, "Et"},
      {"Estonian does not fall back to English", {{3, "En"}}, 4, "Base"},
      {"third language falls back to English", {{3, "En"}}, 5, "En"},
      {"unknown language falls back to English", {{3, "En"}}, 9, "En"},
      {"LangID 0 shows the base caption", {{3, "En"}}, 0, "Base"},
      {"an empty text shows the base caption", {{5, ""}, {3, "En"}}, 5, "Base"},
      {"nothing for English either", {{4, "Et"}}, 5, "Base"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    BrowInfo b;
    b.SetCaption("Base");
    for (const auto& [lang, text] : c.strings) EXPECT_FALSE(b.AddLangString(text, lang));
    b.LangID = c.langID;
    EXPECT_EQ(b.Caption(), c.caption);
  }
}

TEST(Captions, PutGoesToTheBaseOrToTheLanguage) {
  DSInfo ds;
  ds.SetsCaption("One");
  ds.SetsCaption("Two");  // LangID 0: replaces
  EXPECT_EQ(ds.sCaption(), "Two");
  ds.LangID = 3;
  ds.SetsCaption("Three");  // stored for 3, base unchanged
  EXPECT_EQ(ds.sCaption(), "Three");
  ds.LangID = 0;
  EXPECT_EQ(ds.sCaption(), "Two");

  SheetInfo empty;  // no base caption yet: the first text is the base, whatever the language
  empty.LangID = 4;
  empty.SetsCaption("Esimene");
  empty.LangID = 0;
  EXPECT_EQ(empty.sCaption(), "Esimene");

  Cellinfo cell;
  cell.SetCaption("Base");
  cell.SetLangID(5);
  cell.SetCaption("Third");
  EXPECT_EQ(cell.Caption(), "Third");
  cell.SetLangID(4);
  EXPECT_EQ(cell.Caption(), "Base");
}

// ---------------------------------------------------------------------------------------------
// LinkInfo and BrowInfo
// ---------------------------------------------------------------------------------------------

TEST(Link, ValueIsTheFirstNameThatIsSet) {
  struct Case {
    const char* linkName;
    const char* scIndex;
    const char* formIndex;
    const char* dxCode;
    int32_t rtFormID;
    const char* value;
  };
  const Case cases[] = {
      {"L", "S", "F", "D", 0, "L"},
      {"", "S", "F", "D", 0, "S"},
      {"", "", "F", "D", 0, "F"},
      {"", "", "", "D", 0, "D"},
      {"", "", "", "", 0, ""},
      {"L", "S", "F", "D", 7, ""},  // resolved at run time
  };
  for (const Case& c : cases) {
    auto l = MakeRef<LinkInfo>();
    l->LinkName = c.linkName;
    l->SCXALIndex = c.scIndex;
    l->FormXALIndex = c.formIndex;
    l->FormDXCode = c.dxCode;
    l->RTFormID = c.rtFormID;
    EXPECT_EQ(l->Value(), c.value);
    std::vector<Variant> none;
    EXPECT_EQ(Invoke(l, 0, MemberKind::Get, none), Variant(c.value));  // Value is the default member
  }
}

TEST(Link, CloneCopiesTheStoredFieldsOnly) {
  auto l = MakeRef<LinkInfo>();
  l->FormID = 1;
  l->FormDXCode = "dx";
  l->FormXALIndex = "xi";
  l->FormType = 2;
  l->SCID = 3;
  l->SCDXCode = "sd";
  l->SCXALIndex = "sx";
  l->LinkName = "n";
  l->LinkOrder = "o";
  l->LinkFilter = "f";
  l->LinkQuery = "q";
  l->RTFormID = 4;
  l->ShowAsDocument = true;
  Ref<LinkInfo> copy = l->Clone();
  ASSERT_NE(copy, l);
  EXPECT_EQ(copy->FormID, 1);
  EXPECT_EQ(copy->FormDXCode, "dx");
  EXPECT_EQ(copy->FormXALIndex, "xi");
  EXPECT_EQ(copy->FormType, 2);
  EXPECT_EQ(copy->SCID, 3);
  EXPECT_EQ(copy->SCDXCode, "sd");
  EXPECT_EQ(copy->SCXALIndex, "sx");
  EXPECT_EQ(copy->LinkName, "n");
  EXPECT_EQ(copy->LinkOrder, "o");
  EXPECT_EQ(copy->LinkFilter, "f");
  EXPECT_EQ(copy->LinkQuery, "q");
  EXPECT_EQ(copy->RTFormID, 0);
  EXPECT_FALSE(copy->ShowAsDocument);
  copy->LinkName = "changed";
  EXPECT_EQ(l->LinkName, "n");
}

TEST(Browser, ColCountStopsAtTheFirstHole) {
  auto cell = Variant(MakeRef<Cellinfo>());
  struct Case {
    const char* name;
    Variant array;
    int32_t count;
  };
  const Case cases[] = {
      {"no array", Variant(), 0},
      {"not an array", Variant("x"), 0},
      {"empty array", Vec({}), 0},
      {"third of four empty", Vec({cell, cell, Variant(), cell}), 2},
      {"first empty", Vec({Variant(), cell}), 0},
      {"all set", Vec({cell, cell, cell}), 3},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    BrowInfo b;
    b.CIArray = c.array;
    EXPECT_EQ(b.ColCount(), c.count);
  }
}

// ---------------------------------------------------------------------------------------------
// Type library
// ---------------------------------------------------------------------------------------------

TEST(LayoutTypeLibrary, EnumerationsHaveTheirValues) {
  const TypeRegistry& reg = TypeRegistry::Instance();
  auto find = [&](const char* name) -> const EnumInfo* {
    for (const EnumInfo& e : reg.enums())
      if (e.name == name) return &e;
    return nullptr;
  };
  const EnumInfo* types = find("cellTypes");
  ASSERT_NE(types, nullptr);
  ASSERT_EQ(types->values.size(), 23u);
  for (int32_t i = 0; i < 23; ++i) EXPECT_EQ(types->values[static_cast<size_t>(i)].second, i);
  EXPECT_EQ(types->values[12].first, "ctCurData");
  EXPECT_EQ(types->values[18].first, "ctRefCurData");
  EXPECT_EQ(types->values[22].first, "ctFolder");
  const EnumInfo* flags = find("cellFlags");
  ASSERT_NE(flags, nullptr);
  EXPECT_EQ(flags->values, (std::vector<std::pair<std::string, int32_t>>{{"cfNone", 0}, {"cfReCalc", 1}}));
  const EnumInfo* trans = find("cellTrans");
  ASSERT_NE(trans, nullptr);
  EXPECT_EQ(trans->values,
            (std::vector<std::pair<std::string, int32_t>>{{"ctrNone", 0}, {"ctrOnRead", 1}, {"ctrOnRW", 2}}));
}

TEST(LayoutTypeLibrary, MembersInInterfaceOrder) {
  auto names = [](const char* cls) {
    std::vector<std::string> out;
    for (const MemberInfo& m : TypeRegistry::Instance().ByName(cls)->members())
      if (out.empty() || out.back() != m.name) out.push_back(m.name);
    return out;
  };
  EXPECT_EQ(names("LinkInfo"),
            (std::vector<std::string>{"FormID", "FormDXCode", "FormXALIndex", "FormType", "SCID", "SCDXCode",
                                      "SCXALIndex", "LinkName", "LinkOrder", "LinkFilter", "LinkQuery", "GetScript",
                                      "Value", "Clone", "RTFormID", "ShowAsDocument"}));
  EXPECT_EQ(names("MDInfo"), (std::vector<std::string>{"serverID", "aDS", "lID", "aSI", "GetScript"}));
  EXPECT_EQ(names("ImpParams"), (std::vector<std::string>{"sCaption", "sExpr"}));
  const std::vector<std::string> ds = names("DSInfo");
  ASSERT_EQ(ds.size(), 45u);
  EXPECT_EQ(ds[2], "sCaption");
  EXPECT_EQ(ds[40], "GetScript");
  EXPECT_EQ(ds[44], "OnGetStyle");
  const std::vector<std::string> cell = names("Cellinfo");
  ASSERT_EQ(cell.size(), 61u + 22u);
  EXPECT_EQ(cell.front(), "CType");
  EXPECT_EQ(cell[60], "Description");
  EXPECT_EQ(cell[61], "ObjectName");
  EXPECT_EQ(cell.back(), "NN_RelNIDFld");
  EXPECT_EQ(names("BrowInfo").size(), 32u + 4u);
  EXPECT_EQ(names("SheetInfo").size(), 18u);
  EXPECT_EQ(names("CSInfo").size(), 15u);
}

TEST(LayoutTypeLibrary, ScriptsReachEveryKindOfMemberByName) {
  ObjectRef ds = CreateObject("dsinfo");
  PutProperty(ds, "lID", Variant(int16_t{7}));  // converted to the field's type
  EXPECT_EQ(GetProperty(ds, "LID"), Variant(int32_t{7}));
  PutProperty(ds, "sCaption", Variant("C"));
  EXPECT_EQ(GetProperty(ds, "sCaption"), Variant("C"));
  EXPECT_EQ(GetProperty(ds, "Prop", {Variant("x")}), Variant());
  std::vector<Variant> propArgs{Variant("x"), Variant(1)};
  Invoke(ds, "Prop", MemberKind::Put, propArgs);

  ObjectRef link = GetProperty(ds, "LnkInfo").AsObject();
  ASSERT_NE(link, nullptr);
  PutProperty(link, "LinkName", Variant("N"));
  EXPECT_EQ(GetProperty(ds, "LnkInfo").AsObject(), link);
  std::vector<Variant> none;
  EXPECT_EQ(Invoke(link, 0, MemberKind::Get, none), Variant("N"));  // Value, the default member
  ObjectRef other = CreateObject("LinkInfo");
  std::vector<Variant> setArgs{Variant(other)};
  Invoke(ds, "LnkInfo", MemberKind::PutRef, setArgs);
  EXPECT_EQ(GetProperty(ds, "LnkInfo").AsObject(), other);

  ObjectRef cell = CreateObject("Cellinfo");
  EXPECT_EQ(GetProperty(cell, "Visible"), Variant(true));
  PutProperty(cell, "CType", Variant(int32_t{ctData}));
  PutProperty(cell, "Expr", Variant("GRCompany.Name"));
  EXPECT_EQ(GetProperty(cell, "xExpr"), Variant("IDGRCompany"));
  EXPECT_EQ(Call(cell, "AddLangString", {Variant("t"), Variant(3)}), Variant(false));
  PutProperty(cell, "Value", Variant(1.5));
  EXPECT_EQ(GetProperty(cell, "Value"), Variant(1.5));

  ObjectRef brow = CreateObject("BrowInfo");
  PutProperty(brow, "CIArray", Vec({Variant(cell), Variant()}));
  EXPECT_EQ(GetProperty(brow, "ColCount"), Variant(int32_t{1}));

  std::vector<Variant> args{Variant("x\r\n"), Variant(int16_t{1})};
  const Variant returned = Invoke(brow, "GetScript", MemberKind::Method, args);
  EXPECT_EQ(args[0], returned);  // sc by reference holds the same text
  EXPECT_EQ(returned,
            Variant("x\r\nDim BI As Object\r\nDim aVar As Variant\r\n\r\n\tReDim aVar(1)\r\n\r\n"
                    "\tSet BI = New Cellinfo\r\n\tWith BI\r\n\t\t.CType = 1\r\n\t\t.Expr=\"GRCompany.Name\"\r\n"
                    "\t\t.AddLangString \"t\", 3\r\n\tEnd With\r\n\tSet aVar(0) = BI\r\n\r\n\t.CIArray = aVar\r\n"));
}

}  // namespace
}  // namespace xal
