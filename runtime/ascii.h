// ASCII letter case, the case rule for the names the system spells itself: member and class
// names, format and keyword names, SQL words, column-type prefixes, and the ASCII fast paths of the
// text functions. Only A-Z and a-z change; every other byte passes through, so UTF-8 text stays
// intact. User text (names, codes, options) compares through TextEquals/FoldCase instead, which
// fold every letter.
#pragma once

#include <string>
#include <string_view>

namespace xal {

constexpr char AsciiLower(char c) { return (c >= 'A' && c <= 'Z') ? static_cast<char>(c - 'A' + 'a') : c; }
constexpr char AsciiUpper(char c) { return (c >= 'a' && c <= 'z') ? static_cast<char>(c - 'a' + 'A') : c; }

inline std::string AsciiLower(std::string_view s) {
  std::string out(s);
  for (char& c : out) c = AsciiLower(c);
  return out;
}

// Equal when they differ only in the case of ASCII letters.
constexpr bool AsciiEqualsNoCase(std::string_view a, std::string_view b) {
  if (a.size() != b.size()) return false;
  for (size_t i = 0; i < a.size(); ++i)
    if (AsciiLower(a[i]) != AsciiLower(b[i])) return false;
  return true;
}

// `s` begins with `prefix`, ASCII letter case ignored.
constexpr bool AsciiStartsWithNoCase(std::string_view s, std::string_view prefix) {
  return s.size() >= prefix.size() && AsciiEqualsNoCase(s.substr(0, prefix.size()), prefix);
}

}  // namespace xal
