// The numbered UI string table and GetUIString. The texts are data: one row per number with the
// English and the Estonian text, CR LF standing for a line break inside a text. The third
// language column exists in the table but has no texts of its own and repeats the English ones.
#include "collections/ui_strings.h"

#include <algorithm>
#include <array>
#include <string_view>

#include "runtime/convert.h"

namespace xal {

namespace {

struct UIRow {
  int32_t number;
  std::string_view english;
  std::string_view estonian;
};

// clang-format off
constexpr UIRow kUITexts[] = {
    {1, "Amount discount", "Allahindlus summast"},
    {2, "Pricelist discount", "Allahindlus hinnakirjast"},
    {3, "Find production costs", "Korrasta toodangu hinnad"},
    {4, "Client card", "Kliendikaart"},
    {5, "Series", "Seeria"},
    {6, "Lot", "Partii"},
    {7, "Set", "Komplekt"},
    {8, "Particular", "Detail"},
    {9, "Reversed Set", "Elemendid arvele"},
    {10, "warehouses", "laod"},
    {11, "departments", "osakonnad"},
    {12, "projects", "projektid"},
    {13, "workers", "teostajad"},
    {14, "registers", "registrid"},
    {15, "companies", "firmad"},
    {16, "Percent", "Protsent"},
    {17, "expenditure", "väljaminek"},
    {18, "income", "sissetulek"},
    {19, "Item", "Kaup"},
    {20, "Production", "Toodang"},
    {21, "Service", "Teenus"},
    {22, "Partial", "Poolik"},
    {23, "Exported", "Eksporditud"},
    {24, "Finished", "Lõpetatud"},
    {25, "Missing book. algorithm", "Puudub kont. kirjeldus"},
    {26, "Error on saving doc.", "Viga dok. salvestamisel"},
    {27, "Invalid book. algorithm", "Vigane kont. kirjeldus"},
    {28, "Doc. is edited", "Dokument redigeerimisel"},
    {29, "Error on booking", "Viga konteerimisel"},
    {30, "Not bookable", "Mitte konteeritav"},
    {31, "Booked", "Konteeritud"},
    {32, "Creation error", "Viga tekitamisel"},
    {33, "Purchase invoice", "Ostuarve"},
    {34, "Sales invoice", "Arve"},
    {35, "Prepayment", "Ettemaks"},
    {36, "Pre-reservation", "Eelreserveering"},
    {37, "Reservation", "Reserveering"},
    {38, "Receipt", "Sissetulek"},
    {39, "Shipment", "Lähetus"},
    {40, "Expense", "Kuludokument"},
    {41, "Movement", "Laoliikumine"},
    {42, "Assembly", "Komplekteerimine"},
    {43, "Archived", "Arhiveeritud"},
    {44, "Yes", "Jah"},
    {45, "No", "Ei"},
    {46, "Date", "Kuupäev"},
    {47, "Last Used", "Viimati kasutatud"},
    {48, "Archive selected records?", "Kas arhiveerida valitud kirjed?"},
    {49, "Archive salary personal accounts?", "Kas arhiveerida palga isikukaardid?"},
    {50, "Archive employee records?", "Kas arhiveerida töötaja?"},
    {51, "Warehouse document", "Ladu välja"},
    {52, "Print prepayment invoice", "Trüki ettemaksu arve"},
    {53, "Show unused records", "Näita kasutamata kirjeid"},
    {54, "Add lots", "Partiide lisamine"},
    {55, "Interest note info", "Viivisarvete info"},
    {56, "Archive Records", "Arhiveeri kirjed"},
    {57, "Prepayment invoice", "Ettemaksu arve"},
    {58, "Report form", "Trükis"},
    {59, "Error: ", "Viga: "},
    {60, "Checking lot on hand...", "Kontrollitakse partiide laoseisu..."},
    {61, "Checking quantity on hand...", "Kontrollitakse laoseisu..."},
    {62, "Insufficient item '%s' in warehouse '%s'.\r\nRequired quantity %s on hand %s", "Artiklit '%s' ei ole laos '%s' piisavalt.\r\nVajalik kogus %s laos %s"},
    {63, "Insufficient item '%s' lot '%s' in warehouse '%s'.\r\nRequired quantity %s lot on hand %s", "Artikli '%s' partiid '%s' ei ole laos '%s' piisavalt.\r\nVajalik kogus %s partii jääk %s"},
    {64, "Insufficient item set '%s' element '%s' in warehouse '%s'.\r\nRequired quantity %s on hand %s", "Komplekti '%s' elementi '%s' ei ole laos '%s' piisavalt.\r\nVajalik kogus %s laos %s"},
    {65, "Warehouse '%s' has item '%s' on hand %s %s", "Laos '%s' on '%s' tegelik laoseis %s %s"},
    {66, "Receiving warehouse '%s' has item '%s' on hand %s %s", "Saaja laos '%s' on '%s' tegelik laoseis %s %s"},
    {67, "Lot quantity cannot be negative", "Negatiivse kogusega partiid ei saa arvele võtta"},
    {68, "Missing doc. series", "Puudub dokumendi seeria"},
    {69, "Analogous document already exists. Overwrite?", "Sarnane dokument juba eksisteerib. Kas salvestada?"},
    {70, "Warehouse required", "Ladu peab olema täidetud"},
    {71, "Incorrect reference no. checksum, correct value is %s", "Viitenumbri kontrolljärk on vale, õige on %s"},
    {72, "Document date outside allowed date range. Do you want to proceed?", "Kuupäev lubatud vahemikust väljas. Kas jätkata?"},
    {73, "Due date earlier than document date", "Maksetähtaeg on dokumendi kuupäevast väiksem"},
    {74, "Replace %s on document rows?", "Kas lisada ridadele uued %s?"},
    {75, "Delete tax on document rows?", "Kas kustutada ridade maksulipp?"},
    {76, "On hand %s, critical %s", "Jääk %s, kriitiline %s"},
    {77, "Price with minimal markup is %s", "Minimaalse katteprotsendiga hind on %s"},
    {78, "Set part '%s' price with minimal markup is %s", "Komplekti elemendi '%s' minimaalse katteprotsendiga hind on %s"},
    {79, "Recompute all header fields?", "Kas arvutada üle kõik päise väljad?"},
    {80, "Recompute row amounts?", "Kas arvutada uued ridade summad?"},
    {81, "Warehouse needed for lot selection", "Partiide valikuks peab ladu olema määratud"},
    {82, "Client card does not exist", "Kliendikaarti ei leidu"},
    {83, "Client card has expired", "Kliendikaart on aegunud"},
    {84, "Finding set rows...", "Leitakse komplekti ridu..."},
    {85, "Company cannot be changed on batch invoice", "Koondarvel ei ole firma muutmine lubatud"},
    {86, "Company cannot be changed: a related batch invoice exists", "Firma muutmine ei ole lubatud: dokumendiga on seotud koondarve"},
    {87, "Finding credit limit...", "Leitakse krediidilimiiti..."},
    {88, "Company '%s' credit limit is exceeded: unpaid invoices %s - credit limit %s", "Firma '%s' krediidilimiit on ületatud: tasumata arveid %s - krediidilimiit %s"},
    {89, "Save document?", "Kas salvestada dokument?"},
    {90, "Error in script '%s': (%s) %s", "Viga skriptis '%s': (%s) %s"},
    {91, "Find production costs?", "Kas korrastada toodangu hinnad?"},
    {92, "Finding production costs...", "Korrastatakse toodangu hindu..."},
    {93, "Updating production costs", "Toodangu hindade korrastamine"},
    {94, "Set rows are missing", "Puuduvad komplekti read"},
    {95, "No prepayment invoices", "Ettemaksuarveid pole"},
    {96, "Pre-reservations not allowed", "Eelreserveeringud ei ole lubatud"},
    {97, "Setting filter...", "Rakendatakse filtrit..."},
    {98, "Lots with negative quantity exist. No new lots can be added.", "Partiides esineb negatiivseid koguseid, partiide lisamine pole võimalik"},
    {99, "Lots are currently added by another user", "Partiisid juba lisatakse teise kasutaja poolt"},
    {100, "Adding lots...", "Lisatakse partiisid..."},
};
// clang-format on

constexpr int32_t kFirst = 1;
constexpr int32_t kLast = 100;
constexpr bool NumberedInOrder() {
  for (size_t i = 0; i < std::size(kUITexts); ++i)
    if (kUITexts[i].number != kFirst + static_cast<int32_t>(i)) return false;
  return std::size(kUITexts) == kLast - kFirst + 1;
}
static_assert(NumberedInOrder(), "one row per number, in number order");

// Columns as the language identifiers number them: 3 English, 4 Estonian, 5 the third language.
constexpr int32_t kFirstColumn = kLangEnglish;
constexpr int32_t kColumns = 3;

struct UIStringTable {
  bool built = false;
  std::array<std::array<std::string, kColumns>, kLast + 1> cells;  // [number][language - 3]
};

thread_local int32_t tCurrentLangID = 0;
thread_local UIStringTable tTable;

// Stores one row. An empty Estonian or third-language text falls back to the English one, so a
// lookup in any column always finds a text.
void SetUIString(int32_t number, std::string_view english, std::string_view estonian, std::string_view third) {
  auto& row = tTable.cells[static_cast<size_t>(number)];
  row[0] = english;
  row[1] = estonian.empty() ? english : estonian;
  row[2] = third.empty() ? english : third;
}

void InitUIStrings() {
  for (const UIRow& r : kUITexts) SetUIString(r.number, r.english, r.estonian, {});
  tTable.built = true;
}

// The stored text for the current language; an unknown language reads the English column.
const std::string& TextFor(int32_t number) {
  const auto& row = tTable.cells[static_cast<size_t>(number)];
  const int32_t lang = tCurrentLangID;
  if (lang >= kFirstColumn && lang < kFirstColumn + kColumns) {
    const std::string& text = row[static_cast<size_t>(lang - kFirstColumn)];
    if (!text.empty()) return text;
  }
  return row[0];
}

}  // namespace

int32_t CurrentLangID() { return tCurrentLangID; }
void SetCurrentLangID(int32_t langId) { tCurrentLangID = langId; }
bool UIStringTableBuilt() { return tTable.built; }

std::string GetUIString(int32_t number, std::span<const Variant> args) {
  if (number < kFirst || number > kLast) return {};
  if (!tTable.built) InitUIStrings();
  const std::string& text = TextFor(number);
  if (args.empty()) return text;
  // A Null argument adds nothing.
  std::vector<std::string> texts;
  texts.reserve(args.size());
  for (const Variant& a : args) texts.push_back(a.IsNull() ? std::string() : CStr(a));
  return FillPlaceholders(text, texts);
}

std::string FillPlaceholders(std::string_view text, std::span<const std::string> args) {
  std::string out;
  size_t next = 0, start = 0;
  for (size_t at = text.find("%s"); at != std::string_view::npos; at = text.find("%s", start)) {
    out += text.substr(start, at - start);
    if (next < args.size()) out += args[next++];
    start = at + 2;
  }
  out += text.substr(start);
  while (next < args.size()) out += args[next++];
  return out;
}

}  // namespace xal
