// Company prices over the reference host in both database kinds: the company's own list, its
// ordinary list and chain, the price-category list and markup, price rows by date (newest first,
// open ends), lists out of their dates, chains that form a cycle, and the SQL sent.
#include "server/company_price.h"

#include <gtest/gtest.h>

#include "recording_connection.h"
#include "runtime/dates.h"

namespace xal::server {
namespace {

using sqllog::KindName;
using sqllog::DialectDbTest;

Currency Cur(double v) { return Currency::FromDouble(v); }
Date D(int y, int m, int d) { return DateSerial(y, m, d); }
std::string Serial(int y, int m, int d) { return std::to_string(static_cast<int>(D(y, m, d).serial)); }

// Lists: 70 a company's own list; 71 -> 72 an ordinary chain; 73 (valid only in 2010) -> 72;
// 74 <-> 75 a cycle without prices; 76 a price-category list; 77 <-> 78 a cycle of lists out of
// date; 79 out of date at the end of its chain; 80 -> 81 -> 80 a cycle whose second list is out
// of date and whose first has a price.
// Companies: 1 list 71; 2 own list 70 (then 71) and category 5; 3 category 5 only; 4 list 73;
// 5 list 74; 6 nothing; 7 own list 74 (then 71); 8 list 71 and category 5; 9 list 80; 10 own
// list 79 (then 71).
// Articles: 100 category 8, 101 no category, 102 category 9.
class CompanyPriceTest : public DialectDbTest {
 protected:
  void SetUp() override {
    DialectDbTest::SetUp();
    Exec("INSERT INTO GRPriceList (ID, IDFirst, BeginDate, EndDate) VALUES (70, 0, 0, 0), (71, 72, 0, 0),"
         " (72, 0, 0, 0), (73, 72, " + Serial(2010, 1, 1) + ", " + Serial(2010, 12, 31) + "), (74, 75, 0, 0),"
         " (75, 74, 0, 0), (76, 0, 0, 0), (77, 78, " + Serial(2010, 1, 1) + ", " + Serial(2010, 1, 31) + "),"
         " (78, 77, " + Serial(2010, 1, 1) + ", " + Serial(2010, 1, 31) + "), (79, 0, " + Serial(2010, 1, 1) +
         ", " + Serial(2010, 1, 31) + "), (80, 81, " + Serial(2010, 1, 1) + ", " + Serial(2010, 1, 31) +
         "), (81, 80, 0, 0);"
         "INSERT INTO GRCompany (ID, Code, IDGRPriceList, IDGRPriceListC, IDGRCompanyPriceCat) VALUES"
         " (1, 'C1', 71, 0, 0), (2, 'C2', 71, 70, 5), (3, 'C3', 0, 0, 5), (4, 'C4', 73, 0, 0), (5, 'C5', 74, 0, 0),"
         " (6, 'C6', 0, 0, 0), (7, 'C7', 71, 74, 0), (8, 'C8', 71, 0, 5), (9, 'C9', 80, 0, 0),"
         " (10, 'C10', 71, 79, 0);"
         "INSERT INTO GRArticle (ID, Code, IDGRArticlePriceCat) VALUES (100, 'A', 8), (101, 'B', 0), (102, 'C', 9);"
         "INSERT INTO GRPriceCatRel (IDGRArticlePriceCat, IDGRCompanyPriceCat, IDGRPriceList, PriceCut) VALUES"
         " (8, 5, 76, -10), (9, 5, 76, 25);"
         "INSERT INTO GRPriceListRel (IDGRPriceList, IDGRArticle, Price, BeginDate, EndDate) VALUES"
         " (71, 100, 100, " + Serial(2009, 1, 1) + ", 0),"
         " (71, 100, 110, " + Serial(2009, 6, 1) + ", " + Serial(2009, 6, 30) + "),"
         " (71, 100, 120, " + Serial(2009, 3, 1) + ", " + Serial(2009, 3, 31) + "),"
         " (72, 100, 60, 0, 0), (72, 101, 50, 0, 0), (73, 100, 999, 0, 0), (70, 100, 80, 0, 0),"
         " (76, 100, 200, 0, 0), (76, 102, 0.1, 0, 0), (80, 100, 40, 0, 0), (79, 100, 777, 0, 0);");
  }
};

TEST_P(CompanyPriceTest, Prices) {
  struct Row {
    int32_t article, company;
    Date date;
    double expected;
    const char* why;
  } rows[] = {
      {100, 1, D(2009, 3, 15), 120, "the newest row that covers the date"},
      {100, 1, D(2009, 6, 15), 110, ""},
      {100, 1, D(2009, 7, 1), 100, "past the June row: the open-ended January row"},
      {100, 1, D(2009, 3, 31), 120, "the end date itself is covered"},
      {100, 1, D(2008, 12, 1), 60, "before every row of 71: its next list 72"},
      {101, 1, D(2009, 3, 15), 50, "no row in 71 at all"},
      {100, 1, Date(), 100, "no date: today"},
      {100, 1, D(1850, 1, 1), 100, "a date before 1900: today"},
      {100, 2, D(2009, 3, 15), 80, "the company's own list, never marked up"},
      {101, 2, D(2009, 3, 15), 50, "nothing in the own list: the ordinary chain once"},
      {100, 3, D(2009, 3, 15), 180, "the category list, PriceCut -10"},
      {102, 3, D(2009, 3, 15), 0.13, "0.10 + 25 %: cents half away from zero"},
      {101, 3, D(2009, 3, 15), 0, "no category list for an article without category"},
      {100, 8, D(2009, 3, 15), 120, "no markup for a price found in another list than the pair's"},
      {100, 4, D(2009, 3, 15), 60, "list 73 is out of its dates: 72 replaces it"},
      {100, 4, D(2010, 6, 1), 999, "within its dates 73 is used"},
      {100, 5, D(2009, 3, 15), 0, "a cycle without prices ends"},
      {100, 7, D(2009, 3, 15), 120, "an own list in a cycle ends, then the ordinary list"},
      {100, 9, D(2009, 3, 15), 0, "a cycle back to a list out of date ends"},
      {100, 10, D(2010, 1, 15), 777, "the own list within its dates"},
      {100, 10, D(2009, 3, 15), 120, "own list out of date, no valid list after it: the ordinary list"},
      {101, 10, D(2009, 3, 15), 50, "the same without a row in the own list"},
      {100, 6, D(2009, 3, 15), 0, "no list and no category"},
      {100, 99, D(2009, 3, 15), 0, "no such company"},
      {999, 1, D(2009, 3, 15), 0, "no such article"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(::testing::Message() << "article " << r.article << " company " << r.company << " date "
                                      << r.date.serial << ": " << r.why);
    conn->Clear();
    EXPECT_EQ(GetCompanyPrice(conn, r.article, r.company, r.date), Cur(r.expected));
    EXPECT_LT(conn->Sql().size(), 30u);
  }
}

TEST_P(CompanyPriceTest, FindValidPriceList) {
  struct Row {
    Date date;
    int32_t list;
    int32_t expected;
    const char* why;
  } rows[] = {
      {D(2009, 3, 15), 71, 71, "valid: no dates"},
      {D(2009, 3, 15), 73, 72, "73 starts in 2010: its next list"},
      {D(2010, 6, 1), 73, 73, ""},
      {D(2010, 12, 31), 73, 73, "the end date itself"},
      {Date(D(2010, 12, 31).serial + 0.75), 73, 73, "the time of day does not matter"},
      {D(2011, 1, 1), 73, 72, ""},
      {Date(), 73, 73, "no date: the list as given"},
      {D(2009, 3, 15), 0, 0, "no list"},
      {D(2009, 3, 15), 999, 0, "no such list"},
      {D(2009, 3, 15), 79, 0, "out of date at the end of its chain"},
      {D(2009, 3, 15), 77, 0, "a cycle of lists out of date ends"},
      {D(2010, 1, 15), 78, 78, ""},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(::testing::Message() << "list " << r.list << " date " << r.date.serial << ": " << r.why);
    EXPECT_EQ(FindValidPriceList(conn, r.date, r.list), r.expected);
  }
}

TEST_P(CompanyPriceTest, SqlThroughAChain) {
  conn->Clear();
  EXPECT_EQ(GetCompanyPrice(conn, 101, 1, D(2009, 3, 15)), Cur(50));
  const std::vector<std::string> expected = {
      "SELECT IDGRPriceList, IDGRPriceListC, IDGRCompanyPriceCat FROM GRCompany WHERE ID = 1",
      "SELECT IDGRArticlePriceCat FROM GRArticle WHERE ID = 101",
      "SELECT * FROM GRPriceListRel WHERE IDGRArticle = 101 AND IDGRPriceList = 71 ORDER BY BeginDate DESC, EndDate",
      "SELECT IDFirst, IsBruto, WithoutPriceCut FROM GRPriceList WHERE ID = 71",
      "SELECT * FROM GRPriceListRel WHERE IDGRArticle = 101 AND IDGRPriceList = 72 ORDER BY BeginDate DESC, EndDate",
      "SELECT BeginDate, EndDate, IDFirst FROM GRPriceList WHERE ID = 72",
  };
  EXPECT_EQ(conn->Sql(), expected);
  EXPECT_EQ(conn->Modes(), (std::vector<int32_t>{3, 3, 1, 1, 1, 1}));
}

TEST_P(CompanyPriceTest, SqlThroughACategory) {
  conn->Clear();
  EXPECT_EQ(GetCompanyPrice(conn, 100, 3, D(2009, 3, 15)), Cur(180));
  const std::vector<std::string> expected = {
      "SELECT IDGRPriceList, IDGRPriceListC, IDGRCompanyPriceCat FROM GRCompany WHERE ID = 3",
      "SELECT IDGRArticlePriceCat FROM GRArticle WHERE ID = 100",
      "SELECT A.IDGRPriceList FROM GRPriceCatRel A, GRArticle B WHERE B.ID = 100 AND B.IDGRArticlePriceCat = "
      "A.IDGRArticlePriceCat AND A.IDGRCompanyPriceCat = 5",
      "SELECT * FROM GRPriceListRel WHERE IDGRArticle = 100 AND IDGRPriceList = 76 ORDER BY BeginDate DESC, EndDate",
      "SELECT BeginDate, EndDate, IDFirst FROM GRPriceList WHERE ID = 76",
      "SELECT A.PriceCut AS PriceCut FROM GRPriceCatRel A WHERE A.IDGRArticlePriceCat = 8 AND "
      "A.IDGRCompanyPriceCat = 5 AND A.IDGRPriceList = 76",
  };
  EXPECT_EQ(conn->Sql(), expected);
}

INSTANTIATE_TEST_SUITE_P(, CompanyPriceTest, ::testing::Values(1, 2), KindName);

}  // namespace
}  // namespace xal::server
