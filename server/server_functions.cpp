// The ServerFunctions facade: one forwarding body per member, in interface order, plus Execute,
// the name-dispatched entry point that installs the caller's callback for the span of the call.
// Members trap nothing themselves; whether an error reaches the caller is the operation's affair.
#include "server/server_functions.h"

#include "runtime/convert.h"
#include "runtime/text.h"
#include "runtime/trap.h"
#include "server/aggregation.h"
#include "server/array_sort.h"
#include "server/balances.h"
#include "server/ca_balance.h"
#include "server/company_price.h"
#include "server/currency.h"
#include "server/files.h"
#include "server/module_state.h"
#include "server/period_closing.h"
#include "server/sql_utils.h"
#include "server/stock.h"
#include "server/table_filters.h"
#include "server/verbal_sum.h"

namespace xal {

namespace {

// Clears the thread's current callback when Execute leaves, however it leaves.
class CallbackScope {
 public:
  CallbackScope() = default;
  CallbackScope(const CallbackScope&) = delete;
  CallbackScope& operator=(const CallbackScope&) = delete;
  ~CallbackScope() { server::CurrentCallback().reset(); }
};

// Installs the "CallBack" entry of the list as the current callback. A missing entry leaves it
// empty; an entry that is not a callback object is an error, which Execute skips like any other.
void InstallCallback(const Ref<ParamList>& params) {
  if (!params || !params->Exists("CallBack")) return;
  const Variant item = params->Item("CallBack");
  if (!item.IsObject()) Raise(kErrTypeMismatch);
  auto callback = std::dynamic_pointer_cast<IXALCallback>(item.AsObject());
  if (item.AsObject() && !callback) Raise(kErrTypeMismatch);
  server::CurrentCallback() = std::move(callback);
}

}  // namespace

Ref<ServerFunctions> ServerFunctions::Self() { return RefTo(*this); }

Variant ServerFunctions::Execute(const std::string& pName, Ref<ParamList>& pParams) {
  const Ref<ParamList> params = pParams;
  CallbackScope scope;
  // Execute never fails: a step that raises is skipped. A closing that fails answers False, so a
  // caller can never mistake a failure for a closed period.
  TryStep([&] { InstallCallback(params); });
  if (!TextEquals(pName, "ClosePeriod")) return Variant();
  return Variant(TryOr([&] { return server::ClosePeriod(params); }, false));
}

bool ServerFunctions::CheckCategory(Ref<XALConnect>& pXALConnect, const std::string& pTableName, int32_t pID,
                                    int32_t pCatID) {
  const Ref<XALConnect> conn = pXALConnect;
  return server::CheckCategory(conn, pTableName, pID, pCatID);
}

bool ServerFunctions::Bin2File(const std::string& pFileName, Variant& pBinData) {
  const Variant data = pBinData;
  return server::Bin2File(pFileName, data);
}

Variant ServerFunctions::File2Bin(const std::string& pFileName) { return server::File2Bin(pFileName); }

bool ServerFunctions::SQLDelete(Ref<XALConnect>& pXALConnect, const std::string& pSQLString, int32_t pOptions) {
  const Ref<XALConnect> conn = pXALConnect;
  return server::SQLDelete(conn, pSQLString, pOptions);
}

Currency ServerFunctions::CountBankBalance(const Ref<XALConnect>& pXALConnect, int32_t pIDGRBankAccount,
                                           Date pDocDate) {
  return server::CountBankBalance(pXALConnect, pIDGRBankAccount, pDocDate);
}

Currency ServerFunctions::CountCashBalance(const Ref<XALConnect>& pXALConnect, int32_t pIDVRCashDesk, Date pDocDate) {
  return server::CountCashBalance(pXALConnect, pIDVRCashDesk, pDocDate);
}

double ServerFunctions::CountStockBalance(const Ref<XALConnect>& pXALConnect, int32_t pIDGRArticle, int32_t pIDDRStore,
                                          int32_t pIDDDStoreDRow, bool pCountPreReservations, bool pCountSets) {
  return server::CountStockBalance(pXALConnect, pIDGRArticle, pIDDRStore, pIDDDStoreDRow, pCountPreReservations,
                                   pCountSets);
}

bool ServerFunctions::AggrRec(Ref<DataObject>& pObj, int32_t pObjID, Ref<ParamList>& pParams) {
  const Ref<DataObject> obj = pObj;
  const Ref<ParamList> params = pParams;
  return server::AggrRec(obj, pObjID, params);
}

std::string ServerFunctions::SetTargetFigure(std::string& pSourceString) {
  const std::string source = pSourceString;
  return server::SetTargetFigure(source);
}

Variant ServerFunctions::Round(Variant& pInVal, int16_t& pPos) {
  const Variant value = pInVal;
  return server::Round(value, pPos);
}

std::string ServerFunctions::SQLDate(const Variant& pInDate, bool pWithTime) {
  return server::SQLDate(pInDate, pWithTime);
}

double ServerFunctions::CurRate(const Ref<XALConnect>& pXALConnect, int32_t pCurID, Date pRateDate) {
  return server::CurRate(pXALConnect, pCurID, pRateDate);
}

Currency ServerFunctions::ConvertWithRates(Currency pAmount, double pRate1, double pRate2, bool pRefAmount,
                                           bool pIsTriangulation) {
  return server::ConvertWithRates(pAmount, pRate1, pRate2, pRefAmount, pIsTriangulation);
}

Currency ServerFunctions::Convert(const Ref<XALConnect>& pXALConnect, int32_t pCurID, Date pConvDate,
                                  Currency pAmount, Currency& pRefAmount) {
  // pRefAmount is an output: the operation writes the other currency's amount into it.
  return server::Convert(pXALConnect, pCurID, pConvDate, pAmount, pRefAmount);
}

std::string ServerFunctions::SQLDouble(const Variant& pNum) { return server::SQLDouble(pNum); }

int16_t ServerFunctions::InWhereStr(const std::string& pString1, const std::string& pString2, int32_t pStart) {
  return server::InWhereStr(pString1, pString2, pStart);
}

std::string ServerFunctions::GetRowName(const std::string& pDocName) { return server::GetRowName(pDocName); }

std::string ServerFunctions::GetIDFieldName(const std::string& pDocName) { return server::GetIDFieldName(pDocName); }

std::string ServerFunctions::GetSysName(const std::string& pDocName) { return server::GetSysName(pDocName); }

Variant ServerFunctions::GetBalanceDate(Ref<XALConnect>& pXALConnect, Date pDocDate, const std::string& pBalanceName) {
  const Ref<XALConnect> conn = pXALConnect;
  return server::GetBalanceDate(conn, pDocDate, pBalanceName);
}

double ServerFunctions::ComputePenalty(double pAmount, Date pPDate, Date pPromptDate, double pPenaltyPercent,
                                       int32_t pIDGDPrompDate, Ref<XALConnect>& pXALConnect) {
  const Ref<XALConnect> conn = pXALConnect;
  return server::ComputePenalty(pAmount, pPDate, pPromptDate, pPenaltyPercent, pIDGDPrompDate, conn);
}

int32_t ServerFunctions::ComputeWDays(Date pDate1, Date pDate2) { return server::ComputeWDays(pDate1, pDate2); }

int32_t ServerFunctions::GetEmployeeID(Ref<XALConnect>& pXALConnect) {
  const Ref<XALConnect> conn = pXALConnect;
  return server::GetEmployeeID(conn);
}

std::string ServerFunctions::GetDXCode(Ref<DataObject>& pObj) {
  const Ref<DataObject> obj = pObj;
  return server::GetDXCode(obj);
}

std::string ServerFunctions::VerbalSum(const Variant& pToConvert, const std::string& pConvLang,
                                       const std::string& pCurCode, bool pUpperCase, const std::string& pOtherDollar,
                                       const std::string& pOtherCent) {
  return server::VerbalSum(pToConvert, pConvLang, pCurCode, pUpperCase, pOtherDollar, pOtherCent);
}

// Sorts the caller's array in place: the one member whose by-reference argument is its result.
void ServerFunctions::ArraySort(Variant& pArray) { server::ArraySort(pArray); }

Variant ServerFunctions::CountCost(const Ref<XALConnect>& pXALConnect, int32_t pIDGRArticle, int32_t pIDDRStore,
                                   int32_t pIDDoc, bool pResetOptions, const std::string& pArticleType) {
  return server::CountCost(pXALConnect, pIDGRArticle, pIDDRStore, pIDDoc, pResetOptions, pArticleType);
}

std::string ServerFunctions::GetTableFilter(Ref<XALConnect>& xalConnect, std::string& xalType, bool& idListOnly,
                                            std::string& alias, bool& subSelect) {
  const Ref<XALConnect> conn = xalConnect;
  return server::GetTableFilter(conn, xalType, idListOnly, alias, subSelect);
}

bool ServerFunctions::CountCABalance(const Ref<XALConnect>& xalConnect, int32_t idCRCapitalAssets,
                                     int32_t idCADocRow, Date docDate, Currency& basicCost, Currency& basicCostRef,
                                     Currency& depreciatedCost, Currency& depreciatedCostRef,
                                     double& depreciationRate, Currency& depreciationAmount,
                                     Currency& depreciationAmountRef, double& quantity, int32_t& idCALastRegRow) {
  server::CABalance b{basicCost,          basicCostRef,          depreciatedCost, depreciatedCostRef,
                      depreciationRate,   depreciationAmount,    depreciationAmountRef,
                      quantity,           idCALastRegRow};
  const bool ok = server::CountCABalance(xalConnect, idCRCapitalAssets, idCADocRow, docDate, b);
  // The outputs are written back only when the operation returns; a failure leaves them as given.
  basicCost = b.basicCost;
  basicCostRef = b.basicCostRef;
  depreciatedCost = b.depreciatedCost;
  depreciatedCostRef = b.depreciatedCostRef;
  depreciationRate = b.depreciationRate;
  depreciationAmount = b.depreciationAmount;
  depreciationAmountRef = b.depreciationAmountRef;
  quantity = b.quantity;
  idCALastRegRow = b.idCALastRegRow;
  return ok;
}

std::string ServerFunctions::QueryCodeToID(const std::string& pField, const std::string& pCondition,
                                           const std::string& pArgument, const Ref<DataObject>& pSourceTableOB,
                                           const std::string& pQueryLinkTable) {
  return server::QueryCodeToID(pField, pCondition, pArgument, pSourceTableOB, pQueryLinkTable);
}

std::string ServerFunctions::QueryIDToCode(const std::string& pField, const std::string& pCondition,
                                           const std::string& pArgument, const Ref<DataObject>& pSourceTableOB,
                                           const std::string& pQueryLinkTable) {
  return server::QueryIDToCode(pField, pCondition, pArgument, pSourceTableOB, pQueryLinkTable);
}

Currency ServerFunctions::GetCompanyPrice(const Ref<XALConnect>& pXALConnect, int32_t pIDGRArticle,
                                          int32_t pIDGRCompany, Date pDate) {
  return server::GetCompanyPrice(pXALConnect, pIDGRArticle, pIDGRCompany, pDate);
}

}  // namespace xal
