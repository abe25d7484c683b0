// Row amounts, quantities, taxes and the header totals.
// Placeholders until the amounts work lands: each member returns its start value.
#include "docfunc/handler.h"

namespace xal {

// filled by the amounts work
bool DocFunc::DoHeaderRefresh() { return false; }
bool DocFunc::AdjustAllAmounts() { return false; }
bool DocFunc::RecomputeDocAmounts() { return false; }
bool DocFunc::WAmount() { return false; }
bool DocFunc::WCost() { return false; }
bool DocFunc::WQuantity() { return false; }
bool DocFunc::WTaxAmount() { return false; }
bool DocFunc::WRowTaxAmount() { return false; }
bool DocFunc::WRowTax() { return false; }
bool DocFunc::WDealState() { return false; }
bool DocFunc::WSeries() { return false; }
bool DocFunc::WDRStoreRow() { return false; }
bool DocFunc::VAmount() { return false; }
bool DocFunc::VQuantity() { return false; }
bool DocFunc::VCost() { return false; }
bool DocFunc::VUnit() { return false; }
bool DocFunc::VTax() { return false; }
bool DocFunc::VTaxAmount() { return false; }
bool DocFunc::VRowTax() { return false; }
bool DocFunc::VRowTaxAmount() { return false; }
bool DocFunc::VDocRow() { return false; }
Variant DocFunc::DQuantity() { return Variant(); }
Variant DocFunc::DSeries() { return Variant(); }
Variant DocFunc::DRowDiscount() { return Variant(); }
void DocFunc::ComputeDocTotals(bool Full) {}
bool DocFunc::RecomputeRows(bool Full) { return false; }
bool DocFunc::RecomputeRow(Ref<xal::DataObject>& Row, bool Full) { return false; }
void DocFunc::ResetDiscountChecks() {}
void DocFunc::InitialTotals(const StoredTaxes& taxes) {}
double DocFunc::UnitToBase(double quantity, int32_t unit, int32_t baseUnit) { return quantity; }

}  // namespace xal
