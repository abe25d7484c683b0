// The SQL translator: the component's SQL (file-database syntax, also sent on the server kind, plus
// a few server forms) in, SQLite text out.
//
// Input grammar (tokens; see sql_tokenizer.cpp for the exact rules):
//   space | comment | 'string' | "quoted" | [bracketed] | #date# | {d|t|ts '…'} | {fn … }
//   | number | identifier | ( | ) | , | ; | . | operator
// A text is one or more statements separated by ";" at parenthesis depth 0; a statement may also be
// a bare condition (a filter). Parentheses must balance within each statement.
//
// Passes, in order, each linear in the number of tokens:
//   1. literals   #m/d/y[ h:m:s]# and {d|t|ts '…'} -> serial day numbers; {fn f(x)} -> f(x);
//                 True/False -> -1/0; digit-leading names -> "quoted"; "x" -> 'x' (file database).
//   2. functions  IsNull(x) -> (x IS NULL); IsNull(x, y) -> coalesce(x, y);
//                 Format(x, '0.00') -> round(x, 2) (other patterns stay calls of the format UDF);
//                 CStr(x) -> CAST(x AS TEXT). Year, CLng, Int and IIf stay calls.
//   3. clauses    SELECT TOP n -> LIMIT n at the end of that SELECT's level; WITH (NOLOCK) dropped;
//                 DELETE * FROM -> DELETE FROM.
//   4. statements UPDATE with joined or listed tables -> UPDATE … AS a SET … FROM … WHERE …;
//                 SELECT … INTO t -> CREATE TABLE "t" AS SELECT …; DROP TABLE -> … IF EXISTS;
//                 CREATE TABLE column types -> SQLite affinities; CREATE INDEX i ON t -> t_i.
// Rewritten tokens get new text; all others keep their original text.
#include "host/sql_translator.h"

#include <charconv>
#include <string>
#include <vector>

#include "host/database.h"
#include "host/host_error.h"
#include "host/sql_tokenizer.h"
#include "runtime/ascii.h"
#include "runtime/dates.h"
#include "runtime/error.h"

namespace xal::host {
namespace {

using K = SqlTokenKind;

[[noreturn]] void Refuse(const std::string& what) { Raise(kErrSql, "cannot translate " + what); }

bool IsNameChar(char c) {
  return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '_' ||
         c == '$' || static_cast<unsigned char>(c) >= 0x80;
}
bool IsDigit(char c) { return c >= '0' && c <= '9'; }

// A name SQLite reads without quotes: a letter or "_" first, name characters after.
std::string NameText(std::string_view name) {
  bool plain = !name.empty() && !IsDigit(name[0]) && name[0] != '$';
  for (char c : name) plain = plain && IsNameChar(c);
  return plain ? std::string(name) : QuoteName(name);
}

// ---- Output -------------------------------------------------------------------------------------

// Joins pieces of SQL, adding a blank where two pieces would otherwise fuse into one token (two
// names, "-" and "-1" into a comment, two quoted strings into one) and a line break after a line
// comment so that appended text is not swallowed by it.
class Emitter {
 public:
  void Append(std::string_view piece, bool lineComment = false) {
    if (piece.empty()) return;
    if (afterLineComment_) {
      if (piece.front() != '\n' && piece.front() != '\r') s_ += '\n';
    } else if (!s_.empty() && (Fuses(s_.back(), piece.front()) ||
                               (break_ && MayJoin(s_.back()) && MayJoin(piece.front())))) {
      s_ += ' ';
    }
    s_ += piece;
    afterLineComment_ = lineComment;
    break_ = false;
  }
  // Marks a removed token: the next piece gets a blank when it would otherwise touch the last one.
  void Break() { break_ = true; }
  std::string Take() { return std::move(s_); }

