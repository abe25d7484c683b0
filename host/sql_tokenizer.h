// The lexical layer of the SQL translator: splits the component's SQL text (file-database or
// server dialect) into tokens that keep their original text. Literals, quoted names and comments
// are single tokens, so no rewrite can ever reach inside them.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace xal::host {

enum class SqlTokenKind : uint8_t {
  kSpace,         // blanks, tabs, CR, LF
  kLineComment,   // -- up to (not including) the end of the line
  kBlockComment,  // /* … */
  kString,        // '…' with '' for a quote
  kQuoted,        // "…" with "" for a quote: a string on the file database, a name on the server
  kBracketed,     // […]: a name
  kDate,          // #m/d/y[ h:m[:s]]# or #y-m-d[ h:m[:s]]#
  kOdbcLiteral,   // {d '…'}, {t '…'}, {ts '…'}
  kOdbcFn,        // "{fn" opening a scalar-function escape; a later "}" operator closes it
  kNumber,        // 12, 1.5, .5, 2e-3 (never followed by a letter, digit or point)
  kBadNumber,     // digits that run into a point or letter without forming a name: "12.5x"
  kIdentifier,    // letters, digits, _, $, non-ASCII bytes; may start with digits ("4711Tmp")
  kLParen,
  kRParen,
  kComma,
  kSemicolon,
  kDot,
  kOperator,      // = <> <= >= != == || << >> and any other single character (* + - / # { } & …)
};

struct SqlToken {
  SqlTokenKind kind;
  std::string_view text;    // a view into the tokenized SQL
  bool terminated = true;   // false for a literal, quoted name or comment the text never closes
};

// One linear pass over `sql`; the tokens cover the text exactly, in order.
std::vector<SqlToken> TokenizeSql(std::string_view sql);

// The value of a kString, kQuoted or kBracketed token: delimiters removed, doubled quotes undone.
std::string SqlTokenValue(const SqlToken& token);

// True for a kIdentifier token whose text equals `word` ignoring ASCII case.
bool IsSqlWord(const SqlToken& token, std::string_view word);

}  // namespace xal::host
