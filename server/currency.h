// Currency rates and conversion between a document currency, the base currency and the
// reference currency, with the rates held in the database or given by the caller.
#pragma once

#include <cstdint>

#include "bridge/host_model.h"
#include "runtime/currency.h"
#include "runtime/date.h"

namespace xal::server {

double CurRate(const Ref<XALConnect>& pXALConnect, int32_t pCurID, Date pRateDate);
Currency ConvertWithRates(Currency pAmount, double pRate1, double pRate2 = 0, bool pRefAmount = false,
                          bool pIsTriangulation = false);
Currency Convert(const Ref<XALConnect>& pXALConnect, int32_t pCurID, Date pConvDate, Currency pAmount,
                 Currency& pRefAmount);

}  // namespace xal::server
