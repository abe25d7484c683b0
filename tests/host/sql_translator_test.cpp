// Tests of the SQL translator: exact output wherever a rewrite could change meaning (date serials,
// IsNull arity, TOP placement, UPDATE shapes, quoted text left alone), refusals that name the
// construct, and the component's statements — translated for both database kinds — run by SQLite
// against a scratch schema.
#include <gtest/gtest.h>
#include <sqlite3.h>

#include <cstdio>
#include <string>
#include <vector>

#include "host/connection.h"
#include "host/demo_db.h"
#include "host/host_error.h"
#include "host/sql_functions.h"
#include "host/sql_tokenizer.h"
#include "host/sql_translator.h"
#include "runtime/error.h"

namespace xal::host {
namespace {

// ---- Tokenizer ----------------------------------------------------------------------------------

const char* KindName(SqlTokenKind k) {
  switch (k) {
    case SqlTokenKind::kSpace: return "sp";
    case SqlTokenKind::kLineComment: return "lc";
    case SqlTokenKind::kBlockComment: return "bc";
    case SqlTokenKind::kString: return "str";
    case SqlTokenKind::kQuoted: return "dq";
    case SqlTokenKind::kBracketed: return "br";
    case SqlTokenKind::kDate: return "date";
    case SqlTokenKind::kOdbcLiteral: return "odbc";
    case SqlTokenKind::kOdbcFn: return "fn";
    case SqlTokenKind::kNumber: return "num";
    case SqlTokenKind::kBadNumber: return "bad";
    case SqlTokenKind::kIdentifier: return "id";
    case SqlTokenKind::kLParen: return "(";
    case SqlTokenKind::kRParen: return ")";
    case SqlTokenKind::kComma: return ",";
    case SqlTokenKind::kSemicolon: return ";";
    case SqlTokenKind::kDot: return ".";
    case SqlTokenKind::kOperator: return "op";
  }
  return "?";
}

// Non-blank tokens as "kind:text" joined by blanks.
std::string Render(std::string_view sql) {
  std::string s;
  size_t covered = 0;
  for (const SqlToken& t : TokenizeSql(sql)) {
    covered += t.text.size();
    if (t.kind == SqlTokenKind::kSpace) continue;
    if (!s.empty()) s += ' ';
    s += std::string(KindName(t.kind)) + ":" + std::string(t.text) + (t.terminated ? "" : "!");
  }
  EXPECT_EQ(covered, sql.size()) << "tokens must cover the text";
  return s;
}

TEST(SqlTokenizerTest, SplitsWithoutLookingInsideLiterals) {
  struct Row {
    const char* sql;
    const char* expected;
  } rows[] = {
      {"a='It''s #1/2/2009# [x]'", "id:a op:= str:'It''s #1/2/2009# [x]'"},
      {"\"say \"\"hi\"\"\" [Order Details]", "dq:\"say \"\"hi\"\"\" br:[Order Details]"},
      {"#3/5/2009# #12/31/2009 23:5:9# #2009-03-05#", "date:#3/5/2009# date:#12/31/2009 23:5:9# date:#2009-03-05#"},
      {"#.ID = #UID", "op:# .:. id:ID op:= op:# id:UID"},           // rights placeholders are plain text
      {"#3/5/2009", "op:# num:3 op:/ num:5 op:/ num:2009"},           // no closing #
      {"#3/5/2009 1:2:3:4#", "op:# num:3 op:/ num:5 op:/ num:2009 num:1 op:: num:2 op:: num:3 op:: num:4 op:#"},  // four time parts
      {"#123/5/2009#", "op:# num:123 op:/ num:5 op:/ num:2009 op:#"},  // three-digit month
      {"{ d '2009-03-05'} {ts '2009-03-05 1:2:3'}", "odbc:{ d '2009-03-05'} odbc:{ts '2009-03-05 1:2:3'}"},
      {"{fn ucase(x)}", "fn:{fn  id:ucase (:( id:x ):) op:}"},
      {"{IDX IN (1)}", "op:{ id:IDX id:IN (:( num:1 ):) op:}"},       // a raw-SQL brace, not an escape
      {"4711TmpDBalanceStore.DocDate", "id:4711TmpDBalanceStore .:. id:DocDate"},
      {"12 1.5 .5 2e-3 1e5x", "num:12 num:1.5 num:.5 num:2e-3 id:1e5x"},
      {"12.5x", "bad:12.5x"},                                           // a number running into a name
      {"a<>b<=c>=d!=e||f", "id:a op:<> id:b op:<= id:c op:>= id:d op:!= id:e op:|| id:f"},
      {"x -- note\n/* c */y", "id:x lc:-- note bc:/* c */ id:y"},
      {"'open", "str:'open!"},                                          // never closed
      {"[open", "br:[open!"},                                           // never closed
      {"Ärger_1 $x", "id:Ärger_1 op:$ id:x"},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.sql);
    EXPECT_EQ(Render(r.sql), r.expected);
  }
}

TEST(SqlTokenizerTest, TokenValueUndoesQuoting) {
  auto first = [](std::string_view sql) { return SqlTokenValue(TokenizeSql(sql).front()); };
  EXPECT_EQ(first("'It''s'"), "It's");
  EXPECT_EQ(first("\"a\"\"b\""), "a\"b");
  EXPECT_EQ(first("[Order Details]"), "Order Details");
}

// ---- Exact output -------------------------------------------------------------------------------

struct Case {
  int kind;
  const char* sql;
  const char* expected;
};

void CheckCases(const Case* begin, const Case* end) {
  for (const Case* c = begin; c != end; ++c) {
    SCOPED_TRACE(testing::Message() << "kind " << c->kind << ": " << c->sql);
    try {
      EXPECT_EQ(TranslateToSqlite(c->sql, c->kind), c->expected);
    } catch (const VbError& e) {
      ADD_FAILURE() << "refused: " << e.description();
    }
  }
}

TEST(SqlTranslatorTest, DateLiteralsBecomeSerialDays) {
  const Case cases[] = {
      {1, "DocDate = #3/5/2009#", "DocDate = 39877"},
      {1, "DocDate<#12/31/2009 23:5:9#", "DocDate<40178.961909722224"},
      {1, "EndDate=#12/30/1899#", "EndDate=0"},
      {1, "d = #3/5/2009 14:7:0#", "d = 39877.58819444444"},
      {1, "d = #2009-03-05#", "d = 39877"},
      {1, "d = #2/29/2000#", "d = 36585"},
      {1, "d = #3/5/09# OR d = #1/1/30#", "d = 39877 OR d = 10959"},  // two-digit years: 2009, 1930
      {1, "d = #12/30/1899 0:0:1#", "d = 1.1574074074074073e-05"},
      {1, "d = #12/29/1899 6:0#", "d = -1.25"},                       // day -1, six hours forward
      {1, "x-#12/29/1899#", "x- -1"},                                  // not "x--1", a comment
      {1, "ORDER BY#3/5/2009#", "ORDER BY 39877"},
      {2, "p5.BeginDate <= { d '2009-03-05'} AND", "p5.BeginDate <= 39877 AND"},
      {2, "t = {ts '2009-03-05 14:07:00.000'}", "t = 39877.58819444444"},
      {2, "t = {t '06:00:00'}", "t = 0.25"},
      {1, "x = '#3/5/2009#' AND y = #3/5/2009#", "x = '#3/5/2009#' AND y = 39877"},
      {1, "c = '#UID' AND #.ID = 5", "c = '#UID' AND #.ID = 5"},
  };
  CheckCases(std::begin(cases), std::end(cases));
}

TEST(SqlTranslatorTest, FlagsQuotesAndNames) {
  const Case cases[] = {
      {1, "UPDATE GDocument SET IsCertified = True WHERE IsCertified=False AND DealDate < #3/5/2009#",
       "UPDATE GDocument SET IsCertified = -1 WHERE IsCertified=0 AND DealDate < 39877"},
      {2, "UPDATE BBooking SET IsCertified=TRUE WHERE IsCertified=FALSE", "UPDATE BBooking SET IsCertified=-1 WHERE IsCertified=0"},
      {1, "SELECT IsTrue, 'True', [True], T.True, True.x, x IS TRUE, y IS NOT FALSE FROM T WHERE a = TRUE",
       "SELECT IsTrue, 'True', [True], T.True, True.x, x IS TRUE, y IS NOT FALSE FROM T WHERE a = -1"},
      {1, "x = -True", "x = - -1"},
      {1, "Name = \"O'Brien\" AND Code = \"a\"\"b\"", "Name = 'O''Brien' AND Code = 'a\"b'"},
      {2, "Name = \"O'Brien\"", "Name = \"O'Brien\""},
      {1, "a = 'x'\"y\"", "a = 'x' 'y'"},  // two strings must not fuse into one
      {1, "SELECT [Order Details].[Unit Price] FROM [Order Details] WHERE [True] = 'True'",
       "SELECT [Order Details].[Unit Price] FROM [Order Details] WHERE [True] = 'True'"},
      {1, "SELECT * FROM 4711TmpDBalanceStore W WHERE 4711TmpDBalanceStore.DocDate = 1e5",
       "SELECT * FROM \"4711TmpDBalanceStore\" W WHERE \"4711TmpDBalanceStore\".DocDate = 1e5"},
      {2, "SELECT {fn ucase(Name)} FROM T", "SELECT ucase(Name) FROM T"},
      {1, "DROP TABLE a; DROP TABLE IF EXISTS b;", "DROP TABLE IF EXISTS a; DROP TABLE IF EXISTS b;"},
      {1, "x -- True\n= True", "x -- True\n= -1"},
  };
  CheckCases(std::begin(cases), std::end(cases));
}

TEST(SqlTranslatorTest, FunctionsByArity) {
  const Case cases[] = {
      {1, "IIf(IsNull(Sum(R2.Cost)), 0, Sum(R2.Cost))", "IIf((Sum(R2.Cost) IS NULL), 0, Sum(R2.Cost))"},
      {2, "(A.Quantity + IsNull(B.Quantity, 0)) AS DQ", "(A.Quantity + coalesce(B.Quantity, 0)) AS DQ"},
      {2, "IsNull(IsNull(a, b), 0)", "coalesce(coalesce(a, b), 0)"},
      {1, "ISNULL (f(a, b))", " (f(a, b) IS NULL)"},
      {1, "Format(A.BaseQuantity * P.Price, '0.00')", "round(A.BaseQuantity * P.Price, 2)"},
      {1, "Format(x, \"0.0\") + Format(y, '0')", "round(x, 1) + round(y, 0)"},
      {1, "Format(x, '#,##0.00')", "Format(x, '#,##0.00')"},  // the format UDF
      {1, "Format(x, '0.00%')", "Format(x, '0.00%')"},
      {1, "O.OptValue = CStr(R.ID)", "O.OptValue = CAST(R.ID AS TEXT)"},
      {1, "Year(P.EndDate) < 1910 OR CLng(p5.EndDate) < 2 OR Int(x) = 1", "Year(P.EndDate) < 1910 OR CLng(p5.EndDate) < 2 OR Int(x) = 1"},
      {1, "T.IsNull = 'IsNull(x)'", "T.IsNull = 'IsNull(x)'"},
  };
  CheckCases(std::begin(cases), std::end(cases));
}

TEST(SqlTranslatorTest, TopBecomesLimitAtItsLevel) {
  const Case cases[] = {
      {1, "SELECT TOP 2 X.ID FROM GDocRel X WHERE X.IDNextDoc = 8", "SELECT X.ID FROM GDocRel X WHERE X.IDNextDoc = 8 LIMIT 2"},
      {1, "SELECT A.ID FROM T A WHERE A.ID IN (SELECT TOP 1 B.ID FROM U B ORDER BY B.Price) AND A.X = 1",
       "SELECT A.ID FROM T A WHERE A.ID IN (SELECT B.ID FROM U B ORDER BY B.Price LIMIT 1) AND A.X = 1"},
      {1, "SELECT TOP 1 R.* FROM (R INNER JOIN P ON R.I = P.ID) WHERE (P.E >= 1 OR Year(P.E) < 1910)ORDER BY R.Price",
       "SELECT R.* FROM (R INNER JOIN P ON R.I = P.ID) WHERE (P.E >= 1 OR Year(P.E) < 1910)ORDER BY R.Price LIMIT 1"},
      {1, "SELECT DISTINCT TOP 3 a FROM t", "SELECT DISTINCT a FROM t LIMIT 3"},
      {1, "SELECT TOP 1 a FROM t -- first", "SELECT a FROM t LIMIT 1 -- first"},
      {1, "SELECT TOP 1 a FROM (SELECT TOP 5 a FROM t ORDER BY a) ORDER BY a DESC",
       "SELECT a FROM (SELECT a FROM t ORDER BY a LIMIT 5) ORDER BY a DESC LIMIT 1"},
      {1, "SELECT a FROM t WHERE b = (SELECT TOP 1 IsNull(c) FROM u)", "SELECT a FROM t WHERE b = (SELECT (c IS NULL) FROM u LIMIT 1)"},
      {2, "SELECT A.ID FROM DCurDRStockReserve A WITH (NOLOCK) INNER JOIN DRStockReserve B WITH (NOLOCK) ON A.ID = B.ID",
       "SELECT A.ID FROM DCurDRStockReserve A INNER JOIN DRStockReserve B ON A.ID = B.ID"},
      {2, "SELECT a FROM t WITH (NOLOCK, ROWLOCK)", "SELECT a FROM t"},
      {2, "x = #1/2/2009 1:2:WITH (NOLOCK)3#", "x = #1/2/2009 1:2: 3#"},  // a removal must not make a date
      {1, "DELETE * FROM DBalanceStore WHERE IDDRStore = 3", "DELETE FROM DBalanceStore WHERE IDDRStore = 3"},
      {1, "SELECT COUNT(*) FROM t", "SELECT COUNT(*) FROM t"},
  };
  CheckCases(std::begin(cases), std::end(cases));
}

TEST(SqlTranslatorTest, UpdateShapes) {
  const Case cases[] = {
      {1,
       "UPDATE DDStoreDRow A INNER JOIN tmpProductionCost_5 P ON A.IDGRArticle = P.IDGRArticle SET A.Amount = "
       "Format(A.BaseQuantity * P.Price, '0.00'), A.AmountBase = 0, A.Cost = 0 WHERE A.ArticleType = 'P' AND A.IDDoc = 17",
       "UPDATE DDStoreDRow AS A SET Amount = round(A.BaseQuantity * P.Price, 2), AmountBase = 0, Cost = 0 FROM "
       "tmpProductionCost_5 P WHERE (A.IDGRArticle = P.IDGRArticle) AND (A.ArticleType = 'P' AND A.IDDoc = 17)"},
      {1, "UPDATE XALUserOption O, XALOptionList L SET O.OptValue=9 WHERE O.Category=L.Category AND L.Type='ID'",
       "UPDATE XALUserOption AS O SET OptValue=9 FROM XALOptionList L WHERE O.Category=L.Category AND L.Type='ID'"},
      {1, "UPDATE DDStoreDRow R SET R.Cost = 0 WHERE R.IDDoc = 17", "UPDATE DDStoreDRow AS R SET Cost = 0 WHERE R.IDDoc = 17"},
      {1,
       "UPDATE DDStoreDRow R, tmpProductionCost_5 P, DRStore D SET R.Cost = Format(R.BaseQuantity * P.Price, '0.00') "
       "WHERE R.IDGRArticle = P.IDGRArticle AND R.IDSenderStore = D.ID",
       "UPDATE DDStoreDRow AS R SET Cost = round(R.BaseQuantity * P.Price, 2) FROM tmpProductionCost_5 P, DRStore D "
       "WHERE R.IDGRArticle = P.IDGRArticle AND R.IDSenderStore = D.ID"},
      {1, "UPDATE T SET T.x = 1, y = T.y + 1", "UPDATE T SET x = 1, y = T.y + 1"},
      {1, "UPDATE T SET x = 1 WHERE ID In (1,2)", "UPDATE T SET x = 1 WHERE ID In (1,2)"},
      {1, "UPDATE A a INNER JOIN B b ON a.ID = b.ID SET a.X = b.X", "UPDATE A AS a SET X = b.X FROM B b WHERE a.ID = b.ID"},
      {1, "UPDATE A AS a JOIN B AS b ON a.ID = b.ID INNER JOIN C c ON c.ID = b.IDC SET a.X = c.X WHERE a.Y = 1",
       "UPDATE A AS a SET X = c.X FROM B AS b, C c WHERE (a.ID = b.ID) AND (c.ID = b.IDC) AND (a.Y = 1)"},
      {1,
       "UPDATE VBalanceBank A INNER JOIN VBalanceBank B ON A.IDGRCurrency = B.IDGRCurrency SET A.DebitFlow = "
       "A.DebitFlow + B.DebitFlow WHERE A.DocDate = B.DocDate AND B.IDGRBankAccount = 3",
       "UPDATE VBalanceBank AS A SET DebitFlow = A.DebitFlow + B.DebitFlow FROM VBalanceBank B WHERE (A.IDGRCurrency = "
       "B.IDGRCurrency) AND (A.DocDate = B.DocDate AND B.IDGRBankAccount = 3)"},
      {1, "UPDATE A a INNER JOIN B b ON a.ID = b.ID -- join\nSET a.X = 1 WHERE a.Y = 2 -- end",
       "UPDATE A AS a SET X = 1 FROM B b WHERE (a.ID = b.ID) AND (a.Y = 2) -- end"},
      {1, "UPDATE A a, B b SET a.X = b.X WHERE a.ID = b.ID -- c\n", "UPDATE A AS a SET X = b.X FROM B b WHERE a.ID = b.ID -- c\n"},
      {2, "UPDATE [My Table] t SET t.[A Col] = 1", "UPDATE [My Table] AS t SET [A Col] = 1"},
  };
  CheckCases(std::begin(cases), std::end(cases));
}

TEST(SqlTranslatorTest, WorkTables) {
  const Case cases[] = {
      {1, "DROP TABLE tmpProductionCost_5", "DROP TABLE IF EXISTS tmpProductionCost_5"},
      {1,
       "CREATE TABLE tmpProductionCost_5 (ID LONG, IDGRPriceListRel LONG, Price CURRENCY, IDSrcPriceList LONG, "
       "IDGRArticle LONG, IDGRPriceList LONG)",
       "CREATE TABLE tmpProductionCost_5 (ID INTEGER, IDGRPriceListRel INTEGER, Price CURRENCY REAL, IDSrcPriceList "
       "INTEGER, IDGRArticle INTEGER, IDGRPriceList INTEGER)"},
      {1, "CREATE TABLE t (Name TEXT(50), Note MEMO, D DATETIME, F YESNO, B BYTE, S SHORT, X DOUBLE, Y SINGLE, Z BIT)",
       "CREATE TABLE t (Name TEXT COLLATE NOCASE, Note TEXT COLLATE NOCASE, D DATE REAL, F BOOL INTEGER, B INTEGER, "
       "S INTEGER, X REAL, Y REAL, Z BOOL INTEGER)"},
      {1, "CREATE TABLE t (ID LONG NOT NULL, CONSTRAINT pk PRIMARY KEY (ID))",
       "CREATE TABLE t (ID INTEGER NOT NULL, CONSTRAINT pk PRIMARY KEY (ID))"},
      {1, "CREATE TABLE t (a DATE REAL NOT NULL DEFAULT 0, b CURRENCY REAL, c BOOL INTEGER, d TEXT COLLATE NOCASE)",
       "CREATE TABLE t (a DATE REAL NOT NULL DEFAULT 0, b CURRENCY REAL, c BOOL INTEGER, d TEXT COLLATE NOCASE)"},
      {1, "CREATE TABLE t (a DATE, b BOOL)", "CREATE TABLE t (a DATE REAL, b BOOL INTEGER)"},
      {1, "CREATE INDEX t_a ON t (a)", "CREATE INDEX t_a ON t (a)"},  // already prefixed
      {1, "CREATE INDEX IDGRPriceList ON tmpProductionCost_5 (IDGRPriceList)",
       "CREATE INDEX tmpProductionCost_5_IDGRPriceList ON tmpProductionCost_5 (IDGRPriceList)"},
      {1, "CREATE UNIQUE INDEX K ON 4711Tmp (a)", "CREATE UNIQUE INDEX \"4711Tmp_K\" ON \"4711Tmp\" (a)"},
      {1, "DROP INDEX K ON T", "DROP INDEX IF EXISTS T_K"},
      {1,
       "SELECT DocDate, IDDRStore, Sum(DebitQFlow) AS DQ INTO 4711TmpDBalanceStore FROM DBalanceStore WHERE "
       "IDGRArticle = 3 GROUP BY DocDate, IDDRStore",
       "CREATE TABLE \"4711TmpDBalanceStore\" AS SELECT DocDate, IDDRStore, Sum(DebitQFlow) AS DQ FROM DBalanceStore "
       "WHERE IDGRArticle = 3 GROUP BY DocDate, IDDRStore"},
      {1, "INSERT INTO T (a) SELECT b FROM u WHERE c IN (SELECT d FROM v)", "INSERT INTO T (a) SELECT b FROM u WHERE c IN (SELECT d FROM v)"},
  };
  CheckCases(std::begin(cases), std::end(cases));
}

// ---- Refusals -----------------------------------------------------------------------------------

TEST(SqlTranslatorTest, RefusesWhatWouldChangeMeaning) {
  struct Row {
    int kind;
    const char* sql;
    const char* message;  // a part of the error text
  } rows[] = {
      {1, "UPDATE A a INNER JOIN B b ON a.ID = b.ID SET b.X = 1", "SET target b.X belongs to another table"},  // updates B
      {1, "UPDATE GDocument D SET GDocument.X = 1", "SET target GDocument.X belongs to another table"},  // aliased: only D names it
      {1, "UPDATE A a LEFT JOIN B b ON a.ID = b.ID SET a.X = b.X", "outer join"},   // unmatched rows would be skipped
      {1, "UPDATE A a RIGHT OUTER JOIN B b ON a.ID = b.ID SET a.X = 1", "outer join"},
      {1, "UPDATE (A INNER JOIN B ON A.x = B.x) SET A.y = 1", "target must be a table name"},
      {1, "UPDATE A a, B b SET a.X = 1 FROM C", "FROM clause"},                    // two source lists
      {1, "SELECT TOP 10 PERCENT a FROM t", "PERCENT"},
      {1, "SELECT TOP 1 a FROM t UNION SELECT b FROM u", "UNION"},                  // LIMIT would cut the union
      {1, "SELECT a FROM t UNION ALL SELECT TOP 1 b FROM u", "UNION"},
      {1, "SELECT TOP x a FROM t", "whole number"},
      {1, "SELECT TOP 1.5 a FROM t", "whole number"},
      {1, "IsNull(a, b, c)", "IsNull with 3 arguments"},
      {1, "IsNull()", "IsNull with 0 arguments"},
      {1, "CStr(a, b)", "CStr"},
      {1, "Format(a, b, c)", "Format with 3 arguments"},                         // SQLite's own format is printf
      {1, "d = #2/30/2009#", "#2/30/2009#"},                                        // no such day
      {1, "d = #3/5/2009 24:0#", "#3/5/2009 24:0#"},
      {2, "d = {d '2009-3-5'}", "ODBC escape"},                                     // month and day need two digits
      {2, "d = {ts '2009-03-05 10:00:00.5'}", "ODBC escape"},                       // fractions of a second
      {1, "{IDSDInvoiceRow IN (SELECT ID FROM SDInvoiceRow WHERE IDDoc = 5)}", "filter layer"},
      {1, "{fn ucase(x)", "not closed"},
      {2, "WHERE ((A.Q - (SELECT IsNull(Sum(X.Q), 0) FROM X WHERE X.ID = 40)) <> 0", "unbalanced parentheses"},
      {1, "a = b)", "')' has no matching '('"},
      {1, "a = 'abc", "string literal is not closed"},
      {1, "a = \"abc", "double-quoted literal is not closed"},
      {1, "a = [abc", "[name] is not closed"},
      {1, "a /* open", "comment is not closed"},
      {1, "a = 12.5x", "number 12.5x"},
      {1, "Name & 'x'", "'&'"},                                                     // Access concatenation
      {1, "SELECT a INTO T IN 'other.mdb' FROM b", "another database file"},
      {1, "CREATE TABLE t (ID COUNTER)", "column type COUNTER"},                    // an autonumber would be lost
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(testing::Message() << "kind " << r.kind << ": " << r.sql);
    try {
      std::string out = TranslateToSqlite(r.sql, r.kind);
      ADD_FAILURE() << "translated to: " << out;
    } catch (const VbError& e) {
      EXPECT_EQ(e.number(), kErrSql);
      EXPECT_NE(e.description().find(r.message), std::string::npos) << e.description();
    }
  }
}

// ---- The component's statements on SQLite -------------------------------------------------------

// Just the columns the statements name. Identifiers INTEGER, other numbers REAL, dates DATE REAL,
// text case-insensitive and never NULL — the host's conventions.
constexpr const char* kScratchSchema = R"sql(
CREATE TABLE GDocument (ID INTEGER PRIMARY KEY, RefType TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DocName TEXT COLLATE NOCASE NOT NULL DEFAULT '', IDGRCompany INTEGER, IDPartner INTEGER, DocDate DATE REAL,
  DealDate DATE REAL, SourceDocNo TEXT COLLATE NOCASE NOT NULL DEFAULT '', TotalAmountBase CURRENCY REAL,
  DocState TEXT COLLATE NOCASE NOT NULL DEFAULT '', DealState TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IsCertified BOOL INTEGER, IDGRPriceList INTEGER);
CREATE VIEW PDReceiptD AS SELECT * FROM GDocument WHERE DocName = 'PDReceiptD';
CREATE VIEW SDInvoice AS SELECT * FROM GDocument WHERE DocName = 'SDInvoice';
CREATE TABLE GDTax (ID INTEGER PRIMARY KEY, IDGDocument INTEGER, TaxAmount REAL, TaxAmountBase REAL, TaxAmountRef REAL);
CREATE TABLE VDVoucherRow (ID INTEGER PRIMARY KEY, IDVDVoucher INTEGER, IDSourceDoc INTEGER, AmountBase REAL);
CREATE TABLE DDStoreDRow (ID INTEGER PRIMARY KEY, IDDoc INTEGER, IDGRArticle INTEGER, IDReceiverStore INTEGER,
  IDSenderStore INTEGER, ArticleType TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DealState TEXT COLLATE NOCASE NOT NULL DEFAULT '', DocDate DATE REAL, BaseQuantity REAL, Amount REAL,
  AmountBase REAL, Cost REAL);
CREATE TABLE SDInvoiceRow (ID INTEGER PRIMARY KEY, IDDoc INTEGER);
CREATE TABLE SDInvoiceRowPenalty (ID INTEGER PRIMARY KEY, IDSDInvoiceRow INTEGER);
CREATE TABLE DPInventoryB (ID INTEGER PRIMARY KEY);
CREATE TABLE GRPriceLQuantity (ID INTEGER PRIMARY KEY, IDGRPriceListRel INTEGER, Quantity REAL, Price REAL, QuantityPercent REAL);
CREATE TABLE GRCPriceList (ID INTEGER PRIMARY KEY, IsCertified INTEGER, BeginDate DATE REAL, EndDate DATE REAL);
CREATE TABLE GRCPriceListRel (ID INTEGER PRIMARY KEY, IDGRCPriceList INTEGER, IDGRArticle INTEGER, IDGRUnit INTEGER, Price REAL);
CREATE TABLE GRCPriceLCompany (ID INTEGER PRIMARY KEY, IDGRCPriceList INTEGER, IDGRCompany INTEGER);
CREATE TABLE GDocRel (ID INTEGER PRIMARY KEY, PrevDocName TEXT COLLATE NOCASE NOT NULL DEFAULT '', IDPrevDoc INTEGER,
  NextDocName TEXT COLLATE NOCASE NOT NULL DEFAULT '', IDNextDoc INTEGER);
CREATE TABLE GRCompContPerson (ID INTEGER PRIMARY KEY, IDGRCompany INTEGER, IsDefault INTEGER, ShowInReport INTEGER,
  CardNo TEXT COLLATE NOCASE NOT NULL DEFAULT '');
CREATE TABLE GRBankAccount (ID INTEGER PRIMARY KEY, IDGRCompany INTEGER, IsDefault INTEGER, ShowInReport INTEGER,
  ReferenceNo TEXT COLLATE NOCASE NOT NULL DEFAULT '');
CREATE TABLE GRCompany (ID INTEGER PRIMARY KEY, LocationAddr TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DeliveryAddr TEXT COLLATE NOCASE NOT NULL DEFAULT '', LegalAddr TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDGRPriceList INTEGER, IDGRPriceListC INTEGER, IDGRCompanyPriceCat INTEGER);
CREATE TABLE GRCompDeliveryAddr (ID INTEGER PRIMARY KEY, IDGRCompany INTEGER, DeliveryAddr TEXT COLLATE NOCASE NOT NULL DEFAULT '');
CREATE TABLE DRStockReserve (ID INTEGER PRIMARY KEY, IDGRArticle INTEGER, Quantity REAL);
CREATE TABLE DRStockReserveRel (ID INTEGER PRIMARY KEY, IDDRStockReserve INTEGER, IDDDStoreDRow INTEGER, Quantity REAL);
CREATE TABLE DCurDRStockReserve (IDDRStockReserve INTEGER, IDDRStore INTEGER, IDGRArticle INTEGER, Quantity REAL,
  RQuantity REAL, PQuantity REAL, PRIMARY KEY (IDDRStockReserve, IDDRStore));
CREATE TABLE DCurBalanceStore (IDGRArticle INTEGER, IDDRStore INTEGER, Quantity REAL, RQuantity REAL, PQuantity REAL,
  AltQuantity REAL, RAltQuantity REAL, PAltQuantity REAL, AmountBase REAL, Cost REAL, PRIMARY KEY (IDGRArticle, IDDRStore));
CREATE TABLE DBalanceStore (ID INTEGER PRIMARY KEY, DocDate DATE REAL, IDGRArticle INTEGER, IDDRStore INTEGER,
  DebitQFlow REAL, CreditQFlow REAL, DebitFlowBase REAL, CreditFlowBase REAL, DebitFlowRef REAL, CreditFlowRef REAL);
CREATE TABLE GRPriceList (ID INTEGER PRIMARY KEY, IDFirst INTEGER, BeginDate DATE REAL, EndDate DATE REAL,
  IsBruto INTEGER, WithoutPriceCut INTEGER);
CREATE TABLE GRPriceListRel (ID INTEGER PRIMARY KEY, IDGRPriceList INTEGER, IDGRArticle INTEGER, Price REAL,
  BeginDate DATE REAL, EndDate DATE REAL);
CREATE TABLE GRPriceCatRel (ID INTEGER PRIMARY KEY, IDGRArticlePriceCat INTEGER, IDGRCompanyPriceCat INTEGER,
  IDGRPriceList INTEGER, PriceCut REAL, MinMarkup REAL);
CREATE TABLE GRArticle (ID INTEGER PRIMARY KEY, Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  ArticleType TEXT COLLATE NOCASE NOT NULL DEFAULT '', Cost REAL, IDGRArticlePriceCat INTEGER);
CREATE TABLE GRArticleCat (ID INTEGER PRIMARY KEY, Category TEXT COLLATE NOCASE NOT NULL DEFAULT '');
CREATE TABLE GRArticleCatRel (ID INTEGER PRIMARY KEY, IDGRArticle INTEGER, IDGRArticleCat INTEGER);
CREATE TABLE GRArtCompletion (ID INTEGER PRIMARY KEY, IDGRArticle INTEGER, IDDRStore INTEGER);
CREATE TABLE GRArtCompletionRow (ID INTEGER PRIMARY KEY, IDGRArtCompletion INTEGER, IDGRArticle INTEGER,
  IDGRUnit INTEGER, IDDRStore INTEGER, Quantity REAL);
CREATE TABLE GRTermPaymentRow (ID INTEGER PRIMARY KEY, IDGRTermPayment INTEGER, PromptTime INTEGER, PenaltyPercent REAL);
CREATE TABLE GRCurValue (ID INTEGER PRIMARY KEY, IDGRCurrency INTEGER, ChangeDate DATE REAL, ConversionRate REAL);
CREATE TABLE DRStore (ID INTEGER PRIMARY KEY, IDGRPriceList INTEGER, IDComplPriceList INTEGER);
CREATE TABLE BBooking (ID INTEGER PRIMARY KEY, IsCertified INTEGER, DealDate DATE REAL);
CREATE TABLE VBalanceBank (ID INTEGER PRIMARY KEY, DocDate DATE REAL, IDGRBankAccount INTEGER, IDGRCurrency INTEGER,
  DebitFlow REAL, DebitFlowBase REAL, DebitFlowRef REAL, CreditFlow REAL, CreditFlowBase REAL, CreditFlowRef REAL);
CREATE TABLE XALUserOption (ID INTEGER PRIMARY KEY, IDXALUser INTEGER, Category TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '', OptValue TEXT COLLATE NOCASE NOT NULL DEFAULT '');
CREATE TABLE XALOptionList (ID INTEGER PRIMARY KEY, Category TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '', TableName TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Type TEXT COLLATE NOCASE NOT NULL DEFAULT '');
CREATE TABLE xalurights (ID INTEGER PRIMARY KEY, idxaluser INTEGER, objectname TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  category TEXT COLLATE NOCASE NOT NULL DEFAULT '', fcondition TEXT COLLATE NOCASE NOT NULL DEFAULT '', factive INTEGER);
CREATE TABLE EREmployee (ID INTEGER PRIMARY KEY, Record_state TEXT COLLATE NOCASE NOT NULL DEFAULT '');
CREATE TABLE WRPerson (ID INTEGER PRIMARY KEY, IDEREmployee INTEGER, Record_state TEXT COLLATE NOCASE NOT NULL DEFAULT '');
)sql";

