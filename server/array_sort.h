// In-place ascending sort of a script's array: 1-D by element, 2-D by row on the first column.
#pragma once

#include "runtime/variant.h"

namespace xal::server {

// Values compare as the runtime's "<" with text comparison; anything but an array is left alone,
// an array of three or more dimensions is error 9.
void ArraySort(Variant& pArray);

}  // namespace xal::server
