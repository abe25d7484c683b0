// Stock balance and unit cost of articles. The file database has no current-balance table, so
// there the balance is summed from the store document rows (and, before the "DateFixed" date,
// from the closed-period flows); the SQL server keeps current balances per article and store and
// is read directly. The cost is a fixed article cost, a price from the store's price-list chain
// for production articles, a stored cost, or a running average over the stock flows. The cost
// options are read once per thread and kept until a call asks for them to be read again.
#include "server/stock.h"

#include <cmath>
#include <string>

#include "runtime/convert.h"
#include "runtime/dates.h"
#include "runtime/error.h"
#include "runtime/text.h"
#include "runtime/trap.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {

// ---------------------------------------------------------------------------------------------
// Shared helpers
// ---------------------------------------------------------------------------------------------

// The cost settings, read by the first CountCost of a thread and reused until a reset. DateFixed
// is read only by the running-average computation of the file dialect.
struct CostOptionCache {
  bool loaded = false;
  bool costByStore = false;
  bool runningCost = false;
  Date dateFixed;
};
thread_local CostOptionCache tCostOptions;

bool FlagSetting(const Checked<XALConnect>& conn, const char* category, const char* name) {
  const Variant v = conn->Setting(category, name, Variant(false));
  return IsTrue(v);
}

// The date up to which store periods are closed; 0 when stores were never closed.
Date DateFixedSetting(const Checked<XALConnect>& conn) {
  const Variant v = conn->Setting("DateFixed", "Store", Variant(int32_t{0}));
  return ValueOr(v, Date());
}

// The date as a whole number of days (its day, the time of day dropped).
double WholeDays(Date d) { return std::floor(d.serial); }

// ---------------------------------------------------------------------------------------------
// Stock balance, file dialect: sums over DDStoreDRow and DBalanceStore
// ---------------------------------------------------------------------------------------------

struct BalanceFilters {
  std::string in, out, bal;          // store filters of receipts, issues and closed flows
  std::string inDeal, outDeal;       // pre-reservations left out unless asked for
};

BalanceFilters MakeBalanceFilters(int32_t store, int32_t row, bool preReservations) {
  BalanceFilters f;
  if (store != 0) {
    f.in = " AND I.IDReceiverStore = " + Num(store);
    f.out = " AND O.IDSenderStore = " + Num(store);
    f.bal = " AND B.IDDRStore = " + Num(store);
  } else {
    // Over all stores only receipts from outside and issues to outside count; a movement between
    // two stores cancels out.
    f.in = " AND I.IDSenderStore IS NULL AND I.IDReceiverStore IS NOT NULL";
    f.out = " AND O.IDReceiverStore IS NULL AND O.IDSenderStore IS NOT NULL";
  }
  if (row != 0) {
    f.in += " AND I.ID <> " + Num(row);
    f.out += " AND O.ID <> " + Num(row);
  }
  if (!preReservations) {
    f.inDeal = " AND I.DealState <> 'P'";
    f.outDeal = " AND O.DealState <> 'P'";
  }
  return f;
}

std::string FileBalanceSql(int32_t article, const BalanceFilters& f, Date dateFixed) {
  const bool closed = WholeDays(dateFixed) != 0;
  const std::string d = SQLDate(Variant(dateFixed));
  const std::string a = Num(article);
  std::string sql = "SELECT SUM(I.BaseQuantity) AS Q FROM DDStoreDRow I WHERE I.IDGRArticle = " + a +
                    " AND I.ArticleType <> 'S'" + f.inDeal + f.in;
  if (closed) sql += " AND I.DocDate >= " + d;
  sql += " UNION ALL SELECT -SUM(O.BaseQuantity) AS Q FROM DDStoreDRow O WHERE O.IDGRArticle = " + a +
         " AND O.ArticleType <> 'S'" + f.outDeal + f.out;
  if (closed) {
    sql += " AND O.DocDate >= " + d;
    sql += " UNION ALL SELECT (SUM(B.DebitQFlow) - SUM(B.CreditQFlow)) AS Q FROM DBalanceStore B WHERE B.IDGRArticle = " +
           a + f.bal + " AND B.DocDate < " + d;
  }
  return sql;
}