// Prepares and steps one statement through to the end; the error text, or "" on success.
std::string StepAll(sqlite3* db, const std::string& sql) {
  sqlite3_stmt* st = nullptr;
  const char* tail = nullptr;
  if (sqlite3_prepare_v2(db, sql.c_str(), -1, &st, &tail) != SQLITE_OK) return sqlite3_errmsg(db);
  if (tail && std::string_view(tail).find_first_not_of(" \r\n\t;") != std::string_view::npos) {
    sqlite3_finalize(st);
    return "more than one statement";
  }
  int rc;
  while ((rc = sqlite3_step(st)) == SQLITE_ROW) {
  }
  std::string msg = rc == SQLITE_DONE ? "" : sqlite3_errmsg(db);
  sqlite3_finalize(st);
  return msg;
}

class ScratchDb {
 public:
  ScratchDb() {
    sqlite3_open(":memory:", &db_);
    sqlite3_db_config(db_, SQLITE_DBCONFIG_DQS_DML, 0, nullptr);
    sqlite3_db_config(db_, SQLITE_DBCONFIG_DQS_DDL, 0, nullptr);
    RegisterSqlFunctions(db_);
    Exec(kScratchSchema);
  }
  ~ScratchDb() { sqlite3_close(db_); }
  ScratchDb(const ScratchDb&) = delete;
  ScratchDb& operator=(const ScratchDb&) = delete;