 private:
  static bool Fuses(char a, char b) {
    return (IsNameChar(a) && IsNameChar(b)) || (a == '-' && b == '-') || (a == '/' && b == '*') ||
           (a == b && (a == '\'' || a == '"'));
  }
  // Characters that can be part of a longer token (blanks and , ( ) ; never are).
  static bool MayJoin(char c) {
    return !(c == ' ' || c == '\t' || c == '\r' || c == '\n' || c == '\f' || c == '\v' || c == ',' || c == '(' ||
             c == ')' || c == ';');
  }
  std::string s_;
  bool afterLineComment_ = false;
  bool break_ = false;
};

// ---- Literals -----------------------------------------------------------------------------------

// The serial as the shortest decimal text that reads back as the same double.
std::string SerialText(double serial) {
  if (serial == 0) return "0";
  char buf[64];
  auto r = std::to_chars(buf, buf + sizeof buf, serial);
  return std::string(buf, r.ptr);
}

// The numbers of a date or time text, in order ("3/5/2009 14:7:0" -> 3 5 2009 14 7 0).
std::vector<int> NumberGroups(std::string_view text, std::vector<size_t>* widths = nullptr) {
  std::vector<int> groups;
  for (size_t k = 0; k < text.size();) {
    if (!IsDigit(text[k])) {
      ++k;
      continue;
    }
    size_t start = k;
    int v = 0;
    while (k < text.size() && IsDigit(text[k]) && k - start < 9) v = v * 10 + (text[k++] - '0');
    groups.push_back(v);
    if (widths) widths->push_back(k - start);
  }
  return groups;
}

double SerialOf(DateParts p, std::string_view literal) {
  try {
    return MakeDate(p).serial;
  } catch (const VbError&) {
    Refuse("date literal " + std::string(literal) + ": no such date or time");
  }
}

// #m/d/y[ h:m[:s]]# or #y-m-d[ h:m[:s]]#. A year written with one or two digits is read the way
// the file engine reads it: 0-29 as 2000-2029, 30-99 as 1930-1999.
double HashDateSerial(std::string_view text) {
  std::vector<size_t> widths;
  std::vector<int> g = NumberGroups(text, &widths);
  bool iso = text.find('-') != std::string_view::npos;
  DateParts p;
  p.year = iso ? g[0] : g[2];
  p.month = iso ? g[1] : g[0];
  p.day = iso ? g[2] : g[1];
  if (widths[iso ? 0 : 2] <= 2) p.year += p.year < 30 ? 2000 : 1900;
  if (g.size() > 3) p.hour = g[3], p.minute = g[4];
  if (g.size() > 5) p.second = g[5];
  return SerialOf(p, text);
}

// {d 'yyyy-mm-dd'}, {t 'hh:mm:ss'}, {ts 'yyyy-mm-dd hh:mm:ss[.000]'}.
double OdbcSerial(std::string_view text) {
  size_t q = text.find('\'');
  std::string_view head = text.substr(0, q);
  std::string_view body = text.substr(q + 1, text.rfind('\'') - q - 1);
  bool ts = head.find_first_of("sS") != std::string_view::npos;
  bool timeOnly = !ts && head.find_first_of("tT") != std::string_view::npos;
  std::string_view shape = ts ? "dddd-dd-dd dd:dd:dd" : timeOnly ? "dd:dd:dd" : "dddd-dd-dd";
  // The fixed layout, then for {ts} an optional fraction of a second that must be zero.
  bool ok = body.size() >= shape.size();
  for (size_t k = 0; ok && k < shape.size(); ++k)
    ok = shape[k] == 'd' ? IsDigit(body[k]) : body[k] == shape[k];
  if (ok && body.size() > shape.size()) {
    ok = ts && body[shape.size()] == '.';
    for (size_t k = shape.size() + 1; ok && k < body.size(); ++k) ok = body[k] == '0';
  }
  if (!ok) Refuse("ODBC escape " + std::string(text) + ": expected '" + std::string(shape) + "'");
  std::vector<int> g = NumberGroups(body.substr(0, shape.size()));
  DateParts p;
  if (timeOnly) {
    p.hour = g[0], p.minute = g[1], p.second = g[2];
    return SerialOf(p, text);
  }
  p.year = g[0], p.month = g[1], p.day = g[2];
  if (ts) p.hour = g[3], p.minute = g[4], p.second = g[5];
  return SerialOf(p, text);
}

// ---- Tables of rewrites -------------------------------------------------------------------------

// Table hints of the server that mean nothing to SQLite: WITH (hint[, hint…]) is dropped.
constexpr std::string_view kTableHints[] = {
    "NOLOCK", "READUNCOMMITTED", "ROWLOCK", "PAGLOCK", "TABLOCK", "TABLOCKX",
    "UPDLOCK", "XLOCK",          "HOLDLOCK", "READPAST", "READCOMMITTED", "NOWAIT",
};

// File-database column types and the SQLite declared type with the affinity the host expects:
// numbers that are not identifiers must not get NUMERIC affinity (it would store 12.0 as the integer
// 12 and make division truncate); the leading words let the host tell money, dates and flags.
struct TypeRule {
  std::string_view from, to;
};
constexpr TypeRule kColumnTypes[] = {
    {"LONG", "INTEGER"},          {"INTEGER", "INTEGER"},        {"INT", "INTEGER"},
    {"SHORT", "INTEGER"},         {"SMALLINT", "INTEGER"},       {"BYTE", "INTEGER"},
    {"TINYINT", "INTEGER"},       {"YESNO", "BOOL INTEGER"},     {"BIT", "BOOL INTEGER"},
    {"LOGICAL", "BOOL INTEGER"},  {"BOOLEAN", "BOOL INTEGER"},   {"BOOL", "BOOL INTEGER"},
    {"CURRENCY", "CURRENCY REAL"},
    {"MONEY", "CURRENCY REAL"},   {"DOUBLE", "REAL"},            {"SINGLE", "REAL"},
    {"FLOAT", "REAL"},            {"REAL", "REAL"},              {"NUMERIC", "REAL"},
    {"DECIMAL", "REAL"},          {"NUMBER", "REAL"},            {"DATETIME", "DATE REAL"},
    {"DATE", "DATE REAL"},        {"TIME", "DATE REAL"},         {"TEXT", "TEXT COLLATE NOCASE"},
    {"MEMO", "TEXT COLLATE NOCASE"}, {"VARCHAR", "TEXT COLLATE NOCASE"}, {"CHAR", "TEXT COLLATE NOCASE"},
    {"NVARCHAR", "TEXT COLLATE NOCASE"}, {"NCHAR", "TEXT COLLATE NOCASE"}, {"LONGTEXT", "TEXT COLLATE NOCASE"},
    {"STRING", "TEXT COLLATE NOCASE"}, {"LONGBINARY", "BLOB"},  {"BINARY", "BLOB"},
    {"BLOB", "BLOB"},
};

// ---- One statement ------------------------------------------------------------------------------

struct Tok {
  SqlToken src;
  std::string out;     // the text emitted for the token
  std::string suffix;  // text emitted right after it (a moved LIMIT); kept when the token is blanked
  bool removed = false; // taken out of the text by a rewrite
  int match = -1;      // significant position of the partner parenthesis
  int level = -1;      // significant position of the enclosing "(", -1 at the top level
};

// A statement is a range of tokens; passes address its significant (non-blank, non-comment)
// tokens by position p = 0 … N()-1.
class Statement {
 public:
  Statement(std::vector<Tok>& toks, int begin, int end, int kind)
      : t_(toks), begin_(begin), end_(end), kind_(kind) {}