// Complete sets: per component the sets its incoming rows, outgoing rows and closed flows make
// (a component quantity of 0 counting as 1), the smallest over the components.
std::string FileSetBalanceSql(int32_t article, const BalanceFilters& f, Date dateFixed) {
  const bool closed = WholeDays(dateFixed) != 0;
  const std::string d = SQLDate(Variant(dateFixed));
  const std::string a = Num(article);
  const std::string divisor = "IIf(R.Quantity = 0, 1, R.Quantity)";
  std::string sql =
      "SELECT Min(X.Q) AS Q FROM (SELECT Sum(Z.Q) AS Q FROM (SELECT I.IDGRArticle, SUM(I.BaseQuantity / " + divisor +
      ") AS Q FROM (DDStoreDRow I INNER JOIN GRArtCompletionRow R ON I.IDGRArticle = R.IDGRArticle) "
      "INNER JOIN GRArtCompletion C ON R.IDGRArtCompletion = C.ID WHERE C.IDGRArticle = " +
      a + " AND I.ArticleType <> 'S'" + f.inDeal + f.in;
  if (closed) sql += " AND I.DocDate >= " + d;
  sql += " GROUP BY I.IDGRArticle  UNION ALL SELECT O.IDGRArticle, -SUM(O.BaseQuantity / " + divisor +
         ") AS Q FROM (DDStoreDRow O INNER JOIN GRArtCompletionRow R ON O.IDGRArticle = R.IDGRArticle) "
         "INNER JOIN GRArtCompletion C ON R.IDGRArtCompletion = C.ID WHERE C.IDGRArticle = " +
         a + " AND O.ArticleType <> 'S'" + f.outDeal + f.out;
  if (closed) {
    sql += " AND O.DocDate >= " + d + " GROUP BY O.IDGRArticle  UNION ALL SELECT B.IDGRArticle, (SUM(B.DebitQFlow / " +
           divisor + ") - SUM(B.CreditQFlow / " + divisor +
           ")) AS Q FROM (DBalanceStore B INNER JOIN GRArtCompletionRow R ON B.IDGRArticle = R.IDGRArticle) "
           "INNER JOIN GRArtCompletion C ON R.IDGRArtCompletion = C.ID WHERE C.IDGRArticle = " +
           a + f.bal + " AND B.DocDate < " + d + " GROUP BY B.IDGRArticle ";
  } else {
    sql += " GROUP BY O.IDGRArticle";
  }
  return sql + ") Z GROUP BY Z.IDGRArticle) X";
}

// Adds the Q of every row to `total` as it goes, so that a failure leaves the sum so far.
void FileBalance(const Checked<XALConnect>& conn, int32_t article, int32_t store, int32_t row, bool preReservations,
                 bool sets, double& total) {
  const Date dateFixed = DateFixedSetting(conn);
  const BalanceFilters f = MakeBalanceFilters(store, row, preReservations);
  const std::string sql = sets ? FileSetBalanceSql(article, f, dateFixed) : FileBalanceSql(article, f, dateFixed);
  const Checked<XALServer> server = conn->Server();
  const Checked<DataObject> rs = server->OpenQuery(sql, kQueryReadOnly, "", "");
  while (!rs->IsEOF()) {
    total += NumberField(rs, "Q");
    rs->MoveNext();
  }
}

// ---------------------------------------------------------------------------------------------
// Stock balance, server dialect: the current balances
// ---------------------------------------------------------------------------------------------

