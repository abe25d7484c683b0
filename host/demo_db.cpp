// The demo data set's registers, written as tables of rows as they stand, and the build that
// writes them and then the stored documents (host/demo_documents.cpp) in one transaction.
#include "host/demo_db.h"

#include <sqlite3.h>

#include <cmath>
#include <filesystem>
#include <vector>

#include "host/demo_writer.h"
#include "host/host_error.h"
#include "runtime/convert.h"
#include "runtime/text.h"

namespace xal::host {

namespace demo {

double Money(double x) {
  const int64_t raw = std::llround(x * 10000.0);
  const int64_t cents = (raw >= 0 ? raw + 50 : raw - 50) / 100;
  return static_cast<double>(cents) / 100.0;
}

void Insert(Database& db, const char* table, const char* columns, const std::vector<Row>& rows) {
  size_t count = 1;
  for (const char* c = columns; *c; ++c) count += (*c == ',') ? 1 : 0;
  std::string sql = std::string("INSERT INTO ") + table + " (" + columns + ") VALUES (";
  for (size_t i = 0; i < count; ++i) sql += i ? ", ?" : "?";
  sql += ")";
  sqlite3_stmt* st = nullptr;
  if (sqlite3_prepare_v2(db.handle(), sql.c_str(), -1, &st, nullptr) != SQLITE_OK)
    Raise(kErrSql, std::string(sqlite3_errmsg(db.handle())) + " [" + sql + "]");
  try {
    for (const Row& r : rows) {
      if (r.size() != count)
        Raise(kErrSql, std::string("demo row of ") + table + " has " + std::to_string(r.size()) + " values, not " +
                           std::to_string(count));
      for (size_t i = 0; i < count; ++i) BindVariant(st, static_cast<int>(i + 1), r[i]);
      if (sqlite3_step(st) != SQLITE_DONE)
        Raise(kErrSql, std::string(sqlite3_errmsg(db.handle())) + " [" + sql + "]");
      sqlite3_reset(st);
      sqlite3_clear_bindings(st);
    }
  } catch (...) {
    sqlite3_finalize(st);
    throw;
  }
  sqlite3_finalize(st);
}

}  // namespace demo

namespace {

using demo::Insert;
using demo::kDateFixed;
using demo::Row;

// A date column value.
Variant D(int y, int m, int d) { return Variant(Date(DemoDay(y, m, d))); }
const Variant kNoDate = Variant(Date(0));

// ---------------------------------------------------------------------------------------------
// Currencies, units, taxes, categories, terms, people
// ---------------------------------------------------------------------------------------------

// The euro as base currency, the kroon as a triangulation currency, dated rates of the others.
void WriteCurrencies(Database& db) {
  Insert(db, "GRCurrency", "ID, Code, Name, FixedRate, DivThreshold, IsTriangulation", {
      {1, "EUR", "Euro", 1.0, 0, false},
      {2, "USD", "USA dollar", 0.70, 1, false},
      {3, "GBP", "Inglise nael", 1.12, 1, false},
      {4, "SEK", "Rootsi kroon", 0.097, 1, false},
      {5, "EEK", "Eesti kroon", 0.0639116, 0, true},
  });
  Insert(db, "GRCurValue", "IDGRCurrency, ChangeDate, ConversionRate", {
      {2, D(2009, 12, 1), 0.6645},
      {2, D(2010, 1, 4), 0.6942},
      {2, D(2010, 2, 1), 0.7186},
      {2, D(2010, 2, 3), 0.7143},
      {2, D(2010, 3, 1), 0.7345},
      {2, D(2010, 3, 5), 0.7315},
      {3, D(2009, 9, 10), 1.1240},
      {3, D(2009, 12, 1), 1.1003},
      {3, D(2010, 1, 4), 1.1198},
      {3, D(2010, 2, 1), 1.1452},
      {3, D(2010, 3, 1), 1.0996},
      {4, D(2009, 12, 1), 0.0965},
      {4, D(2010, 1, 4), 0.0975},
      {4, D(2010, 2, 1), 0.0968},
      {4, D(2010, 2, 15), 0.0958},
      {4, D(2010, 3, 1), 0.0999},
      {4, D(2010, 3, 5), 0.1012},
  });
}

// Units and VAT rates.
void WriteUnitsAndTaxes(Database& db) {
  // Alternative units name their first unit and how many of it they hold.
  Insert(db, "GRUnit", "ID, Code, Code_ENG, Name, IDFirst, Relation", {
      {1, "tk", "pcs", "Tükk", 0, 1.0},
      {2, "kg", "kg", "Kilogramm", 0, 1.0},
      {3, "l", "l", "Liiter", 0, 1.0},
      {4, "m", "m", "Meeter", 0, 1.0},
      {5, "h", "h", "Tund", 0, 1.0},
      {6, "pk", "pack", "Pakk (10 tk)", 1, 10.0},
      {7, "kst", "box", "Kast (24 tk)", 1, 24.0},
      {8, "g", "g", "Gramm", 2, 0.001},
      {9, "t", "t", "Tonn", 2, 1000.0},
  });
  Insert(db, "GRTax", "ID, Code, TaxPercent", {
      {1, "KM20", 20.0},
      {2, "KM9", 9.0},
      {3, "KM0", 0.0},
  });
}

// Price categories of articles and companies, article and company categories.
void WriteCategories(Database& db) {
  Insert(db, "GRArticlePriceCat", "ID, Code, Name, Category", {
      {1, "TOIT", "Toidukaubad", "Hind"},
      {2, "EHITUS", "Ehituskaubad", "Hind"},
      {3, "TEENUS", "Teenused", "Hind"},
  });
  Insert(db, "GRCompanyPriceCat", "ID, Code, Name, Category", {
      {1, "HULGI", "Hulgimüük", "Hind"},
      {2, "JAE", "Jaemüük", "Hind"},
      {3, "VIP", "Püsikliendid", "Hind"},
  });
  Insert(db, "GRArticleCat", "ID, Code, Name, Category", {
      {1, "JOOGID", "Joogid ja kohv", "Toit"},
      {2, "PIIM", "Piimatooted", "Toit"},
      {3, "TOORIIST", "Tööriistad", "Ehitus"},
      {4, "MATERJAL", "Ehitusmaterjalid", "Ehitus"},
      {5, "MUU", "Muu kaup", "Muu"},
  });
  Insert(db, "GRCompanyCat", "ID, Code, Name, Category", {
      {1, "EE", "Eesti partnerid", "Riik"},
      {2, "LV", "Läti partnerid", "Riik"},
      {3, "VALIS", "Muud välispartnerid", "Riik"},
  });
}

// Payment terms (with their instalment rows) and delivery terms.
void WriteTerms(Database& db) {
  Insert(db, "GRTermPayment", "ID, Code, Name, PromptTime, PenaltyPercent", {
      {1, "ETTEMAKS", "Ettemaks", 0, 0.0},
      {2, "14P", "14 päeva", 14, 0.05},
      {3, "30P", "30 päeva", 30, 0.1},
      {4, "7/30", "Pool 7 päeva, pool 30 päeva", 30, 0.15},
  });
  Insert(db, "GRTermPaymentRow", "IDGRTermPayment, PromptTime, PenaltyPercent", {
      {1, 0, 0.0},
      {2, 14, 0.05},
      {3, 30, 0.1},
      {4, 7, 0.15},
      {4, 30, 0.15},
  });
  Insert(db, "GRTermDelivery", "ID, Code, Name, DeliveryTime", {
      {1, "EXW", "Tehasest, Tallinn", 0},
      {2, "DAP", "Kohale toimetatud", 2},
      {3, "CPT", "Vedu tasutud, Riia", 5},
  });
}

// People, employees, sales people and the users who log in.
void WritePeople(Database& db) {
  Insert(db, "ERPerson", "ID, Code, Name", {
      {1, "MTAMM", "Mari Tamm"},
      {2, "JKALNINS", "Jānis Kalniņš"},
      {3, "PSEPP", "Peeter Sepp"},
  });
  Insert(db, "EREmployee", "ID, Code, Name, IDERPerson", {
      {1, "MTAMM", "Mari Tamm", 1},
      {2, "JKALNINS", "Jānis Kalniņš", 2},
      {3, "PSEPP", "Peeter Sepp", 3},
  });
  Insert(db, "WRPerson", "ID, Code, Name, IDEREmployee", {
      {1, "MTAMM", "Mari Tamm", 1},
      {2, "PSEPP", "Peeter Sepp", 3},
  });
  Insert(db, "XALUser", "ID, Code, Name, IDEREmployee, LangID", {
      {1, "ADMIN", "Administraator", 0, 4},
      {2, "MARI", "Mari Tamm", 1, 4},
      {3, "JANIS", "Jānis Kalniņš", 2, 3},
      {4, "PEETER", "Peeter Sepp", 3, 4},
  });
}

// Document types and number series, cash desks.
void WriteDocSeries(Database& db) {
  Insert(db, "GRDocType", "ID, Code, Name, DocType", {
      {1, "ARVE", "Müügiarve", "SDInvoice"},
      {2, "TELL", "Müügitellimus", "SDOrder"},
      {3, "SISSE", "Sissetulek", "PDReceiptD"},
      {4, "VALJA", "Väljastus", "SDConsignmD"},
      {5, "LIIK", "Laoliikumine", "DDMovement"},
      {6, "KOMPL", "Komplekteerimine", "DDProduction"},
  });
  Insert(db, "GRDocSeries", "ID, Code, Name, DocType, LastNo", {
      {1, "A", "Müügiarved", "SDInvoice", 0},
      {2, "T", "Tellimused", "SDOrder", 0},
      {3, "S", "Sissetulekud", "PDReceiptD", 0},
      {4, "V", "Väljastused", "SDConsignmD", 0},
      {5, "L", "Liikumised", "DDMovement", 0},
      {6, "K", "Komplekteerimised", "DDProduction", 0},
  });
  Insert(db, "VRCashDesk", "ID, Code, Name, IDGRCurrency", {
      {1, "KASSA", "Tallinna kassa", 1},
      {2, "KASSA-USD", "Valuutakassa", 2},
  });
}

// Accounting years and holidays.
void WriteCalendar(Database& db) {
  Insert(db, "BRAccountingYear", "ID, Code, BeginDate, EndDate", {
      {1, "2009", D(2009, 1, 1), D(2009, 12, 31)},
      {2, "2010", D(2010, 1, 1), D(2010, 12, 31)},
  });
  Insert(db, "GRHoliday", "HolidayDate, Name", {
      {D(2009, 12, 24), "Jõululaupäev"},
      {D(2009, 12, 25), "Esimene jõulupüha"},
      {D(2009, 12, 26), "Teine jõulupüha"},
      {D(2010, 1, 1), "Uusaasta"},
      {D(2010, 2, 24), "Iseseisvuspäev"},
      {D(2010, 4, 2), "Suur reede"},
      {D(2010, 4, 4), "Ülestõusmispühade 1. püha"},
      {D(2010, 5, 1), "Kevadpüha"},
      {D(2010, 5, 23), "Nelipühade 1. püha"},
      {D(2010, 6, 23), "Võidupüha"},
      {D(2010, 6, 24), "Jaanipäev"},
      {D(2010, 8, 20), "Taasiseseisvumispäev"},
      {D(2010, 12, 24), "Jõululaupäev"},
      {D(2010, 12, 25), "Esimene jõulupüha"},
      {D(2010, 12, 26), "Teine jõulupüha"},
  });
}

// The small registers the rest of the data refers to.
void WriteBasics(Database& db) {
  WriteCurrencies(db);
  WriteUnitsAndTaxes(db);
  WriteCategories(db);
  WriteTerms(db);
  WritePeople(db);
  WriteDocSeries(db);
  WriteCalendar(db);
}

// ---------------------------------------------------------------------------------------------
// Price lists (chains through IDFirst; EndDate 0 is open), certified lists, price categories
// ---------------------------------------------------------------------------------------------

// Price lists and their article prices.
void WritePriceLists(Database& db) {
  Insert(db, "GRPriceList",
         "ID, Code, Name, IDFirst, BeginDate, EndDate, IsBruto, WithoutPriceCut, IDGRCurrency", {
      {1, "BASE", "Põhihinnakiri", 0, D(2009, 1, 1), kNoDate, false, false, 1},
      {2, "BASE2010", "Põhihinnakiri 2010", 1, D(2010, 1, 1), kNoDate, false, false, 1},
      {3, "HULGI-Q1", "Hulgihinnad 2010 I kvartal", 2, D(2010, 1, 1), D(2010, 3, 31), false, false, 1},
      {4, "HULGI-2009", "Hulgihinnad 2009", 1, D(2009, 1, 1), D(2009, 12, 31), false, false, 1},
      {5, "JAE", "Jaehinnad käibemaksuga", 2, D(2009, 1, 1), kNoDate, true, false, 1},
      {6, "OMAHIND", "Omahinnad", 0, D(2009, 1, 1), kNoDate, false, true, 1},
      {7, "KOMPLEKT", "Komplektide hinnad", 6, D(2009, 1, 1), kNoDate, false, true, 1},
      {8, "TAMM", "Tamme Ehituse erihinnad", 3, D(2010, 1, 1), D(2010, 12, 31), false, true, 1},
      {9, "OST-VORU", "Võru Piimatööstuse ostuhinnad", 0, D(2009, 1, 1), kNoDate, false, false, 1},
      {10, "LV-EUR", "Latvijas cenrādis", 2, D(2010, 1, 1), kNoDate, false, false, 1},
  });
  Insert(db, "GRPriceListRel", "ID, IDGRPriceList, IDGRArticle, IDGRUnit, Price, BeginDate, EndDate", {
      {101, 1, 1, 1, 3.10, D(2009, 1, 1), kNoDate},
      {102, 1, 2, 1, 1.45, D(2009, 1, 1), kNoDate},
      {103, 1, 3, 2, 8.60, D(2009, 1, 1), kNoDate},
      {104, 1, 4, 2, 16.90, D(2009, 1, 1), kNoDate},
      {105, 1, 5, 1, 12.50, D(2009, 1, 1), kNoDate},
      {106, 1, 6, 1, 3.90, D(2009, 1, 1), kNoDate},
      {107, 1, 7, 1, 13.90, D(2009, 1, 1), kNoDate},
      {108, 1, 8, 1, 79.00, D(2009, 1, 1), kNoDate},
      {109, 1, 9, 6, 3.60, D(2009, 1, 1), kNoDate},
      {110, 1, 10, 1, 4.90, D(2009, 1, 1), kNoDate},
      {111, 1, 11, 1, 38.50, D(2009, 1, 1), kNoDate},
      {112, 1, 12, 1, 4.40, D(2009, 1, 1), kNoDate},
      {113, 1, 13, 3, 0.79, D(2009, 1, 1), kNoDate},
      {114, 1, 14, 5, 25.00, D(2009, 1, 1), kNoDate},
      {115, 1, 15, 5, 18.00, D(2009, 1, 1), kNoDate},
      {116, 1, 16, 1, 24.90, D(2009, 1, 1), kNoDate},
      {117, 1, 17, 1, 129.00, D(2009, 1, 1), kNoDate},
      {118, 1, 18, 1, 0.95, D(2009, 1, 1), kNoDate},
      {201, 2, 1, 1, 3.30, D(2010, 1, 1), D(2010, 2, 28)},
      {202, 2, 1, 1, 3.45, D(2010, 3, 1), kNoDate},
      {203, 2, 3, 2, 8.90, D(2010, 1, 1), kNoDate},
      {204, 2, 8, 1, 89.00, D(2010, 1, 1), kNoDate},
      {205, 2, 12, 1, 4.60, D(2010, 1, 1), kNoDate},
      {206, 2, 11, 1, 39.90, D(2010, 1, 1), kNoDate},
      {207, 2, 13, 3, 0.79, D(2010, 1, 1), kNoDate},
      {301, 3, 1, 1, 2.95, D(2010, 1, 1), kNoDate},
      {302, 3, 2, 1, 1.25, D(2010, 1, 1), kNoDate},
      {303, 3, 10, 1, 4.40, D(2010, 1, 1), kNoDate},
      {304, 3, 12, 1, 3.95, D(2010, 1, 1), kNoDate},
      {305, 3, 7, 1, 12.20, D(2010, 1, 1), kNoDate},
      {401, 4, 1, 1, 2.85, D(2009, 1, 1), kNoDate},
      {402, 4, 3, 2, 7.90, D(2009, 1, 1), kNoDate},
      {501, 5, 1, 1, 3.99, D(2009, 1, 1), kNoDate},
      {502, 5, 2, 1, 1.79, D(2009, 1, 1), kNoDate},
      {503, 5, 5, 1, 13.90, D(2009, 1, 1), kNoDate},
      {504, 5, 6, 1, 4.49, D(2009, 1, 1), kNoDate},
      {505, 5, 16, 1, 29.90, D(2009, 1, 1), kNoDate},
      {601, 6, 16, 1, 14.20, D(2009, 1, 1), kNoDate},
      {602, 6, 17, 1, 71.00, D(2009, 1, 1), kNoDate},
      {701, 7, 16, 1, 15.00, D(2009, 1, 1), kNoDate},
      {801, 8, 8, 1, 82.00, D(2010, 1, 1), kNoDate},
      {802, 8, 17, 1, 115.00, D(2010, 1, 1), kNoDate},
      {901, 9, 1, 1, 2.10, D(2009, 1, 1), kNoDate},
      {902, 9, 2, 1, 0.95, D(2009, 1, 1), kNoDate},
      {903, 9, 3, 2, 5.80, D(2009, 1, 1), kNoDate},
      {904, 9, 13, 3, 0.45, D(2009, 1, 1), kNoDate},
      {905, 9, 18, 1, 0.60, D(2009, 1, 1), kNoDate},
      {1001, 10, 12, 1, 4.60, D(2010, 1, 1), kNoDate},
      {1002, 10, 11, 1, 39.90, D(2010, 1, 1), kNoDate},
  });
}

// Quantity prices and the price-category rules (price cut, minimal markup).
void WritePriceRules(Database& db) {
  // Quantity prices: from the quantity on, the price (or a percentage off the row price).
  Insert(db, "GRPriceLQuantity", "IDGRPriceListRel, Quantity, Price, QuantityPercent", {
      {205, 100.0, 4.20, 0.0},
      {205, 500.0, 3.95, 0.0},
      {112, 100.0, 4.10, 0.0},
      {201, 50.0, 0.0, -5.0},
  });
  Insert(db, "GRPriceCatRel", "IDGRArticlePriceCat, IDGRCompanyPriceCat, IDGRPriceList, PriceCut, MinMarkup", {
      {1, 1, 3, -5.0, 8.0},
      {2, 1, 3, -8.0, 10.0},
      {3, 1, 2, 0.0, 0.0},
      {1, 2, 5, 0.0, 0.0},
      {2, 2, 5, 0.0, 0.0},
      {3, 2, 5, 0.0, 0.0},
      {1, 3, 3, -10.0, 5.0},
      {2, 3, 3, -12.0, 5.0},
      {3, 3, 2, -5.0, 0.0},
  });
}

// Certified (contract) price lists and the companies they are for.
void WriteCertifiedPrices(Database& db) {
  Insert(db, "GRCPriceList", "ID, Code, Name, IsCertified, BeginDate, EndDate", {
      {1, "LEPING-TAMM", "Tamme Ehitus: lepinguhinnad 2010", true, D(2010, 1, 1), D(2010, 12, 31)},
      {2, "PAKKUMINE-LV", "Bērziņš un Daugava: hinnapakkumine", false, D(2010, 2, 1), kNoDate},
  });
  Insert(db, "GRCPriceListRel", "IDGRCPriceList, IDGRArticle, IDGRUnit, Price", {
      {1, 8, 1, 84.00},
      {1, 7, 1, 13.50},
      {1, 10, 1, 4.95},
      {1, 12, 1, 4.30},
      {1, 17, 1, 119.00},
      {2, 12, 1, 4.40},
      {2, 11, 1, 37.90},
      {2, 10, 1, 5.10},
  });
  Insert(db, "GRCPriceLCompany", "IDGRCPriceList, IDGRCompany", {
      {1, 12},
      {2, 14},
      {2, 15},
  });
}

// Price lists, price rules and certified price lists.
void WritePrices(Database& db) {
  WritePriceLists(db);
  WritePriceRules(db);
  WriteCertifiedPrices(db);
}

// ---------------------------------------------------------------------------------------------
// Companies: the owner, customers, suppliers, and what hangs on them
// ---------------------------------------------------------------------------------------------

void WriteCompanies(Database& db) {
  Insert(db, "GRCompany",
         "ID, Code, Name, LocationAddr, DeliveryAddr, LegalAddr, ReferenceNo, Message, CreditLimit, IDGRCurrency, "
         "IDGRTax, IDSalesManager, IDGRPriceList, IDGRPriceListC, IDGRCompanyPriceCat, IDGRTermPayment, "
         "IDGRTermDelivery, PriceCut, IDSettlCompany", {
      {1, "OMA", "Näidisfirma OÜ", "Tartu mnt 80, 10112 Tallinn", "Tartu mnt 80, 10112 Tallinn", "Tartu mnt 80, 10112 Tallinn", "10000001", "", 0.0, 1, 1, 0, 0, 0, 0, 0, 0, 0.0, 0},
      {10, "KASK", "Kask ja Pärn OÜ", "Pärnu mnt 15, 10141 Tallinn", "Laki 12, 10621 Tallinn", "Pärnu mnt 15, 10141 Tallinn", "11223344", "", 5000.0, 1, 1, 1, 0, 0, 1, 3, 2, 0.0, 0},
      {11, "SAARE", "Saare Kõrts OÜ", "Tallinna 3, 93811 Kuressaare", "Tallinna 3, 93811 Kuressaare", "Tallinna 3, 93811 Kuressaare", "12345678", "Ainult ettemaksuga!", 0.0, 1, 1, 1, 5, 0, 2, 1, 1, 0.0, 0},
      {12, "TAMM", "Tamme Ehitus AS", "Riia 142, 50411 Tartu", "Ränilinna ehitusplats, Tartu", "Riia 142, 50411 Tartu", "10987654", "", 25000.0, 1, 1, 3, 0, 8, 3, 4, 2, 0.0, 0},
      {13, "ULEMISTE", "Ülemiste Kaubandus OÜ", "Suur-Sõjamäe 4, 11415 Tallinn", "Suur-Sõjamäe 4, 11415 Tallinn", "Suur-Sõjamäe 4, 11415 Tallinn", "14001122", "", 8000.0, 1, 1, 1, 3, 0, 1, 3, 2, -2.0, 0},
      {14, "BERZINS", "SIA Bērziņš un Partneri", "Brīvības iela 55, Rīga, LV-1010", "Krasta iela 52, Rīga, LV-1003", "Brīvības iela 55, Rīga, LV-1010", "40003012345", "", 15000.0, 1, 1, 2, 10, 0, 1, 3, 3, 0.0, 0},
      {15, "DAUGAVA", "SIA Daugavas Būvmateriāli", "Rīgas iela 22, Daugavpils, LV-5401", "Rīgas iela 22, Daugavpils, LV-5401", "Rīgas iela 22, Daugavpils, LV-5401", "41503055555", "", 6000.0, 1, 1, 2, 0, 0, 1, 2, 3, 0.0, 14},
      {16, "LIEPAJA", "AS Liepājas Zivju Konservi", "Zivju iela 1, Liepāja, LV-3401", "Zivju iela 1, Liepāja, LV-3401", "Zivju iela 1, Liepāja, LV-3401", "42103000777", "", 0.0, 1, 1, 2, 0, 0, 2, 1, 3, 0.0, 0},
      {17, "NORDIC", "Nordic Import AB", "Storgatan 12, 411 38 Göteborg", "Storgatan 12, 411 38 Göteborg", "Storgatan 12, 411 38 Göteborg", "556677-8899", "", 10000.0, 4, 3, 2, 0, 0, 1, 3, 3, 0.0, 0},
  });
  Insert(db, "GRCompany",
         "ID, Code, Name, LocationAddr, LegalAddr, ReferenceNo, IDGRCurrency, IDGRTax, IDPurchasingAgent, "
         "IDGRPriceListP, IDGRCompanyPriceCatP, IDGRTermPaymentP, IDGRTermDeliveryP, PriceCutP", {
      {20, "VORU", "Võru Piimatööstus AS", "Jüri 30, 65604 Võru", "Jüri 30, 65604 Võru", "10556677", 1, 1, 3, 9, 0, 3, 1, 0.0},
      {21, "SKANTOOL", "Skandinaviska Verktyg AB", "Hamngatan 5, 411 14 Göteborg", "Hamngatan 5, 411 14 Göteborg", "556123-4567", 4, 3, 3, 0, 0, 3, 3, 0.0},
      {22, "BRITHW", "British Hardware Ltd", "12 Mill Lane, Leeds LS1 4AB", "12 Mill Lane, Leeds LS1 4AB", "GB123456789", 3, 3, 3, 0, 0, 4, 3, 0.0},
      {23, "ACME", "Acme Tools Inc", "100 Main St, Springfield, IL 62701", "100 Main St, Springfield, IL 62701", "US-77-1234567", 2, 3, 3, 0, 0, 3, 3, 0.0},
      {24, "RUKISI", "SIA Rūķīši", "Lielā iela 7, Jelgava, LV-3001", "Lielā iela 7, Jelgava, LV-3001", "43603011111", 1, 1, 3, 0, 0, 2, 3, -3.0},
  });
  Insert(db, "GRCompanyCatRel", "IDGRCompany, IDGRCompanyCat", {
      {10, 1}, {11, 1}, {12, 1}, {13, 1}, {20, 1},
      {14, 2}, {15, 2}, {16, 2}, {24, 2},
      {17, 3}, {21, 3}, {22, 3}, {23, 3},
  });
  Insert(db, "GRCompContPerson", "IDGRCompany, IsDefault, ShowInReport, CardNo, SurName, FirstName", {
      {10, true, true, "", "Kask", "Jüri"},
      {10, false, false, "", "Pärn", "Tiiu"},
      {11, true, true, "", "Sepp", "Mart"},
      {12, true, true, "KK-1200", "Tamm", "Kärt"},
      {13, true, false, "KK-1300", "Õunapuu", "Ülle"},
      {14, true, true, "", "Bērziņš", "Jānis"},
      {15, true, true, "", "Kalniņa", "Līga"},
      {16, true, false, "", "Ozoliņš", "Andris"},
      {17, true, true, "", "Söderström", "Åsa"},
      {20, true, true, "", "Mägi", "Peeter"},
      {24, true, true, "", "Liepiņa", "Ilze"},
  });
  Insert(db, "GRBankAccount", "IDGRCompany, IsDefault, ShowInReport, ReferenceNo, Name, Code, IDGRCurrency", {
      {1, true, true, "EE382200221020145685", "Swedbank", "HABAEE2X", 1},
      {1, false, true, "EE471000001020145685", "SEB Pank", "EEUHEE2X", 1},
      {1, false, false, "EE961700017000123456", "Nordea Pank, USD", "NDEAEE2X", 2},
      {10, true, true, "EE122200221012345678", "Swedbank", "HABAEE2X", 1},
      {12, true, true, "EE591010220034567890", "SEB Pank", "EEUHEE2X", 1},
      {14, true, true, "LV80HABA0000435195001", "Swedbank Latvija", "HABALV22", 1},
      {15, true, true, "LV97HABA0012345678910", "Swedbank Latvija", "HABALV22", 1},
      {17, true, true, "SE4550000000058398257466", "SEB Sverige", "ESSESESS", 4},
      {20, true, true, "EE702200221011223344", "Swedbank", "HABAEE2X", 1},
      {22, true, true, "GB29NWBK60161331926819", "NatWest", "NWBKGB2L", 3},
      {23, true, true, "US021000021123456789", "JPMorgan Chase", "CHASUS33", 2},
      {24, true, true, "LV10UNLA0050012345678", "SEB banka", "UNLALV2X", 1},
  });
  Insert(db, "GRCompDeliveryAddr", "IDGRCompany, DeliveryAddr", {
      {10, "Laki 12, 10621 Tallinn"},
      {10, "Peterburi tee 46, 11415 Tallinn"},
      {12, "Ränilinna ehitusplats, Tartu"},
      {14, "Krasta iela 52, Rīga, LV-1003"},
      {14, "Tallinas iela 4, Valmiera, LV-4201"},
  });
}

// ---------------------------------------------------------------------------------------------
// Stores and articles: goods, services, sets with their components, lot and serial keeping
// ---------------------------------------------------------------------------------------------

void WriteArticles(Database& db) {
  Insert(db, "DRStore", "ID, Code, Name, IDGRCompany, IDGRPriceList, IDComplPriceList", {
      {1, "KESK", "Keskladu, Tallinn", 1, 6, 7},
      {2, "TARTU", "Tartu ladu", 1, 6, 7},
      {3, "RIIA", "Rīgas noliktava", 1, 6, 7},
  });
  Insert(db, "GRArticle",
         "ID, Code, Name, ArticleType, Country, Cost, NetMass, MnQuantity, IDGRUnit, IDGRArticlePriceCat, IDGRTax, "
         "IDDRStore, IDGRCompany, IsLot, IsSerial", {
      {1, "KOHV-500", "Kohv Java 500 g", "G", "EE", 2.15, 0.5, 10.0, 1, 1, 1, 1, 20, false, false},
      {2, "TEE-100", "Roheline tee 100 g", "G", "EE", 0.95, 0.1, 20.0, 1, 1, 1, 1, 20, false, false},
      {3, "JUUST", "Eesti juust, kaalukaup", "G", "EE", 5.85, 1.0, 5.0, 2, 1, 1, 1, 20, true, false},
      {4, "LOHE-KS", "Külmsuitsulõhe", "G", "NO", 11.50, 1.0, 2.0, 2, 1, 1, 2, 20, true, false},
      {5, "RAAMAT-KOOK", "Eesti köögiraamat", "G", "EE", 7.80, 0.9, 0.0, 1, 1, 2, 2, 20, false, false},
      {6, "VITAMIIN-C", "C-vitamiin 100 tabletti", "G", "FI", 2.40, 0.1, 0.0, 1, 1, 2, 2, 20, false, false},
      {7, "SAAG-500", "Käsisaag 500 mm", "G", "GB", 9.35, 0.6, 5.0, 1, 2, 1, 1, 22, false, false},
      {8, "TRELL-18V", "Akutrell 18 V", "G", "GB", 49.50, 1.8, 0.0, 1, 2, 1, 1, 22, false, true},
      {9, "KRUVI-4X40", "Puidukruvid 4×40, pakk", "G", "LV", 2.42, 1.2, 10.0, 6, 2, 1, 1, 22, false, false},
      {10, "KIPS-12", "Kipsplaat 12,5 mm 1200×2600", "G", "LV", 3.40, 25.0, 20.0, 1, 2, 1, 3, 24, false, false},
      {11, "VARV-10L", "Fassaadivärv valge 10 l", "G", "LV", 28.00, 13.0, 5.0, 1, 2, 1, 3, 24, false, false},
      {12, "TSEMENT-25", "Tsement 25 kg", "G", "LV", 3.10, 25.0, 50.0, 1, 2, 1, 3, 24, false, false},
      {13, "PIIM-1L", "Piim 2,5%, 1 l", "G", "EE", 0.45, 1.0, 50.0, 3, 1, 1, 1, 20, false, false},
      {14, "TRANSPORT", "Transporditeenus", "S", "", 25.00, 0.0, 0.0, 5, 3, 1, 0, 0, false, false},
      {15, "PAIGALDUS", "Paigaldustöö", "S", "", 18.00, 0.0, 0.0, 5, 3, 1, 0, 0, false, false},
      {16, "KINKEKORV", "Kinkekorv Eesti maitsed", "P", "EE", 0.0, 2.5, 0.0, 1, 1, 1, 1, 0, false, false},
      {17, "TOORIISTAD", "Tööriistakomplekt", "P", "", 0.0, 3.0, 0.0, 1, 2, 1, 1, 0, false, false},
      {18, "SUHKUR-1KG", "Suhkur 1 kg", "G", "LV", 0.62, 1.0, 50.0, 1, 1, 1, 1, 20, false, false},
  });
  Insert(db, "GRArticleCatRel", "IDGRArticle, IDGRArticleCat", {
      {1, 1}, {2, 1}, {3, 2}, {13, 2}, {4, 5}, {5, 5}, {6, 5}, {18, 5}, {16, 5},
      {7, 3}, {8, 3}, {9, 3}, {17, 3}, {10, 4}, {11, 4}, {12, 4},
  });
  Insert(db, "GRBarCode", "IDGRArticle, IDGRUnit, Code, ContentQuantity", {
      {1, 1, "4740012000013", 1.0},
      {1, 7, "4740012001010", 24.0},
      {2, 1, "4740012000020", 1.0},
      {2, 7, "4740012001027", 24.0},
      {3, 2, "4740012000037", 1.0},
      {4, 2, "4740012000044", 1.0},
      {5, 1, "4740012000051", 1.0},
      {6, 1, "4740012000068", 1.0},
      {7, 1, "4750099000073", 1.0},
      {8, 1, "4750099000080", 1.0},
      {9, 6, "4750099000097", 1.0},
      {10, 1, "4750099000103", 1.0},
      {11, 1, "4750099000110", 1.0},
      {12, 1, "4750099000127", 1.0},
      {13, 3, "4740012000136", 1.0},
      {16, 1, "4740012000167", 1.0},
      {18, 1, "4740012000181", 1.0},
  });
  Insert(db, "GRArtCompletion", "ID, IDGRArticle, IDDRStore", {
      {1, 16, 1},
      {2, 17, 1},
  });
  Insert(db, "GRArtCompletionRow", "IDGRArtCompletion, IDGRArticle, IDGRUnit, IDDRStore, Quantity, PriceRegulations", {
      {1, 1, 1, 1, 1.0, 0.0},
      {1, 2, 1, 1, 2.0, 0.0},
      {1, 3, 2, 1, 0.5, 0.0},
      {1, 18, 1, 1, 1.0, 0.0},
      {2, 7, 1, 1, 1.0, 0.0},
      {2, 8, 1, 1, 1.0, 0.0},
      {2, 9, 6, 1, 2.0, 0.0},
  });
}

// ---------------------------------------------------------------------------------------------
// Settings, user options, rights, messages
// ---------------------------------------------------------------------------------------------

void WriteOptions(Database& db) {
  const std::string fixed = std::to_string(kDateFixed);
  // User 0 holds the system's settings and options.
  Insert(db, "XALUserOption", "IDXALUser, Category, Name, OptValue", {
      {0, "DateFixed", "Store", fixed},
      {0, "DateFixed", "Sales", fixed},
      {0, "DateFixed", "Purchase", fixed},
      {0, "DateFixed", "Bank", std::to_string(DemoDay(2009, 12, 31))},
      {0, "DateFixed", "Booking", fixed},
      {0, "CostCounting", "CostByStore", "-1"},
      {0, "CostCounting", "RunningCost", "0"},
      {0, "GRCurrency", "BaseCurrency", "1"},
      {0, "Owner", "GRCompany", "1"},
      {0, "DXCode", "GRCompany", "Code"},
      {0, "DXCode", "GRArticle", "Code"},
      {0, "DXCode", "GRBankAccount", "ReferenceNo"},
      {1, "SDInvoice", "CheckCreditLimit", "-1"},
      {1, "SDOrder", "CheckCreditLimit", "-1"},
      {1, "GDocument", "DocDateLimit", "60"},
      {1, "GDocument", "RoundingQuantity", "3"},
      {1, "DRStore", "ComputeSetQuantity", "-1"},
      {1, "DRStore", "FillDRStockReserveFifo", "-1"},
      {1, "DRStore", "UseCampaignStock", "0"},
      {1, "DRStore", "PriceByOrderedQuantity", "0"},
      {1, "GRCompany", "CompanyMessage", "SDInvoice, SDOrder"},
      {1, "GRArticle", "MinQuantityMessage", "-1"},
      {1, "SDConsignmD", "AmountFromSDOrder", "-1"},
      {1, "PDReceiptD", "AmountFromPDOrder", "0"},
      {2, "SDInvoice", "CheckCreditLimit", "-1"},
      {2, "GDocument", "DocDateLimit", "30"},
      {2, "DRStore", "ComputeSetQuantity", "-1"},
      {2, "GRCompany", "CompanyMessage", ""},
      {3, "SDInvoice", "CheckCreditLimit", "0"},
      {3, "DRStore", "FillDRStockReserveFifo", "0"},
      {4, "PDReceiptD", "AmountFromPDOrder", "-1"},
  });
  // Peeter may not change sales invoices (bit 2: edit) or see the purchase prices.
  Insert(db, "XALRight", "IDXALUser, Kind, ObjectName, Denied", {
      {4, "Table", "SDInvoice", 2},
      {4, "Field", "GRArticle.Cost", 1},
  });
  Insert(db, "xalurights", "idxaluser, objectname, category, fcondition, factive", {
      {3, "GDocument", "Row", "IDDRStore = 3", true},
  });
  Insert(db, "XALMessage", "MsgKey, Kind, English, Estonian", {
      {"Err_AggrRec", 2, "The records cannot be merged", "Kirjeid ei saa ühendada"},
      {"Err_ChangeCertifiedDoc", 2, "A certified document cannot be changed", "Kinnitatud dokumenti ei saa muuta"},
      {"Err_DealDateMissing", 2, "The deal date is missing", "Tehingu kuupäev puudub"},
      {"Err_DealDateOutOfRange", 2, "The deal date falls in a closed period", "Tehingu kuupäev jääb suletud perioodi"},
      {"Err_DiffCategory", 2, "the records belong to different categories", "kirjed kuuluvad erinevatesse kategooriatesse"},
      {"Err_DiffType", 2, "the articles have different quantity types", "artiklitel on erinev koguse tüüp"},
      {"Err_DiffUnits", 2, "the articles have different units", "artiklitel on erinevad mõõtühikud"},
      {"Err_DocDateMissing", 2, "The document date is missing", "Dokumendi kuupäev puudub"},
      {"Err_DocInClosedPeriod", 2, "The document date falls in a closed period", "Dokumendi kuupäev jääb suletud perioodi"},
      {"Err_TargetNotFound", 2, "the target record was not found", "sihtkirjet ei leitud"},
      {"SDInvoice", 1, "Sales invoices", "Müügiarved"},
      {"SDOrder", 1, "Sales orders", "Müügitellimused"},
      {"PDReceiptD", 1, "Receipts", "Sissetulekud"},
      {"SDConsignmD", 1, "Shipments", "Väljastused"},
      {"DDMovement", 1, "Stock movements", "Laoliikumised"},
      {"DDProduction", 1, "Assemblies", "Komplekteerimised"},
      {"GRCompany", 1, "Companies", "Firmad"},
      {"GRArticle", 1, "Articles", "Artiklid"},
      {"DRStore", 1, "Stores", "Laod"},
      {"GRCurrency", 1, "Currencies", "Valuutad"},
  });
}

}  // namespace

void BuildDemoDatabase(HostConnection& conn) {
  Database& db = conn.db();
  db.ExecScript("BEGIN");
  try {
    WriteBasics(db);
    WritePrices(db);
    WriteCompanies(db);
    WriteArticles(db);
    WriteOptions(db);
    demo::WriteDocuments(db);
    db.ExecScript("COMMIT");
  } catch (...) {
    db.ExecScript("ROLLBACK");
    conn.InvalidateLinks();
    throw;
  }
  conn.InvalidateLinks();
}

Ref<HostConnection> OpenDemoDatabase(const std::string& path, int32_t kind) {
  std::error_code ec;
  const bool fresh = !std::filesystem::exists(path, ec) || std::filesystem::file_size(path, ec) == 0;
  if (fresh) {
    // Stale journal files of an earlier database under this name would be replayed into the new one.
    std::filesystem::remove(path + "-wal", ec);
    std::filesystem::remove(path + "-shm", ec);
  }
  Ref<HostConnection> conn = HostConnection::Open(path, kind);
  if (fresh || CLng(conn->db().Scalar("SELECT count(*) FROM GRCompany")) == 0) BuildDemoDatabase(*conn);
  return conn;
}

}  // namespace xal::host
