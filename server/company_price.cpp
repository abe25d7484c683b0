// Company prices: the price of an article for a customer on a date. The price comes from the
// company's own list (tried first, never marked up), its ordinary list, or the list its price
// category assigns to the article's category; each list may hand over to the next list of its
// chain (IDFirst) when it has no valid price or is itself out of date. A chain whose links come
// back to a list already walked ends there, as if the chain had run out.
#include "server/company_price.h"

#include <cmath>
#include <string>
#include <unordered_set>

#include "runtime/convert.h"
#include "runtime/dates.h"
#include "runtime/trap.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {

double DateField(const Checked<DataObject>& rs, const char* name) {
  const Variant v = rs->Field(name);
  return ValueOr(v, Date()).serial;
}

// What the company and the article bring to the search.
struct Customer {
  int32_t list = 0;         // GRCompany.IDGRPriceList
  int32_t ownList = 0;      // GRCompany.IDGRPriceListC, tried first
  int32_t companyCat = 0;   // GRCompany.IDGRCompanyPriceCat
  int32_t articleCat = 0;   // GRArticle.IDGRArticlePriceCat
};

// The ordinary starting list: the company's list, else the list of the price-category pair;
// 0 when there is neither.
int32_t OrdinaryList(const Checked<XALServer>& server, int32_t article, const Customer& c) {
  if (c.list != 0) return c.list;
  if (c.companyCat == 0) return 0;
  return CategoryPriceList(server, article, c.companyCat);
}

// The price of the row of `list` valid on `date`; false when none qualifies.
bool ValidPriceRow(const Checked<XALServer>& server, int32_t article, int32_t list, Date date, Currency& price) {
  Ref<DataObject> rs = PriceRowOnDate(server, article, list, date);
  if (!rs) return false;
  price = ValueOr(rs->Field("Price"), Currency());
  return true;
}

// The price-category markup for the list the price was found in, when the pair has one.
Currency WithPriceCut(const Checked<XALServer>& server, Currency price, const Customer& c, int32_t list) {
  const Checked<DataObject> rs = server->OpenQuery(
      "SELECT A.PriceCut AS PriceCut FROM GRPriceCatRel A WHERE A.IDGRArticlePriceCat = " + Num(c.articleCat) +
          " AND A.IDGRCompanyPriceCat = " + Num(c.companyCat) + " AND A.IDGRPriceList = " + Num(list),
      kQueryReadOnly, "", "");
  if (rs->IsEOF()) return price;
  const double pct = ValueOr(rs->Field("PriceCut"), 0.0);
  return CCur(Round(Variant(price.ToDouble() * (1 + pct / 100)), 2));
}

}  // namespace

int32_t CategoryPriceList(const Checked<XALServer>& server, int32_t article, int32_t companyCategory) {
  const Checked<DataObject> rs = server->OpenQuery(
      "SELECT A.IDGRPriceList FROM GRPriceCatRel A, GRArticle B WHERE B.ID = " + Num(article) +
          " AND B.IDGRArticlePriceCat = A.IDGRArticlePriceCat AND A.IDGRCompanyPriceCat = " + Num(companyCategory),
      kQueryReadOnly, "", "");
  return rs->IsEOF() ? 0 : IdField(rs, "IDGRPriceList");
}

PriceListInfo ReadPriceList(const Checked<XALServer>& server, int32_t list) {
  const Checked<DataObject> rs = server->OpenQuery(
      "SELECT IDFirst, IsBruto, WithoutPriceCut FROM GRPriceList WHERE ID = " + Num(list), kQueryEditable, "", "");
  PriceListInfo info;
  if (rs->IsEOF()) return info;
  info.exists = true;
  info.next = IdField(rs, "IDFirst");
  info.gross = IdField(rs, "IsBruto") != 0;
  info.noCut = IdField(rs, "WithoutPriceCut") != 0;
  return info;
}

Ref<DataObject> PriceRowOnDate(const Checked<XALServer>& server, int32_t article, int32_t list, Date date) {
  const Checked<DataObject> rs = server->OpenQuery("SELECT * FROM GRPriceListRel WHERE IDGRArticle = " + Num(article) +
                                                        " AND IDGRPriceList = " + Num(list) +
                                                        " ORDER BY BeginDate DESC, EndDate",
                                                    kQueryEditable, "", "");
  for (; !rs->IsEOF(); rs->MoveNext()) {
    const double begin = DateField(rs, "BeginDate");
    const double end = DateField(rs, "EndDate");
    if (begin <= date.serial && (end >= date.serial || Year(Date(end)) < 1900)) return rs.get();
  }
  return nullptr;
}