std::string ServerBalanceSql(int32_t article, int32_t store, bool preReservations, bool sets) {
  const std::string a = Num(article);
  if (sets) {
    std::string sql =
        "SELECT Min(X.Quantity) AS Quantity, 0 AS RQuantity, 0 AS PQuantity FROM (SELECT Sum((A.Quantity + A.RQuantity" +
        std::string(preReservations ? " + A.PQuantity" : "") +
        ") / Case When B.Quantity = 0 Then 1 Else B.Quantity End) AS Quantity "
        "FROM DCurBalanceStore A INNER JOIN GRArtCompletionRow B ON A.IDGRArticle = B.IDGRArticle "
        "INNER JOIN GRArtCompletion C ON B.IDGRArtCompletion = C.ID WHERE C.IDGRArticle = " +
        a;
    if (store != 0) sql += " AND A.IDDRStore = " + Num(store);
    return sql + " GROUP BY A.IDGRArticle ) X";
  }
  // One store has one balance row; over all stores the rows are summed.
  const bool one = store != 0;
  std::string sql = "SELECT " + std::string(one ? "Quantity" : "Sum(Quantity)") + " AS Quantity, " +
                    (one ? "RQuantity" : "Sum(RQuantity)") + " AS RQuantity, " +
                    (one ? "PQuantity" : "Sum(PQuantity)") + " AS PQuantity FROM DCurBalanceStore WHERE IDGRArticle = " +
                    a;
  if (one) sql += " AND IDDRStore = " + Num(store);
  return sql;
}

std::string ServerRowSql(int32_t article, int32_t store, int32_t row, bool preReservations) {
  std::string sql = "SELECT BaseQuantity, IDReceiverStore, IDSenderStore FROM DDStoreDRow WHERE ID = " + Num(row) +
                    " AND IDGRArticle = " + Num(article);
  if (store != 0) sql += " AND (IDReceiverStore = " + Num(store) + " OR IDSenderStore = " + Num(store) + ")";
  sql += " AND ArticleType <> 'S'";
  if (!preReservations) sql += " AND DealState <> 'P'";
  return sql;
}

void ServerBalance(const Checked<XALConnect>& conn, int32_t article, int32_t store, int32_t row, bool preReservations,
                   bool sets, double& total) {
  const Checked<XALServer> server = conn->Server();
  const Checked<DataObject> rs = server->OpenQuery(ServerBalanceSql(article, store, preReservations, sets),
                                                   sets ? kQueryServer : kQueryReadOnly, "", "");
  double q = NumberField(rs, "Quantity") + NumberField(rs, "RQuantity");
  if (preReservations) q += NumberField(rs, "PQuantity");
  total = q;
  if (row == 0) return;

  // The given row applied to the current balance: into the store (or from outside) adds, out of
  // the store (or to outside) subtracts.
  const Checked<DataObject> r = server->OpenQuery(ServerRowSql(article, store, row, preReservations), kQueryReadOnly, "", "");
  if (r->IsEOF()) return;
  const double base = NumberField(r, "BaseQuantity");
  const int32_t receiver = IdField(r, "IDReceiverStore");
  const int32_t sender = IdField(r, "IDSenderStore");
  if (store != 0) {
    if (receiver == store)
      total += base;
    else if (sender == store)
      total -= base;
  } else {
    if (receiver == 0)
      total -= base;
    else if (sender == 0)
      total += base;
  }
}

// ---------------------------------------------------------------------------------------------
// Cost
// ---------------------------------------------------------------------------------------------

