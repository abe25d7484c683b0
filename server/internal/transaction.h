// The server module's one way of writing several statements as a unit. The host may or may not
// offer transactions on its connection; the operations that change several tables (a merge, a
// period closing) go through InTransaction so that both cases read the same everywhere.
#pragma once

#include <utility>

#include "bridge/host_model.h"
#include "runtime/trap.h"

namespace xal::server::internal {

// Runs `body` (which returns True to keep its work) as one unit on `conn`:
//   1. Ask the host to begin a transaction. A host that offers none answers False; the
//      statements of `body` then run one by one, each kept by the host as it runs.
//   2. Run `body`. True commits the transaction, False rolls it back; either way the result of
//      `body` is the result.
//   3. A run-time error (or any failure) inside `body` rolls the transaction back and is raised
//      again. A rollback that fails as well is ignored, so the caller sees the first error.
// Without a transaction steps 2 and 3 only pass the result or the error on.
template <class Body>
bool InTransaction(XALConnect& conn, Body&& body) {
  const bool own = conn.BeginTransaction();
  try {
    const bool keep = std::forward<Body>(body)();
    if (own) {
      if (keep)
        conn.CommitTransaction();
      else
        conn.RollbackTransaction();
    }
    return keep;
  } catch (...) {
    if (own) TryStep([&] { conn.RollbackTransaction(); });
    throw;
  }
}

}  // namespace xal::server::internal
