// State the server module keeps between calls. Each thread is its own apartment, so the state is
// per thread and needs no lock: a server running documents on many threads keeps them apart.
#pragma once

#include "bridge/host_model.h"

namespace xal::server {

// The host callback of the Execute call in progress on this thread; empty outside such a call.
// Execute sets it from its parameter list and clears it before it returns.
Ref<IXALCallback>& CurrentCallback();

}  // namespace xal::server