  // Runs a script; the error text, or "" on success.
  std::string Exec(const std::string& sql) {
    char* err = nullptr;
    if (sqlite3_exec(db_, sql.c_str(), nullptr, nullptr, &err) == SQLITE_OK) return "";
    std::string msg = err ? err : "?";
    sqlite3_free(err);
    return msg;
  }

  std::string Run(const std::string& sql) { return StepAll(db_, sql); }

  // The first column of every row, as text ("NULL" for Null).
  std::vector<std::string> Column(const std::string& sql) {
    std::vector<std::string> out;
    sqlite3_stmt* st = nullptr;
    if (sqlite3_prepare_v2(db_, sql.c_str(), -1, &st, nullptr) != SQLITE_OK) {
      out.push_back(std::string("error: ") + sqlite3_errmsg(db_));
      return out;
    }
    int rc;
    while ((rc = sqlite3_step(st)) == SQLITE_ROW) {
      const unsigned char* t = sqlite3_column_text(st, 0);
      out.push_back(t ? reinterpret_cast<const char*>(t) : "NULL");
    }
    if (rc != SQLITE_DONE) out.push_back(std::string("error: ") + sqlite3_errmsg(db_));
    sqlite3_finalize(st);
    return out;
  }

  sqlite3* db() { return db_; }

