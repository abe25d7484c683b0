// The price of an article for a customer company on a date, through the company's own lists,
// price-list chains and price categories.
#pragma once

#include <cstdint>

#include "bridge/host_model.h"
#include "runtime/object.h"
#include "runtime/trap.h"
#include "runtime/currency.h"
#include "runtime/date.h"

namespace xal::server {

Currency GetCompanyPrice(const Ref<XALConnect>& pXALConnect, int32_t pIDGRArticle, int32_t pIDGRCompany, Date pDate);
// The first list of the chain starting at `priceList` that is valid on `date`, or 0. When `next`
// is given it receives the IDFirst of the list returned (0 when there is none).
int32_t FindValidPriceList(const Ref<XALConnect>& conn, Date date, int32_t priceList, int32_t* next = nullptr);

// What a price list says of itself: the next list of its chain and how its prices are meant.
struct PriceListInfo {
  bool exists = false;  // the list has a row
  int32_t next = 0;     // IDFirst: the list that follows when this one has no valid price
  bool gross = false;   // IsBruto: prices include tax
  bool noCut = false;   // WithoutPriceCut: prices are not subject to price cuts
};
PriceListInfo ReadPriceList(const Checked<XALServer>& server, int32_t list);

// The price list that the price-category pair of `article` and `companyCategory` names; 0 when
// the pair has none.
int32_t CategoryPriceList(const Checked<XALServer>& server, int32_t article, int32_t companyCategory);

// The price row of `article` in `list` that is valid on `date`: the newest row (latest
// BeginDate) whose BeginDate is not after the date and whose EndDate is not before it (an
// EndDate before 1900 is open). The query is returned positioned on that row, or nullptr when
// no row qualifies.
Ref<DataObject> PriceRowOnDate(const Checked<XALServer>& server, int32_t article, int32_t list, Date date);

}  // namespace xal::server
