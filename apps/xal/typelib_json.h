// `xal typelib --json`: the type library as one JSON document.
#pragma once

#include "apps/xal/json_values.h"
#include "runtime/member_table.h"

namespace xal::app {
Json TypeLibraryJson(const TypeRegistry& registry);
}
