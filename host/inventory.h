// The inventory computation the document logic asks for before saving a stock document (server
// command "DPInventoryB"): the quantity on hand per article and store, as if some documents were
// not stored, written as one DPInventoryB row with its DPInventoryBRow rows.
#pragma once

#include <cstdint>
#include <vector>

#include "host/connection.h"

namespace xal::host {

// Runs the computation the parameter list asks for; the answer is the new DPInventoryB ID (Long).
Variant InventoryB(HostConnection& conn, const Ref<ParamList>& params);

// The ids a list parameter holds: none for Empty, Null or blank text; a number; text of numbers
// separated by commas, semicolons or blanks; an array of numbers. Anything else raises error 13.
std::vector<int32_t> IdList(const Variant& v);

}  // namespace xal::host
