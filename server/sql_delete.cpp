// A DELETE statement run in chunks on the file database. That engine keeps a whole statement's
// changes in memory (and in its lock table) until it ends, so a delete of many thousands of rows
// is split by ranges of ID first; the SQL server takes the statement whole. Every error is
// trapped: the caller only learns whether the delete ran.
#include <string>

#include "runtime/convert.h"
#include "runtime/text.h"
#include "server/internal/require.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {

using internal::Require;

// Rows per chunk, and the count above which the statement is chunked at all.
constexpr int32_t kChunkRows = 10000;

// Deletes the rows below MIN(ID) + 10000, + 20000, … as separate statements, leaving the last
// range to the caller's whole statement. The statement must end in a WHERE clause that takes a
// further " AND" condition; a statement that is not a DELETE … WHERE fails here or in the count.
void DeleteInChunks(XALConnect& conn, const std::string& sql) {
  // The counting query is the statement with its verb replaced. Only the first "DELETE " is the
  // verb; a later one (inside a literal) must stay as it is so the count sees the same condition.
  const std::string counting =
      Replace(UCase(sql), "DELETE ", "SELECT COUNT(*) AS Cnt, MIN(ID) AS MnID, MAX(ID) AS MxID ", 1, 1);
  Ref<DataObject> stats = Require(conn.Server()).OpenQuery(counting, 4, "", "");
  if (!stats || stats->IsEOF()) Raise(kErrInvalidCall, "The delete counted no rows");
  if (CDbl(stats->Field("Cnt")) <= kChunkRows) return;
  const int32_t last = CLng(stats->Field("MxID"));
  for (int64_t bound = int64_t{CLng(stats->Field("MnID"))} + kChunkRows; bound < last; bound += kChunkRows)
    conn.Execute(sql + " AND ID<" + std::to_string(bound), 0);
}

}  // namespace

bool SQLDelete(const Ref<XALConnect>& pXALConnect, const std::string& pSQLString, int32_t pOptions) {
  try {
    if (Trim(pSQLString).empty()) return false;
    XALConnect& conn = Require(pXALConnect);
    if (conn.DatabaseKind() == 1) DeleteInChunks(conn, pSQLString);
    conn.Execute(pSQLString, pOptions);
    return true;
  } catch (const VbError&) {
    return false;
  }
}

}  // namespace xal::server
