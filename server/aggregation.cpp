// Record merging. One register record (the source) is folded into another of the same table
// (the target): the pair is checked (units and quantity type of articles, category group of
// categories), the stored balances of bank accounts, cash desks, articles and stores are summed
// onto the target, the host moves every reference, stored options are re-pointed, the source is
// deleted when asked, and the current balances are rebuilt. The whole merge is one transaction of
// the host's connection when the host offers transactions, so a merge that fails changes nothing.
#include "server/aggregation.h"

#include <chrono>
#include <cmath>
#include <random>
#include <string>

#include "runtime/convert.h"
#include "runtime/text.h"
#include "runtime/trap.h"
#include "server/internal/transaction.h"
#include "server/internal/work_table.h"
#include "server/sql_utils.h"
#include "server/table_filters.h"

namespace xal::server {

namespace internal {

namespace {
thread_local WorkTableNumberSource tWorkTableNumbers;
}  // namespace

void SetWorkTableNumberSource(WorkTableNumberSource source) { tWorkTableNumbers = std::move(source); }

}  // namespace internal

namespace {

// How many work-table names a merge tries before it gives up.
constexpr int kWorkTableTries = 20;


// Int(10000 × Rnd + 1) from a generator seeded once per thread, or the test's source.
int32_t NextWorkTableNumber() {
  if (internal::tWorkTableNumbers) return internal::tWorkTableNumbers();
  thread_local std::mt19937 generator = [] {
    std::random_device device;
    const auto now = static_cast<uint32_t>(std::chrono::steady_clock::now().time_since_epoch().count());
    std::seed_seq seed{device(), device(), now};
    return std::mt19937(seed);
  }();
  std::uniform_real_distribution<double> rnd(0.0, 1.0);
  return static_cast<int32_t>(std::floor(10000.0 * rnd(generator) + 1.0));
}

struct Merge {
  Checked<DataObject> obj;
  Checked<XALConnect> conn;
  Checked<XALServer> server;
  int32_t lang = 0;
  std::string table;  // the register both records belong to
  int32_t source = 0, target = 0;
  bool deleteSource = false;
  std::string general;  // the general error text, the start of every error