 private:
  sqlite3* db_ = nullptr;
};

// The price-list chain union the production costs read (five levels through IDFirst).
std::string ChainUnion() {
  std::string u =
      "SELECT pr.id, pr.price, pr.idgrarticle, pl.id as idgrpricelist, pl.id as idsrcpricelist, 1 as plevel, "
      "pl.begindate, pl.enddate FROM grpricelistrel pr inner join grpricelist pl on pr.idgrpricelist = pl.id";
  for (int n = 2; n <= 5; ++n) {
    std::string src = "pl" + std::to_string(n - 1);
    std::string from = "grpricelistrel pr inner join grpricelist pl1 on pr.idgrpricelist=pl1.id";
    for (int k = 2; k < n; ++k)
      from = "(" + from + ") inner join grpricelist pl" + std::to_string(k) + " on pl" + std::to_string(k) +
             ".idfirst=pl" + std::to_string(k - 1) + ".id";
    from = "(" + from + ") inner join grpricelist pl on pl.idfirst=" + src + ".id";
    u += " UNION ALL SELECT pr.id, pr.price, pr.idgrarticle, pl.id as idgrpricelist, " + src + ".id as idsrcpricelist, " +
         std::to_string(n) + " as plevel, " + src + ".begindate, " + src + ".enddate FROM " + from;
  }
  return u;
}

