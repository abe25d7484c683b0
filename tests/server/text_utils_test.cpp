// The keyword search that skips quoted text, the 7-3-1 check digit, and the names derived from a
// document name (row table, back-pointing field, subsystem).
#include <gtest/gtest.h>

#include "error_of.h"

#include <functional>

#include "server/sql_utils.h"

namespace xal::server {
namespace {

using ::xal::test::ErrorOf;

TEST(InWhereStr, SkipsMatchesInsideQuotes) {
  struct Row {
    const char* text;
    const char* find;
    int32_t start;
    int16_t expected;
  } rows[] = {
      {"a='x AND y' AND b", "AND", 1, 13},
      {"a='x and y' AND b", "and", 1, 13},             // case-insensitive
      {"a=\"x AND y\" AND b", "AND", 1, 13},
      {"a='x AND y' AND b", "AND", 14, 0},             // nothing after the start
      {"a='x AND y AND b", "AND", 1, 6},               // one quote: nothing is quoted, first match
      {"a=\"x AND y AND b", "AND", 1, 6},
      {"a='x AND y'", "AND", 1, 0},                    // the only match is quoted
      {"'AND' 'AND' AND", "AND", 1, 13},               // two quoted parts skipped in turn
      {"a AND 'b'", "AND", 1, 3},                      // the match lies before the quotes
      {"a=\"it's AND\" AND b", "AND", 1, 14},          // double quotes win over the single quote
      {"x='a' AND 'b AND c", "AND", 1, 7},
      {"x='a' OR y='AND", "AND", 1, 13},               // inside the unterminated last quote: found
      {"a='x AND y' AND b", "", 4, 4},                 // empty search text: the start
      {"", "AND", 1, 0},                               // empty text
      {"abc", "AND", 1, 0},
      {"ä='AND' AND", "AND", 1, 9},                    // positions count characters, not bytes
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(std::string(r.text) + " / " + r.find);
    EXPECT_EQ(InWhereStr(r.text, r.find, r.start), r.expected);
  }
}

TEST(InWhereStr, BadStartFails) {
  EXPECT_EQ(ErrorOf([] { InWhereStr("a AND b", "AND", 0); }), kErrInvalidCall);  // positions start at 1
}

TEST(SetTargetFigure, CheckDigit) {
  struct Row {
    const char* input;
    const char* expected;
  } rows[] = {
      {"1234560", "1234561"},     // 6×7 + 5×3 + 4×1 + 3×7 + 2×3 + 1×1 = 89 → 1
      {"1234569", "1234561"},     // the old last character does not count
      {"1239X", "12399"},         // nor need it be a digit: 9×7 + 3×3 + 2×1 + 1×7 = 81 → 9
      {"10", "13"},               // 7 → 3
      {"20", "26"},               // 14 → 6
      {"370", "372"},             // 7×7 + 3×3 = 58 → 2
      {"550", "550"},             // 5×7 + 5×3 = 50: a multiple of 10 ends in 0
      {"5", "0"},                 // one character: check 10 → "0"
      {"0000", "0000"},           // sum 0 → "0"
      {"1111", "1119"},           // 7 + 3 + 1 = 11 → 9
      {"11110", "11112"},         // 7 + 3 + 1 + 7 = 18 → 2
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.input);
    EXPECT_EQ(SetTargetFigure(r.input), r.expected);
  }
}

TEST(SetTargetFigure, BadInputFails) {
  struct Row {
    const char* input;
    int error;
  } rows[] = {
      {"12A40", kErrTypeMismatch},  // a letter among the digits
      {"12 40", kErrTypeMismatch},  // a blank is no digit either
      {"-1230", kErrTypeMismatch},  // nor a sign
      {"", kErrInvalidCall},        // no last character to replace
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.input);
    EXPECT_EQ(ErrorOf([&] { SetTargetFigure(r.input); }), r.error);
  }
}

struct NameRow {
  const char* docName;
  const char* expected;
};