  void Translate(Emitter& e) {
    CheckComments();
    Structure();
    Literals();
    Functions();
    Clauses();
    // The statement passes read the statement as the clause passes left it, so that what they
    // removed (hints, TOP n, escapes) cannot hide a leading keyword from them.
    Structure(/*skipRemoved=*/true);
    if (N() > 0 && Is(0, "UPDATE") && RewriteUpdate(e)) return;
    if (N() > 0 && Is(0, "SELECT")) SelectInto();
    if (N() > 0 && Is(0, "DROP")) Drop();
    if (N() > 0 && Is(0, "CREATE")) Create();
    EmitTokens(e, begin_, end_);
  }

 private:
  // ---- Access ----
  int N() const { return static_cast<int>(sig_.size()); }
  Tok& At(int p) { return t_[sig_[p]]; }
  K KindAt(int p) { return p >= 0 && p < N() ? At(p).src.kind : K::kSpace; }
  bool Is(int p, std::string_view word) { return p >= 0 && p < N() && IsSqlWord(At(p).src, word); }
  bool IsText(int p, std::string_view text) { return p >= 0 && p < N() && At(p).src.text == text; }
  bool IsName(int p) {
    K k = KindAt(p);
    return k == K::kIdentifier || k == K::kBracketed || (k == K::kQuoted && kind_ == 2);
  }
  // The name a name token stands for, without quotes or brackets.
  std::string NameValue(int p) {
    const SqlToken& s = At(p).src;
    return s.kind == K::kIdentifier ? std::string(s.text) : SqlTokenValue(s);
  }
  // The next position at the same depth (a "(" jumps past its partner).
  int Step(int p) { return KindAt(p) == K::kLParen ? At(p).match + 1 : p + 1; }
  int FindWord(int from, int to, std::string_view word) {
    for (int p = from; p < to; p = Step(p))
      if (Is(p, word)) return p;
    return -1;
  }
  // Takes a token (and the blank after it) out of the text. Its neighbours are kept apart by a
  // blank if they would otherwise touch, so a removal never creates a new token.
  void Remove(int t) {
    t_[t].out.clear();
    t_[t].removed = true;
  }
  void Blank(int p, bool withSpaceAfter) {
    Remove(sig_[p]);
    int t = sig_[p] + 1;
    if (withSpaceAfter && t < end_ && t_[t].src.kind == K::kSpace) Remove(t);
  }

