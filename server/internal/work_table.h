// The numbers the record merge draws its work-table names from ("4711TmpDBalanceStore"). By
// default they come from a per-thread random generator seeded once; a test replaces the source to
// make two merges meet on one name.
#pragma once

#include <cstdint>
#include <functional>

namespace xal::server::internal {

// Returns a number from 1 to 10000 for each call.
using WorkTableNumberSource = std::function<int32_t()>;

// Replaces this thread's source; an empty function restores the random one.
void SetWorkTableNumberSource(WorkTableNumberSource source);

}  // namespace xal::server::internal
