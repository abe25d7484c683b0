// Small operations around payments and balances: the balance of a bank account or a cash desk on a
// date, the last balance date of a balance table, a late-payment penalty, the working days between
// two dates, and the employee linked to the current user.
#pragma once

#include <cstdint>
#include <string>

#include "bridge/host_model.h"
#include "runtime/currency.h"
#include "runtime/date.h"
#include "runtime/variant.h"

namespace xal::server {

Currency CountBankBalance(const Ref<XALConnect>& pXALConnect, int32_t pIDGRBankAccount, Date pDocDate);
Currency CountCashBalance(const Ref<XALConnect>& pXALConnect, int32_t pIDVRCashDesk, Date pDocDate);
// The latest DocDate of `pBalanceName` before `pDocDate`: Null when there is none, Empty on error.
Variant GetBalanceDate(const Ref<XALConnect>& pXALConnect, Date pDocDate, const std::string& pBalanceName);
double ComputePenalty(double pAmount, Date pPDate, Date pPromptDate = Date(), double pPenaltyPercent = 0,
                      int32_t pIDGDPrompDate = 0, const Ref<XALConnect>& pXALConnect = nullptr);
int32_t ComputeWDays(Date pDate1, Date pDate2);
int32_t GetEmployeeID(const Ref<XALConnect>& pXALConnect);

}  // namespace xal::server
