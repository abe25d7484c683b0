// The script text is faithful: for a few hundred randomly generated definitions of every class,
// running the text that GetScript writes against a fresh object (through the test interpreter in
// script_reader.cpp) rebuilds a definition whose own GetScript is the same text.
//
// What the text cannot carry is left out of the generated data: a quote inside a text that is
// written without doubling (everything but links), and line breaks inside texts.
#include <gtest/gtest.h>

#include <random>

#include "layout/brow_info.h"
#include "layout/cell_info.h"
#include "layout/cs_info.h"
#include "layout/ds_info.h"
#include "layout/link_info.h"
#include "layout/md_info.h"
#include "layout/sheet_info.h"
#include "layout_test_util.h"
#include "runtime/dispatch.h"
#include "script_reader.h"

namespace xal {
namespace {

using testing::RunScript;

class Generator {
 public:
  explicit Generator(uint32_t seed) : rng_(seed) {}

  bool Chance(double p) { return std::bernoulli_distribution(p)(rng_); }
  int32_t Between(int32_t lo, int32_t hi) { return std::uniform_int_distribution<int32_t>(lo, hi)(rng_); }
  // Zero half of the time, so that both the written and the omitted form occur.
  int32_t Long() { return Chance(0.5) ? 0 : Between(INT32_MIN, INT32_MAX); }
  int16_t Integer() { return static_cast<int16_t>(Chance(0.5) ? 0 : Between(-32768, 32767)); }
  std::string Text(bool quotes = false) {
    static const std::vector<std::string> kPieces = {
        "a", "Z", "7", " ", ".", "(", ")", "=", ",", "'", "&", "_", "\t", "\xC3\xB5", "\xC3\x84", "ID", "Amount",
        "\"", "\"\""};
    if (Chance(0.4)) return {};
    std::string out;
    const size_t pieces = kPieces.size() - (quotes ? 0 : 2);
    for (int i = Between(1, 8); i > 0; --i) out += kPieces[static_cast<size_t>(Between(0, int32_t(pieces) - 1))];
    return out;
  }
  void LangStrings(const std::function<void(const std::string&, int32_t)>& add) {
    for (int i = Between(0, 3); i > 0; --i) add(Text(), Between(-1, 6));
  }

  Ref<LinkInfo> Link() {
    auto l = MakeRef<LinkInfo>();
    l->LinkName = Text(true);
    l->FormXALIndex = Text(true);
    l->FormDXCode = Text(true);
    l->FormType = Long();
    l->SCXALIndex = Text(true);
    l->FormID = Long();  // not written: must not matter
    l->LinkQuery = Text(true);
    l->RTFormID = Long();
    return l;
  }

  Ref<Cellinfo> Cell() {
    auto c = MakeRef<Cellinfo>();
    c->CType = Chance(0.3) ? ctList : Between(0, 22);
    if (Chance(0.3)) c->SetLangID(Between(3, 5));  // labels then keep later texts per language
    c->SetExpr(Text());
    if (Chance(0.3)) c->SetExpr(Text());
    c->Editable = Chance(0.3);
    c->LOID = Long();
    c->Valid = Text();
    c->When = Text();
    c->OnGetStyle = Text();
    c->Flags = Long();
    c->Mask = Text();
    c->Style = Text();
    c->FStyle = Text();
    c->SetSkip(Chance(0.3));
    if (Chance(0.2)) c->RTSkip = Variant(Chance(0.5));
    c->RefreshItems = Chance(0.3);
    c->Script = Text();
    c->OnDisplay = Text();
    c->Width = Integer();
    c->DDWidth = static_cast<int16_t>(Between(-10, 300));
    c->Height = Integer();
    c->SetCaption(Text());
    c->SetCaption(Text());
    c->Feature = Text();
    c->NoUTFilter = Chance(0.3);
    LangStrings([&](const std::string& t, int32_t id) { c->AddLangString(t, id); });
    c->SetTranslated(Between(0, 2));
    c->SetValuefilter(Text());
    c->ScriptName = Text();
    c->ListLink = Text();
    c->SetListShow(Text());
    c->ListSave = Text();
    if (Chance(0.4)) c->SetLnkInfo(Link());
    c->Dynamic = Chance(0.15);
    c->AmountMode = Text();  // none of these is written
    c->Visible = Chance(0.5);
    c->DataType = Long();
    c->LangSuffix = Text();
    return c;
  }

