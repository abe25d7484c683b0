// Record aggregation: merges one register record into another of the same table, moving every
// reference and stored balance of the source onto the target.
#pragma once

#include <cstdint>

#include "bridge/host_model.h"

namespace xal::server {

// `pObj` is positioned on the source record `pObjID`; `pParams` gives "TargetID" and "Delete" and
// receives "ErrText" on failure. True when the records were merged.
bool AggrRec(const Ref<DataObject>& pObj, int32_t pObjID, const Ref<ParamList>& pParams);

}  // namespace xal::server
