// The per-thread state of the server module. Function-local thread_locals, so each is created on
// first use in its thread and no order of static initialisation between files matters.
#include "server/module_state.h"

namespace xal::server {

Ref<IXALCallback>& CurrentCallback() {
  thread_local Ref<IXALCallback> callback;
  return callback;
}

}  // namespace xal::server
