// Period closing: fixes one subsystem of the ledger (or the accounting as a whole) up to a closing
// date, asking the user through the host callback to certify what is not certified yet.
#pragma once

#include "bridge/host_model.h"

namespace xal::server {

// Reads "XALConnect", "SystemName" and "CloseDate" from `pParams`; True when the period was closed.
// Talks to the user through CurrentCallback(), which Execute sets for the span of the call.
bool ClosePeriod(const Ref<ParamList>& pParams);

}  // namespace xal::server
