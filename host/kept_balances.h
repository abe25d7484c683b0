// The kept current balances of the reference host (DCurBalanceStore per article and store,
// DCurDRStockReserve per reservation and store). The schema's triggers keep them by difference on
// every write of a store row or a reservation relation; these helpers rebuild them from their
// defining views, and load many rows at once without the per-row upkeep.
#pragma once

#include <functional>
#include <string>

#include "host/connection.h"

namespace xal::host {

// Rebuilds DCurBalanceStore from vCurBalanceStore: every key when `field` is empty, else the keys
// whose `field` ("IDGRArticle" or "IDDRStore") is `value`.
void RebuildStockBalances(Database& db, const std::string& field = "", const Variant& value = Variant());
// Rebuilds DCurDRStockReserve from vCurDRStockReserve.
void RebuildReserveBalances(Database& db);

// Runs `load` in one transaction with the kept-balance triggers off, then rebuilds both kept
// tables once: for loading many store rows, where the per-row upkeep would cost more than one
// rebuild. A failure rolls the whole load back; the triggers are on again either way.
void LoadInBulk(HostConnection& conn, const std::function<void(Database&)>& load);

}  // namespace xal::host
