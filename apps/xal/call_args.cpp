// Parsing of `xal call` argument words.
#include "apps/xal/call_args.h"

#include <charconv>
#include <cmath>
#include <limits>

#include "runtime/convert.h"
#include "runtime/dates.h"
#include "runtime/error.h"
#include "runtime/locale.h"
#include "runtime/text.h"

namespace xal::app {

namespace {
// Numbers on the command line are always written with ".", whatever the runtime's locale.
double DotNumber(std::string_view text) {
  ScopedLocale dot{RuntimeLocale{}};
  return ParseNumber(text);
}

bool BareNumber(std::string_view w, Variant& out) {
  if (w.empty()) return false;
  int64_t whole = 0;
  auto [p, ec] = std::from_chars(w.data(), w.data() + w.size(), whole);
  if (ec == std::errc() && p == w.data() + w.size()) {
    if (whole >= std::numeric_limits<int32_t>::min() && whole <= std::numeric_limits<int32_t>::max())
      out = Variant(static_cast<int32_t>(whole));
    else
      out = Variant(static_cast<double>(whole));
    return true;
  }
  double d = 0;
  auto [q, ec2] = std::from_chars(w.data(), w.data() + w.size(), d);
  if (ec2 == std::errc() && q == w.data() + w.size() && std::isfinite(d)) {
    out = Variant(d);
    return true;
  }
  return false;
}
}  // namespace

Variant ParseCallArg(std::string_view w) {
  if (w == "null") return Variant::Null();
  if (w == "empty") return Variant();
  if (w == "missing") return Variant::Missing();
  if (w.size() >= 2 && w[1] == ':') {
    std::string_view v = w.substr(2);
    switch (w[0]) {
      case 'i': return Variant(CInt(Variant(DotNumber(v))));
      case 'l': return Variant(CLng(Variant(DotNumber(v))));
      case 'f': return Variant(DotNumber(v));
      case 'c': return Variant(CCur(Variant(DotNumber(v))));
      case 'd': return Variant(ParseDate(v));
      case 'b': {
        if (TextEquals(v, "true") || v == "1" || v == "-1") return Variant(true);
        if (TextEquals(v, "false") || v == "0") return Variant(false);
        Raise(kErrTypeMismatch, "Type mismatch: b:" + std::string(v));
      }
      case 's': return Variant(std::string(v));
      default: break;
    }
  }
  Variant number;
  if (BareNumber(w, number)) return number;
  return Variant(std::string(w));
}

MemberKind ParseMemberKind(std::string_view word) {
  for (MemberKind k : {MemberKind::Method, MemberKind::Get, MemberKind::Put, MemberKind::PutRef})
    if (TextEquals(word, MemberKindName(k))) return k;
  Raise(kErrInvalidCall, "Invalid procedure call or argument: kind \"" + std::string(word) + "\"");
}

}  // namespace xal::app
