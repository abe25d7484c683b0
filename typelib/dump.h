// The readable text form of the type library (`xal typelib`): classes with their members in
// interface order, event interfaces and enumerations, written the way a script programmer reads
// a declaration: "[3] method Add(a As Long, [b As Long = 1]) As Long".
#pragma once

#include <string>

#include "runtime/member_table.h"

namespace xal {

std::string DumpTypeLibrary(const TypeRegistry& registry);
// "a As Long", "ByRef Text As String", "[b As Long = 1]"
std::string DescribeParam(const ParamInfo& p);
// The type's name for a declaration: "Long", "Variant", or an object parameter's class name.
std::string TypeText(VarType type, const std::type_info* objectType);

}  // namespace xal
