// Tokenizer for the component's SQL. Grammar of the tokens, tried in this order at each position:
//
//   space      := [ \t\r\n\f\v]+
//   comment    := "--" …end of line | "/*" … "*/"
//   string     := "'" ( [^'] | "''" )* "'"
//   quoted     := '"' ( [^"] | '""' )* '"'
//   bracketed  := "[" [^\]]* "]"
//   date       := "#" D{1,2} "/" D{1,2} "/" D{1,4} time? "#"
//               | "#" D{1,4} "-" D{1,2} "-" D{1,2} time? "#"        (anything else: "#" is an operator)
//   time       := " "+ D{1,2} ":" D{1,2} ( ":" D{1,2} )?
//   odbc       := "{" ws* ("d" | "t" | "ts") ws* string ws* "}"
//   odbc-fn    := "{" ws* "fn" ws                                  (its "}" is a separate operator)
//   number     := ( D+ ( "." D* )? | "." D+ ) ( [eE] [+-]? D+ )?   not followed by a name char or "."
//   identifier := name-start name-char*  |  D+ name-char* containing a non-digit ("4711Tmp")
//   operator   := "<>" | "<=" | ">=" | "!=" | "==" | "||" | "<<" | ">>" | any other single byte
//
// name-start is a letter, "_" or a byte >= 0x80 (UTF-8); name-char adds digits and "$".
#include "host/sql_tokenizer.h"

#include "runtime/ascii.h"

namespace xal::host {
namespace {

bool IsDigit(char c) { return c >= '0' && c <= '9'; }
bool IsAlpha(char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); }
bool IsNameStart(char c) { return IsAlpha(c) || c == '_' || static_cast<unsigned char>(c) >= 0x80; }
bool IsNameChar(char c) { return IsNameStart(c) || IsDigit(c) || c == '$'; }
bool IsSpace(char c) { return c == ' ' || c == '\t' || c == '\r' || c == '\n' || c == '\f' || c == '\v'; }

class Scanner {
 public:
  explicit Scanner(std::string_view s) : s_(s) {}

  std::vector<SqlToken> Run() {
    std::vector<SqlToken> out;
    out.reserve(s_.size() / 3 + 4);
    while (i_ < s_.size()) out.push_back(Next());
    return out;
  }

 private:
  char At(size_t k) const { return k < s_.size() ? s_[k] : '\0'; }
  SqlToken Make(SqlTokenKind kind, size_t start, bool terminated = true) {
    return SqlToken{kind, s_.substr(start, i_ - start), terminated};
  }

  // Counts the digits at k (at most `max` + 1, so a caller can see "too many").
  size_t Digits(size_t k, size_t max) const {
    size_t n = 0;
    while (n <= max && IsDigit(At(k + n))) ++n;
    return n;
  }

  // Length of a strict #date# literal starting at i_ (0 when it is not one).
  size_t DateLength() const {
    size_t k = i_ + 1;
    size_t a = Digits(k, 4);
    if (a == 0 || a > 4) return 0;
    char sep = At(k + a);
    if (sep != '/' && sep != '-') return 0;
    if (sep == '/' && a > 2) return 0;
    k += a + 1;
    size_t b = Digits(k, 2);
    if (b == 0 || b > 2 || At(k + b) != sep) return 0;
    k += b + 1;
    size_t c = Digits(k, sep == '/' ? 4 : 2);
    if (c == 0 || c > (sep == '/' ? 4u : 2u)) return 0;
    k += c;
    if (At(k) == ' ') {
      size_t t = k;
      while (At(t) == ' ') ++t;
      size_t h = Digits(t, 2);
      if (h == 0 || h > 2 || At(t + h) != ':') return 0;
      t += h + 1;
      size_t m = Digits(t, 2);
      if (m == 0 || m > 2) return 0;
      t += m;
      if (At(t) == ':') {
        size_t sec = Digits(t + 1, 2);
        if (sec == 0 || sec > 2) return 0;
        t += 1 + sec;
      }
      k = t;
    }
    return At(k) == '#' ? k + 1 - i_ : 0;
  }

  // Length of an ODBC escape at i_: {d|t|ts '…'} (kind kOdbcLiteral) or "{fn " (kOdbcFn).
  size_t OdbcLength(SqlTokenKind* kind) const {
    size_t k = i_ + 1;
    while (IsSpace(At(k))) ++k;
    size_t w = k;
    while (IsAlpha(At(w))) ++w;
    const std::string word = AsciiLower(s_.substr(k, w - k));
    if (word == "fn" && IsSpace(At(w))) {
      *kind = SqlTokenKind::kOdbcFn;
      return w + 1 - i_;
    }
    if (word != "d" && word != "t" && word != "ts") return 0;
    while (IsSpace(At(w))) ++w;
    if (At(w) != '\'') return 0;
    ++w;
    while (w < s_.size() && s_[w] != '\'') ++w;  // the escape's text never contains a quote
    if (w >= s_.size()) return 0;
    ++w;
    while (IsSpace(At(w))) ++w;
    if (At(w) != '}') return 0;
    *kind = SqlTokenKind::kOdbcLiteral;
    return w + 1 - i_;
  }

