// Prices and discounts of document rows.
// Placeholders until the prices work lands: each member returns its start value.
#include "docfunc/handler.h"

namespace xal {

// filled by the prices work
bool DocFunc::VPriceList(bool pAsk) { return false; }
bool DocFunc::VPriceCut(bool pAsk) { return false; }
bool DocFunc::WPriceCut() { return false; }
bool DocFunc::VDiscount() { return false; }
bool DocFunc::FillPrice(Ref<xal::DataObject>& pRowOB) { return false; }
bool DocFunc::ComputePercentAmount() { return false; }
bool DocFunc::ComputePercentPricelist() { return false; }

}  // namespace xal