  void EmitTokens(Emitter& e, int from, int to) {
    for (int t = from; t < to; ++t) {
      e.Append(t_[t].out, t_[t].src.kind == K::kLineComment && !t_[t].out.empty());
      if (t_[t].removed) e.Break();
      e.Append(t_[t].suffix);
    }
  }
  void EmitSig(Emitter& e, int first, int last) {
    if (first <= last) EmitTokens(e, sig_[first], sig_[last] + 1);
  }

  // ---- Structure: significant tokens, parentheses ----
  void CheckComments() {
    for (int t = begin_; t < end_; ++t)
      if (t_[t].src.kind == K::kBlockComment && !t_[t].src.terminated) Refuse("text: a /* comment is not closed");
  }

  void Structure(bool skipRemoved = false) {
    std::vector<int> open;
    sig_.clear();
    for (int t = begin_; t < end_; ++t) {
      K k = t_[t].src.kind;
      if (k == K::kSpace || k == K::kLineComment || k == K::kBlockComment) continue;
      if (skipRemoved && t_[t].removed && t_[t].suffix.empty()) continue;
      int p = N();
      sig_.push_back(t);
      Tok& x = t_[t];
      x.level = open.empty() ? -1 : open.back();
      if (k == K::kLParen) {
        open.push_back(p);
      } else if (k == K::kRParen) {
        if (open.empty()) Refuse("text: a ')' has no matching '('");
        int q = open.back();
        open.pop_back();
        x.match = q;
        At(q).match = p;
        x.level = At(q).level;
      }
    }
    if (!open.empty()) Refuse("text: unbalanced parentheses, " + std::to_string(open.size()) + " '(' not closed");
  }

  // ---- Pass 1: literals ----
  void Literals() {
    std::vector<int> fnLevels;  // levels of the open {fn escapes
    for (int p = 0; p < N(); ++p) {
      Tok& x = At(p);
      const SqlToken& s = x.src;
      switch (s.kind) {
        case K::kString:
          if (!s.terminated) Refuse("text: a string literal is not closed");
          break;
        case K::kQuoted:
          if (!s.terminated) Refuse("text: a double-quoted literal is not closed");
          if (kind_ != 2) {  // the file database reads "x" as a string
            x.out = "'";
            for (char c : SqlTokenValue(s)) x.out += c == '\'' ? "''" : std::string(1, c);
            x.out += "'";
          }
          break;
        case K::kBracketed:
          if (!s.terminated) Refuse("text: a [name] is not closed");
          break;  // SQLite reads [x] as a name already
        case K::kDate:
          x.out = SerialText(HashDateSerial(s.text));
          break;
        case K::kOdbcLiteral:
          x.out = SerialText(OdbcSerial(s.text));
          break;
        case K::kOdbcFn:
          fnLevels.push_back(x.level);
          Remove(sig_[p]);
          break;
        case K::kBadNumber:
          Refuse("number " + std::string(s.text) + ": digits run into a point or letter");
        case K::kIdentifier:
          if (IsDigit(s.text[0])) {
            x.out = QuoteName(s.text);
          } else if (Is(p, "TRUE") || Is(p, "FALSE")) {
            // Flags are -1/0 as in the file engine. Not a column (T.True), a table (True.x), an
            // alias, or the operand of IS, where SQLite's TRUE already means "non-zero".
            bool literal = KindAt(p - 1) != K::kDot && KindAt(p + 1) != K::kDot && !Is(p - 1, "AS") &&
                           !Is(p - 1, "IS") && !(Is(p - 1, "NOT") && Is(p - 2, "IS"));
            if (literal) x.out = Is(p, "TRUE") ? "-1" : "0";
          }
          break;
        case K::kOperator:
          if (s.text == "}") {
            if (fnLevels.empty() || fnLevels.back() != x.level)
              Refuse("'}': braces other than {fn …} and {d|t|ts '…'} belong to the host's filter layer");
            fnLevels.pop_back();
            Remove(sig_[p]);
          } else if (s.text == "{") {
            Refuse("'{': braces other than {fn …} and {d|t|ts '…'} belong to the host's filter layer");
          } else if (s.text == "&") {
            Refuse("'&' (text concatenation): in SQLite '&' is a bitwise AND and '||' turns Null into Null");
          }
          break;
        default:
          break;
      }
    }
    if (!fnLevels.empty()) Refuse("{fn …}: the escape is not closed");
  }

