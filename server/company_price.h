// The price of an article for a customer company on a date, through the company's own lists,
// price-list chains and price categories.
#pragma once

#include <cstdint>

#include "bridge/host_model.h"
#include "runtime/currency.h"
#include "runtime/date.h"

namespace xal::server {

Currency GetCompanyPrice(const Ref<XALConnect>& pXALConnect, int32_t pIDGRArticle, int32_t pIDGRCompany, Date pDate);
// The first list of the chain starting at `priceList` that is valid on `date`, or 0.
int32_t FindValidPriceList(const Ref<XALConnect>& conn, Date date, int32_t priceList);

}  // namespace xal::server
