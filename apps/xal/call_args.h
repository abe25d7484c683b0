// Arguments of `xal call`, one per word: bare numbers and words, or typed forms
//   i:5 (Integer)  l:5 (Long)  f:1.5 (Double)  c:12.34 (Currency)  d:2009-03-05[T14:07:00] (Date)
//   b:true (Boolean)  s:text (String)  null  empty  missing
// A bare whole number that fits 32 bits is a Long, any other bare number a Double ("." always),
// anything else a String.
#pragma once

#include <string_view>

#include "runtime/member_table.h"
#include "runtime/variant.h"

namespace xal::app {
Variant ParseCallArg(std::string_view word);

// The member kind a call names, for `xal call --kind` and the session's "kind" alike: "method",
// "get", "put" or "putref" in any letter case; any other word is run-time error 5.
MemberKind ParseMemberKind(std::string_view word);
}
