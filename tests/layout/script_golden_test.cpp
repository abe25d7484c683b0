// Whole GetScript texts, written out by hand from the rules of the script text: which lines, in
// which order, with which blanks and tabs, CR LF after each line.
#include <gtest/gtest.h>

#include "layout/brow_info.h"
#include "layout/cell_info.h"
#include "layout/cs_info.h"
#include "layout/ds_info.h"
#include "layout/imp_params.h"
#include "layout/link_info.h"
#include "layout/md_info.h"
#include "layout/sheet_info.h"
#include "layout_test_util.h"
#include "runtime/dispatch.h"

namespace xal {
namespace {

using testing::ErrorOf;
using testing::Grid;
using testing::Vec;

template <class T>
std::string ScriptOf(const T& obj, int16_t tabs = 0) {
  std::string sc;
  return obj.GetScript(sc, tabs);
}

Ref<Cellinfo> Cell(int32_t type) {
  auto c = MakeRef<Cellinfo>();
  c->CType = type;
  return c;
}

// ---------------------------------------------------------------------------------------------
// New objects
// ---------------------------------------------------------------------------------------------

TEST(ScriptGolden, NewObjectOfEachClass) {
  struct Case {
    const char* cls;
    std::string expected;
  };
  const Case cases[] = {
      {"DSInfo", "Dim CI As Object\r\nDim DSVar As Variant\r\n"},
      {"MDInfo", "Dim SI As Object\r\nDim MDVar As Variant\r\n"},
      {"SheetInfo", "Dim SIVar As Variant\r\n"},
      {"CSInfo", ""},
      {"LinkInfo", ""},
      {"Cellinfo", ".CType = 0\r\n"},  // CType is written even when 0
      {"BrowInfo", "Dim BI As Object\r\nDim aVar As Variant\r\n"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.cls);
    // Through the type library, as a script would call it: sc by reference, Tabs left out.
    std::vector<Variant> args{Variant(std::string())};
    Variant result = Invoke(CreateObject(c.cls), "GetScript", MemberKind::Method, args);
    EXPECT_EQ(result, Variant(c.expected));
    EXPECT_EQ(args[0], Variant(c.expected));  // the text also comes back in sc
  }
}

TEST(ScriptGolden, DimLinesAreNeverIndentedStatementsAre) {
  EXPECT_EQ(ScriptOf(DSInfo{}, 3), "Dim CI As Object\r\nDim DSVar As Variant\r\n");
  EXPECT_EQ(ScriptOf(Cellinfo{}, 3), "\t\t\t.CType = 0\r\n");
}

TEST(ScriptGolden, AppendsToTheTextAndWritesDimOnce) {
  DSInfo ds;
  ds.lID = 4;
  std::string sc = "' form\r\n";
  const std::string first = ds.GetScript(sc, 0);
  EXPECT_EQ(first, "' form\r\nDim CI As Object\r\nDim DSVar As Variant\r\n.lID = 4\r\n");
  EXPECT_EQ(sc, first);
  const std::string second = ds.GetScript(sc, 0);
  EXPECT_EQ(second, first + ".lID = 4\r\n");

  // The search ignores letter case.
  std::string lower = "dim ci as object\r\n";
  EXPECT_EQ(ds.GetScript(lower, 0), "dim ci as object\r\nDim DSVar As Variant\r\n.lID = 4\r\n");
}

// ---------------------------------------------------------------------------------------------
// Data sheets
// ---------------------------------------------------------------------------------------------

TEST(ScriptGolden, FullySetDataSheetWithGridHole) {
  DSInfo ds;
  ds.serverID = 99;  // not written
  ds.lID = 7;
  ds.SetsCaption("Header");
  ds.AddLangString("Pais", 4);
  ds.AddLangString("Head", 3);
  ds.lType = 2;
  ds.bList = ds.bLocked = true;
  ds.sExpr = "GDocument";
  ds.iPos = 1;
  ds.iRows = 3;
  ds.iCols = 2;
  ds.iLHeight = -4;
  ds.iBHeight = 5;
  ds.iBSplitPos = 6;
  ds.sProgname = "prog";
  ds.sColWidth = "10;20";
  ds.sValid = "v()";
  ds.sWhen = "w()";
  ds.OnGetStyle = "style()";
  ds.iLayout = 8;
  ds.bHeader = ds.bBrowser = true;
  ds.iBrowmode = 9;
  ds.iListmode = 10;
  ds.sListmaster = "master";
  ds.sOnAddNew = "add()";
  ds.sOnDelete = "del()";
  ds.SkipMaster = "skip";
  ds.bAltStyle = ds.bMultiRow = true;
  ds.isLoaded = ds.needRefresh = ds.isSingle = true;  // run-time state, not written
  ds.U_SplitPos = 12;
  ds.LangID = 4;
  auto a = Cell(ctData);
  a->SetExpr("GRCompany.Name");
  auto b = Cell(ctText);
  b->SetCaption("Name");
  auto c = Cell(ctCheck);
  c->Editable = true;
  ds.aCells = Grid(2, 2, {Variant(a), Variant(), Variant(b), Variant(c)});

  const std::string expected =
      "Dim CI As Object\r\n"
      "Dim DSVar As Variant\r\n"
      ".lID = 7\r\n"
      ".sCaption = \"Header\"\r\n"
      ".AddLangString \"Pais\", 4\r\n"
      ".AddLangString \"Head\", 3\r\n"
      ".lType = 2\r\n"
      ".bList = True\r\n"
      ".bLocked = True\r\n"
      ".sExpr = \"GDocument\"\r\n"
      ".iPos = 1\r\n"
      ".iRows = 3\r\n"
      ".iCols = 2\r\n"
      ".iLHeight = -4\r\n"
      ".iBHeight = 5\r\n"
      ".iBSplitPos = 6\r\n"
      ".sProgname = \"prog\"\r\n"
      ".sColWidth = \"10;20\"\r\n"
      ".sValid = \"v()\"\r\n"
      ".sWhen = \"w()\"\r\n"
      ".OnGetStyle=\"style()\"\r\n"
      ".iLayout = 8\r\n"
      ".bHeader = True\r\n"
      ".bBrowser = True\r\n"
      ".iBrowmode = 9\r\n"
      ".iListmode = 10\r\n"
      ".sListmaster = \"master\"\r\n"
      ".sOnAddNew = \"add()\"\r\n"
      ".sOnDelete = \"del()\"\r\n"
      ".SkipMaster = \"skip\"\r\n"
      ".bAltStyle = True\r\n"
      ".bMultiRow = True\r\n"
      "\r\n"
      "ReDim DSVar(1,1)\r\n"
      "\r\n"
      "Set CI = New Cellinfo\r\n"
      "With CI\r\n"
      "\t.CType = 1\r\n"
      "\t.Expr=\"GRCompany.Name\"\r\n"
      "End With\r\n"
      "Set DSVar(0,0) = CI\r\n"
      "\r\n"
      "Set CI = New Cellinfo\r\n"
      "With CI\r\n"
      "\t.CType = 0\r\n"
      "\t.Caption=\"Name\"\r\n"
      "End With\r\n"
      "Set DSVar(1,0) = CI\r\n"
      "\r\n"
      "Set CI = New Cellinfo\r\n"
      "With CI\r\n"
      "\t.CType = 9\r\n"
      "\t.Editable=True\r\n"
      "End With\r\n"
      "Set DSVar(1,1) = CI\r\n"
      "\r\n"
      ".aCells = DSVar\r\n";
  EXPECT_EQ(ScriptOf(ds), expected);
}

TEST(ScriptGolden, ColumnCellsArePackedAroundADynamicCell) {
  DSInfo ds;
  auto first = Cell(ctData);
  first->SetExpr("A.B");
  auto dynamic = Cell(ctYesNo);
  dynamic->Dynamic = true;
  auto list = Cell(ctList);
  list->ListLink = "L";
  list->SetListShow("S");
  list->ListSave = "V";
  ds.aCS = Vec({Variant(first), Variant(dynamic), Variant(list)});

  const std::string expected =
      "Dim CI As Object\r\n"
      "Dim DSVar As Variant\r\n"
      "\r\n"
      "ReDim DSVar(2)\r\n"
      "\r\n"
      "Set CI = New Cellinfo\r\n"
      "With CI\r\n"
      "\t.CType = 1\r\n"
      "\t.Expr=\"A.B\"\r\n"
      "End With\r\n"
      "Set DSVar(0) = CI\r\n"
      "\r\n"
      "Set CI = New Cellinfo\r\n"
      "With CI\r\n"
      "\t.CType = 5\r\n"
      "\t.ListLink=\"L\"\r\n"
      "\t.ListShow=\"S\"\r\n"
      "\t.ListSave=\"V\"\r\n"
      "End With\r\n"
      "Set DSVar(1) = CI\r\n"
      "\r\n"
      ".aCS = DSVar\r\n";
  EXPECT_EQ(ScriptOf(ds), expected);
}

TEST(ScriptGolden, TabsTwoWithLinkGridAndBrowsers) {
  DSInfo ds;
  ds.lID = 1;
  ds.LnkInfo()->LinkName = "Lnk";
  ds.aCells = Grid(1, 1, {Variant(Cell(ctScript))});
  auto withColumns = MakeRef<BrowInfo>();
  withColumns->LOID = 5;
  withColumns->CIArray = Vec({Variant(Cell(ctData))});
  auto plain = MakeRef<BrowInfo>();
  plain->Pos = 1;
  ds.aBrow = Vec({Variant(withColumns), Variant(), Variant(plain)});

  const std::string expected =
      "Dim CI As Object\r\n"
      "Dim DSVar As Variant\r\n"
      "\t\t.lID = 1\r\n"
      "\t\tWith .LnkInfo\r\n"
      "\t\t\t.LinkName=\"Lnk\"\r\n"
      "\t\tEnd With\r\n"
      "\r\n"
      "\t\tReDim DSVar(0,0)\r\n"
      "\r\n"
      "\t\tSet CI = New Cellinfo\r\n"
      "\t\tWith CI\r\n"
      "\t\t\t.CType = 3\r\n"
      "\t\tEnd With\r\n"
      "\t\tSet DSVar(0,0) = CI\r\n"
      "\r\n"
      "\t\t.aCells = DSVar\r\n"
      "\r\n"
      "\t\tReDim DSVar(2)\r\n"
      "\r\n"
      "\t\tSet CI = New Browinfo\r\n"
      "\t\tWith CI\r\n"
      "Dim BI As Object\r\n"
      "Dim aVar As Variant\r\n"
      "\t\t\t.LOID = 5\r\n"
      "\r\n"
      "\t\t\tReDim aVar(0)\r\n"
      "\r\n"
      "\t\t\tSet BI = New Cellinfo\r\n"
      "\t\t\tWith BI\r\n"
      "\t\t\t\t.CType = 1\r\n"
      "\t\t\tEnd With\r\n"
      "\t\t\tSet aVar(0) = BI\r\n"
      "\r\n"
      "\t\t\t.CIArray = aVar\r\n"
      "\t\tEnd With\r\n"
      "\t\tSet DSVar(0) = CI\r\n"
      "\r\n"
      "\t\tSet CI = New Browinfo\r\n"
      "\t\tWith CI\r\n"
      "\t\t\t.Pos = 1\r\n"
      "\t\tEnd With\r\n"
      "\t\tSet DSVar(2) = CI\r\n"
      "\r\n"
      "\t\t.aBrow = DSVar\r\n";
  EXPECT_EQ(ScriptOf(ds, 2), expected);
}

TEST(ScriptGolden, ReadingTheLinkIdCreatesAnEmptyLinkBlock) {
  DSInfo ds;
  EXPECT_EQ(ds.lIDLinkForm(), 0);
  EXPECT_EQ(ScriptOf(ds, 1),
            "Dim CI As Object\r\n"
            "Dim DSVar As Variant\r\n"
            "\tWith .LnkInfo\r\n"
            "\tEnd With\r\n");
}

// ---------------------------------------------------------------------------------------------
// Cells, browsers, links, sheets, forms, column sets
// ---------------------------------------------------------------------------------------------

TEST(ScriptGolden, FullySetListCell) {
  Cellinfo c;
  c.CType = ctList;
  c.SetExpr("GRArticle.Code");
  c.Editable = true;
  c.LOID = 11;
  c.Valid = "val";
  c.When = "when";
  c.OnGetStyle = "gs";
  c.Flags = cfReCalc;
  c.Mask = "###";
  c.Style = "st";
  c.FStyle = "fs";
  c.SetSkip(true);
  c.RTSkip = Variant(false);  // the run-time flag is not what is written
  c.RefreshItems = true;
  c.Script = "scr";
  c.OnDisplay = "disp";
  c.Width = 120;
  c.DDWidth = 101;
  c.Height = 15;
  c.SetCaption("Article");
  c.Feature = "feat";
  c.NoUTFilter = true;
  c.AddLangString("Artikkel", 4);
  c.SetTranslated(ctrOnRW);
  c.LangSuffix = "_eng";  // ListShow now reads "ls_eng"; the script keeps the stored text
  c.SetValuefilter("Code");
  c.ScriptName = "sn";
  c.ListLink = "ll";
  c.SetListShow("ls");
  c.ListSave = "lsv";
  c.LnkInfo()->LinkName = "Articles";
  c.AmountMode = "Base";  // not written, nor the following
  c.Visible = false;
  c.DataType = 7;
  c.Text = "x";
  c.Description = "d";

  const std::string expected =
      "\t.CType = 5\r\n"
      "\t.Expr=\"GRArticle.Code\"\r\n"
      "\t.Editable=True\r\n"
      "\t.LOID=11\r\n"
      "\t.Valid=\"val\"\r\n"
      "\t.When=\"when\"\r\n"
      "\t.OnGetStyle=\"gs\"\r\n"
      "\t.Flags=1\r\n"
      "\t.Mask=\"###\"\r\n"
      "\t.Style=\"st\"\r\n"
      "\t.FStyle=\"fs\"\r\n"
      "\t.Skip=True\r\n"
      "\t.RefreshItems=True\r\n"
      "\t.Script=\"scr\"\r\n"
      "\t.OnDisplay=\"disp\"\r\n"
      "\t.Width=120\r\n"
      "\t.DDWidth=101\r\n"
      "\t.Height=15\r\n"
      "\t.Caption=\"Article\"\r\n"
      "\t.Feature=\"feat\"\r\n"
      "\t.NoUTFilter=True\r\n"
      "\t.AddLangString \"Artikkel\", 4\r\n"
      "\t.Translated=2\r\n"
      "\t.ValueFilter=\"Code\"\r\n"
      "\t.ScriptName=\"sn\"\r\n"
      "\t.ListLink=\"ll\"\r\n"
      "\t.ListShow=\"ls\"\r\n"
      "\t.ListSave=\"lsv\"\r\n"
      "\tWith .LnkInfo\r\n"
      "\t\t.LinkName=\"Articles\"\r\n"
      "\tEnd With\r\n";
  EXPECT_EQ(ScriptOf(c, 1), expected);
}

TEST(ScriptGolden, CellConditionalLines) {
  struct Case {
    const char* name;
    std::function<void(Cellinfo&)> set;
    std::string expected;
  };
  const Case cases[] = {
      {"DDWidth 100 is the default", [](Cellinfo& c) { c.DDWidth = 100; }, ".CType = 0\r\n"},
      {"DDWidth 101", [](Cellinfo& c) { c.DDWidth = 101; }, ".CType = 0\r\n.DDWidth=101\r\n"},
      {"negative width", [](Cellinfo& c) { c.Width = -3; }, ".CType = 0\r\n.Width=-3\r\n"},
      {"list lines only for lists",
       [](Cellinfo& c) {
         c.CType = ctData;
         c.ListLink = "l";
         c.SetListShow("s");
         c.ListSave = "v";
       },
       ".CType = 1\r\n"},
      {"run-time skip is not written", [](Cellinfo& c) { c.RTSkip = Variant(true); }, ".CType = 0\r\n"},
      {"Translated back to 0", [](Cellinfo& c) { c.SetTranslated(ctrOnRead); c.SetTranslated(ctrNone); },
       ".CType = 0\r\n"},
      {"quote written unchanged", [](Cellinfo& c) { c.SetCaption("a\"b"); },
       ".CType = 0\r\n.Caption=\"a\"b\"\r\n"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    Cellinfo cell;
    c.set(cell);
    EXPECT_EQ(ScriptOf(cell), c.expected);
  }
}

TEST(ScriptGolden, FullySetBrowserWithColumnCells) {
  BrowInfo b;
  b.LOID = 3;
  b.SetCaption("Rows");
  b.AddLangString("Read", 4);
  b.Expr = "SDInvoiceRow";
  b.DataFilter = "f";
  b.DataOrder = "o";
  b.Locked = true;
  b.Valid = "v";
  b.OnGetStyle = "g";
  b.When = "w";
  b.Pos = 2;
  b.ProgName = "p";
  b.AltStyle = b.MultiRow = true;
  b.Master = "m";
  b.SkipMaster = "sm";
  b.OnAddNew = "a";
  b.OnDelete = "d";
  b.TreeSrc = "ts";
  b.TreeName = "tn";
  b.TreeFields = "tf";
  b.sClone = "not written";
  b.Filter = "not written";
  b.MaxRows = 50;
  auto x = Cell(ctData);
  x->SetExpr("X.Y");
  auto dynamic = Cell(ctData);
  dynamic->Dynamic = true;
  auto label = Cell(ctText);
  label->SetCaption("C");
  b.CIArray = Vec({Variant(x), Variant(), Variant(dynamic), Variant(label)});

  const std::string expected =
      "Dim BI As Object\r\n"
      "Dim aVar As Variant\r\n"
      ".LOID = 3\r\n"
      ".Caption = \"Rows\"\r\n"
      ".AddLangString \"Read\", 4\r\n"
      ".Expr = \"SDInvoiceRow\"\r\n"
      ".DataFilter = \"f\"\r\n"
      ".DataOrder = \"o\"\r\n"
      ".Locked = True\r\n"
      ".Valid = \"v\"\r\n"
      ".OnGetStyle=\"g\"\r\n"
      ".When = \"w\"\r\n"
      ".Pos = 2\r\n"
      ".Progname = \"p\"\r\n"
      ".AltStyle = True\r\n"
      ".MultiRow = True\r\n"
      ".Master = \"m\"\r\n"
      ".SkipMaster = \"sm\"\r\n"
      ".OnAddNew = \"a\"\r\n"
      ".OnDelete = \"d\"\r\n"
      ".TreeSrc = \"ts\"\r\n"
      ".TreeName = \"tn\"\r\n"
      ".TreeFields = \"tf\"\r\n"
      "\r\n"
      "ReDim aVar(3)\r\n"
      "\r\n"
      "Set BI = New Cellinfo\r\n"
      "With BI\r\n"
      "\t.CType = 1\r\n"
      "\t.Expr=\"X.Y\"\r\n"
      "End With\r\n"
      "Set aVar(0) = BI\r\n"
      "\r\n"
      "Set BI = New Cellinfo\r\n"
      "With BI\r\n"
      "\t.CType = 0\r\n"
      "\t.Caption=\"C\"\r\n"
      "End With\r\n"
      "Set aVar(1) = BI\r\n"
      "\r\n"
      ".CIArray = aVar\r\n";
  EXPECT_EQ(ScriptOf(b), expected);
}

TEST(ScriptGolden, LinkQuotesItsTextsAndWritesNoBlanks) {
  LinkInfo l;
  l.LinkName = "Say \"hi\"";
  l.FormXALIndex = "IDX";
  l.FormDXCode = "DX";
  l.FormType = -1;
  l.SCXALIndex = "S\"C";
  l.FormID = 4;  // the rest is not written
  l.SCID = 5;
  l.SCDXCode = "sd";
  l.LinkOrder = "o";
  l.LinkFilter = "f";
  l.LinkQuery = "q";
  l.RTFormID = 6;
  l.ShowAsDocument = true;
  EXPECT_EQ(ScriptOf(l, 1),
            "\t.LinkName=\"Say \"\"hi\"\"\"\r\n"
            "\t.FormXALIndex=\"IDX\"\r\n"
            "\t.FormDXCode=\"DX\"\r\n"
            "\t.FormType=-1\r\n"
            "\t.SCXALIndex=\"S\"\"C\"\r\n");
}

TEST(ScriptGolden, CaptionWithQuoteIsWrittenUnchanged) {
  DSInfo ds;
  ds.SetsCaption("Say \"hi\"");
  ds.LnkInfo()->LinkName = "Say \"hi\"";
  EXPECT_EQ(ScriptOf(ds),
            "Dim CI As Object\r\n"
            "Dim DSVar As Variant\r\n"
            ".sCaption = \"Say \"hi\"\"\r\n"
            "With .LnkInfo\r\n"
            "\t.LinkName=\"Say \"\"hi\"\"\"\r\n"
            "End With\r\n");
}

TEST(ScriptGolden, LanguageStringsInListOrder) {
  DSInfo ds;
  ds.SetsCaption("Base");      // LangID 0: the base caption
  ds.LangID = 3;
  ds.SetsCaption("English");   // a base caption exists: stored for language 3
  ds.LangID = 4;
  ds.SetsCaption("Eesti");
  ds.LangID = 3;
  ds.SetsCaption("English2");  // replaces the entry for 3, which keeps its place
  EXPECT_EQ(ScriptOf(ds),
            "Dim CI As Object\r\n"
            "Dim DSVar As Variant\r\n"
            ".sCaption = \"Base\"\r\n"
            ".AddLangString \"English2\", 3\r\n"
            ".AddLangString \"Eesti\", 4\r\n");
}

TEST(ScriptGolden, FormWithSheets) {
  auto general = MakeRef<SheetInfo>();
  general->SetsCaption("General");
  general->AddLangString("\xC3\x9C" "ldine", 4);
  general->bLocked = true;
  general->sExpr = "e";
  general->sFilter = "f";
  general->sOrder = "o";
  general->sScript = "s";
  general->sClone = "not written";
  general->LnkInfo()->FormXALIndex = "F1";
  MDInfo form;
  form.lID = 8;  // not written
  form.aSI = Vec({Variant(general), Variant(), Variant(MakeRef<SheetInfo>())});

  const std::string expected =
      "Dim SI As Object\r\n"
      "Dim MDVar As Variant\r\n"
      "\r\n"
      "ReDim MDVar(2)\r\n"
      "\r\n"
      "Set SI = New SheetInfo\r\n"
      "With SI\r\n"
      "Dim SIVar As Variant\r\n"
      "\t.sCaption = \"General\"\r\n"
      "\t.AddLangString \"\xC3\x9C" "ldine\", 4\r\n"
      "\t.bLocked = True\r\n"
      "\t.sExpr = \"e\"\r\n"
      "\t.sFilter = \"f\"\r\n"
      "\t.sOrder = \"o\"\r\n"
      "\t.sScript = \"s\"\r\n"
      "\tWith .LnkInfo\r\n"
      "\t\t.FormXALIndex=\"F1\"\r\n"
      "\tEnd With\r\n"
      "End With\r\n"
      "Set MDVar(0) = SI\r\n"
      "\r\n"
      "Set SI = New SheetInfo\r\n"
      "With SI\r\n"
      "End With\r\n"
      "Set MDVar(2) = SI\r\n"
      "\r\n"
      ".aSI = MDVar\r\n";
  EXPECT_EQ(ScriptOf(form), expected);
}

TEST(ScriptGolden, FullySetColumnSet) {
  CSInfo cs;
  cs.sCaption = "Qty";
  cs.lType = 1;
  cs.sExpr = "Quantity";
  cs.iWidth = 80;
  cs.bLocked = true;
  cs.sValid = "v";
  cs.sWhen = "w";
  cs.iPos = 2;
  cs.bSkip = cs.bRefresh = true;
  cs.sScript = "s";
  cs.lLinkFType = 3;
  cs.LinkXALIndex = "X";
  cs.lIDLinkForm = 4;
  EXPECT_EQ(ScriptOf(cs),
            ".sCaption = \"Qty\"\r\n"
            ".lType = 1\r\n"
            ".sExpr = \"Quantity\"\r\n"
            ".iWidth = 80\r\n"
            ".bLocked = True\r\n"
            ".sValid = \"v\"\r\n"
            ".sWhen = \"w\"\r\n"
            ".iPos = 2\r\n"
            ".bSkip = True\r\n"
            ".bRefresh = True\r\n"
            ".sScript = \"s\"\r\n"
            ".lLinkFType = 3\r\n"
            ".LinkXALIndex = \"X\"\r\n"
            ".lIDLinkForm = 4\r\n");
}

// ---------------------------------------------------------------------------------------------
// Failures: the text built up to the failing element stays in sc
// ---------------------------------------------------------------------------------------------

TEST(ScriptGolden, WrongClassInColumnCellsStopsWithTypeMismatch) {
  DSInfo ds;
  ds.lID = 5;
  ds.aCS = Vec({Variant(Cell(ctData)), Variant(MakeRef<LinkInfo>()), Variant(Cell(ctData))});
  std::string sc;
  EXPECT_EQ(ErrorOf([&] { ds.GetScript(sc, 0); }), kErrTypeMismatch);
  EXPECT_EQ(sc,
            "Dim CI As Object\r\n"
            "Dim DSVar As Variant\r\n"
            ".lID = 5\r\n"
            "\r\n"
            "ReDim DSVar(2)\r\n"
            "\r\n"
            "Set CI = New Cellinfo\r\n"
            "With CI\r\n"
            "\t.CType = 1\r\n"
            "End With\r\n"
            "Set DSVar(0) = CI\r\n"
            "\r\n");
}

TEST(ScriptGolden, WrongElementsInEachArray) {
  struct Case {
    const char* name;
    std::function<void(DSInfo&)> set;
    int error;
    std::string textAfterDims;
  };
  const std::string grid = "\r\nReDim DSVar(0,1)\r\n\r\n";
  const Case cases[] = {
      {"browser in the grid", [](DSInfo& d) { d.aCells = Grid(1, 2, {Variant(), Variant(MakeRef<BrowInfo>())}); },
       kErrTypeMismatch, grid},
      {"text in the grid", [](DSInfo& d) { d.aCells = Grid(1, 2, {Variant("x"), Variant()}); }, kErrTypeMismatch,
       grid},
      {"Nothing in the grid", [](DSInfo& d) { d.aCells = Grid(1, 2, {Variant::Nothing(), Variant()}); },
       kErrObjectNotSet, grid},
      {"cell among the browsers", [](DSInfo& d) { d.aBrow = Vec({Variant(Cell(ctText))}); }, kErrTypeMismatch,
       "\r\nReDim DSVar(0)\r\n\r\n"},
      {"a number is no array", [](DSInfo& d) { d.aCS = Variant(3); }, kErrTypeMismatch, "\r\n"},
      {"a 1-D grid has no second bound", [](DSInfo& d) { d.aCells = Vec({Variant()}); }, kErrSubscript, "\r\n"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    DSInfo ds;
    c.set(ds);
    std::string sc;
    EXPECT_EQ(ErrorOf([&] { ds.GetScript(sc, 0); }), c.error);
    EXPECT_EQ(sc, "Dim CI As Object\r\nDim DSVar As Variant\r\n" + c.textAfterDims);
  }
}

TEST(ScriptGolden, WrongClassInBrowserColumns) {
  BrowInfo b;
  b.Pos = 1;
  b.CIArray = Vec({Variant(MakeRef<BrowInfo>())});
  std::string sc;
  EXPECT_EQ(ErrorOf([&] { b.GetScript(sc, 0); }), kErrTypeMismatch);
  EXPECT_EQ(sc, "Dim BI As Object\r\nDim aVar As Variant\r\n.Pos = 1\r\n\r\nReDim aVar(0)\r\n\r\n");
}

TEST(ScriptGolden, FormCallsEachSheetByName) {
  // Any object with a GetScript answers for itself; one without it stops the form with 438.
  MDInfo form;
  form.aSI = Vec({Variant(MakeRef<Cellinfo>()), Variant(MakeRef<ImpParams>())});
  std::string sc;
  EXPECT_EQ(ErrorOf([&] { form.GetScript(sc, 0); }), kErrNoMember);
  EXPECT_EQ(sc,
            "Dim SI As Object\r\n"
            "Dim MDVar As Variant\r\n"
            "\r\n"
            "ReDim MDVar(1)\r\n"
            "\r\n"
            "Set SI = New SheetInfo\r\n"
            "With SI\r\n"
            "\t.CType = 0\r\n"
            "End With\r\n"
            "Set MDVar(0) = SI\r\n"
            "\r\n"
            "Set SI = New SheetInfo\r\n"
            "With SI\r\n");
}

TEST(ScriptGolden, NegativeTabsAreAnInvalidCall) {
  Cellinfo c;
  std::string sc;
  EXPECT_EQ(ErrorOf([&] { c.GetScript(sc, -1); }), kErrInvalidCall);
  EXPECT_EQ(sc, "");
}

}  // namespace
}  // namespace xal
