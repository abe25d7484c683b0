// ServerFunctions: the public, creatable class through which host scripts reach the server
// module's business functions. It holds no state: every member copies its arguments, calls the
// module operation of the same name and returns that result unchanged, so DocFunc's handlers,
// which call the operations directly, and scripts, which come through here, share one
// implementation. Host objects passed in stay owned by the host; a member holds them only for the
// span of its call.
#pragma once

#include <cstdint>
#include <string>

#include "bridge/host_model.h"
#include "runtime/currency.h"
#include "runtime/date.h"
#include "runtime/variant.h"

namespace xal {

// Members in interface order. By-reference parameters of the interface are non-const references.
class ServerFunctions : public Object {
 public:
  Ref<ServerFunctions> Self();  // the property "ServerFunctions": the object itself
  // Runs the operation `pName` ("ClosePeriod") with its arguments in `pParams`; never fails.
  Variant Execute(const std::string& pName, Ref<ParamList>& pParams);
  bool CheckCategory(Ref<XALConnect>& pXALConnect, const std::string& pTableName, int32_t pID, int32_t pCatID);
  bool Bin2File(const std::string& pFileName, Variant& pBinData);
  Variant File2Bin(const std::string& pFileName);
  bool SQLDelete(Ref<XALConnect>& pXALConnect, const std::string& pSQLString, int32_t pOptions);
  Currency CountBankBalance(const Ref<XALConnect>& pXALConnect, int32_t pIDGRBankAccount, Date pDocDate);
  Currency CountCashBalance(const Ref<XALConnect>& pXALConnect, int32_t pIDVRCashDesk, Date pDocDate);
  double CountStockBalance(const Ref<XALConnect>& pXALConnect, int32_t pIDGRArticle, int32_t pIDDRStore,
                           int32_t pIDDDStoreDRow, bool pCountPreReservations, bool pCountSets);
  bool AggrRec(Ref<DataObject>& pObj, int32_t pObjID, Ref<ParamList>& pParams);
  std::string SetTargetFigure(std::string& pSourceString);
  Variant Round(Variant& pInVal, int16_t& pPos);
  std::string SQLDate(const Variant& pInDate, bool pWithTime);
  double CurRate(const Ref<XALConnect>& pXALConnect, int32_t pCurID, Date pRateDate);
  Currency ConvertWithRates(Currency pAmount, double pRate1, double pRate2, bool pRefAmount, bool pIsTriangulation);
  Currency Convert(const Ref<XALConnect>& pXALConnect, int32_t pCurID, Date pConvDate, Currency pAmount,
                   Currency& pRefAmount);
  std::string SQLDouble(const Variant& pNum);
  int16_t InWhereStr(const std::string& pString1, const std::string& pString2, int32_t pStart);
  std::string GetRowName(const std::string& pDocName);
  std::string GetIDFieldName(const std::string& pDocName);
  std::string GetSysName(const std::string& pDocName);
  Variant GetBalanceDate(Ref<XALConnect>& pXALConnect, Date pDocDate, const std::string& pBalanceName);
  double ComputePenalty(double pAmount, Date pPDate, Date pPromptDate, double pPenaltyPercent,
                        int32_t pIDGDPrompDate, Ref<XALConnect>& pXALConnect);
  int32_t ComputeWDays(Date pDate1, Date pDate2);
  int32_t GetEmployeeID(Ref<XALConnect>& pXALConnect);
  std::string GetDXCode(Ref<DataObject>& pObj);
  std::string VerbalSum(const Variant& pToConvert, const std::string& pConvLang, const std::string& pCurCode,
                        bool pUpperCase, const std::string& pOtherDollar, const std::string& pOtherCent);
  void ArraySort(Variant& pArray);
  Variant CountCost(const Ref<XALConnect>& pXALConnect, int32_t pIDGRArticle, int32_t pIDDRStore, int32_t pIDDoc,
                    bool pResetOptions, const std::string& pArticleType);
  // These two keep the interface's unprefixed parameter names (XALConnect, XALType, …) in the type
  // library; in C++ they are spelled in lower camel case so they do not hide the host types.
  std::string GetTableFilter(Ref<XALConnect>& xalConnect, std::string& xalType, bool& idListOnly, std::string& alias,
                             bool& subSelect);
  bool CountCABalance(const Ref<XALConnect>& xalConnect, int32_t idCRCapitalAssets, int32_t idCADocRow, Date docDate,
                      Currency& basicCost, Currency& basicCostRef, Currency& depreciatedCost,
                      Currency& depreciatedCostRef, double& depreciationRate, Currency& depreciationAmount,
                      Currency& depreciationAmountRef, double& quantity, int32_t& idCALastRegRow);
  std::string QueryCodeToID(const std::string& pField, const std::string& pCondition, const std::string& pArgument,
                            const Ref<DataObject>& pSourceTableOB, const std::string& pQueryLinkTable);
  std::string QueryIDToCode(const std::string& pField, const std::string& pCondition, const std::string& pArgument,
                            const Ref<DataObject>& pSourceTableOB, const std::string& pQueryLinkTable);
  Currency GetCompanyPrice(const Ref<XALConnect>& pXALConnect, int32_t pIDGRArticle, int32_t pIDGRCompany,
                           Date pDate);
};

}  // namespace xal