std::string FillProductionCosts(int kind) {
  std::string l = kind == 2 ? "{ d '2009-03-05'} " : "#3/5/2009#";
  std::string dc = " p5.BeginDate <= " + l + " AND (p5.EndDate >= " + l +
                   (kind == 2 ? " OR Year(p5.EndDate) < 1900)" : " OR CLng(p5.EndDate) < 2)");
  std::string u = ChainUnion();
  return "INSERT INTO tmpProductionCost_17(ID, IDGRPriceListRel, Price, IDSrcPriceList, IDGRArticle, IDGRPriceList)"
         "SELECT p5u.id, p5u.id, p5u.price, p5u.idsrcpricelist, p5u.idgrarticle, p5u.idgrpricelist FROM (" +
         u + ") p5u INNER JOIN (select  min (p5.plevel) as plevel, p5.idgrarticle, p5.idgrpricelist from (" + u +
         ") p5 where " + dc +
         " group by p5.idgrarticle, p5.idgrpricelist) p5l ON (p5u.plevel = p5l.plevel) AND (p5u.idgrarticle = "
         "p5l.idgrarticle) AND (p5u.idgrpricelist = p5l.idgrpricelist)\r\nWHERE p5u.idgrarticle in (select idgrarticle "
         "from ddstoredrow where articletype='P' and iddoc=17)";
}

std::string PriceChain() {
  std::string t = "#3/5/2009#";
  std::string ids;
  for (int n = 1; n <= 5; ++n) {
    std::string wa = "WA" + std::to_string(n);
    ids += "IIf(" + t + " >= " + wa + ".BeginDate AND (" + t + " <= " + wa + ".EndDate OR Year(" + wa +
           ".EndDate) < 1900), " + wa + ".ID, 0) AS ID_" + std::to_string(n) + (n < 5 ? ", " : " ");
  }
  return "SELECT A.IDGRArticle, A.IDGRPriceList, A.Price FROM GRPriceListRel A, (SELECT WA.IDGRArticle, "
         "Min(IIf(WB.ID_1 = WA.IDGRPriceList, 1, IIf(WB.ID_2 = WA.IDGRPriceList, 2, IIf(WB.ID_3 = WA.IDGRPriceList, 3, "
         "IIf(WB.ID_4 = WA.IDGRPriceList, 4, 5))))) AS Weight FROM GRPriceListRel WA, (SELECT " +
         ids +
         "FROM (((GRPriceList WA1 LEFT JOIN GRPriceList WA2 ON WA1.IDFirst = WA2.ID) LEFT JOIN GRPriceList WA3 ON "
         "WA2.IDFirst = WA3.ID) LEFT JOIN GRPriceList WA4 ON WA3.IDFirst = WA4.ID) LEFT JOIN GRPriceList WA5 ON "
         "WA4.IDFirst = WA5.ID WHERE 4 In (WA1.ID, WA2.ID, WA3.ID, WA4.ID, WA5.ID)) WB WHERE WA.IDGRArticle = 12 GROUP "
         "BY WA.IDGRArticle) B, (SELECT A1.ID AS ID_1, A2.ID AS ID_2, A3.ID AS ID_3, A4.ID AS ID_4, A5.ID AS ID_5 FROM "
         "(((GRPriceList A1 LEFT JOIN GRPriceList A2 ON A1.IDFirst = A2.ID) LEFT JOIN GRPriceList A3 ON A2.IDFirst = "
         "A3.ID) LEFT JOIN GRPriceList A4 ON A3.IDFirst = A4.ID) LEFT JOIN GRPriceList A5 ON A4.IDFirst = A5.ID WHERE 4 "
         "In (A1.ID, A2.ID, A3.ID, A4.ID, A5.ID)) C WHERE A.IDGRArticle = B.IDGRArticle AND (IIf(B.Weight = 1, C.ID_1, "
         "IIf(B.Weight = 2, C.ID_2, IIf(B.Weight = 3, C.ID_3, IIf(B.Weight = 4, C.ID_4, C.ID_5))))) = A.IDGRPriceList";
}

std::string ReservationDifference(const std::string& extra) {
  return "(SELECT Sum(IIf(Y.IDReceiverStore = 2 AND Y.DealState <> 'P', X.Quantity, 0)) - Sum(IIf(Y.IDSenderStore = 2, "
         "X.Quantity, 0)) FROM DRStockReserveRel X, DDStoreDRow Y WHERE A.ID = X.IDDRStockReserve AND X.IDDDStoreDRow = "
         "Y.ID AND (Y.IDSenderStore = 2 OR Y.IDReceiverStore = 2) AND " +
         extra + ")";
}

std::string ServerReservation() {
  return "((A.Quantity + A.RQuantity + A.PQuantity- (SELECT IsNull(Sum(X.Quantity), 0) FROM DRStockReserveRel X WHERE "
         "X.IDDRStockReserve = A.IDDRStockReserve AND X.IDDDStoreDRow = 40)))";
}

struct Statement {
  const char* code;   // the inventory entry
  int kinds;          // 1: file database, 2: server, 3: both
  const char* table;  // for a filter: the table it restricts (the statement is then the condition)
  std::string sql;
};

