// The check that the kept current balances equal their defining views: every key of either side,
// with its quantities (to 1e-7: both sides keep 9 decimals), value and cost.
#pragma once

#include <string>
#include <vector>

#include "host/database.h"
#include "runtime/convert.h"

namespace xal::host::testing {

// "stock 1/2" or "reserve 5/2" for each key where the kept table and its view differ.
inline std::vector<std::string> BalanceMismatches(Database& db) {
  auto keys = [&](const char* label, const std::string& sql) {
    std::vector<std::string> out;
    for (auto& r : db.Query(sql).rows) out.push_back(std::string(label) + " " + CStr(r[0]) + "/" + CStr(r[1]));
    return out;
  };
  const std::string differs =
      "abs(T.Quantity - V.Quantity) > 1e-7 OR abs(T.RQuantity - V.RQuantity) > 1e-7 "
      "OR abs(T.PQuantity - V.PQuantity) > 1e-7";
  auto sides = [&](const std::string& kept, const std::string& view, const std::string& on, const std::string& more) {
    return "SELECT V.K1, V.K2 FROM (SELECT *, " + on + " FROM " + view + ") V LEFT JOIN (SELECT *, " + on +
           " FROM " + kept + ") T USING (K1, K2) WHERE T.K1 IS NULL OR " + differs + more +
           " UNION SELECT T.K1, T.K2 FROM (SELECT *, " + on + " FROM " + kept + ") T LEFT JOIN (SELECT *, " + on +
           " FROM " + view + ") V USING (K1, K2) WHERE V.K1 IS NULL";
  };
  std::vector<std::string> out = keys(
      "stock", sides("DCurBalanceStore", "vCurBalanceStore", "IDGRArticle K1, IDDRStore K2",
                     " OR abs(T.AltQuantity - V.AltQuantity) > 1e-7 OR abs(T.RAltQuantity - V.RAltQuantity) > 1e-7"
                     " OR abs(T.PAltQuantity - V.PAltQuantity) > 1e-7 OR abs(T.AmountBase - V.AmountBase) > 1e-6"
                     " OR abs(T.Cost - V.Cost) > 1e-6"));
  for (std::string& k : keys("reserve", sides("DCurDRStockReserve", "vCurDRStockReserve",
                                              "IDDRStockReserve K1, IDDRStore K2",
                                              " OR T.IDGRArticle <> V.IDGRArticle")))
    out.push_back(std::move(k));
  return out;
}

}  // namespace xal::host::testing
