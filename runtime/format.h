// Format(value, pattern) for the numeric patterns the component uses: "0", "0.00", "#,##0.00",
// "#.##", ".00", "0.0000E+000" and the like. Rounding is half away from zero on the 15-digit
// decimal text that CStr would give, never on the binary value.
#pragma once

#include <string>
#include <string_view>

#include "runtime/variant.h"

namespace xal {

// Null gives "", Empty formats as 0, numeric text is parsed first; text that is not numeric is
// returned unchanged. Separators come from the current locale.
std::string Format(const Variant& value, std::string_view pattern);

}  // namespace xal
