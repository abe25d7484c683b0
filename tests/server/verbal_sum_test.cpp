// Amounts in words in the four languages: singular and plural words, teens and tens, hundreds,
// thousands and millions, cents, signs, unknown currencies and the upper-case flag.
#include "server/verbal_sum.h"

#include <gtest/gtest.h>

namespace xal::server {
namespace {

TEST(VerbalSum, Words) {
  struct Row {
    Variant amount;
    const char* lang;
    const char* cur;
    bool upper;
    const char* expected;
  } rows[] = {
      {Variant(1), "EST", "EEK", true, "Üks kroon ja 00 senti"},
      {Variant(2), "EST", "EEK", true, "Kaks krooni ja 00 senti"},
      {Variant(0.5), "ENG", "USD", true, "Null dollars and 50 cents"},
      {Variant(21.01), "EST", "eek", true, "Kakskümmend üks krooni ja 01 sent"},
      {Variant(-5), "LAT", "LVL", true, "- Pieci LVL un 00 "},
      {Variant(123.05), "ENG", "EEK", true, "One hundred twenty three kroons and 05 cents"},
      {Variant(1000000), "ENG", "USD", true, "One million dollars and 00 cents"},
      {Variant(1000), "EST", "EEK", true, "Üks tuhat krooni ja 00 senti"},
      {Variant(13.5), "ENG", "USD", false, "thirteen dollars and 50 cents"},
      {Variant(45), "ENG", "XYZ", true, "Forty five XYZ and 00 "},             // unknown currency: the code
      {Variant(12), "ENG", "DEM", true, "Twelve marks and 00 pennies"},
      {Variant(11.01), "ENG", "LVL", true, "Eleven lats and 01 santim"},
      {Variant(80), "ENG", "USD", true, "Eighty dollars and 00 cents"},
      {Variant(215), "ENG", "USD", true, "Two hundred fifteen dollars and 00 cents"},
      {Variant(2002001), "ENG", "USD", true, "Two millions two thousand one dollars and 00 cents"},
      {Variant(1234567.89), "EST", "EEK", true,
       "Üks miljon kakssada kolmkümmend neli tuhat viissada kuuskümmend seitse krooni ja 89 senti"},
      {Variant(-10), "EST", "USD", true, "miinus Kümme dollarit ja 00 senti"},
      {Variant(111), "LAT", "LVL", true, "Simts vienpadsmit LVL un 00 "},
      {Variant(342), "LAT", "LVL", true, "Trīs simti četrdesmit divi LVL un 00 "},
      {Variant(1001), "LAT", "LVL", true, "Viens tūkstotis viens LVL un 00 "},
      {Variant(2000000), "LAT", "LVL", true, "Divi miljoni LVL un 00 "},
      {Variant(112), "LIT", "LTL", true, "Šimtas dvylika LTL ir 00 "},  // one hundred agrees: šimtas
      {Variant(211), "LIT", "LTL", true, "Du šimtai vienuolika LTL ir 00 "},
      {Variant(34), "LIT", "LTL", true, "Trisdešimt keturi LTL ir 00 "},
      {Variant(15), "LIT", "LTL", true, "Penkiolika LTL ir 00 "},
      {Variant(1000), "LIT", "LTL", true, "Vienas tūkstantis LTL ir 00 "},
      {Variant(3000), "LIT", "LTL", true, "Trys tūkstančiai LTL ir 00 "},
      {Variant(10), "LIT", "LTL", true, "Dešimt LTL ir 00 "},
      {Variant(0.99), "ENG", "USD", true, "Null dollars and 99 cents"},
      {Variant(1.005), "ENG", "USD", true, "One dollar and 01 cent"},    // rounded half away first
      {Variant("12.50"), "ENG", "USD", true, "Twelve dollars and 50 cents"},
      {Variant("abc"), "ENG", "USD", true, ""},                          // not a number: nothing
      {Variant::Null(), "ENG", "USD", true, ""},                         // Null: nothing
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.expected);
    EXPECT_EQ(VerbalSum(r.amount, r.lang, r.cur, r.upper), r.expected);
  }
}

TEST(VerbalSum, CurrencyWordLanguageFollowsThePattern) {
  // "ENGLISH" counts as English for the currency words but not for the number words.
  EXPECT_EQ(VerbalSum(Variant(2), "ENGLISH", "USD"), "Kaks dollars ja 00 cents");
  // Any code with L?T has no currency names.
  EXPECT_EQ(VerbalSum(Variant(2), "XLAT", "USD"), "Kaks USD ja 00 ");
}

TEST(VerbalSum, BillionsAndAboveAThousandBillions) {
  EXPECT_EQ(VerbalSum(Variant(3000000000.0), "ENG", "USD"), "Three billions dollars and 00 cents");
  EXPECT_EQ(VerbalSum(Variant(1234000000000.0), "ENG", "USD"), "1234 billions dollars and 00 cents");
}

}  // namespace
}  // namespace xal::server