// The price of `article` in the chain of up to five price lists that contains `priceList`, on
// the day written `t`: the lists valid on that day take part (an EndDate before 1900 is open),
// and the price of the lowest chain level that has one wins.
std::string PriceChainSql(int32_t priceList, const std::string& t, int32_t article) {
  const std::string l = Num(priceList);
  std::string valid;
  for (int i = 1; i <= 5; ++i) {
    const std::string wa = "WA" + std::to_string(i);
    valid += "IIf(" + t + " >= " + wa + ".BeginDate AND (" + t + " <= " + wa + ".EndDate OR Year(" + wa +
             ".EndDate) < 1900), " + wa + ".ID, 0) AS ID_" + std::to_string(i) + (i < 5 ? ", " : " ");
  }
  return "SELECT A.IDGRArticle, A.IDGRPriceList, A.Price FROM GRPriceListRel A, "
         "(SELECT WA.IDGRArticle, Min(IIf(WB.ID_1 = WA.IDGRPriceList, 1, IIf(WB.ID_2 = WA.IDGRPriceList, 2, "
         "IIf(WB.ID_3 = WA.IDGRPriceList, 3, IIf(WB.ID_4 = WA.IDGRPriceList, 4, 5))))) AS Weight "
         "FROM GRPriceListRel WA, (SELECT " +
         valid +
         "FROM (((GRPriceList WA1 LEFT JOIN GRPriceList WA2 ON WA1.IDFirst = WA2.ID) LEFT JOIN GRPriceList WA3 ON "
         "WA2.IDFirst = WA3.ID) LEFT JOIN GRPriceList WA4 ON WA3.IDFirst = WA4.ID) LEFT JOIN GRPriceList WA5 ON "
         "WA4.IDFirst = WA5.ID WHERE " +
         l + " In (WA1.ID, WA2.ID, WA3.ID, WA4.ID, WA5.ID)) WB WHERE WA.IDGRArticle = " + Num(article) +
         " GROUP BY WA.IDGRArticle) B, (SELECT A1.ID AS ID_1, A2.ID AS ID_2, A3.ID AS ID_3, A4.ID AS ID_4, A5.ID AS "
         "ID_5 FROM (((GRPriceList A1 LEFT JOIN GRPriceList A2 ON A1.IDFirst = A2.ID) LEFT JOIN GRPriceList A3 ON "
         "A2.IDFirst = A3.ID) LEFT JOIN GRPriceList A4 ON A3.IDFirst = A4.ID) LEFT JOIN GRPriceList A5 ON "
         "A4.IDFirst = A5.ID WHERE " +
         l +
         " In (A1.ID, A2.ID, A3.ID, A4.ID, A5.ID)) C WHERE A.IDGRArticle = B.IDGRArticle AND (IIf(B.Weight = 1, "
         "C.ID_1, IIf(B.Weight = 2, C.ID_2, IIf(B.Weight = 3, C.ID_3, IIf(B.Weight = 4, C.ID_4, C.ID_5))))) = "
         "A.IDGRPriceList";
}

// A production article's cost: its price in the chain of the store's price list ("PC" articles
// use the store's list for completions), on the date of document `doc` or today.
Variant ProductionCost(const Checked<XALServer>& server, int32_t article, int32_t store, int32_t doc,
                       const std::string& type) {
  const std::string storeSql =
      TextEquals(type, "PC") ? "SELECT IDComplPriceList AS IDGRPriceList FROM DRStore WHERE ID = " + Num(store)
                             : "SELECT IDGRPriceList FROM DRStore WHERE ID = " + Num(store);
  const int32_t priceList = IdField(server->OpenQuery(storeSql, kQueryEditable, "", ""), "IDGRPriceList");
  Date when = Today();
  if (doc != 0) {
    const Checked<DataObject> d =
        server->OpenQuery("SELECT DocDate FROM GDocument WHERE ID = " + Num(doc), kQueryEditable, "", "");
    if (!d->IsEOF()) when = CDate(d->Field("DocDate"));
  }
  const Checked<DataObject> price =
      server->OpenQuery(PriceChainSql(priceList, SQLDate(Variant(when)), article), kQueryEditable, "", "");
  return price->IsEOF() ? Variant(int16_t{0}) : price->Field("Price");
}

