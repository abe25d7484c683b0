// The inventory computation "DPInventoryB".
//
// Parameters (ParamList entries; a missing entry takes the default):
//   "Documents"            the documents whose stored rows are left out, so that a document being
//                          saved is not counted twice (its rows on the form are what it needs); an
//                          id list (see IdList), default none.
//   "ReservedD"            reservations count as taken: rows in state R stay in the balance, as the
//                          stock balance counts them (default True).
//   "CountPreReservations" every pre-reserved row counts (state P): pre-reserved receipts as coming
//                          in and pre-reserved issues as going out, as the stock balance counts them
//                          when asked to (default False).
//   "PreReservedD"         pre-reserved issues count as going out even when pre-reservations are not
//                          counted: the cautious view of what is free (default False).
//   "GRArticleIDs"         the articles to compute, an id list (default every article).
//   "MakeReport"           keep the article/store pairs whose quantity is 0 as well (default False:
//                          only the pairs with stock, which is all a comparison needs).
// Steps:
//   1. One DPInventoryB row records today's date, the user and the parameters; its ID is the answer.
//   2. Per article and store, start from the kept balance (DCurBalanceStore): Quantity, plus
//      RQuantity with "ReservedD", plus PQuantity with "CountPreReservations".
//   3. Take back the stored rows of the left-out documents: each row's receipt and issue side in a
//      state step 2 counted, a receipt subtracted and an issue added back. Services have no part.
//   4. With "PreReservedD" and without "CountPreReservations": subtract the pre-reserved issues of
//      the other documents.
//   5. One DPInventoryBRow per article and store with Quantity (steps 2-4), and the reserved and
//      pre-reserved parts (RQuantity, PQuantity) of the other documents' rows; quantities to 9
//      decimals as the balances keep them; a pair whose Quantity is 0 only with "MakeReport".
//   6. The caller removes the computation with "DELETE * FROM DPInventoryB WHERE ID = …"; the rows
//      go with their header.
#include "host/inventory.h"

#include "runtime/convert.h"
#include "runtime/dates.h"
#include "runtime/text.h"

namespace xal::host {

namespace {

std::string Joined(const std::vector<int32_t>& ids) {
  std::string out;
  for (int32_t id : ids) out += (out.empty() ? "" : ",") + std::to_string(id);
  return out;
}

// A switch of the computation: not given (Empty, Null or an empty text, as a form leaves an unset
// parameter) means its default.
bool Switch(const Ref<ParamList>& params, const char* name, bool byDefault) {
  const Variant v = params ? params->Item(name) : Variant();
  if (v.IsEmpty() || v.IsNull() || (v.IsString() && Trim(v.AsString()).empty())) return byDefault;
  return CBool(v);
}

// Steps 2 to 5 as one statement: ?1 the header, ?2 ReservedD, ?3 CountPreReservations,
// ?4 PreReservedD, ?5 MakeReport.
std::string RowsSql(const std::string& docs, const std::string& articles) {
  const std::string art = articles.empty() ? "" : " AND IDGRArticle IN (" + articles + ")";
  const std::string sides = " AND ArticleType <> 'S'" + art;
  return "INSERT INTO DPInventoryBRow (IDDPInventoryB, IDGRArticle, IDDRStore, Quantity, RQuantity, PQuantity) "
         "SELECT ?1, IDGRArticle, IDDRStore, round(total(Q), 9), round(total(RQ), 9), round(total(PQ), 9) FROM ("
         "SELECT IDGRArticle, IDDRStore, Quantity + CASE WHEN ?2 THEN RQuantity ELSE 0 END "
         "+ CASE WHEN ?3 THEN PQuantity ELSE 0 END Q, RQuantity RQ, PQuantity PQ FROM DCurBalanceStore WHERE 1" + art +
         " UNION ALL SELECT IDGRArticle, S, -D * Q * (St = '' OR (St = 'R' AND ?2) OR (St = 'P' AND ?3)), "
         "-D * Q * (St = 'R'), -D * Q * (St = 'P') FROM ("
         "SELECT IDGRArticle, IDReceiverStore S, 1 D, upper(DealState) St, BaseQuantity Q FROM DDStoreDRow "
         "WHERE IDReceiverStore IS NOT NULL AND IDDoc IN (" + docs + ")" + sides +
         " UNION ALL SELECT IDGRArticle, IDSenderStore, -1, upper(DealState), BaseQuantity FROM DDStoreDRow "
         "WHERE IDSenderStore IS NOT NULL AND IDDoc IN (" + docs + ")" + sides + ")"
         " UNION ALL SELECT IDGRArticle, IDSenderStore, -BaseQuantity, 0, 0 FROM DDStoreDRow "
         "WHERE ?4 AND NOT ?3 AND upper(DealState) = 'P' AND IDSenderStore IS NOT NULL AND IDDoc NOT IN (" + docs +
         ")" + sides + ") GROUP BY IDGRArticle, IDDRStore HAVING ?5 OR round(total(Q), 9) <> 0";
}

}  // namespace

std::vector<int32_t> IdList(const Variant& v) {
  std::vector<int32_t> ids;
  if (v.IsEmpty() || v.IsNull()) return ids;
  if (v.IsArray()) {
    for (const Variant& e : v.AsArray().Elements()) ids.push_back(CLng(e));
    return ids;
  }
  if (!v.IsString()) {
    ids.push_back(CLng(v));
    return ids;
  }
  std::string text = v.AsString();
  for (char& c : text)
    if (c == ',' || c == ';' || c == '\t') c = ' ';
  for (const std::string& part : Split(text, " "))
    if (!part.empty()) ids.push_back(CLng(Variant(part)));
  return ids;
}

Variant InventoryB(HostConnection& conn, const Ref<ParamList>& params) {
  const Variant none;
  const std::string docs = Joined(IdList(params ? params->Item("Documents") : none));
  const std::string articles = Joined(IdList(params ? params->Item("GRArticleIDs") : none));
  const Variant reserved(Switch(params, "ReservedD", true)), pre(Switch(params, "CountPreReservations", false));
  const Variant preIssues(Switch(params, "PreReservedD", false)), report(Switch(params, "MakeReport", false));
  Database& db = conn.db();
  const bool own = conn.BeginTransaction();
  try {
    db.Exec("INSERT INTO DPInventoryB (DocDate, IDXALUser, Documents, GRArticleIDs, ReservedD, CountPreReservations, "
            "PreReservedD, MakeReport) VALUES (?, ?, ?, ?, ?, ?, ?, ?)",
            {Variant(Today()), Variant(conn.UserID()), Variant(docs), Variant(articles), reserved, pre, preIssues,
             report});
    const Variant id(static_cast<int32_t>(db.LastInsertId()));
    db.Exec(RowsSql(docs, articles), {id, reserved, pre, preIssues, report});
    if (own) conn.CommitTransaction();
    conn.InvalidateLinks();
    return id;
  } catch (...) {
    if (own) conn.RollbackTransaction();
    conn.InvalidateLinks();
    throw;
  }
}

}  // namespace xal::host
