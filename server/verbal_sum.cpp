// Amounts in words: the integer part spelled out in English, Estonian, Latvian or Lithuanian,
// then the currency's unit word, a conjunction, the cents as two digits and the cent word.
// Words are assembled from digit stems and suffixes ("kaks" + "kümmend "), so every table below
// keeps the trailing blanks that separate the words of the result.
#include "server/verbal_sum.h"

#include <array>

#include "runtime/convert.h"
#include "runtime/format.h"
#include "runtime/text.h"
#include "runtime/trap.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {

enum class Lang { English, Estonian, Latvian, Lithuanian };

struct LangWords {
  const char* hundred;
  const char* tens;
  const char* teen;
  const char* minus;
  const char* conjunction;
  std::array<const char*, 6> groups;  // billion 1/n, million 1/n, thousand 1/n
};

constexpr LangWords kWords[] = {
    {" hundred ", "ty ", "teen ", "minus ", " and ",
     {"billion ", "billions ", "million ", "millions ", "thousand ", "thousand "}},
    {"sada ", "kümmend ", "teist ", "miinus ", " ja ",
     {"miljard ", "miljardit ", "miljon ", "miljonit ", "tuhat ", "tuhat "}},
    {" simti ", "desmit ", "padsmit ", "- ", " un ",
     {"miljards ", "miljardi ", "miljons ", "miljoni ", "tūkstotis ", "tūkstoši "}},
    {" šimtai ", "dešimt ", "olika ", "- ", " ir ",
     {"milijardas ", "milijardai ", "milijonas ", "milijonai ", "tūkstantis ", "tūkstančiai "}},
};

const LangWords& WordsOf(Lang l) { return kWords[static_cast<int>(l)]; }

// Currency words: unit singular, unit plural, cent singular, cent plural — English, then Estonian.
struct CurrencyWords {
  const char* code;
  std::array<const char*, 4> english;
  std::array<const char*, 4> estonian;
};

constexpr CurrencyWords kCurrencies[] = {
    {"EEK", {"kroon", "kroons", "cent", "cents"}, {"kroon", "krooni", "sent", "senti"}},
    {"USD", {"dollar", "dollars", "cent", "cents"}, {"dollar", "dollarit", "sent", "senti"}},
    {"DEM", {"mark", "marks", "penny", "pennies"}, {"mark", "marka", "penn", "penni"}},
    {"FIM", {"mark", "marks", "penny", "pennies"}, {"mark", "marka", "penn", "penni"}},
    {"LVL", {"lat", "lats", "santim", "santims"}, {"latt", "latti", "santiim", "santiimi"}},
    {"LTL", {"lit", "lits", "cent", "cents"}, {"litt", "litti", "sent", "senti"}},
};

// Stems per digit 1..9 and 0 (ten): the plain form, and the form used before the tens and teen
// suffixes where the language shortens it.
struct DigitStems {
  const char* plain;
  const char* joined;
};

constexpr DigitStems kEstonian[] = {{"kümme", "kümme"}, {"üks", "üks"},     {"kaks", "kaks"},     {"kolm", "kolm"},
                                    {"neli", "neli"},   {"viis", "viis"},   {"kuus", "kuus"},     {"seitse", "seitse"},
                                    {"kaheksa", "kaheksa"}, {"üheksa", "üheksa"}};
constexpr DigitStems kLatvian[] = {{"desmit", "desmit"}, {"viens", "vien"},   {"divi", "div"},       {"trīs", "trīs"},
                                   {"četri", "četr"},    {"pieci", "piec"},   {"seši", "seš"},       {"septiņi", "septiņ"},
                                   {"astoņi", "astoņ"},  {"deviņi", "deviņ"}};
constexpr DigitStems kLithuanian[] = {{"dešimt", "dešimt"},   {"vienas", "vienu"},     {"du", "dvi"},
                                      {"trys", "tris"},       {"keturi", "keturias"},  {"penki", "penkias"},
                                      {"šeši", "šešias"},     {"septyni", "septynias"}, {"aštuoni", "aštuonias"},
                                      {"devyni", "devynias"}};

std::string EnglishDigit(int d, const std::string& suffix, const std::string& s) {
  const bool ty = s == "ty", teen = s == "teen";
  switch (d) {
    case 1: return teen ? "eleven " : "one" + suffix;
    case 2: return teen ? "twelve " : ty ? "twenty " : "two" + suffix;
    case 3: return (ty || teen) ? "thir" + suffix : "three" + suffix;
    case 4: return ty ? "forty " : "four" + suffix;
    case 5: return (ty || teen) ? "fif" + suffix : "five" + suffix;
    case 6: return "six" + suffix;
    case 7: return "seven" + suffix;
    case 8: return (ty || teen) ? "eigh" + suffix : "eight" + suffix;
    case 9: return "nine" + suffix;
    default: return "ten" + suffix;
  }
}