// The running average of the file dialect: (closed flows' amount + receipts' cost − issues'
// cost) / (the same quantities), 0 when the quantity is 0. Row `doc` is left out.
std::string FileRunningCostSql(int32_t article, int32_t store, int32_t doc, Date dateFixed) {
  const std::string a = Num(article);
  const std::string d = SQLDate(Variant(dateFixed));
  const bool byStore = store != 0;
  std::string sql = "SELECT IIf(IIf(IsNull(Sum(R.Q)), 0,Sum(R.Q)) = 0, 0, Sum(R.A) / Sum(R.Q)) AS Cost FROM (";
  if (dateFixed.serial > 0) {
    sql += "SELECT IIf(IsNull(Sum(R1.DebitFlowBase)), 0, Sum(R1.DebitFlowBase)) "
           "-IIf(IsNull(Sum(R1.CreditFlowBase)), 0, Sum(R1.CreditFlowBase)) AS A, "
           "IIf(IsNull(Sum(R1.DebitQFlow)), 0, Sum(R1.DebitQFlow)) "
           "-IIf(IsNull(Sum(R1.CreditQFlow)), 0, Sum(R1.CreditQFlow)) AS Q FROM DBalanceStore R1 WHERE R1.IDGRArticle = " +
           a + (byStore ? " AND R1.IDDRStore = " + Num(store) : "") + " AND R1.DocDate < " + d + " UNION ALL ";
  }
  const bool closed = dateFixed.serial != 0;
  sql += "SELECT IIf(IsNull(Sum(R2.Cost)), 0, Sum(R2.Cost)) AS A, "
         "IIf(IsNull(Sum(R2.BaseQuantity)), 0, Sum(R2.BaseQuantity)) AS Q FROM DDStoreDRow R2 WHERE R2.IDGRArticle = " +
         a + (byStore ? " AND R2.IDReceiverStore = " + Num(store) : "") +
         " AND R2.DealState = '' AND R2.ArticleType <> 'S' AND R2.IDReceiverStore IS NOT NULL " +
         (closed ? " AND R2.DocDate >= " + d : "") + (doc != 0 ? " AND R2.ID <> " + Num(doc) : "") +
         " UNION ALL SELECT -IIf(IsNull(Sum(R3.Cost)), 0, Sum(R3.Cost)), "
         "-IIf(IsNull(Sum(R3.BaseQuantity)), 0, Sum(R3.BaseQuantity)) FROM DDStoreDRow R3 WHERE R3.IDGRArticle = " +
         a + (byStore ? " AND R3.IDSenderStore = " + Num(store) : "") +
         " AND R3.DealState <> 'P' AND R3.ArticleType <> 'S' AND R3.IDSenderStore IS NOT NULL " +
         (closed ? " AND R3.DocDate >= " + d : "") + (doc != 0 ? " AND R3.ID <> " + Num(doc) : "") + ") R ";
  return sql;
}

// The running average of the server dialect from the current balances; with `doc` the issue row
// `doc` is taken back into the balance first.
std::string ServerRunningCostSql(int32_t article, int32_t store, int32_t doc) {
  const std::string a = Num(article);
  const bool byStore = store != 0;
  const std::string storeFilter = byStore ? " AND IDDRStore = " + Num(store) : "";
  if (doc == 0) {
    return "SELECT (Case When IsNull(Sum(Quantity + RQuantity), 0) = 0 Then 0 Else IsNull(Sum(AmountBase), 0) / "
           "IsNull(Sum(Quantity + RQuantity), 0) End) AS Cost FROM DCurBalanceStore WHERE IDGRArticle = " +
           a + storeFilter;
  }
  return "SELECT (Case When IsNull(DC.Quantity + R.BaseQuantity, 0) = 0 Then 0 Else (DC.AmountBase + R.Cost) / "
         "(DC.Quantity + R.BaseQuantity) End) AS Cost FROM (SELECT IsNull(Sum(Quantity + RQuantity), 0) AS Quantity, "
         "IsNull(Sum(AmountBase), 0) AS AmountBase FROM DCurBalanceStore WHERE IDGRArticle = " +
         a + storeFilter +
         ") DC, (SELECT IsNull(Sum(BaseQuantity), 0) AS BaseQuantity, IsNull(Sum(Cost), 0) AS Cost FROM DDStoreDRow "
         "WHERE ID = " +
         Num(doc) + " AND IDGRArticle = " + a +
         (byStore ? " AND IDSenderStore = " + Num(store) : " AND IDSenderStore Is Not Null ") +
         " AND ArticleType <> 'S' AND DealState <> 'P') R";
}