TEST(DocNames, RowName) {
  const NameRow rows[] = {
      {"DDStoreDRow", "DDSTOREDROW"},   // already a row table: upper-cased as it is
      {"SDInvoice", "SDINVOICERow"},
      {" sdinvoice ", "SDINVOICERow"},  // trimmed and upper-cased first
      {"SDConsignmD", "DDStoreDRow"},
      {"PDReceiptD", "DDStoreDRow"},
      {"DDMovement", "DDStoreDRow"},
      {"DDCostInvD", "DDStoreDRow"},
      {"SDExpenseD", "DDStoreDRow"},
      {"DDProduction", "DDStoreDRow"},
      {"VDBank", "VDVoucherRow"},
      {"VDCash", "VDVoucherRow"},
      {"VDBalanceDoc", "VDVoucherRow"},
      {"CADocument", "CADocRow"},
      {"CDAmortizing", "CADocRow"},
      {"CDConsumption", "CADocRow"},
      {"CDMovement", "CADocRow"},
      {"CDRebuilding", "CADocRow"},
      {"CDReceipts", "CADocRow"},
      {"DDOrder", "PDOrderRow"},
      {"WDocument", "WDocumentRow"},
      {"WDAccount", "WDocumentRow"},
      {"WDHoldBack", "WDocumentRow"},
      {"WDPayout", "WDocumentRow"},
      {"WPTaxRetINF1_09", "WPTaxRetINF1Row_09"},
      {"", "Row"},                      // nothing to map: the rule still applies
  };
  for (const NameRow& r : rows) {
    SCOPED_TRACE(r.docName);
    EXPECT_EQ(GetRowName(r.docName), r.expected);
  }
}

TEST(DocNames, IDFieldName) {
  const NameRow rows[] = {
      {"sdinvoice", "IDSDINVOICE"},
      {"SDConsignmD", "IDGDocument"},
      {"PDReceiptD", "IDGDocument"},
      {"DDMovement", "IDGDocument"},
      {"DDCostInvD", "IDGDocument"},
      {"SDExpenseD", "IDGDocument"},
      {" DDProduction", "IDGDocument"},
      {"CADocument", "IDCADocument"},
      {"CDAmortizing", "IDCADocument"},
      {"CDConsumption", "IDCADocument"},
      {"CDMovement", "IDCADocument"},
      {"CDRebuilding", "IDCADocument"},
      {"CDReceipts", "IDCADocument"},
      {"DDOrder", "IDPDOrder"},
      {"WDocument", "IDWDocument"},
      {"WDAccount", "IDWDocument"},
      {"WDHoldBack", "IDWDocument"},
      {"WDPayout", "IDWDocument"},
      {"VDBank", "IDVDBANK"},           // no entry: "ID" + the upper-cased name
  };
  for (const NameRow& r : rows) {
    SCOPED_TRACE(r.docName);
    EXPECT_EQ(GetIDFieldName(r.docName), r.expected);
  }
}

TEST(DocNames, SysName) {
  const NameRow rows[] = {
      {"SDOrder", "SALES"},
      {"sdinvoice", "SALES"},
      {"PDOrder", "PURCHASE"},
      {"PDInvoice", "PURCHASE"},
      {"VDVoucher", "BANK"},
      {"BDBookingOrder", "BOOKINGORDER"},
      {"SDConsignmD", "STORE"},
      {"PDReceiptD", "STORE"},
      {"DDMovement", "STORE"},
      {"DDCostInvD", "STORE"},
      {"SDExpenseD", "STORE"},
      {"DDProduction", "STORE"},
      {"DDOrder", "STORE"},
      {"CADocument", "CAPITAL_ASSETS"},
      {"CDAmortizing", "CAPITAL_ASSETS"},
      {"CDConsumption", "CAPITAL_ASSETS"},
      {"CDMovement", "CAPITAL_ASSETS"},
      {"CDRebuilding", "CAPITAL_ASSETS"},
      {" CDReceipts ", "CAPITAL_ASSETS"},
      {"WDocument", "WAGES"},
      {"WDAccount", "WAGES"},
      {"WDHoldBack", "WAGES"},
      {"WDPayout", "WAGES"},
      {"VDBank", ""},                   // a bank voucher kind is not a subsystem name of its own
      {"GRArticle", ""},
  };
  for (const NameRow& r : rows) {
    SCOPED_TRACE(r.docName);
    EXPECT_EQ(GetSysName(r.docName), r.expected);
  }
}

}  // namespace
}  // namespace xal::server
