// The balance of a capital asset as of a date or a capital-asset document row, replayed from the
// asset's document rows with monthly depreciation.
#pragma once

#include <cstdint>

#include "bridge/host_model.h"
#include "runtime/currency.h"
#include "runtime/date.h"

namespace xal::server {

// The values the balance is returned through; each is written by CountCABalance.
struct CABalance {
  Currency basicCost, basicCostRef;
  Currency depreciatedCost, depreciatedCostRef;
  double depreciationRate = 0;
  Currency depreciationAmount, depreciationAmountRef;
  double quantity = 0;
  int32_t idCALastRegRow = 0;
};

// True when the balance was computed; `out` holds it then.
bool CountCABalance(const Ref<XALConnect>& xalConnect, int32_t idCRCapitalAssets, int32_t idCADocRow, Date docDate,
                    CABalance& out);

}  // namespace xal::server
