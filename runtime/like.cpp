// The Like operator: a script's wildcard match of a text against ? * # [list] [!list] [a-z].
// The pattern is compiled into single-character tokens and stars first (so a bad pattern fails
// the same way whatever the text), then matched with backtracking only to the last star, which
// keeps the worst case at text length × pattern length.
#include <unicode/uchar.h>

#include <unordered_map>

#include "runtime/ascii.h"
#include "runtime/error.h"
#include "runtime/text.h"

namespace xal {

namespace {

// ---------------------------------------------------------------------------------------------
// Compiled pattern
// ---------------------------------------------------------------------------------------------

struct Range {
  char32_t lo, hi;  // a single character has lo == hi
};

struct CharList {
  std::vector<Range> ranges;
  bool negate = false;
  // Text-mode range tests go through the collator; the answers per character are kept because a
  // long text asks the same question many times while backtracking.
  mutable std::unordered_map<char32_t, bool> memo;
};

enum class Kind { Literal, AnyChar, Digit, List, Star };

struct Token {
  Kind kind;
  char32_t ch = 0;   // Literal (folded in text mode)
  size_t list = 0;   // List: index into Pattern::lists
};

struct Pattern {
  std::vector<Token> tokens;
  std::vector<CharList> lists;
};

char32_t Fold(char32_t c) {
  if (c < 0x80) return static_cast<char32_t>(AsciiLower(static_cast<char>(c)));
  return static_cast<char32_t>(u_foldCase(static_cast<UChar32>(c), U_FOLD_CASE_DEFAULT));
}

std::string One(char32_t c) { return ToUtf8(std::u32string_view(&c, 1)); }

// Order of two characters in the compare mode: code points in binary, the collator (case
// ignored, accents counted) in text mode.
int CharOrder(char32_t a, char32_t b, CompareMode mode) {
  if (mode == CompareMode::Binary) return a < b ? -1 : a > b ? 1 : 0;
  return StrComp(One(a), One(b), CompareMode::Text);
}

// Parses the inside of "[...]". "-" first or last is literal; "a-z" is a range and must not run
// backwards; a leading "!" negates.
CharList ParseList(std::u32string_view body, CompareMode mode) {
  CharList list;
  if (!body.empty() && body[0] == U'!') {
    list.negate = true;
    body.remove_prefix(1);
  }
  for (size_t i = 0; i < body.size();) {
    if (i + 2 < body.size() && body[i + 1] == U'-') {
      if (CharOrder(body[i], body[i + 2], mode) > 0) Raise(kErrBadPattern);
      list.ranges.push_back({body[i], body[i + 2]});
      i += 3;
    } else {
      list.ranges.push_back({body[i], body[i]});
      ++i;
    }
  }
  return list;
}

Pattern Compile(std::u32string_view p, CompareMode mode) {
  Pattern pat;
  for (size_t i = 0; i < p.size(); ++i) {
    char32_t c = p[i];
    if (c == U'*') {
      if (pat.tokens.empty() || pat.tokens.back().kind != Kind::Star) pat.tokens.push_back({Kind::Star});
    } else if (c == U'?') {
      pat.tokens.push_back({Kind::AnyChar});
    } else if (c == U'#') {
      pat.tokens.push_back({Kind::Digit});
    } else if (c == U'[') {
      size_t close = p.find(U']', i + 1);
      if (close == std::u32string_view::npos) Raise(kErrBadPattern);
      std::u32string_view body = p.substr(i + 1, close - i - 1);
      i = close;
      if (body.empty()) continue;  // "[]" matches the empty string: no token at all
      pat.lists.push_back(ParseList(body, mode));
      pat.tokens.push_back({Kind::List, 0, pat.lists.size() - 1});
    } else {
      pat.tokens.push_back({Kind::Literal, mode == CompareMode::Text ? Fold(c) : c});
    }
  }
  return pat;
}

// ---------------------------------------------------------------------------------------------
// Matching
// ---------------------------------------------------------------------------------------------

bool InRange(const Range& r, char32_t c, CompareMode mode) {
  if (mode == CompareMode::Binary) return r.lo <= c && c <= r.hi;
  if (r.lo == r.hi) return Fold(r.lo) == Fold(c);
  return CharOrder(r.lo, c, mode) <= 0 && CharOrder(c, r.hi, mode) <= 0;
}

bool InList(const CharList& list, char32_t c, CompareMode mode) {
  if (mode == CompareMode::Text) {
    if (auto it = list.memo.find(c); it != list.memo.end()) return it->second;
  }
  bool found = false;
  for (const Range& r : list.ranges)
    if (InRange(r, c, mode)) {
      found = true;
      break;
    }
  bool result = found != list.negate;
  if (mode == CompareMode::Text) list.memo.emplace(c, result);
  return result;
}

// `c` is the text character as is; `folded` its folded form for text-mode literals.
bool TokenMatches(const Pattern& pat, const Token& t, char32_t c, char32_t folded, CompareMode mode) {
  switch (t.kind) {
    case Kind::AnyChar: return true;
    case Kind::Digit: return c >= U'0' && c <= U'9';
    case Kind::Literal: return t.ch == folded;
    case Kind::List: return InList(pat.lists[t.list], c, mode);
    case Kind::Star: break;
  }
  return false;
}

bool Match(const Pattern& pat, std::u32string_view s, CompareMode mode) {
  const std::vector<Token>& tk = pat.tokens;
  constexpr size_t kNone = static_cast<size_t>(-1);
  size_t si = 0, pi = 0, starP = kNone, starS = 0;
  while (si < s.size()) {
    if (pi < tk.size() && tk[pi].kind == Kind::Star) {
      starP = pi++;
      starS = si;
      continue;
    }
    char32_t folded = mode == CompareMode::Text ? Fold(s[si]) : s[si];
    if (pi < tk.size() && TokenMatches(pat, tk[pi], s[si], folded, mode)) {
      ++si, ++pi;
      continue;
    }
    if (starP == kNone) return false;
    // Every token but a star takes exactly one character, so letting the last star swallow one
    // more character is the only retry that can still succeed.
    pi = starP + 1;
    si = ++starS;
  }
  while (pi < tk.size() && tk[pi].kind == Kind::Star) ++pi;
  return pi == tk.size();
}

}  // namespace

bool Like(std::string_view s, std::string_view pattern, CompareMode mode) {
  Pattern pat = Compile(ToUtf32(pattern), mode);
  return Match(pat, ToUtf32(s), mode);
}

}  // namespace xal