// Statements in the order a session would send them (work tables are created before they are used).
std::vector<Statement> Inventory() {
  const std::string costF =
      "SELECT IIf(IIf(IsNull(Sum(R.Q)), 0,Sum(R.Q)) = 0, 0, Sum(R.A) / Sum(R.Q)) AS Cost FROM (SELECT "
      "IIf(IsNull(Sum(R1.DebitFlowBase)), 0, Sum(R1.DebitFlowBase)) -IIf(IsNull(Sum(R1.CreditFlowBase)), 0, "
      "Sum(R1.CreditFlowBase)) AS A, IIf(IsNull(Sum(R1.DebitQFlow)), 0, Sum(R1.DebitQFlow)) "
      "-IIf(IsNull(Sum(R1.CreditQFlow)), 0, Sum(R1.CreditQFlow)) AS Q FROM DBalanceStore R1 WHERE R1.IDGRArticle = 12 "
      "AND R1.IDDRStore = 2 AND R1.DocDate < #3/5/2009# UNION ALL SELECT IIf(IsNull(Sum(R2.Cost)), 0, Sum(R2.Cost)) AS A, "
      "IIf(IsNull(Sum(R2.BaseQuantity)), 0, Sum(R2.BaseQuantity)) AS Q FROM DDStoreDRow R2 WHERE R2.IDGRArticle = 12 AND "
      "R2.IDReceiverStore = 2 AND R2.DealState = '' AND R2.ArticleType <> 'S' AND R2.IDReceiverStore IS NOT NULL  AND "
      "R2.DocDate >= #3/5/2009# AND R2.ID <> 40 UNION ALL SELECT -IIf(IsNull(Sum(R3.Cost)), 0, Sum(R3.Cost)), "
      "-IIf(IsNull(Sum(R3.BaseQuantity)), 0, Sum(R3.BaseQuantity)) FROM DDStoreDRow R3 WHERE R3.IDGRArticle = 12 AND "
      "R3.IDSenderStore = 2 AND R3.DealState <> 'P' AND R3.ArticleType <> 'S' AND R3.IDSenderStore IS NOT NULL  AND "
      "R3.DocDate >= #3/5/2009# AND R3.ID <> 40) R ";
  const std::string setsF =
      "SELECT Min(X.Q) AS Q FROM (SELECT Sum(Z.Q) AS Q FROM (SELECT I.IDGRArticle, SUM(I.BaseQuantity / IIf(R.Quantity = "
      "0, 1, R.Quantity)) AS Q FROM (DDStoreDRow I INNER JOIN GRArtCompletionRow R ON I.IDGRArticle = R.IDGRArticle) "
      "INNER JOIN GRArtCompletion C ON R.IDGRArtCompletion = C.ID WHERE C.IDGRArticle = 12 AND I.ArticleType <> 'S' AND "
      "I.IDReceiverStore = 2 AND I.DocDate >= #3/5/2009# GROUP BY I.IDGRArticle  UNION ALL SELECT O.IDGRArticle, "
      "-SUM(O.BaseQuantity / IIf(R.Quantity = 0, 1, R.Quantity)) AS Q FROM (DDStoreDRow O INNER JOIN GRArtCompletionRow "
      "R ON O.IDGRArticle = R.IDGRArticle) INNER JOIN GRArtCompletion C ON R.IDGRArtCompletion = C.ID WHERE "
      "C.IDGRArticle = 12 AND O.ArticleType <> 'S' AND O.IDSenderStore = 2 AND O.DocDate >= #3/5/2009# GROUP BY "
      "O.IDGRArticle  UNION ALL SELECT B.IDGRArticle, (SUM(B.DebitQFlow / IIf(R.Quantity = 0, 1, R.Quantity)) - "
      "SUM(B.CreditQFlow / IIf(R.Quantity = 0, 1, R.Quantity))) AS Q FROM (DBalanceStore B INNER JOIN GRArtCompletionRow "
      "R ON B.IDGRArticle = R.IDGRArticle) INNER JOIN GRArtCompletion C ON R.IDGRArtCompletion = C.ID WHERE "
      "C.IDGRArticle = 12 AND B.IDDRStore = 2 AND B.DocDate < #3/5/2009# GROUP BY B.IDGRArticle ) Z GROUP BY "
      "Z.IDGRArticle) X";
  return {
      // Plain look-ups.
      {"look-up", 3, nullptr, "SELECT ID FROM GRBankAccount WHERE IsDefault <> 0 AND IDGRCompany = 3"},
      {"look-up", 3, nullptr,
       "SELECT A.PromptTime, A.PenaltyPercent FROM GRTermPaymentRow A WHERE A.IDGRTermPayment = 2 AND A.PromptTime = "
       "(SELECT Max(X.PromptTime) FROM GRTermPaymentRow X WHERE X.IDGRTermPayment = 2)"},
      {"look-up", 3, nullptr,
       "SELECT Price, QuantityPercent FROM GRPriceLQuantity WHERE Quantity <= 2.5 AND IDGRPriceListRel = 9 ORDER BY "
       "Quantity DESC"},
      {"look-up", 3, nullptr, "SELECT * FROM GRPriceListRel WHERE 1=0"},
      {"look-up", 3, nullptr,
       "SELECT A.IDGRPriceList FROM GRPriceCatRel A, GRArticle B WHERE B.ID = 12 AND B.IDGRArticlePriceCat = "
       "A.IDGRArticlePriceCat AND A.IDGRCompanyPriceCat = 5"},
      {"look-up", 3, nullptr, "SELECT ID FROM GRArticle WHERE Code In ('a','b')"},
      {"look-up", 3, nullptr, "SELECT ConversionRate FROM GRCurValue WHERE IDGRCurrency = 2 AND ChangeDate = #3/5/2009#"},
      {"look-up", 3, nullptr,
       "select fcondition from xalurights where idxaluser = 1 and objectname = 'GRArticle' and category = 'REGISTER' "
       "and factive <> 0"},
      {"look-up", 3, nullptr,
       "SELECT REL.ID FROM GRArticleCat C, GRArticleCat CNew, GRArticleCatRel REL WHERE REL.IDGRArticle=12 AND "
       "C.ID=REL.IDGRArticleCat AND CNew.ID=7 AND CNew.Category=C.Category AND CNew.Category<>'' AND "
       "NOT(REL.IDGRArticle=12 AND REL.IDGRArticleCat=7)"},
      {"#1", 3, nullptr, "SELECT Min(ID) AS tmpID FROM GRPriceLQuantity"},
      {"#2", 3, nullptr,
       "SELECT Sum(TaxAmount) AS Tax, Sum(TaxAmountBase) AS TaxBase, Sum(TaxAmountRef) AS TaxRef FROM GDTax WHERE "
       "IDGDocument = 17"},
      {"#2", 3, nullptr,
       "SELECT Sum(TotalAmountBase) AS Amount FROM GDocument WHERE IDGRCompany = 3 AND RefType = 'SDInvoice' AND "
       "DocState <> 'F'"},
      {"#2", 3, nullptr,
       "SELECT Sum(B.AmountBase) AS Amount FROM GDocument A INNER JOIN VDVoucherRow B ON A.ID = B.IDSourceDoc WHERE "
       "A.IDGRCompany = 3"},
      {"#3", 3, nullptr,
       "SELECT ID FROM GDocument WHERE RefType = 'SDInvoice' AND IDGRCompany = 3 AND DocDate = #3/5/2009# AND ID <> 17 "
       "AND SourceDocNo = 'A-1'"},
      {"#4", 3, nullptr,
       "SELECT IDGRArticle, BaseQuantity, IDReceiverStore, IDSenderStore FROM DDStoreDRow WHERE ArticleType Not In "
       "('P', 'S') AND ((BaseQuantity > 0 AND IDReceiverStore Is Not Null) OR (BaseQuantity < 0 AND IDSenderStore Is "
       "Not Null)) AND IDDoc = 17"},
      {"#4", 3, nullptr, "DELETE * FROM DPInventoryB WHERE ID = 4"},
      {"#5", 3, nullptr,
       "SELECT TOP 1 R.* FROM (GRCPriceListRel R INNER JOIN GRCPriceList P ON R.IDGRCPriceList = P.ID) INNER JOIN "
       "GRCPriceLCompany C ON C.IDGRCPriceList = P.ID WHERE P.IsCertified <> 0 AND R.IDGRArticle = 12 AND C.IDGRCompany "
       "= 3 AND #3/5/2009# >= P.BeginDate AND (#3/5/2009# <= P.EndDate OR Year(P.EndDate) < 1910)ORDER BY R.Price"},
      {"#6", 3, nullptr,
       "SELECT TOP 1 X.IDNextDoc FROM GDocRel X WHERE X.PrevDocName = 'SDConsignmD' AND X.NextDocName = 'SDInvoice' "
       "AND X.IDPrevDoc = 17"},
      {"#6", 3, nullptr,
       "SELECT TOP 2 X.ID FROM GDocRel X WHERE X.PrevDocName = 'SDConsignmD' AND X.NextDocName = 'SDInvoice' AND "
       "X.IDNextDoc = 18"},
      {"#6", 3, nullptr, "SELECT TOP 1 ID FROM GRBankAccount WHERE ShowInReport <> 0 AND IDGRCompany = 3"},
      {"#6", 3, nullptr,
       "SELECT TOP 1 A.ID FROM DRStockReserveRel A INNER JOIN DDStoreDRow B ON A.IDDDStoreDRow = B.ID WHERE A.Quantity "
       "< 0 AND B.IDDoc = 17"},
      {"#7", 3, nullptr,
       "SELECT RTrim(LocationAddr) AS Address FROM GRCompany WHERE RTrim(LocationAddr) <> '' AND ID = 3 UNION SELECT "
       "RTrim(DeliveryAddr) FROM GRCompany WHERE RTrim(DeliveryAddr) <> '' AND ID = 3 UNION SELECT RTrim(LegalAddr) "
       "FROM GRCompany WHERE RTrim(LegalAddr) <> '' AND ID = 3 UNION SELECT RTrim(DeliveryAddr) FROM "
       "GRCompDeliveryAddr WHERE RTrim(DeliveryAddr) <> '' AND IDGRCompany = 3 ORDER BY 1"},
      {"F1", 3, "GDocument", "DocName In ('DRStoreOut', 'SDInvoice')"},
      {"F1", 3, "GRCompContPerson", "IDGRCompany = 3 AND ShowInReport <> 0"},
      {"F1", 3, "GRPriceList", "ID In (4,5) Or IDFirst In (4,5)"},
      {"F1", 3, "GRArticle", "1 = 0"},
      {"F2", 3, "GRPriceList", "BeginDate <= #3/5/2009# AND (EndDate >= #3/5/2009# OR EndDate=#12/30/1899#)"},
      {"#8", 2, nullptr,
       "SELECT DISTINCT B.ID, B.Quantity AS ResQ FROM DCurDRStockReserve A WITH (NOLOCK) INNER JOIN DRStockReserve B "
       "WITH (NOLOCK) ON A.IDDRStockReserve = B.ID WHERE A.IDGRArticle = 12 AND A.IDDRStore = 2 AND " +
           ServerReservation() + " <> 0"},
      {"#8", 2, nullptr,
       "SELECT DISTINCT A.IDDRStockReserve AS ID, " + ServerReservation() +
           " AS ResQ FROM DCurDRStockReserve A WITH (NOLOCK) WHERE A.IDGRArticle = 12 AND A.IDDRStore = 2 AND " +
           ServerReservation() + " <> 0"},
      {"#9", 1, nullptr,
       "SELECT A.ID, A.Quantity AS ResQ FROM DRStockReserve A WHERE A.IDGRArticle = 12 AND (0 <> " +
           ReservationDifference("X.IDDDStoreDRow <> 40") +
           " OR Not Exists (SELECT * FROM DRStockReserveRel Z WHERE A.ID = Z.IDDRStockReserve))"},
      {"#9", 1, nullptr,
       "SELECT A.ID, " + ReservationDifference("X.IDDDStoreDRow <> 40") +
           " AS ResQ FROM DRStockReserve A WHERE A.IDGRArticle = 12 AND (0 <> " +
           ReservationDifference("X.IDDDStoreDRow <> 40") +
           " OR Not Exists (SELECT * FROM DRStockReserveRel Z WHERE A.ID = Z.IDDRStockReserve))"},
      {"#10", 2, nullptr,
       "SELECT A.IDDRStockReserve, (A.Quantity + A.RQuantity + A.PQuantity + IsNull(B.Quantity, 0)) AS DQ FROM "
       "DCurDRStockReserve A LEFT JOIN (SELECT X.IDDRStockReserve, Sum(X.Quantity) AS Quantity FROM DRStockReserveRel X "
       "INNER JOIN DDStoreDRow Y ON X.IDDDStoreDRow = Y.ID WHERE Y.IDDoc = 17 GROUP BY X.IDDRStockReserve) B ON "
       "A.IDDRStockReserve = B.IDDRStockReserve WHERE (A.Quantity + A.RQuantity + A.PQuantity + IsNull(B.Quantity, 0)) "
       "> 0 AND A.IDGRArticle = 12 AND A.IDDRStore = 2 ORDER BY A.IDDRStockReserve"},
      {"#11", 1, nullptr,
       "SELECT A.ID AS IDDRStockReserve, " + ReservationDifference("Y.IDDoc <> 17") +
           " AS DQ FROM DRStockReserve A WHERE A.IDGRArticle = 12 AND A.ID IN (3,4) ORDER BY A.IDGRArticle, A.ID"},
      {"#12", 3, nullptr, "DROP TABLE tmpProductionCost_17"},
      {"#12", 3, nullptr,
       "CREATE TABLE tmpProductionCost_17 (ID LONG, IDGRPriceListRel LONG, Price CURRENCY, IDSrcPriceList LONG, "
       "IDGRArticle LONG, IDGRPriceList LONG)"},
      {"#12", 3, nullptr, "CREATE INDEX IDGRPriceList ON tmpProductionCost_17 (IDGRPriceList)"},
      {"#13", 1, nullptr, FillProductionCosts(1)},
      {"#13", 2, nullptr, FillProductionCosts(2)},
      {"#14", 3, nullptr, "SELECT IDGRPriceList FROM PDReceiptD WHERE ID = 17"},
      {"#14", 3, nullptr,
       "UPDATE DDStoreDRow A INNER JOIN tmpProductionCost_17 P ON A.IDGRArticle = P.IDGRArticle SET A.Amount = "
       "Format(A.BaseQuantity * P.Price, '0.00'), A.AmountBase = 0, A.Cost = 0 WHERE A.ArticleType = 'P' AND A.IDDoc = "
       "17 AND P.IDGRPriceList = 4"},
      {"#14", 3, nullptr,
       "UPDATE DDStoreDRow R SET R.Cost = 0 WHERE R.IDDoc = 17 AND R.ArticleType = 'P' AND R.IDSenderStore Is Not Null"},
      {"#14", 3, nullptr,
       "UPDATE DDStoreDRow R, tmpProductionCost_17 P, DRStore D SET R.Cost = Format(R.BaseQuantity * P.Price, '0.00') "
       "WHERE R.IDDoc = 17 AND R.ArticleType = 'P' AND R.IDGRArticle = P.IDGRArticle AND P.IDGRPriceList = "
       "D.IDComplPriceList AND R.IDReceiverStore = D.ID AND R.IDSenderStore Is Null"},
      {"#12", 3, nullptr, "DROP TABLE tmpProductionCost_17"},
      {"#15", 3, nullptr, "UPDATE WRPerson SET Record_state = 'A' WHERE ID In (1,2)"},
      {"#15", 3, nullptr,
       "UPDATE EREmployee A, WRPerson B SET A.Record_state = 'A' WHERE A.ID = B.IDEREmployee AND B.ID In (1,2)"},
      {"F4", 3, "GRCompany",
       "ID > 0 AND Not Exists (SELECT * FROM GDocument X1 WHERE X1.IDGRCompany = GRCompany.ID AND X1.DocDate >= "
       "#3/5/2009#) AND Not Exists (SELECT * FROM VDVoucherRow X2 INNER JOIN GDocument XX2 ON X2.IDVDVoucher = XX2.ID "
       "WHERE X2.IDSourceDoc = GRCompany.ID AND XX2.DocDate >= #3/5/2009#) AND Not Exists (SELECT * FROM "
       "DCurBalanceStore X3 WHERE Quantity + RQuantity + PQuantity + AltQuantity + PAltQuantity + RAltQuantity + "
       "AmountBase <> 0 AND X3.IDDRStore = GRCompany.ID) AND Not Exists (SELECT * FROM XALUserOption O INNER JOIN "
       "XALOptionList L ON O.Category = L.Category AND O.Name = L.Name WHERE L.TableName = 'GRCompany' AND L.Type = 'ID' "
       "AND O.OptValue = CStr(GRCompany.ID))"},
      {"#16", 1, nullptr,
       "SELECT COUNT(*) AS CNT, MIN(ID) AS MNID, MAX(ID) AS MXID FROM DDSTOREDROW WHERE IDDOC = 17 AND ARTICLETYPE = 'P'"},
      {"#16", 1, nullptr, "DELETE FROM DDStoreDRow WHERE IDDoc = 17 AND ArticleType = 'P' AND ID<10001"},
      {"#17", 1, nullptr,
       "SELECT SUM(I.BaseQuantity) AS Q FROM DDStoreDRow I WHERE I.IDGRArticle = 12 AND I.ArticleType <> 'S' AND "
       "I.IDReceiverStore = 2 AND I.DocDate >= #3/5/2009# UNION ALL SELECT -SUM(O.BaseQuantity) AS Q FROM DDStoreDRow O "
       "WHERE O.IDGRArticle = 12 AND O.ArticleType <> 'S' AND O.IDSenderStore = 2 AND O.DocDate >= #3/5/2009# UNION "
       "ALL SELECT (SUM(B.DebitQFlow) - SUM(B.CreditQFlow)) AS Q FROM DBalanceStore B WHERE B.IDGRArticle = 12 AND "
       "B.IDDRStore = 2 AND B.DocDate < #3/5/2009#"},
      {"#18", 1, nullptr, setsF},
      {"#19", 2, nullptr,
       "SELECT Min(X.Quantity) AS Quantity, 0 AS RQuantity, 0 AS PQuantity FROM (SELECT Sum((A.Quantity + A.RQuantity + "
       "A.PQuantity) / Case When B.Quantity = 0 Then 1 Else B.Quantity End) AS Quantity FROM DCurBalanceStore A INNER "
       "JOIN GRArtCompletionRow B ON A.IDGRArticle = B.IDGRArticle INNER JOIN GRArtCompletion C ON B.IDGRArtCompletion "
       "= C.ID WHERE C.IDGRArticle = 12 AND A.IDDRStore = 2 GROUP BY A.IDGRArticle ) X"},
      {"#19", 2, nullptr,
       "SELECT Sum(Quantity) AS Quantity, Sum(RQuantity) AS RQuantity, Sum(PQuantity) AS PQuantity FROM "
       "DCurBalanceStore WHERE IDGRArticle = 12"},
      {"#20", 1, nullptr, costF},
      {"#21", 2, nullptr,
       "SELECT (Case When IsNull(DC.Quantity + R.BaseQuantity, 0) = 0 Then 0 Else (DC.AmountBase + R.Cost) / "
       "(DC.Quantity + R.BaseQuantity) End) AS Cost FROM (SELECT IsNull(Sum(Quantity + RQuantity), 0) AS Quantity, "
       "IsNull(Sum(AmountBase), 0) AS AmountBase FROM DCurBalanceStore WHERE IDGRArticle = 12 AND IDDRStore = 2) DC, "
       "(SELECT IsNull(Sum(BaseQuantity), 0) AS BaseQuantity, IsNull(Sum(Cost), 0) AS Cost FROM DDStoreDRow WHERE ID = "
       "40 AND IDGRArticle = 12 AND IDSenderStore = 2 AND ArticleType <> 'S' AND DealState <> 'P') R"},
      {"#21", 2, nullptr,
       "SELECT (Case When IsNull(Sum(Quantity + RQuantity), 0) = 0 Then 0 Else IsNull(Sum(AmountBase), 0) / "
       "IsNull(Sum(Quantity + RQuantity), 0) End) AS Cost FROM DCurBalanceStore WHERE IDGRArticle = 12"},
      {"#22", 3, nullptr, PriceChain()},
      {"#23", 3, nullptr, "SELECT MAX(DocDate) AS DDate FROM DBalanceStore WHERE DocDate<#3/5/2009#"},
      {"#24", 3, nullptr,
       "SELECT COUNT(*) AS C FROM GDocument WHERE IsCertified=FALSE AND DealState<>'' AND DealDate < #3/5/2009# AND "
       "RefType In ('DDCostInvD', 'DDMovement', 'PDReceiptD', 'SDConsignmD')"},
      {"#24", 3, nullptr,
       "UPDATE GDocument SET IsCertified = True WHERE IsCertified=False AND DealDate < #3/5/2009# AND RefType In "
       "('DDCostInvD', 'DDMovement', 'PDReceiptD', 'SDConsignmD')"},
      {"#24", 3, nullptr, "UPDATE BBooking SET IsCertified=TRUE WHERE IsCertified=FALSE AND DealDate<#3/5/2009#"},
      {"#25", 3, nullptr, "DELETE FROM GRArtCompletion WHERE IDGRArticle = 12"},
      {"#25", 3, nullptr, "UPDATE GRArticleCatRel SET IDGRArticleCat=7 WHERE IDGRArticleCat=8"},
      {"#25", 3, nullptr,
       "UPDATE VBalanceBank A INNER JOIN VBalanceBank B ON A.IDGRCurrency = B.IDGRCurrency SET A.DebitFlow = "
       "A.DebitFlow + B.DebitFlow, A.DebitFlowBase = A.DebitFlowBase + B.DebitFlowBase, A.DebitFlowRef = A.DebitFlowRef "
       "+ B.DebitFlowRef, A.CreditFlow = A.CreditFlow + B.CreditFlow, A.CreditFlowBase = A.CreditFlowBase + "
       "B.CreditFlowBase, A.CreditFlowRef = A.CreditFlowRef + B.CreditFlowRef WHERE A.DocDate = B.DocDate AND "
       "A.IDGRBankAccount = 2 AND B.IDGRBankAccount = 3"},
      {"#25", 3, nullptr,
       "INSERT INTO VBalanceBank (DocDate, DebitFlow, DebitFlowBase, DebitFlowRef, CreditFlow, CreditFlowBase, "
       "CreditFlowRef, IDGRCurrency, IDGRBankAccount) SELECT A.DocDate, A.DebitFlow, A.DebitFlowBase, A.DebitFlowRef, "
       "A.CreditFlow, A.CreditFlowBase, A.CreditFlowRef, A.IDGRCurrency, 2 FROM VBalanceBank A WHERE A.IDGRBankAccount "
       "= 3 AND Not Exists (SELECT * FROM VBalanceBank X WHERE X.DocDate = A.DocDate AND X.IDGRCurrency = "
       "A.IDGRCurrency AND X.IDGRBankAccount = 2)"},
      {"#25", 3, nullptr, "DELETE * FROM VBalanceBank WHERE IDGRBankAccount = 3"},
      {"#25", 3, nullptr, "DELETE FROM GRBankAccount WHERE ID=3"},
      {"#26", 3, nullptr,
       "SELECT DocDate, IDGRArticle, Sum(DebitQFlow) AS DQ, Sum(CreditQFlow) AS CQ, Sum(DebitFlowBase) AS DFB, "
       "Sum(CreditFlowBase) AS CFB, Sum(DebitFlowRef) AS DFR, Sum(CreditFlowRef) AS CFR INTO 4711TmpDBalanceStore FROM "
       "DBalanceStore WHERE IDDRStore = 3 GROUP BY DocDate, IDGRArticle"},
      {"#26", 3, nullptr,
       "UPDATE DBalanceStore A INNER JOIN 4711TmpDBalanceStore B ON A.IDGRArticle = B.IDGRArticle SET A.DebitQFlow = "
       "A.DebitQFlow + B.DQ, A.CreditQFlow = A.CreditQFlow + B.CQ, A.DebitFlowBase = A.DebitFlowBase + B.DFB, "
       "A.CreditFlowBase = A.CreditFlowBase + B.CFB, A.DebitFlowRef = A.DebitFlowRef + B.DFR, A.CreditFlowRef = "
       "A.CreditFlowRef + B.CFR WHERE A.DocDate = B.DocDate AND A.IDDRStore = 2"},
      {"#26", 3, nullptr,
       "UPDATE DBalanceStore A SET A.IDDRStore = 2 WHERE A.IDDRStore = 3 AND Not Exists (SELECT * FROM DBalanceStore X "
       "WHERE A.DocDate = X.DocDate AND X.IDGRArticle = A.IDGRArticle AND X.IDDRStore = 2)"},
      {"#26", 3, nullptr, "DELETE * FROM DBalanceStore WHERE IDDRStore = 3"},
      {"#26", 3, nullptr, "DROP TABLE 4711TmpDBalanceStore"},
      {"#26", 3, nullptr, "DELETE * FROM DCurBalanceStore WHERE IDDRStore = 3"},
      {"#27", 3, nullptr,
       "UPDATE XALUserOption O, XALOptionList L SET O.OptValue=9 WHERE O.Category=L.Category AND O.Name=L.Name AND "
       "O.OptValue='8' AND L.TableName='GRArticle' AND L.Type='ID'"},
      {"#27", 3, nullptr,
       "UPDATE XALUserOption O, XALOptionList L SET O.OptValue='' WHERE O.Category=L.Category AND O.Name=L.Name AND "
       "O.OptValue='8' AND L.TableName='GRArticle' AND L.Type='ID'"},
  };
}