  Variant Cells(int32_t maxCount) {
    if (Chance(0.3)) return Variant();
    std::vector<Variant> items;
    for (int i = Between(0, maxCount); i > 0; --i) items.push_back(Chance(0.2) ? Variant() : Variant(Cell()));
    return testing::Vec(std::move(items));
  }

  Variant Grid() {
    const int32_t rows = Between(0, 3), cols = Between(1, 3);
    std::vector<Variant> items;
    for (int i = rows * cols; i > 0; --i) items.push_back(Chance(0.2) ? Variant() : Variant(Cell()));
    return testing::Grid(rows, cols, std::move(items));
  }

  Ref<BrowInfo> Browser() {
    auto b = MakeRef<BrowInfo>();
    b->LOID = Long();
    b->SetCaption(Text());
    LangStrings([&](const std::string& t, int32_t id) { b->AddLangString(t, id); });
    for (std::string* s : {&b->Expr, &b->DataFilter, &b->DataOrder, &b->Valid, &b->OnGetStyle, &b->When,
                           &b->ProgName, &b->Master, &b->SkipMaster, &b->OnAddNew, &b->OnDelete, &b->TreeSrc,
                           &b->TreeName, &b->TreeFields, &b->sClone, &b->Filter})
      *s = Text();
    b->Locked = Chance(0.5);
    b->Pos = Integer();
    b->AltStyle = Chance(0.5);
    b->MultiRow = Chance(0.5);
    b->CIArray = Cells(4);
    return b;
  }

  Ref<DSInfo> DataSheet() {
    auto d = MakeRef<DSInfo>();
    d->lID = Long();
    d->SetsCaption(Text());
    LangStrings([&](const std::string& t, int32_t id) { d->AddLangString(t, id); });
    d->lType = Long();
    for (bool* b : {&d->bList, &d->bLocked, &d->bHeader, &d->bBrowser, &d->bAltStyle, &d->bMultiRow, &d->isLoaded})
      *b = Chance(0.5);
    for (int16_t* n : {&d->iPos, &d->iRows, &d->iCols, &d->iLHeight, &d->iBHeight, &d->iBSplitPos, &d->iLayout,
                       &d->iBrowmode, &d->iListmode, &d->serverID})
      *n = Integer();
    for (std::string* s : {&d->sExpr, &d->sProgname, &d->sColWidth, &d->sValid, &d->sWhen, &d->OnGetStyle,
                           &d->sListmaster, &d->sOnAddNew, &d->sOnDelete, &d->SkipMaster})
      *s = Text();
    if (Chance(0.4)) d->SetLnkInfo(Link());
    d->aCells = Chance(0.4) ? Variant() : Grid();
    d->aCS = Cells(4);
    if (Chance(0.5)) {
      std::vector<Variant> browsers;
      for (int i = Between(0, 3); i > 0; --i) browsers.push_back(Chance(0.2) ? Variant() : Variant(Browser()));
      d->aBrow = testing::Vec(std::move(browsers));
    }
    return d;
  }

  Ref<SheetInfo> Sheet() {
    auto s = MakeRef<SheetInfo>();
    s->SetsCaption(Text());
    LangStrings([&](const std::string& t, int32_t id) { s->AddLangString(t, id); });
    s->bLocked = Chance(0.5);
    s->sExpr = Text();
    s->sFilter = Text();
    s->sOrder = Text();
    s->sScript = Text();
    s->sClone = Text();
    if (Chance(0.4)) s->SetLnkInfo(Link());
    return s;
  }