  // ---- Pass 2: functions ----
  struct Range {
    int first, last;  // significant positions, inclusive
  };
  std::vector<Range> Arguments(int open) {
    std::vector<Range> args;
    int close = At(open).match;
    if (close == open + 1) return args;
    int start = open + 1;
    for (int p = start; p < close; p = Step(p)) {
      if (KindAt(p) == K::kComma) {
        args.push_back({start, p - 1});
        start = p + 1;
      }
    }
    args.push_back({start, close - 1});
    return args;
  }

  // '0' or '0.0…0': a fixed number of decimals that round() gives with the same digits.
  static int FixedDecimals(std::string_view pattern) {
    if (pattern == "0") return 0;
    if (pattern.size() < 3 || pattern.substr(0, 2) != "0.") return -1;
    for (char c : pattern.substr(2))
      if (c != '0') return -1;
    return static_cast<int>(pattern.size() - 2);
  }

  void Functions() {
    for (int p = 0; p + 1 < N(); ++p) {
      if (KindAt(p) != K::kIdentifier || KindAt(p + 1) != K::kLParen || KindAt(p - 1) == K::kDot) continue;
      int open = p + 1, close = At(open).match;
      if (Is(p, "ISNULL")) {
        // ISNULL is an SQLite keyword, so IsNull( is a syntax error there: rewrite by arity.
        std::vector<Range> args = Arguments(open);
        if (args.size() == 1) {
          At(p).out.clear();
          At(close).out = " IS NULL)";
        } else if (args.size() == 2) {
          At(p).out = "coalesce";
        } else {
          Refuse("IsNull with " + std::to_string(args.size()) + " arguments");
        }
      } else if (Is(p, "FORMAT")) {
        std::vector<Range> args = Arguments(open);
        if (args.size() != 1 && args.size() != 2) Refuse("Format with " + std::to_string(args.size()) + " arguments");
        if (args.size() == 2 && args[1].first == args[1].last) {
          int q = args[1].first;
          bool text = KindAt(q) == K::kString || (KindAt(q) == K::kQuoted && kind_ != 2);
          int decimals = text ? FixedDecimals(SqlTokenValue(At(q).src)) : -1;
          if (decimals >= 0) {
            At(p).out = "round";
            At(q).out = std::to_string(decimals);
          }
        }
      } else if (Is(p, "CSTR")) {
        if (Arguments(open).size() != 1) Refuse("CStr with other than one argument");
        At(p).out = "CAST";
        At(close).out = " AS TEXT)";
      }
    }
  }

  // ---- Pass 3: clauses ----
  void Clauses() {
    std::vector<char> compound(N() + 1), limited(N() + 1);  // indexed by level + 1
    for (int p = 0; p < N(); ++p)
      if (Is(p, "UNION") || Is(p, "INTERSECT") || Is(p, "EXCEPT")) compound[At(p).level + 1] = 1;
    for (int p = 0; p < N(); ++p) {
      if (Is(p, "SELECT")) {
        int q = p + 1;
        if (Is(q, "DISTINCT") || Is(q, "ALL")) ++q;
        if (Is(q, "TOP")) Top(p, q, compound, limited);
      } else if (Is(p, "WITH") && p > 0 && KindAt(p + 1) == K::kLParen) {
        TableHints(p);
      } else if (Is(p, "DELETE") && IsText(p + 1, "*") && Is(p + 2, "FROM")) {
        Blank(p + 1, true);
      }
    }
  }

