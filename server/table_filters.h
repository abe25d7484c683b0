// Row-level rights as query filters, the category check of a record, and the rewrite of stored
// options when a record is replaced by another.
#pragma once

#include <cstdint>
#include <string>

#include "bridge/host_model.h"

namespace xal::server {

// The current user's rights on object type `xalType` as a WHERE condition, a list of permitted
// identifiers (`idListOnly`) or a sub-select (`subSelect`), with `alias` as the table prefix;
// empty when nothing is restricted.
std::string GetTableFilter(const Ref<XALConnect>& xalConnect, const std::string& xalType, bool idListOnly = false,
                           const std::string& alias = "", bool subSelect = false);
// Whether record `pID` of `pTableName` may take category `pCatID` without holding two categories of
// one category group.
bool CheckCategory(const Ref<XALConnect>& pXALConnect, const std::string& pTableName, int32_t pID, int32_t pCatID);
// Makes the stored options that hold record `oldID` of `tableName` hold `newID` (an empty text for
// 0) and has the host reload them; False when nothing could be done (no table, no old id, an error).
bool ResetOptions(const Ref<XALConnect>&, const std::string& tableName, int32_t oldID, int32_t newID);

}  // namespace xal::server