std::string LatvianDigit(int d, const std::string& suffix, const std::string& s) {
  if (d == 1 && s == "simti") return "simts ";
  const bool shortForm = s == "padsmit" || (s == "desmit" && d != 1);
  return std::string(shortForm ? kLatvian[d].joined : kLatvian[d].plain) + suffix;
}

std::string LithuanianDigit(int d, const std::string& suffix, const std::string& s) {
  if (s == "olika") {
    if (d == 2) return "dvylika ";
    if (d == 3) return "trylika ";
    if (d == 1) return std::string(kLithuanian[1].joined) + suffix;
    return std::string(kLithuanian[d].plain) + suffix;
  }
  // One hundred agrees in number: "šimtas", as the Latvian "simts" does.
  if (d == 1 && s == "šimtai") return "šimtas ";
  return std::string(s == "dešimt" && d != 1 ? kLithuanian[d].joined : kLithuanian[d].plain) + suffix;
}

// The word for digit d (0 meaning ten) joined to `suffix`.
std::string VerbalDigit(int d, const std::string& suffix, Lang lang) {
  const std::string s = Trim(suffix);
  switch (lang) {
    case Lang::English: return EnglishDigit(d, suffix, s);
    case Lang::Latvian: return LatvianDigit(d, suffix, s);
    case Lang::Lithuanian: return LithuanianDigit(d, suffix, s);
    case Lang::Estonian: return std::string(kEstonian[d].plain) + suffix;
  }
  return "";
}

// One group of up to three digits with its group word; a larger group is written in digits.
std::string VerbalGroup(int64_t n, const std::string& groupWord, Lang lang) {
  if (n > 999) return Format(Variant(static_cast<double>(n)), "0 ") + groupWord;
  const LangWords& w = WordsOf(lang);
  std::string text;
  const int h = static_cast<int>(n / 100);
  if (h > 0) text = VerbalDigit(h, w.hundred, lang);
  const int t = static_cast<int>((n - 100 * h) / 10), r = static_cast<int>(n - 100 * h - 10 * t);
  if (t >= 2) {
    text += VerbalDigit(t, w.tens, lang);
    if (r > 0) text += VerbalDigit(r, " ", lang);
  } else if (t == 1) {
    text += r > 0 ? VerbalDigit(r, w.teen, lang) : VerbalDigit(0, " ", lang);
  } else if (r > 0) {
    text += VerbalDigit(r, " ", lang);
  }
  return text + groupWord;
}

Lang NumberLanguage(const std::string& code) {
  if (TextEquals(code, "ENG")) return Lang::English;
  if (TextEquals(code, "LAT")) return Lang::Latvian;
  if (TextEquals(code, "LIT")) return Lang::Lithuanian;
  return Lang::Estonian;
}

// Unit and cent words: English or Estonian names of a known currency; otherwise (and for the
// Latvian and Lithuanian texts, which have no names) the code itself and no cent word.
std::array<std::string, 4> CurrencyNames(const std::string& lang, const std::string& cur) {
  const std::string upper = UCase(lang);
  const bool english = InStr(upper, "ENG") > 0;
  const bool none = !english && Like(upper, "*L?T*");
  if (!none)
    for (const auto& c : kCurrencies)
      if (TextEquals(c.code, cur)) {
        const auto& w = english ? c.english : c.estonian;
        return {w[0], w[1], w[2], w[3]};
      }
  return {cur, cur, "", ""};
}

}  // namespace

std::string VerbalSum(const Variant& pToConvert, const std::string& pConvLang, const std::string& pCurCode,
                      bool pUpperCase, const std::string&, const std::string&) {
  std::string result;
  // Appends as it goes, so an error leaves the text built so far.
  TryStep([&] {
    Currency a = CCur(Round(pToConvert, 2));
    const bool neg = a.raw() < 0;
    if (neg) a = -a;
    const Lang lang = NumberLanguage(pConvLang);
    const LangWords& w = WordsOf(lang);
    const auto names = CurrencyNames(pConvLang, pCurCode);
    const int64_t whole = a.raw() / Currency::kScale;
    const int64_t cents = (a.raw() % Currency::kScale) / 100;
    std::string text;
    if (a.raw() <= 9900) {
      text = "null ";
    } else {
      const int64_t parts[] = {whole / 1000000000, whole / 1000000 % 1000, whole / 1000 % 1000, whole % 1000};
      for (int g = 0; g < 4; ++g) {
        if (parts[g] <= 0) continue;
        const std::string word = g == 3 ? "" : w.groups[static_cast<size_t>(2 * g + (parts[g] == 1 ? 0 : 1))];
        text += VerbalGroup(parts[g], word, lang);
      }
    }
    if (pUpperCase) text = UCase(Left(text, 1)) + Mid(text, 2);
    result = neg ? w.minus : "";
    result += text;
    result += names[whole == 1 ? 0 : 1];
    result += w.conjunction;
    result += (cents <= 9 ? "0" : "") + std::to_string(cents) + " ";
    result += names[cents == 1 ? 2 : 3];
  });
  return result;
}

}  // namespace xal::server