  void Top(int select, int top, std::vector<char>& compound, std::vector<char>& limited) {
    int n = top + 1;
    bool whole = KindAt(n) == K::kNumber;
    for (char c : whole ? At(n).src.text : std::string_view()) whole = whole && IsDigit(c);
    if (!whole) Refuse("TOP: the row count must be a whole number");
    if (Is(n + 1, "PERCENT")) Refuse("TOP … PERCENT: SQLite has no percentage row limit");
    int level = At(select).level;
    if (compound[level + 1]) Refuse("TOP in a SELECT combined by UNION: LIMIT would cut the whole union");
    if (limited[level + 1]) Refuse("TOP: two row limits at one level");
    limited[level + 1] = 1;
    int last = level >= 0 ? At(level).match - 1 : N() - 1;
    At(last).suffix += " LIMIT " + std::string(At(n).src.text);
    Blank(top, true);
    Blank(n, true);
  }

  void TableHints(int with) {
    int open = with + 1, close = At(open).match;
    if (close == open + 1) return;
    if ((close - open) % 2 != 0) return;  // hint (, hint)*: an odd number of tokens
    for (int p = open + 1; p < close; ++p) {
      bool ok = (p - open) % 2 == 0 && KindAt(p) == K::kComma;
      for (std::string_view h : kTableHints) ok = ok || ((p - open) % 2 == 1 && Is(p, h));
      if (!ok) return;
    }
    int t = sig_[with] - 1;
    if (t >= begin_ && t_[t].src.kind == K::kSpace) Remove(t);
    for (t = sig_[with]; t <= sig_[close]; ++t) Remove(t);
  }

  // ---- Pass 4: statements ----

  // UPDATE a-list SET assignments [WHERE w], where a-list is "T [AS] [a]" followed by tables joined
  // with "," or [INNER] JOIN … ON. SQLite wants the target alone (alias after AS), unqualified SET
  // targets, the other tables in FROM and the join conditions in WHERE. Returns false when the
  // statement needs none of that.
  bool RewriteUpdate(Emitter& e) {
    int set = FindWord(1, N(), "SET");
    if (set < 0) return false;
    const std::vector<ListEntry> items = UpdateTableList(set);
    const UpdateTarget target = TargetOf(items[0]);
    const std::string owner = NameValue(target.alias >= 0 ? target.alias : target.nameLast);

    // SET assignments up to WHERE: qualified targets must belong to the target table.
    int where = FindWord(set + 1, N(), "WHERE");
    int setEnd = where >= 0 ? where : N();
    if (FindWord(set + 1, setEnd, "FROM") >= 0 && items.size() > 1)
      Refuse("UPDATE: a joined table list together with a FROM clause");
    const bool qualified = UnqualifySetTargets(set, setEnd, owner);
    if (items.size() == 1 && target.alias < 0 && !qualified) return false;
    if (where == N() - 1) Refuse("UPDATE: WHERE without a condition");
    EmitUpdate(e, items, target, set, setEnd, where);
    return true;
  }

  // One entry of UPDATE's table list: significant positions first..last, its ON (or -1).
  struct ListEntry {
    int first, last, on = -1;
  };
  // The target entry: the table name ends at nameLast; alias is its alias's position or -1.
  struct UpdateTarget {
    int first, nameLast, alias;
  };

  // The table list before SET, cut at "," and [INNER|CROSS] JOIN, with each entry's ON noted.
  std::vector<ListEntry> UpdateTableList(int set) {
    std::vector<ListEntry> items{{1, set - 1}};
    for (int p = 1; p < set; p = Step(p)) {
      int sep = 0;  // tokens in the separator
      if (KindAt(p) == K::kComma) {
        sep = 1;
      } else if (Is(p, "JOIN")) {
        sep = 1;
      } else if ((Is(p, "INNER") || Is(p, "CROSS")) && Is(p + 1, "JOIN")) {
        sep = 2;
      } else if ((Is(p, "LEFT") || Is(p, "RIGHT") || Is(p, "FULL")) && (Is(p + 1, "JOIN") || Is(p + 1, "OUTER"))) {
        Refuse("UPDATE: the source has an outer join (" + std::string(At(p).src.text) +
               " JOIN); SQLite's UPDATE … FROM joins inner only");
      } else if (Is(p, "NATURAL")) {
        Refuse("UPDATE: a NATURAL JOIN in the table list");
      } else if (Is(p, "ON")) {
        if (items.back().on >= 0 || items.size() == 1) Refuse("UPDATE: ON without a joined table");
        items.back().on = p;
      }
      if (sep) {
        items.back().last = p - 1;
        items.push_back({p + sep, set - 1});
        p += sep - 1;
      }
    }
    for (const ListEntry& it : items) {
      int end = it.on >= 0 ? it.on - 1 : it.last;
      if (it.first > end || (it.on >= 0 && it.on == it.last)) Refuse("UPDATE: an empty entry in the table list");
    }
    return items;
  }

