// Two text helpers of the server module: a case-insensitive search for a keyword in a WHERE text
// that skips matches inside quoted literals (so a caller can find the real " AND " of a condition),
// and the 7-3-1 check digit of reference numbers. Neither traps errors: a bad argument fails the
// call with the runtime's conversion error.
#include <limits>

#include "runtime/text.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {

// The quoted parts of a text as the pieces between quote characters: even pieces (0-based) lie
// outside quotes, odd ones inside. Double quotes win when there are at least two of them; then
// single quotes; with fewer than two of either kind there is nothing to skip.
std::vector<std::string> QuoteSplit(const std::string& text) {
  std::vector<std::string> pieces = Split(text, "\"");
  if (pieces.size() >= 3) return pieces;
  pieces = Split(text, "'");
  if (pieces.size() >= 3) return pieces;
  return {};
}

// The position as the 16-bit result the interface declares; longer texts overflow as they did.
int16_t ToPosition(int32_t pos) {
  if (pos > std::numeric_limits<int16_t>::max() || pos < std::numeric_limits<int16_t>::min()) Raise(kErrOverflow);
  return static_cast<int16_t>(pos);
}

}  // namespace

int16_t InWhereStr(const std::string& pString1, const std::string& pString2, int32_t pStart) {
  if (pString1.empty()) return 0;
  if (pString2.empty()) return ToPosition(pStart);
  int32_t pos = InStr(pStart, pString1, pString2, CompareMode::Text);
  if (pos == 0) return 0;
  const std::vector<std::string> pieces = QuoteSplit(pString1);
  if (pieces.empty()) return ToPosition(pos);

  // Walk the pieces with their 1-based start in pString1; each next piece begins one character
  // past the previous one's end, behind its quote. A match inside a quoted piece is skipped by
  // searching again behind the closing quote.
  int32_t start = 1;
  for (size_t i = 0; i < pieces.size(); ++i) {
    const int32_t len = Len(pieces[i]);
    if (pos >= start && pos < start + len) {
      const bool outside = i % 2 == 0;
      const bool unterminated = i + 1 == pieces.size();
      if (outside || unterminated) return ToPosition(pos);
      const int32_t after = start + len + 1;
      pos = after > Len(pString1) ? 0 : InStr(after, pString1, pString2, CompareMode::Text);
    }
    start += len + 1;
  }
  return 0;
}

std::string SetTargetFigure(const std::string& pSourceString) {
  const int32_t length = Len(pSourceString);
  // Weights 7, 3, 1 repeating from the character just before the last one, leftwards.
  static constexpr int kWeights[3] = {1, 7, 3};  // indexed by i mod 3
  int sum = 0;
  for (int32_t i = 1; i <= length - 1; ++i) {
    const std::string ch = Mid(pSourceString, length - i, 1);
    if (ch.size() != 1 || ch[0] < '0' || ch[0] > '9') Raise(kErrTypeMismatch);
    sum += (ch[0] - '0') * kWeights[i % 3];
  }
  // A check of 10 keeps only its last character, "0".
  const std::string check = std::to_string(10 - sum % 10);
  return Left(pSourceString, length - 1) + check.substr(check.size() - 1);
}

}  // namespace xal::server