// Translates every statement of the inventory for `kind` and runs it, in order (a work table one
// statement creates is used by the next ones), on `db`; each must run.
void RunInventory(int kind, sqlite3* db) {
  int ran = 0;
  for (const Statement& s : Inventory()) {
    if (!(s.kinds & (kind == 2 ? 2 : 1))) continue;
    SCOPED_TRACE(testing::Message() << s.code << " kind " << kind << ": " << s.sql);
    std::string sql;
    try {
      sql = TranslateToSqlite(s.sql, kind);
    } catch (const VbError& e) {
      ADD_FAILURE() << "refused: " << e.description();
      continue;
    }
    if (s.table) sql = std::string("SELECT * FROM ") + s.table + " WHERE " + sql;
    EXPECT_EQ(StepAll(db, sql), "") << sql;
    ++ran;
  }
  EXPECT_GT(ran, 50);
}

class InventoryTest : public testing::TestWithParam<int> {};

TEST_P(InventoryTest, EveryStatementRunsOnSqlite) {
  const int kind = GetParam();
  ScratchDb db;
  RunInventory(kind, db.db());
}

INSTANTIATE_TEST_SUITE_P(BothKinds, InventoryTest, testing::Values(1, 2),
                         [](const testing::TestParamInfo<int>& i) { return i.param == 2 ? "Server" : "FileDatabase"; });