  SqlToken Quoted(char close, bool doubling, SqlTokenKind kind) {
    size_t start = i_++;
    while (i_ < s_.size()) {
      if (s_[i_] == close) {
        if (doubling && At(i_ + 1) == close) {
          i_ += 2;
          continue;
        }
        ++i_;
        return Make(kind, start);
      }
      ++i_;
    }
    return Make(kind, start, false);
  }

  SqlToken Number() {
    size_t start = i_;
    while (IsDigit(At(i_))) ++i_;
    if (At(i_) == '.') {
      ++i_;
      while (IsDigit(At(i_))) ++i_;
    }
    if ((At(i_) == 'e' || At(i_) == 'E')) {
      size_t k = i_ + 1;
      if (At(k) == '+' || At(k) == '-') ++k;
      if (IsDigit(At(k))) {
        i_ = k;
        while (IsDigit(At(i_))) ++i_;
      }
    }
    if (!IsNameChar(At(i_)) && At(i_) != '.') return Make(SqlTokenKind::kNumber, start);
    // Not a number: a digit-leading name when the run of name characters holds a non-digit.
    size_t k = start;
    bool nonDigit = false;
    while (IsNameChar(At(k))) nonDigit |= !IsDigit(s_[k++]);
    if (nonDigit) {
      i_ = k;
      return Make(SqlTokenKind::kIdentifier, start);
    }
    while (IsNameChar(At(i_)) || At(i_) == '.') ++i_;
    return Make(SqlTokenKind::kBadNumber, start);
  }

  SqlToken Next() {
    size_t start = i_;
    char c = s_[i_];
    if (IsSpace(c)) {
      while (IsSpace(At(i_))) ++i_;
      return Make(SqlTokenKind::kSpace, start);
    }
    if (c == '-' && At(i_ + 1) == '-') {
      while (i_ < s_.size() && s_[i_] != '\n' && s_[i_] != '\r') ++i_;
      return Make(SqlTokenKind::kLineComment, start);
    }
    if (c == '/' && At(i_ + 1) == '*') {
      size_t end = s_.find("*/", i_ + 2);
      if (end == std::string_view::npos) {
        i_ = s_.size();
        return Make(SqlTokenKind::kBlockComment, start, false);
      }
      i_ = end + 2;
      return Make(SqlTokenKind::kBlockComment, start);
    }
    if (c == '\'') return Quoted('\'', true, SqlTokenKind::kString);
    if (c == '"') return Quoted('"', true, SqlTokenKind::kQuoted);
    if (c == '[') return Quoted(']', false, SqlTokenKind::kBracketed);
    if (c == '#') {
      if (size_t n = DateLength()) {
        i_ += n;
        return Make(SqlTokenKind::kDate, start);
      }
    }
    if (c == '{') {
      SqlTokenKind kind;
      if (size_t n = OdbcLength(&kind)) {
        i_ += n;
        return Make(kind, start);
      }
    }
    if (IsDigit(c) || (c == '.' && IsDigit(At(i_ + 1)))) return Number();
    if (IsNameStart(c)) {
      while (IsNameChar(At(i_))) ++i_;
      return Make(SqlTokenKind::kIdentifier, start);
    }
    ++i_;
    switch (c) {
      case '(': return Make(SqlTokenKind::kLParen, start);
      case ')': return Make(SqlTokenKind::kRParen, start);
      case ',': return Make(SqlTokenKind::kComma, start);
      case ';': return Make(SqlTokenKind::kSemicolon, start);
      case '.': return Make(SqlTokenKind::kDot, start);
      default: break;
    }
    char d = At(i_);
    if ((c == '<' && (d == '>' || d == '=' || d == '<')) || (c == '>' && (d == '=' || d == '>')) ||
        ((c == '!' || c == '=') && d == '=') || (c == '|' && d == '|'))
      ++i_;
    return Make(SqlTokenKind::kOperator, start);
  }

  std::string_view s_;
  size_t i_ = 0;
};

}  // namespace

std::vector<SqlToken> TokenizeSql(std::string_view sql) { return Scanner(sql).Run(); }

std::string SqlTokenValue(const SqlToken& token) {
  std::string_view t = token.text;
  if (t.empty()) return {};
  char open = t.front();
  char close = open == '[' ? ']' : open;
  size_t end = (token.terminated && t.size() >= 2 && t.back() == close) ? t.size() - 1 : t.size();
  std::string v;
  v.reserve(end);
  for (size_t k = 1; k < end; ++k) {
    v += t[k];
    if (open != '[' && t[k] == close && k + 1 < end && t[k + 1] == close) ++k;
  }
  return v;
}

bool IsSqlWord(const SqlToken& token, std::string_view word) {
  return token.kind == SqlTokenKind::kIdentifier && AsciiEqualsNoCase(token.text, word);
}

}  // namespace xal::host