  Ref<MDInfo> Form() {
    auto m = MakeRef<MDInfo>();
    m->lID = Long();
    if (Chance(0.8)) {
      std::vector<Variant> sheets;
      for (int i = Between(0, 3); i > 0; --i) sheets.push_back(Chance(0.2) ? Variant() : Variant(Sheet()));
      m->aSI = testing::Vec(std::move(sheets));
    }
    return m;
  }

  Ref<CSInfo> ColumnSet() {
    auto c = MakeRef<CSInfo>();
    for (std::string* s : {&c->sCaption, &c->sExpr, &c->sValid, &c->sWhen, &c->sScript, &c->LinkXALIndex}) *s = Text();
    for (int32_t* n : {&c->lType, &c->lLinkFType, &c->lIDLinkForm}) *n = Long();
    c->iWidth = Integer();
    c->iPos = Integer();
    c->bLocked = Chance(0.5);
    c->bSkip = Chance(0.5);
    c->bRefresh = Chance(0.5);
    return c;
  }

  // A definition of the class numbered `which`, and its class name.
  std::pair<ObjectRef, const char*> Any(int which) {
    switch (which % 7) {
      case 0: return {DataSheet(), "DSInfo"};
      case 1: return {Form(), "MDInfo"};
      case 2: return {Sheet(), "SheetInfo"};
      case 3: return {ColumnSet(), "CSInfo"};
      case 4: return {Link(), "LinkInfo"};
      case 5: return {Cell(), "Cellinfo"};
      default: return {Browser(), "BrowInfo"};
    }
  }

 private:
  std::mt19937 rng_;
};

std::string ScriptByName(const ObjectRef& obj, int16_t tabs) {
  std::vector<Variant> args{Variant(std::string()), Variant(tabs)};
  return Invoke(obj, "GetScript", MemberKind::Method, args).AsString();
}

TEST(RoundTrip, RandomDefinitionsRebuildTheSameScript) {
  Generator gen(20240917);
  testing::ReaderStats total;
  for (int i = 0; i < 700; ++i) {
    auto [original, cls] = gen.Any(i);
    const int16_t tabs = static_cast<int16_t>(gen.Between(0, 2));
    const std::string text = ScriptByName(original, tabs);
    SCOPED_TRACE(std::string(cls) + " #" + std::to_string(i) + ":\n" + text);
    ObjectRef fresh = CreateObject(cls);
    testing::ReaderStats stats;
    ASSERT_NO_THROW(stats = RunScript(text, fresh, tabs));
    EXPECT_EQ(ScriptByName(fresh, tabs), text);
    total.statements += stats.statements;
    total.objects += stats.objects;
    total.properties += stats.properties;
  }
  // The data is rich enough to exercise nesting and every kind of statement.
  EXPECT_GT(total.objects, 400);
  EXPECT_GT(total.properties, 8000);
  EXPECT_GT(total.statements, 12000);
}

TEST(RoundTrip, TheCheckNoticesALostLine) {
  Generator gen(7);
  auto ds = gen.DataSheet();
  ds->lID = 12;
  std::string sc;
  const std::string text = ds->GetScript(sc, 0);
  const std::string line = ".lID = 12\r\n";
  ASSERT_NE(text.find(line), std::string::npos);
  std::string damaged = text;
  damaged.erase(damaged.find(line), line.size());
  ObjectRef fresh = CreateObject("DSInfo");
  RunScript(damaged, fresh, 0);
  EXPECT_NE(ScriptByName(fresh, 0), text);
}

TEST(RoundTrip, ReaderRejectsFormsTheWriterNeverWrites) {
  const char* bad[] = {
      ".lID = 012\r\n",            // not a plain decimal
      "\t.lID = 1\r\n",            // indented deeper than its block
      ".lID = 1\n",                // no CR
      "With X\r\n",                // unknown variable
      ".sCaption = \"open\r\n",    // unterminated text
      "End With\r\n",              // nothing to close
      "Dim CI As Integer\r\n",     // a type the writer never declares
  };
  for (const char* text : bad) {
    SCOPED_TRACE(text);
    EXPECT_THROW(RunScript(text, CreateObject("DSInfo"), 0), std::runtime_error);
  }
}

}  // namespace
}  // namespace xal
