// The UI string table: texts in both languages, the languages the identifiers select, "%s"
// filling with too few, too many and Null arguments, numbers outside the table, and the
// per-thread state (language and table) of the module.
#include "collections/ui_strings.h"

#include <gtest/gtest.h>

#include <thread>

#include "runtime/text.h"

namespace xal {
namespace {

// Sets the thread's language for one test and puts the old one back.
class LangScope {
 public:
  explicit LangScope(int32_t lang) : saved_(CurrentLangID()) { SetCurrentLangID(lang); }
  ~LangScope() { SetCurrentLangID(saved_); }

 private:
  int32_t saved_;
};

struct Row {
  int32_t number;
  std::vector<Variant> args;
  const char* english;
  const char* estonian;
};

std::string Look(const Row& r) { return GetUIString(r.number, std::span<const Variant>(r.args)); }

TEST(UIStrings, TextsAndFillingInBothLanguages) {
  const Row rows[] = {
      {44, {}, "Yes", "Jah"},
      {1, {}, "Amount discount", "Allahindlus summast"},
      {24, {}, "Finished", "Lõpetatud"},
      {59, {}, "Error: ", "Viga: "},
      {100, {}, "Adding lots...", "Lisatakse partiisid..."},
      {71, {Variant(7)}, "Incorrect reference no. checksum, correct value is 7",
       "Viitenumbri kontrolljärk on vale, õige on 7"},
      {65, {Variant("W1"), Variant("A1")}, "Warehouse 'W1' has item 'A1' on hand  ",  // two missing: dropped
       "Laos 'W1' on 'A1' tegelik laoseis  "},
      {65, {}, "Warehouse '%s' has item '%s' on hand %s %s", "Laos '%s' on '%s' tegelik laoseis %s %s"},
      {65, {Variant("W1"), Variant("A1"), Variant(2.5), Variant("pcs")}, "Warehouse 'W1' has item 'A1' on hand 2.5 pcs",
       "Laos 'W1' on 'A1' tegelik laoseis 2.5 pcs"},
      {44, {Variant("!")}, "Yes!", "Jah!"},                               // surplus: appended as is
      {44, {Variant(1), Variant(2)}, "Yes12", "Jah12"},                   // several, without separators
      {71, {Variant::Null()}, "Incorrect reference no. checksum, correct value is ",  // Null adds nothing
       "Viitenumbri kontrolljärk on vale, õige on "},
      {90, {Variant("VGRCompany"), Variant::Null(), Variant("Type mismatch")},
       "Error in script 'VGRCompany': () Type mismatch", "Viga skriptis 'VGRCompany': () Type mismatch"},
      {90, {Variant("a"), Variant(13), Variant("m"), Variant("x")}, "Error in script 'a': (13) mx",
       "Viga skriptis 'a': (13) mx"},
      {76, {Variant(true), Variant()}, "On hand True, critical ", "Jääk True, kriitiline "},  // Empty is ""
      {62, {}, "Insufficient item '%s' in warehouse '%s'.\r\nRequired quantity %s on hand %s",
       "Artiklit '%s' ei ole laos '%s' piisavalt.\r\nVajalik kogus %s laos %s"},
      {63, {Variant("A"), Variant("L"), Variant("W"), Variant(5), Variant(3)},
       "Insufficient item 'A' lot 'L' in warehouse 'W'.\r\nRequired quantity 5 lot on hand 3",
       "Artikli 'A' partiid 'L' ei ole laos 'W' piisavalt.\r\nVajalik kogus 5 partii jääk 3"},
      {0, {}, "", ""},                 // below the table
      {101, {}, "", ""},               // above the table
      {-5, {Variant("x")}, "", ""},    // arguments do not help a bad number
  };
  for (int32_t lang : {kLangEnglish, kLangEstonian}) {
    LangScope scope(lang);
    for (const auto& r : rows) {
      SCOPED_TRACE("language " + std::to_string(lang) + ", text " + std::to_string(r.number));
      EXPECT_EQ(Look(r), lang == kLangEstonian ? r.estonian : r.english);
    }
  }
}

TEST(UIStrings, LanguageIdentifiers) {
  struct LangRow {
    int32_t lang;
    const char* text44;
  } rows[] = {
      {3, "Yes"},
      {4, "Jah"},
      {5, "Yes"},   // the third language has no texts of its own
      {7, "Yes"},   // an unknown language reads English
      {0, "Yes"},
      {-4, "Yes"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.lang);
    LangScope scope(r.lang);
    EXPECT_EQ(GetUIString(44), r.text44);
    EXPECT_EQ(CurrentLangID(), r.lang);
  }
}

TEST(UIStrings, EveryTextHasBothLanguagesWithTheSamePlaceholders) {
  for (int32_t n = 1; n <= 100; ++n) {
    SCOPED_TRACE(n);
    std::string en, et;
    {
      LangScope scope(kLangEnglish);
      en = GetUIString(n);
    }
    {
      LangScope scope(kLangEstonian);
      et = GetUIString(n);
    }
    EXPECT_FALSE(en.empty());
    EXPECT_FALSE(et.empty());
    EXPECT_NE(en, et);  // every Estonian text is a translation of its own
    EXPECT_EQ(Split(en, "%s").size(), Split(et, "%s").size());
    // Only the stock warnings 62 to 64 run over two lines.
    const bool twoLines = n >= 62 && n <= 64;
    EXPECT_EQ(Split(en, "\r\n").size(), twoLines ? 2u : 1u);
    EXPECT_EQ(Split(et, "\r\n").size(), twoLines ? 2u : 1u);
    {
      LangScope scope(kLangThird);
      EXPECT_EQ(GetUIString(n), en);
    }
  }
}

TEST(UIStrings, Text62IsTwoLines) {
  LangScope scope(kLangEnglish);
  const std::vector<std::string> lines = Split(GetUIString(62), "\r\n");
  ASSERT_EQ(lines.size(), 2u);
  EXPECT_EQ(lines[0], "Insufficient item '%s' in warehouse '%s'.");
  EXPECT_EQ(lines[1], "Required quantity %s on hand %s");
}

TEST(UIStrings, StateBelongsToTheThread) {
  LangScope scope(kLangEstonian);
  ASSERT_EQ(GetUIString(44), "Jah");
  struct Seen {
    int32_t langAtStart = -1;
    bool builtAtStart = true;
    bool builtAfterBadNumber = true;
    bool builtAfterLookUp = false;
    std::string text;
  } seen;
  std::thread other([&] {
    seen.langAtStart = CurrentLangID();
    seen.builtAtStart = UIStringTableBuilt();
    GetUIString(0);
    seen.builtAfterBadNumber = UIStringTableBuilt();  // a bad number does not build the table
    seen.text = GetUIString(44);
    seen.builtAfterLookUp = UIStringTableBuilt();
    SetCurrentLangID(kLangEnglish);
  });
  other.join();
  EXPECT_EQ(seen.langAtStart, 0);  // a new thread starts without a language: English
  EXPECT_FALSE(seen.builtAtStart);
  EXPECT_FALSE(seen.builtAfterBadNumber);
  EXPECT_TRUE(seen.builtAfterLookUp);
  EXPECT_EQ(seen.text, "Yes");
  EXPECT_EQ(CurrentLangID(), kLangEstonian);  // the other thread's change stayed there
}

}  // namespace
}  // namespace xal