  // The target entry: name[.name] [AS] [alias].
  UpdateTarget TargetOf(const ListEntry& entry) {
    int p = entry.first;
    if (entry.on >= 0 || !IsName(p)) Refuse("UPDATE: the target must be a table name with an optional alias");
    int nameLast = p;
    if (KindAt(p + 1) == K::kDot && p + 2 <= entry.last && IsName(p + 2)) nameLast = p + 2;
    int alias = -1;
    int q = nameLast + 1;
    if (Is(q, "AS")) ++q;
    if (q <= entry.last) {
      if (q != entry.last || !IsName(q)) Refuse("UPDATE: the target must be a table name with an optional alias");
      alias = q;
    } else if (q != nameLast + 1) {
      Refuse("UPDATE: AS without an alias");
    }
    return {entry.first, nameLast, alias};
  }

  // Drops the "owner." qualifier of each SET target between set and setEnd; a target qualified by
  // another table is refused. Returns whether any target was qualified.
  bool UnqualifySetTargets(int set, int setEnd, const std::string& owner) {
    bool qualified = false;
    for (int a = set + 1; a < setEnd;) {
      int b = a;
      while (b < setEnd && KindAt(b) != K::kComma) b = Step(b);
      if (KindAt(a + 1) == K::kDot) {
        if (!IsName(a) || !IsName(a + 2) || !IsText(a + 3, "="))
          Refuse("UPDATE: SET target " + TextOf(a, b - 1) + " is not a column of the target");
        if (!AsciiEqualsNoCase(NameValue(a), owner))
          Refuse("UPDATE: SET target " + TextOf(a, a + 2) + " belongs to another table");
        At(a).out.clear();  // a qualifier before its "." and column never joins two tokens
        At(a + 1).out.clear();
        qualified = true;
      }
      a = b + 1;
    }
    return qualified;
  }

  // UPDATE target [AS alias] SET … [FROM the other entries] [WHERE (ON conditions) AND (where)].
  void EmitUpdate(Emitter& e, const std::vector<ListEntry>& items, const UpdateTarget& target, int set, int setEnd,
                  int where) {
    EmitTokens(e, begin_, sig_[0]);
    e.Append("UPDATE ");
    EmitSig(e, target.first, target.nameLast);
    if (target.alias >= 0) {
      e.Append(" AS ");
      EmitSig(e, target.alias, target.alias);
    }
    e.Append(" ");
    EmitSig(e, set, setEnd - 1);
    for (size_t k = 1; k < items.size(); ++k) {
      e.Append(k == 1 ? " FROM " : ", ");
      EmitSig(e, items[k].first, items[k].on >= 0 ? items[k].on - 1 : items[k].last);
    }
    std::vector<Range> conditions;
    for (size_t k = 1; k < items.size(); ++k)
      if (items[k].on >= 0) conditions.push_back({items[k].on + 1, items[k].last});
    if (where >= 0) conditions.push_back({where + 1, N() - 1});
    for (size_t k = 0; k < conditions.size(); ++k) {
      bool wrap = conditions.size() > 1;
      e.Append(k == 0 ? " WHERE " : " AND ");
      if (wrap) e.Append("(");
      EmitSig(e, conditions[k].first, conditions[k].last);
      if (wrap) e.Append(")");
    }
    EmitTokens(e, sig_[N() - 1] + 1, end_);
  }

  std::string TextOf(int first, int last) {
    Emitter e;
    EmitSig(e, first, last);
    return e.Take();
  }

  // SELECT … INTO t FROM … at the top level: the file engine's make-table query.
  void SelectInto() {
    int into = FindWord(1, N(), "INTO");
    if (into < 0) return;
    int name = into + 1;
    if (!IsName(name)) Refuse("SELECT … INTO: the new table needs a plain name");
    if (KindAt(name + 1) == K::kDot) Refuse("SELECT … INTO: a qualified table name");
    if (Is(name + 1, "IN")) Refuse("SELECT … INTO … IN: a table in another database file");
    At(0).out = "CREATE TABLE " + QuoteName(NameValue(name)) + " AS " + At(0).out;
    Blank(into, true);
    Blank(name, true);
  }