  // The host's message `key`. The connection's language picks the text, so the user reads the
  // error in the language of the session.
  std::string Text(const char* key) const { return server->Text(key, kTextMessage, lang); }
  std::string Fail(const char* key) const { return general + " - " + Text(key); }
  void Exec(const std::string& sql, int32_t options = 0) const { conn->Execute(sql, options); }
};

// A field that may be absent from the table (not every register has a Code); empty then.
std::string OptionalText(const Checked<DataObject>& obj, const char* field) {
  return TryOr([&] { return ValueOr(obj->Field(field), std::string()); }, std::string());
}

// Units, quantity types and category groups are codes, and codes compare without regard to case
// (as CheckCategory's query compares the groups): "COLOR" and "color" are one group.
bool SameValue(const Checked<DataObject>& a, const Checked<DataObject>& b, const char* field) {
  return TextEquals(CStr(a->Field(field)), CStr(b->Field(field)));
}

// ---------------------------------------------------------------------------------------------
// Stored balances
// ---------------------------------------------------------------------------------------------

// Bank accounts and cash desks: the source's flows are added to the target's rows of the same
// date and currency; rows the target lacks are copied over; the source's rows go.
void MergeMoneyBalances(const Merge& m, const std::string& balance) {
  const std::string link = "ID" + m.table, s = Num(m.source), d = Num(m.target);
  m.Exec("UPDATE " + balance + " A INNER JOIN " + balance + " B ON A.IDGRCurrency = B.IDGRCurrency " +
         "SET A.DebitFlow = A.DebitFlow + B.DebitFlow, A.DebitFlowBase = A.DebitFlowBase + B.DebitFlowBase, " +
         "A.DebitFlowRef = A.DebitFlowRef + B.DebitFlowRef, A.CreditFlow = A.CreditFlow + B.CreditFlow, " +
         "A.CreditFlowBase = A.CreditFlowBase + B.CreditFlowBase, A.CreditFlowRef = A.CreditFlowRef + B.CreditFlowRef " +
         "WHERE A.DocDate = B.DocDate AND A." + link + " = " + d + " AND B." + link + " = " + s);
  m.Exec("INSERT INTO " + balance + " (DocDate, DebitFlow, DebitFlowBase, DebitFlowRef, " +
         "CreditFlow, CreditFlowBase, CreditFlowRef, IDGRCurrency, " + link + ") " +
         "SELECT A.DocDate, A.DebitFlow, A.DebitFlowBase, A.DebitFlowRef, " +
         "A.CreditFlow, A.CreditFlowBase, A.CreditFlowRef, A.IDGRCurrency, " + d + " FROM " + balance + " A " +
         "WHERE A." + link + " = " + s + " AND Not Exists (SELECT * FROM " + balance + " X WHERE X.DocDate = A.DocDate " +
         "AND X.IDGRCurrency = A.IDGRCurrency AND X." + link + " = " + d + ")");
  m.Exec("DELETE * FROM " + balance + " WHERE " + link + " = " + s);
}

// Sums the source's stock flows per date and `other` key into a new work table and returns its
// name. Work tables live in the shared database, and a table of the drawn name may belong to a
// merge running in another session right now, so an existing table is never dropped: the merge
// draws another name and tries again.
std::string CollectStockFlows(const Merge& m, const std::string& key, const std::string& other) {
  auto collectInto = [&](const std::string& work) {
    m.Exec("SELECT DocDate, " + other + ", Sum(DebitQFlow) AS DQ, Sum(CreditQFlow) AS CQ, " +
           "Sum(DebitFlowBase) AS DFB, Sum(CreditFlowBase) AS CFB, Sum(DebitFlowRef) AS DFR, Sum(CreditFlowRef) AS CFR " +
           "INTO " + work + " FROM DBalanceStore " + "WHERE " + key + " = " + Num(m.source) + " GROUP BY DocDate, " +
           other);
  };
  for (int attempt = 1; attempt < kWorkTableTries; ++attempt) {
    const std::string work = Num(NextWorkTableNumber()) + "TmpDBalanceStore";
    if (TryStep([&] { collectInto(work); })) return work;
  }
  // The last name drawn: its failure is the merge's.
  const std::string work = Num(NextWorkTableNumber()) + "TmpDBalanceStore";
  collectInto(work);
  return work;
}

// Articles and stores: the source's flows of a date and store (or article) are added to the
// target's row of that date and store; rows the target lacks are moved to it; the rest goes.
void MergeStockBalances(const Merge& m) {
  const bool article = TextEquals(m.table, "GRArticle");
  const std::string key = article ? "IDGRArticle" : "IDDRStore";
  const std::string other = article ? "IDDRStore" : "IDGRArticle";
  const std::string s = Num(m.source), d = Num(m.target);
  const std::string work = CollectStockFlows(m, key, other);
  TrappedError failure;
  const bool moved = TryReport(
      [&] {
        m.Exec("UPDATE DBalanceStore A INNER JOIN " + work + " B ON A." + other + " = B." + other + " " +
               "SET A.DebitQFlow = A.DebitQFlow + B.DQ, A.CreditQFlow = A.CreditQFlow + B.CQ, " +
               "A.DebitFlowBase = A.DebitFlowBase + B.DFB, A.CreditFlowBase = A.CreditFlowBase + B.CFB, " +
               "A.DebitFlowRef = A.DebitFlowRef + B.DFR, A.CreditFlowRef = A.CreditFlowRef + B.CFR " +
               "WHERE A.DocDate = B.DocDate AND A." + key + " = " + d);
        m.Exec("UPDATE DBalanceStore A SET A." + key + " = " + d + " WHERE A." + key + " = " + s +
               " AND Not Exists (SELECT * FROM DBalanceStore X WHERE A.DocDate = X.DocDate " + "AND X." + other +
               " = A." + other + " AND X." + key + " = " + d + ")");
        m.Exec("DELETE * FROM DBalanceStore WHERE " + key + " = " + s);
      },
      [&](const TrappedError& e) { failure = e; });
  if (!moved) {
    // Without a host transaction the work table would outlive the failure.
    TryStep([&] { m.Exec("DROP TABLE " + work); });
    Raise(failure.number, failure.description);
  }
  m.Exec("DROP TABLE " + work);
  m.Exec("DELETE * FROM DCurBalanceStore WHERE " + key + " = " + s);
}

// After the move: the target's current balances and costs are rebuilt by the host.
void RefreshCurrentBalances(const Merge& m) {
  const bool article = TextEquals(m.table, "GRArticle");
  const Checked<ParamList> args = m.server->NewParamList();
  args->Set("FieldName", Variant("ID" + m.table));
  args->Set("FieldValue", Variant(m.target));
  m.conn->ServerCommand("Update_DCurBalance", args.get());
  const Checked<ParamList> costArgs = m.server->NewParamList();
  costArgs->Set("Filter", Variant(std::string(article ? "" : "1")));
  costArgs->Set("ID", Variant(m.target));
  const Checked<DataObject> articles = m.server->OpenDataObject("GRArticle");
  articles->CallFunction("CountCost", Variant(costArgs.get()), 0);
}

// ---------------------------------------------------------------------------------------------
// The merge
// ---------------------------------------------------------------------------------------------

// Runs the merge; the result is empty on success, else the error text for "ErrText".
std::string RunMerge(const Merge& m) {
  const std::string s = Num(m.source), d = Num(m.target);
  if (m.obj->FindFirst("ID = " + s, 0) != 0) return m.Fail("Err_TargetNotFound");
  const Checked<DataObject> target = m.server->OpenQuery(m.table, kQueryEditable, "ID = " + d, "");
  if (target->IsEOF()) return m.Fail("Err_TargetNotFound");

  const bool isArticle = TextEquals(m.table, "GRArticle");
  const bool isStore = TextEquals(m.table, "DRStore");
  if (isArticle) {
    if (!SameValue(m.obj, target, "IDGRUnit")) return m.Fail("Err_DiffUnits");
    if (!SameValue(m.obj, target, "QuantityType")) return m.Fail("Err_DiffType");
    // The source's set definition is dropped, with its component rows.
    m.Exec("DELETE FROM GRArtCompletionRow WHERE IDGRArtCompletion In (SELECT ID FROM GRArtCompletion WHERE IDGRArticle = " +
           s + ")");
    m.Exec("DELETE FROM GRArtCompletion WHERE IDGRArticle = " + s);
  }
  if (m.table.size() > 3 && TextEquals(Right(m.table, 3), "Cat")) {
    if (!SameValue(m.obj, target, "Category")) return m.Fail("Err_DiffCategory");
    m.Exec("UPDATE " + m.table + "Rel" + " SET ID" + m.table + "=" + d + " WHERE ID" + m.table + "=" + s, 4);
  }
  if (TextEquals(m.table, "GRBankAccount")) MergeMoneyBalances(m, "VBalanceBank");
  if (TextEquals(m.table, "VRCashDesk")) MergeMoneyBalances(m, "VBalanceCash");
  if (isArticle || isStore) MergeStockBalances(m);

  const std::string sourceCode = OptionalText(m.obj, "Code");
  const std::string targetCode = OptionalText(target, "Code");
  // The host keeps its last error text until the next failure, so only a text the move itself
  // left behind counts as its failure.
  const std::string errorBefore = CStr(m.obj->Property(kPropLastError));
  m.obj->RecordOperation(kRecordOpMoveReferences, Variant(m.target));
  const std::string errorAfter = CStr(m.obj->Property(kPropLastError));
  if (!errorAfter.empty() && errorAfter != errorBefore) return errorAfter;

  if (!ResetOptions(m.conn.get(), m.table, m.source, m.target)) return m.general;
  if (m.deleteSource) m.Exec("DELETE FROM " + m.table + " WHERE ID=" + s);
  if (m.conn->LogCheck("REGISTER", m.table, kLogRecordChanges))
    m.conn->WriteLog("REGISTER", m.table, m.source, sourceCode + " Aggregated/Deleted (into: " + targetCode + ")");
  if (isArticle || isStore) RefreshCurrentBalances(m);
  return std::string();
}

}  // namespace

// Failures never reach the caller: the result is False and "ErrText" holds the general text,
// possibly followed by " - " and the specific one (or the host's own text when it refused to
// move the references). Without a host object the text cannot be looked up and is its key.
bool AggrRec(const Ref<DataObject>& pObj, int32_t pObjID, const Ref<ParamList>& pParams) {
  Merge m;
  m.general = "Err_AggrRec";
  std::string errText = m.general;
  const bool finished = TryStep([&] {
    if (pObj) {
      m.obj = pObj;
      m.conn = m.obj->Connection();
      m.server = m.conn->Server();
      m.lang = CLng(m.conn->Property(kConnPropLanguage));
      m.general = errText = m.Text("Err_AggrRec");
      m.table = Trim(CStr(m.obj->Property(kPropTableName)));
    }
    m.source = pObjID;
    m.target = pParams ? CLng(pParams->Item("TargetID")) : 0;
    m.deleteSource = pParams && IsTrue(pParams->Item("Delete"));
    if (!pObj || m.source == 0 || m.target == 0 || m.source == m.target) return;
    // One transaction when the host offers it: a merge that fails changes nothing.
    internal::InTransaction(*m.conn, [&] {
      errText = RunMerge(m);
      return errText.empty();
    });
  });
  if (!finished) errText = m.general;
  if (errText.empty()) return true;
  if (pParams) TryStep([&] { pParams->Set("ErrText", Variant(errText)); });
  return false;
}

}  // namespace xal::server