// Walks the chain from `priceList` to the first list valid on the day of `date` (an EndDate of 0
// is open). A date before day 1 or no list returns the list as given; a chain that runs out, or
// comes back to a list already seen, returns 0.
int32_t FindValidPriceList(const Ref<XALConnect>& conn, Date date, int32_t priceList, int32_t* next) {
  int32_t unused = 0;
  int32_t& after = next ? *next : unused;
  after = 0;
  const double t = std::floor(date.serial);
  if (t < 1 || priceList == 0) {
    if (next && priceList != 0) after = ReadPriceList(Checked<XALConnect>(conn)->Server(), priceList).next;
    return priceList;
  }
  const Checked<XALServer> server = Checked<XALConnect>(conn)->Server();
  std::unordered_set<int32_t> seen;
  int32_t list = priceList;
  while (seen.insert(list).second) {
    const Checked<DataObject> rs =
        server->OpenQuery("SELECT BeginDate, EndDate, IDFirst FROM GRPriceList WHERE ID = " + Num(list), kQueryEditable,
                          "", "");
    if (rs->IsEOF()) return 0;
    const double b = std::floor(DateField(rs, "BeginDate"));
    const double e = std::floor(DateField(rs, "EndDate"));
    const int32_t first = IdField(rs, "IDFirst");
    if (t >= b && (t <= e || e == 0)) {
      after = first;
      return list;
    }
    list = first;
    if (list == 0) return 0;
  }
  return 0;
}

// The price of `pIDGRArticle` for `pIDGRCompany` on `pDate` (today when left out or before 1900);
// 0 when no list in reach holds a valid price. Failing queries reach the caller.
Currency GetCompanyPrice(const Ref<XALConnect>& pXALConnect, int32_t pIDGRArticle, int32_t pIDGRCompany, Date pDate) {
  const Date date = Year(pDate) < 1900 ? Today() : pDate;
  const Checked<XALServer> server = Checked<XALConnect>(pXALConnect)->Server();

  Customer c;
  const Checked<DataObject> company = server->OpenQuery(
      "SELECT IDGRPriceList, IDGRPriceListC, IDGRCompanyPriceCat FROM GRCompany WHERE ID = " + Num(pIDGRCompany),
      kQueryReadOnly, "", "");
  const Checked<DataObject> article = server->OpenQuery(
      "SELECT IDGRArticlePriceCat FROM GRArticle WHERE ID = " + Num(pIDGRArticle), kQueryReadOnly, "", "");
  c.list = IdField(company, "IDGRPriceList");
  c.ownList = IdField(company, "IDGRPriceListC");
  c.companyCat = IdField(company, "IDGRCompanyPriceCat");
  c.articleCat = IdField(article, "IDGRArticlePriceCat");

  // The company's own list first; when its chain yields nothing, the ordinary list once.
  bool usedOwnList = c.ownList != 0;
  int32_t list = usedOwnList ? c.ownList : OrdinaryList(server, pIDGRArticle, c);
  if (!usedOwnList && list == 0) return Currency();

  // Lists whose prices were looked at since the current start; coming back to one means the
  // chain is a cycle, and it ends there as if it had no further list.
  std::unordered_set<int32_t> walked;
  Currency price;
  bool found = false;
  while (true) {
    const bool cycled = !walked.insert(list).second;
    found = !cycled && ValidPriceRow(server, pIDGRArticle, list, date, price);
    if (!found && !cycled) {
      const int32_t next = ReadPriceList(server, list).next;
      if (next != 0) {
        list = next;
        continue;
      }
    }
    if (!cycled) {
      // A list that is itself out of date gives way to the first valid list of its chain.
      // A price found in a list that is out of date, with no valid list after it, is no price;
      // a company-specific list then still hands over to the ordinary list below.
      const int32_t valid = FindValidPriceList(pXALConnect, date, list);
      if (valid == 0) {
        found = false;
      } else if (valid != list) {
        list = valid;
        continue;
      }
    }
    if (!found && usedOwnList) {
      usedOwnList = false;
      walked.clear();
      list = OrdinaryList(server, pIDGRArticle, c);
      if (list == 0) return Currency();
      continue;
    }
    break;
  }
  // The end of a chain with no valid price anywhere.
  if (!found) return Currency();

  if (c.articleCat != 0 && c.companyCat != 0 && !usedOwnList) price = WithPriceCut(server, price, c, list);
  return price;
}

}  // namespace xal::server