// ---- Meaning on data ----------------------------------------------------------------------------

std::string Translated(const char* sql, int kind = 1) { return TranslateToSqlite(sql, kind); }

TEST(SqlTranslatorDataTest, RewritesKeepTheirMeaning) {
  ScratchDb db;
  ASSERT_EQ(db.Exec("INSERT INTO DDStoreDRow (ID, IDDoc, IDGRArticle, ArticleType, BaseQuantity, Amount, DocDate) VALUES "
                    "(1, 17, 12, 'P', 3, 0, 39877), (2, 17, 13, 'P', 2, 0, 39877.5), (3, 18, 12, 'P', 5, 0, 39878);"
                    "INSERT INTO DRStore (ID, IDComplPriceList) VALUES (2, 4);"
                    "CREATE TABLE tmpCost (IDGRArticle INTEGER, Price REAL);"
                    "INSERT INTO tmpCost VALUES (12, 1.255), (14, 9);"),
            "");
  // Only the joined row of IDDoc 17 changes; the amount is rounded to cents.
  ASSERT_EQ(db.Run(Translated("UPDATE DDStoreDRow A INNER JOIN tmpCost P ON A.IDGRArticle = P.IDGRArticle SET "
                              "A.Amount = Format(A.BaseQuantity * P.Price, '0.00') WHERE A.IDDoc = 17")),
            "");
  EXPECT_EQ(db.Column("SELECT Amount FROM DDStoreDRow ORDER BY ID"), (std::vector<std::string>{"3.77", "0.0", "0.0"}));
  // Date literals compare with stored serials, with and without time.
  EXPECT_EQ(db.Column(Translated("SELECT ID FROM DDStoreDRow WHERE DocDate = #3/5/2009# ORDER BY ID")),
            (std::vector<std::string>{"1"}));
  EXPECT_EQ(db.Column(Translated("SELECT ID FROM DDStoreDRow WHERE DocDate >= #3/5/2009 12:0:0# ORDER BY ID")),
            (std::vector<std::string>{"2", "3"}));
  // TOP in a subquery limits the subquery only.
  EXPECT_EQ(db.Column(Translated("SELECT ID FROM DDStoreDRow WHERE ID IN (SELECT TOP 2 ID FROM DDStoreDRow ORDER BY "
                                 "BaseQuantity DESC) ORDER BY ID")),
            (std::vector<std::string>{"1", "3"}));
  // IsNull with one argument tests, with two it replaces.
  EXPECT_EQ(db.Column(Translated("SELECT IIf(IsNull(Max(Cost)), 'none', 'some') FROM DDStoreDRow")),
            (std::vector<std::string>{"none"}));
  EXPECT_EQ(db.Column(Translated("SELECT IsNull(Max(Cost), 0) FROM DDStoreDRow", 2)), (std::vector<std::string>{"0"}));
  // True is -1, as flags are stored.
  EXPECT_EQ(db.Column(Translated("SELECT True")), (std::vector<std::string>{"-1"}));
  EXPECT_EQ(db.Column(Translated("SELECT False")), (std::vector<std::string>{"0"}));
  EXPECT_EQ(db.Column(Translated("SELECT \"True\"")), (std::vector<std::string>{"True"}));
}

// ---- SQL functions ------------------------------------------------------------------------------

TEST(SqlFunctionsTest, FollowTheRuntimeRules) {
  ScratchDb db;
  struct Row {
    const char* expr;
    const char* expected;
  } rows[] = {
      {"year(0)", "1899"},
      {"year(NULL)", "NULL"},
      {"year(39877)", "2009"},
      {"year(39877.75)", "2009"},
      {"year(1)", "1899"},
      {"year(367)", "1901"},
      {"year(-1.25)", "1899"},
      {"clng(2.5)", "2"},
      {"clng(3.5)", "4"},
      {"clng(-2.5)", "-2"},
      {"clng(2.500001)", "3"},
      {"clng(7)", "7"},
      {"clng(NULL)", "NULL"},
      {"CLng('12')", "12"},
      {"format(1234.5, '#,##0.00')", "1,234.50"},
      {"format(2.675, '0.00')", "2.68"},
      {"Format(0.5, '0')", "1"},
      {"format(NULL, '0.00')", "NULL"},
      {"int(-2.5)", "-3.0"},
      {"int(2.5)", "2.0"},
      {"int(7)", "7"},
      {"int(NULL)", "NULL"},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.expr);
    EXPECT_EQ(db.Column(std::string("SELECT ") + r.expr), (std::vector<std::string>{r.expected}));
  }
}

TEST(SqlFunctionsTest, ErrorsAndDeterminism) {
  ScratchDb db;
  EXPECT_NE(db.Run("SELECT clng(3000000000)"), "");  // overflow, as CLng raises
  EXPECT_NE(db.Run("SELECT year('no date')"), "");   // not a date
  // Only deterministic functions may index an expression.
  EXPECT_EQ(db.Exec("CREATE INDEX GDocument_Year ON GDocument (year(DocDate), clng(TotalAmountBase), int(DealDate), "
                    "format(DocDate, '0'))"),
            "");
}

}  // namespace
}  // namespace xal::host

namespace xal::host {
namespace {

// The same inventory against the host's own schema, filled with the demo company's data: every
// statement must find the tables and columns it names there, and run on real rows.
class InventoryOnHostSchemaTest : public testing::TestWithParam<int> {};

TEST_P(InventoryOnHostSchemaTest, EveryStatementRunsOnTheDemoDatabase) {
  const int kind = GetParam();
  const std::string path = testing::TempDir() + "xal_inventory_" + std::to_string(kind) + ".db";
  std::remove(path.c_str());
  Ref<HostConnection> conn = OpenDemoDatabase(path, kind);
  RunInventory(kind, conn->db().handle());
  conn.reset();
  std::remove(path.c_str());
}

INSTANTIATE_TEST_SUITE_P(BothKinds, InventoryOnHostSchemaTest, testing::Values(1, 2),
                         [](const testing::TestParamInfo<int>& i) { return i.param == 2 ? "Server" : "FileDatabase"; });

}  // namespace
}  // namespace xal::host
