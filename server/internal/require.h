// Access to the host objects the server module is handed goes through xal::Require (runtime/trap.h):
// a Nothing reference raises error 91, which the module's error trapping relies on.
#pragma once

#include "runtime/trap.h"

namespace xal::server::internal {
using xal::Require;
}  // namespace xal::server::internal
