// Stock balance and cost of articles, in the two SQL dialects the connection's database kind
// selects. The cost options are read once per thread and kept until a call asks to reset them.
#pragma once

#include <cstdint>
#include <string>

#include "bridge/host_model.h"
#include "runtime/variant.h"

namespace xal::server {

double CountStockBalance(const Ref<XALConnect>& pXALConnect, int32_t pIDGRArticle, int32_t pIDDRStore = 0,
                         int32_t pIDDDStoreDRow = 0, bool pCountPreReservations = false, bool pCountSets = false);
Variant CountCost(const Ref<XALConnect>& pXALConnect, int32_t pIDGRArticle, int32_t pIDDRStore, int32_t pIDDoc = 0,
                  bool pResetOptions = false, const std::string& pArticleType = "X");

}  // namespace xal::server