  // Index names are database-wide in SQLite but per table in the file engine: prefix the table.
  // A name that already carries the prefix keeps it.
  std::string IndexName(int table, int index) {
    std::string prefix = NameValue(table) + "_", name = NameValue(index);
    return NameText(AsciiStartsWithNoCase(name, prefix) ? name : prefix + name);
  }

  void Drop() {
    if (Is(1, "TABLE") && !Is(2, "IF")) {
      At(1).out += " IF EXISTS";
    } else if (Is(1, "INDEX") && !Is(2, "IF") && IsName(2) && Is(3, "ON") && IsName(4) && N() == 5) {
      At(1).out += " IF EXISTS";
      Blank(2, true);  // the blank before ON goes too
      At(2).out = IndexName(4, 2);
      Blank(3, true);
      Blank(4, false);
    }
  }

  void Create() {
    int p = 1;
    if (Is(p, "TEMP") || Is(p, "TEMPORARY")) ++p;
    if (Is(p, "UNIQUE")) ++p;
    bool table = Is(p, "TABLE"), index = Is(p, "INDEX");
    if (!table && !index) return;
    ++p;
    if (Is(p, "IF") && Is(p + 1, "NOT") && Is(p + 2, "EXISTS")) p += 3;
    if (!IsName(p)) return;
    if (index) {
      if (Is(p + 1, "ON") && IsName(p + 2)) At(p).out = IndexName(p + 2, p);
      return;
    }
    if (KindAt(p + 1) == K::kDot) p += 2;
    if (KindAt(p + 1) == K::kLParen) ColumnTypes(p + 1);
  }

  void ColumnTypes(int open) {
    for (const Range& def : Arguments(open)) {
      int p = def.first;
      if (Is(p, "CONSTRAINT") || Is(p, "PRIMARY") || Is(p, "UNIQUE") || Is(p, "FOREIGN") || Is(p, "CHECK")) continue;
      int type = p + 1;
      if (type > def.last || KindAt(type) != K::kIdentifier) continue;
      bool more = type + 1 <= def.last;
      if (more && Is(type + 1, "PRECISION")) Blank(type + 1, false);  // DOUBLE PRECISION
      const TypeRule* rule = nullptr;
      for (const TypeRule& r : kColumnTypes)
        if (Is(type, r.from)) rule = &r;
      if (!rule) Refuse("CREATE TABLE: column type " + std::string(At(type).src.text) + " of " + NameValue(p));
      // Declared types this translator writes ("CURRENCY REAL", "TEXT COLLATE …") stay as they are.
      std::string_view to = rule->to;
      size_t blank = to.rfind(' ');
      bool complete = more && blank != std::string_view::npos &&
                      (Is(type + 1, to.substr(blank + 1)) || (Is(type + 1, "COLLATE") && Is(type, "TEXT")));
      if (!complete) At(type).out = to;
      if (more && KindAt(type + 1) == K::kLParen) {  // TEXT(50), DECIMAL(19, 4): SQLite ignores sizes
        for (int k = type + 1; k <= At(type + 1).match; ++k) Blank(k, false);
      }
    }
  }

  std::vector<Tok>& t_;
  int begin_, end_;
  int kind_;
  std::vector<int> sig_;
};

}  // namespace

std::string TranslateToSqlite(std::string_view sql, int databaseKind) {
  std::vector<SqlToken> tokens = TokenizeSql(sql);
  std::vector<Tok> toks;
  toks.reserve(tokens.size());
  for (const SqlToken& s : tokens) toks.push_back(Tok{s, std::string(s.text), {}, false, -1, -1});

  Emitter e;
  int begin = 0, depth = 0;
  for (int t = 0; t <= static_cast<int>(toks.size()); ++t) {
    bool last = t == static_cast<int>(toks.size());
    if (!last) {
      K k = toks[t].src.kind;
      depth += k == K::kLParen ? 1 : k == K::kRParen ? -1 : 0;
      if (k != K::kSemicolon || depth > 0) continue;
    }
    Statement(toks, begin, t, databaseKind).Translate(e);
    if (!last) e.Append(toks[t].out);
    begin = t + 1;
  }
  return e.Take();
}

}  // namespace xal::host
