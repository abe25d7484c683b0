// Errors of the reference host. SQL that cannot be translated or that SQLite rejects becomes a
// run-time error the component's error trapping understands, carrying the reason as its text.
#pragma once

#include <cstdint>

namespace xal::host {

// The number the original data layer used for a failed SQL call.
constexpr int32_t kErrSql = 3146;

}  // namespace xal::host
