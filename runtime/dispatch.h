// Late-bound calls: a member found by name (case-insensitive) or dispatch id, its arguments
// checked against the member table — too many is error 450, a missing required one 449, omitted
// optional ones take their default or the type's zero value — converted, the call made, and
// by-reference results written back into the caller's arguments. Scripts, `xal` and any language
// binding reach the component only this way.
#pragma once

#include <span>
#include <string_view>
#include <vector>

#include "runtime/member_table.h"

namespace xal {

// Calls `name` on `obj`. Arguments beyond those given count as omitted; a Missing argument is
// omitted too. Errors: 91 for Nothing, 438 for no such member of that kind, 449, 450, 13, and
// whatever the member itself raises.
Variant Invoke(const ObjectRef& obj, std::string_view name, MemberKind kind, std::span<Variant> args);
Variant Invoke(const ObjectRef& obj, int32_t dispid, MemberKind kind, std::span<Variant> args);

// Convenience for C++ callers that need no by-ref results.
Variant Call(const ObjectRef& obj, std::string_view name, std::vector<Variant> args = {});
Variant GetProperty(const ObjectRef& obj, std::string_view name, std::vector<Variant> args = {});
void PutProperty(const ObjectRef& obj, std::string_view name, Variant value);

// The value an omitted optional parameter of this type receives when it has no default:
// 0, False, "", date zero, Nothing; a Variant parameter receives Missing.
Variant ZeroValue(VarType type);

}  // namespace xal