// The cost from the balances: a running average, or the stored cost per store or per article.
Variant BalanceCost(const Checked<XALConnect>& conn, int32_t article, int32_t store, int32_t doc) {
  CostOptionCache& opt = tCostOptions;
  const Checked<XALServer> server = conn->Server();
  const int32_t costStore = opt.costByStore ? store : 0;
  Checked<DataObject> rs;
  if (opt.runningCost) {
    if (IsServerDialect(conn->DatabaseKind())) {
      rs = server->OpenQuery(ServerRunningCostSql(article, costStore, doc), kQueryServer, "", "");
    } else {
      if (!opt.loaded) opt.dateFixed = DateFixedSetting(conn);
      rs = server->OpenQuery(FileRunningCostSql(article, costStore, doc, opt.dateFixed), kQueryReadOnly, "", "");
    }
  } else if (opt.costByStore) {
    rs = server->OpenQuery("SELECT Cost FROM DCurBalanceStore WHERE IDDRStore = " + Num(store) +
                               " AND IDGRArticle = " + Num(article),
                           kQueryReadOnly, "", "");
  } else {
    rs = server->OpenQuery("SELECT Cost FROM GRArticle WHERE ID = " + Num(article), kQueryReadOnly, "", "");
  }
  return rs->IsEOF() ? Variant() : rs->Field("Cost");
}

}  // namespace

// ---------------------------------------------------------------------------------------------
// Entry points
// ---------------------------------------------------------------------------------------------

// The quantity of `pIDGRArticle` in store `pIDDRStore` (0: all stores), with row `pIDDDStoreDRow`
// left out (file dialect) or applied (server dialect). Errors are trapped: the result is then the
// quantity summed before the failure (0 when the host gave no connection or server).
double CountStockBalance(const Ref<XALConnect>& pXALConnect, int32_t pIDGRArticle, int32_t pIDDRStore,
                         int32_t pIDDDStoreDRow, bool pCountPreReservations, bool pCountSets) {
  double total = 0;
  TryStep([&] {
    const Checked<XALConnect> conn = pXALConnect;
    if (IsServerDialect(conn->DatabaseKind()))
      ServerBalance(conn, pIDGRArticle, pIDDRStore, pIDDDStoreDRow, pCountPreReservations, pCountSets, total);
    else
      FileBalance(conn, pIDGRArticle, pIDDRStore, pIDDDStoreDRow, pCountPreReservations, pCountSets, total);
  });
  return total;
}

// The unit cost of `pIDGRArticle` in store `pIDDRStore`: a number, or Empty when no cost row
// exists. Nothing is trapped.
Variant CountCost(const Ref<XALConnect>& pXALConnect, int32_t pIDGRArticle, int32_t pIDDRStore, int32_t pIDDoc,
                  bool pResetOptions, const std::string& pArticleType) {
  const Checked<XALConnect> conn = pXALConnect;
  CostOptionCache& opt = tCostOptions;
  if (pResetOptions) opt.loaded = false;
  if (!opt.loaded) {
    opt.costByStore = FlagSetting(conn, "CostCounting", "CostByStore");
    opt.runningCost = FlagSetting(conn, "CostCounting", "RunningCost");
  }

  const Checked<XALServer> server = conn->Server();
  const Checked<DataObject> art =
      server->OpenQuery("SELECT ArticleType, Cost FROM GRArticle WHERE ID = " + Num(pIDGRArticle), kQueryReadOnly, "", "");
  Variant result;
  bool decided = false;
  if (!art->IsEOF()) {
    std::string type = pArticleType;
    if (TextEquals(type, "X")) {
      type = ValueOr(art->Field("ArticleType"), std::string());
    }
    if (TextEquals(type, "S")) {
      result = art->Field("Cost");
      decided = true;
    } else if (Like(type, "P*", CompareMode::Text) && pIDDRStore != 0) {
      result = ProductionCost(server, pIDGRArticle, pIDDRStore, pIDDoc, type);
      decided = true;
    }
  }
  if (!decided) result = BalanceCost(conn, pIDGRArticle, pIDDRStore, pIDDoc);
  opt.loaded = true;
  return result;
}

}  // namespace xal::server
