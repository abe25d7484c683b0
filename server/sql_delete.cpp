// A DELETE statement run in chunks on the file database. That engine keeps a whole statement's
// changes in memory (and in its lock table) until it ends, so a delete of many thousands of rows
// is split by ranges of ID first; the SQL server takes the statement whole. Every error is
// trapped: the caller only learns whether the delete ran.
#include <string>

#include "runtime/convert.h"
#include "runtime/text.h"
#include "runtime/trap.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {

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
  const Checked<XALServer> server = conn.Server();
  const Checked<DataObject> stats = server->OpenQuery(counting, kQueryForward, "", "");
  if (stats->IsEOF()) Raise(kErrInvalidCall, "The delete counted no rows");
  if (CDbl(stats->Field("Cnt")) <= kChunkRows) return;
  const int32_t last = CLng(stats->Field("MxID"));
  for (int64_t bound = int64_t{CLng(stats->Field("MnID"))} + kChunkRows; bound < last; bound += kChunkRows)
    conn.Execute(sql + " AND ID<" + std::to_string(bound), 0);
}

}  // namespace

bool SQLDelete(const Ref<XALConnect>& pXALConnect, const std::string& pSQLString, int32_t pOptions) {
  if (Trim(pSQLString).empty()) return false;
  return TryStep([&] {
    const Checked<XALConnect> conn = pXALConnect;
    // Only the file database is chunked; the SQL server, and any kind the host adds, take the
    // statement whole.
    if (conn->DatabaseKind() == kDbFile) DeleteInChunks(*conn, pSQLString);
    conn->Execute(pSQLString, pOptions);
  });
}

}  // namespace xal::server
