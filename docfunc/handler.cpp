// The bookkeeping around every DocFunc handler: the call stack with the rows' positions, the error
// report, the refreshes and totals deferred to the outermost handler, the propagation question,
// and the option and query reads every topic shares.
#include "docfunc/handler.h"

#include "collections/ui_strings.h"
#include "docfunc/values.h"
#include "runtime/text.h"

namespace xal {

using namespace docfunc;  // NOLINT: the value readers of this folder

// ---------------------------------------------------------------------------------------------
// Enter and leave
// ---------------------------------------------------------------------------------------------

// One level deeper: the name is kept for the error report, and the position of the rows is
// remembered so that the leave step can put them back. The host's flags and bookmark are read
// with errors trapped (a host without a current row answers no bookmark); nothing escapes.
void DocFunc::EnterHandler(const std::string& Name) {
  if (st_.EnterGuard) return;
  st_.EnterGuard = true;
  ++st_.CallDepth;
  st_.CallName = Name;
  const size_t depth = static_cast<size_t>(st_.CallDepth);
  if (depth >= 10 && depth >= st_.RowMarks.size()) st_.RowMarks.resize(depth + 10 + 1);
  st_.RowMarks[depth] = Variant();
  if (const Ref<xal::DataObject>& rows = st_.RowOB.get()) {
    st_.RowMarks[depth] = TryOr(
        [&] { return (!rows->IsBOF() || rows->IsEOF()) ? rows->Bookmark() : Variant(); }, Variant());
  }
  st_.EnterGuard = false;
}

// Reports the error, runs the deferred work when the outermost handler leaves, and moves the rows
// back to where the handler found them.
//   1. An error is shown as text 90 with the handler's name, number and description.
//   2. The deferred work runs only at depth 1 and never re-enters itself (the leave guard).
//   3. The stack is popped in every case. A handler that runs inside the deferred work (the
//      totals may run WhenDocument) thus leaves its own level and no other: skipping the pop for
//      it would leave the depth one too high for good, and no later handler would be outermost.
void DocFunc::LeaveHandler(const std::string& Name, const TrappedError& error) {
  if (error.number != 0) ReportError(Name, error);
  if (!st_.LeaveGuard) {
    st_.LeaveGuard = true;
    if (st_.CallDepth < 2) RunDeferredWork(Name);
    st_.LeaveGuard = false;
  }
  const size_t depth = static_cast<size_t>(st_.CallDepth);
  const Variant mark = depth < st_.RowMarks.size() ? st_.RowMarks[depth] : Variant();
  if (!mark.IsEmpty() && st_.RowOB) TryStep([&] { st_.RowOB->GoToBookmark(mark); });
  if (st_.CallDepth > 0) --st_.CallDepth;
}

void DocFunc::ReportError(const std::string& Name, const TrappedError& error) {
  TryStep([&] {
    if (!st_.Doc) return;
    st_.Doc->StatusMsg(GetUIString(90, {Variant(Name), Variant(error.number), Variant(error.description)}));
  });
}

// The work handlers asked for, in its fixed order: rows written back, header, browser, row,
// full totals, incremental totals. Each flag is cleared before its work runs, so a failing step
// is not repeated by the next handler; a failure is reported like a handler's own.
void DocFunc::RunDeferredWork(const std::string& Name) {
  auto step = [&](bool& flag, auto&& work) {
    if (!flag) return;
    flag = false;
    TryReport(work, [&](const TrappedError& e) { ReportError(Name, e); });
  };
  step(st_.RowsRecalcPending, [&] {
    if (!st_.RowOB) return;
    if (!st_.BrowserRefreshPending) return st_.RowOB->UpdateRow(true, false, false);
    for (st_.RowOB->MoveFirst(); !st_.RowOB->IsEOF(); st_.RowOB->MoveNext()) st_.RowOB->UpdateRow(true, false, false);
  });
  step(st_.HeaderRefreshPending, [&] { st_.Doc->RefreshHeader(""); });
  if (st_.BrowserRefreshPending) st_.RowRefreshPending = false;
  step(st_.BrowserRefreshPending, [&] { st_.Doc->RefreshBrowser(""); });
  step(st_.RowRefreshPending, [&] { st_.Doc->RefreshRow(); });
  if (st_.FullTotalsPending) st_.TotalsPending = false;
  step(st_.FullTotalsPending, [&] { ComputeDocTotals(true); });
  step(st_.TotalsPending, [&] { ComputeDocTotals(false); });
}

// ---------------------------------------------------------------------------------------------
// The propagation question
// ---------------------------------------------------------------------------------------------

// Whether a header change is carried into the rows. Without rows there is nothing to carry and
// nothing is asked (False). Otherwise the user's option DocTable/key decides: "AlwaysYes" and
// "AlwaysNo" (any letter case) answer without asking; anything else asks `question` Yes/No.
bool DocFunc::CarryToRows(const std::string& key, const std::string& question) {
  if (st_.RowOB->RowCount() == 0) return false;
  const std::string answer = TrimmedOf(UserOption(st_.DocTable, key, Variant("")));
  if (TextEquals(answer, "AlwaysYes")) return true;
  if (TextEquals(answer, "AlwaysNo")) return false;
  return st_.Doc->MsgBox(question, kMbYesNo, "") == kAnswerYes;
}

// ---------------------------------------------------------------------------------------------
// Shared reads
// ---------------------------------------------------------------------------------------------

Variant DocFunc::UserOption(const std::string& section, const std::string& key, const Variant& defaultValue) {
  return st_.Connect->UserOption(st_.UserID, section, key, defaultValue);
}

Variant DocFunc::SystemOption(const std::string& section, const std::string& key, const Variant& defaultValue) {
  return st_.Connect->UserOption(0, section, key, defaultValue);
}

Ref<xal::DataObject> DocFunc::OpenQuery(const std::string& sql) {
  Ref<xal::DataObject> q = st_.Server->OpenQuery(sql, kQueryReadOnly, "", "");
  Require(q);
  return q;
}

Ref<ParamList> DocFunc::NewParams() {
  Ref<ParamList> p = st_.Server->NewParamList();
  Require(p);
  return p;
}

std::string DocFunc::HostText(const std::string& key) { return st_.Server->Text(key, 2, CurrentLangID()); }

void DocFunc::Status(const std::string& text) { st_.Doc->StatusMsg(text); }

}  // namespace xal
