// Type-library entry of ServerFunctions: the creatable facade of the server module, one line per
// member in interface order, with the interface's parameter names, optional flags and defaults.
// By-reference parameters are the non-const references of the C++ signatures.
#include "runtime/binding.h"
#include "server/server_functions.h"

namespace xal {
namespace {

void RegisterServerFunctions() {
  using S = ServerFunctions;
  ClassBuilder<S>("ServerFunctions").Creatable()
      .Get<&S::Self>("ServerFunctions")
      .Method<&S::Execute>("Execute", {Param("pName"), Param("pParams")})
      .Method<&S::CheckCategory>("CheckCategory", {Param("pXALConnect"), Param("pTableName"), Param("pID"), Param("pCatID")})
      .Method<&S::Bin2File>("Bin2File", {Param("pFileName"), Param("pBinData")})
      .Method<&S::File2Bin>("File2Bin", {Param("pFileName")})
      .Method<&S::SQLDelete>("SQLDelete", {Param("pXALConnect"), Param("pSQLString"), Opt("pOptions")})
      .Method<&S::CountBankBalance>("CountBankBalance", {Param("pXALConnect"), Param("pIDGRBankAccount"), Param("pDocDate")})
      .Method<&S::CountCashBalance>("CountCashBalance", {Param("pXALConnect"), Param("pIDVRCashDesk"), Param("pDocDate")})
      .Method<&S::CountStockBalance>("CountStockBalance", {Param("pXALConnect"), Param("pIDGRArticle"), Def("pIDDRStore", 0),
                                                           Def("pIDDDStoreDRow", 0), Def("pCountPreReservations", false),
                                                           Def("pCountSets", false)})
      .Method<&S::AggrRec>("AggrRec", {Param("pObj"), Param("pObjID"), Param("pParams")})
      .Method<&S::SetTargetFigure>("SetTargetFigure", {Param("pSourceString")})
      .Method<&S::Round>("Round", {Param("pInVal"), Opt("pPos")})
      .Method<&S::SQLDate>("SQLDate", {Param("pInDate"), Opt("pWithTime")})
      .Method<&S::CurRate>("CurRate", {Param("pXALConnect"), Param("pCurID"), Opt("pRateDate")})
      .Method<&S::ConvertWithRates>("ConvertWithRates", {Param("pAmount"), Param("pRate1"), Opt("pRate2"), Opt("pRefAmount"),
                                                         Opt("pIsTriangulation")})
      .Method<&S::Convert>("Convert", {Param("pXALConnect"), Param("pCurID"), Param("pConvDate"), Param("pAmount"),
                                       Opt("pRefAmount")})
      .Method<&S::SQLDouble>("SQLDouble", {Param("pNum")})
      .Method<&S::InWhereStr>("InWhereStr", {Param("pString1"), Param("pString2"), Def("pStart", 1)})
      .Method<&S::GetRowName>("GetRowName", {Param("pDocName")})
      .Method<&S::GetIDFieldName>("GetIDFieldName", {Param("pDocName")})
      .Method<&S::GetSysName>("GetSysName", {Param("pDocName")})
      .Method<&S::GetBalanceDate>("GetBalanceDate", {Param("pXALConnect"), Param("pDocDate"), Param("pBalanceName")})
      .Method<&S::ComputePenalty>("ComputePenalty", {Param("pAmount"), Param("pPDate"), Opt("pPromptDate"),
                                                     Opt("pPenaltyPercent"), Opt("pIDGDPrompDate"), Opt("pXALConnect")})
      .Method<&S::ComputeWDays>("ComputeWDays", {Param("pDate1"), Param("pDate2")})
      .Method<&S::GetEmployeeID>("GetEmployeeID", {Param("pXALConnect")})
      .Method<&S::GetDXCode>("GetDXCode", {Param("pObj")})
      .Method<&S::VerbalSum>("VerbalSum", {Param("pToConvert"), Param("pConvLang"), Param("pCurCode"), Def("pUpperCase", true),
                                           Def("pOtherDollar", ""), Def("pOtherCent", "")})
      .Method<&S::ArraySort>("ArraySort", {Param("pArray")})
      .Method<&S::CountCost>("CountCost", {Param("pXALConnect"), Param("pIDGRArticle"), Param("pIDDRStore"), Def("pIDDoc", 0),
                                           Def("pResetOptions", false), Def("pArticleType", "X")})
      .Method<&S::GetTableFilter>("GetTableFilter", {Param("XALConnect"), Param("XALType"), Opt("IDListOnly"), Opt("Alias"),
                                                     Opt("SubSelect")})
      .Method<&S::CountCABalance>("CountCABalance", {Param("XALConnect"), Param("IDCRCapitalAssets"), Def("IDCADocRow", 0),
                                                     Opt("DocDate"), Opt("BasicCost"), Opt("BasicCostRef"),
                                                     Opt("DepreciatedCost"), Opt("DepreciatedCostRef"),
                                                     Opt("DepreciationRate"), Opt("DepreciationAmount"),
                                                     Opt("DepreciationAmountRef"), Opt("Quantity"), Opt("IDCALastRegRow")})
      .Method<&S::QueryCodeToID>("QueryCodeToID", {Param("pField"), Param("pCondition"), Param("pArgument"),
                                                   Param("pSourceTableOB"), Param("pQueryLinkTable")})
      .Method<&S::QueryIDToCode>("QueryIDToCode", {Param("pField"), Param("pCondition"), Param("pArgument"),
                                                   Param("pSourceTableOB"), Param("pQueryLinkTable")})
      .Method<&S::GetCompanyPrice>("GetCompanyPrice", {Param("pXALConnect"), Param("pIDGRArticle"), Param("pIDGRCompany"),
                                                       Opt("pDate")});
}

const bool kRegistered = (RegisterServerFunctions(), true);

}  // namespace
}  // namespace xal
