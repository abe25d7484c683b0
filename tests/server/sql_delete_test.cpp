// The chunked delete on the reference host: the statements sent for each database kind and row
// count (recorded by a connection that passes them on), and the rows left afterwards.
#include <gtest/gtest.h>

#include "../host/host_fixture.h"
#include "recording_host.h"
#include "runtime/convert.h"
#include "server/sql_utils.h"

namespace xal::server {
namespace {

using testing::RecordingConnection;
using testing::SqlCall;

class SQLDeleteTest : public host::testing::HostTest {
 protected:
  // Rows 1..n of article 5, and three rows of article 6 above them that must survive.
  void Fill(int n) {
    conn->db().Exec("DELETE FROM DRStockReserve");
    if (n > 0)
      conn->db().Exec(
          "WITH RECURSIVE k(i) AS (SELECT 1 UNION ALL SELECT i + 1 FROM k WHERE i < ?) "
          "INSERT INTO DRStockReserve (ID, IDGRArticle) SELECT i, 5 FROM k",
          {Variant(int32_t{n})});
    conn->db().Exec("INSERT INTO DRStockReserve (ID, IDGRArticle) VALUES (?, 6), (?, 6), (?, 6)",
                    {Variant(int32_t{n + 1}), Variant(int32_t{n + 2}), Variant(int32_t{n + 3})});
  }
  int32_t Count(int article) {
    return CLng(conn->db().Scalar("SELECT COUNT(*) FROM DRStockReserve WHERE IDGRArticle = ?",
                                  {Variant(int32_t{article})}));
  }
};

constexpr const char* kDelete = "DELETE FROM DRStockReserve WHERE IDGRArticle=5";

TEST_F(SQLDeleteTest, ChunksOnTheFileDatabase) {
  const std::string d = kDelete;
  struct Row {
    int kind;
    int rows;
    int32_t options;
    std::vector<SqlCall> expected;
  } rows[] = {
      {1, 25000, 7, {{d + " AND ID<10001", 0}, {d + " AND ID<20001", 0}, {d, 7}}},
      {1, 20002, 0, {{d + " AND ID<10001", 0}, {d + " AND ID<20001", 0}, {d, 0}}},
      {1, 10001, 0, {{d, 0}}},        // more than 10000 rows, but the first bound is the last ID
      {1, 10000, 0, {{d, 0}}},        // 10000 rows are not chunked
      {1, 0, 0, {{d, 0}}},            // nothing to delete still runs the statement
      {2, 25000, 3, {{d, 3}}},        // the SQL server takes the statement whole
  };
  for (const Row& r : rows) {
    SCOPED_TRACE("kind " + std::to_string(r.kind) + ", " + std::to_string(r.rows) + " rows");
    Fill(r.rows);
    auto recorder = MakeRef<RecordingConnection>(r.kind == 1 ? conn : host::HostConnection::Open(path(), r.kind));
    EXPECT_TRUE(SQLDelete(recorder, kDelete, r.options));
    EXPECT_EQ(recorder->executed, r.expected);
    EXPECT_EQ(Count(5), 0);
    EXPECT_EQ(Count(6), 3);
  }
}

TEST_F(SQLDeleteTest, CountsWithTheStatementsOwnCondition) {
  Fill(25000);
  auto recorder = MakeRef<RecordingConnection>(conn);
  ASSERT_TRUE(SQLDelete(recorder, "delete FROM DRStockReserve WHERE IDGRArticle=5"));
  ASSERT_EQ(recorder->queried.size(), 1u);
  EXPECT_EQ(recorder->queried[0],
            (SqlCall{"SELECT COUNT(*) AS Cnt, MIN(ID) AS MnID, MAX(ID) AS MxID FROM DRSTOCKRESERVE WHERE IDGRARTICLE=5",
                     4}));
}

TEST_F(SQLDeleteTest, FailuresAnswerFalse) {
  Fill(10);
  struct Row {
    int kind;
    const char* sql;
    size_t executed;
  } rows[] = {
      {1, "   ", 0},                                           // nothing to run
      {2, "", 0},
      {1, "DELETE * FROM DRStockReserve WHERE IDGRArticle=5", 0},  // the count cannot be built from it
      {1, "DELETE FROM NoSuchTable WHERE ID=1", 0},            // the count fails
      {2, "DELETE FROM NoSuchTable WHERE ID=1", 1},            // the statement fails
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.sql);
    auto recorder = MakeRef<RecordingConnection>(r.kind == 1 ? conn : host::HostConnection::Open(path(), r.kind));
    EXPECT_FALSE(SQLDelete(recorder, r.sql, 0));
    EXPECT_EQ(recorder->executed.size(), r.executed);
  }
  EXPECT_EQ(Count(5), 10);
  EXPECT_FALSE(SQLDelete(nullptr, kDelete, 0));  // no connection
}

}  // namespace
}  // namespace xal::server
