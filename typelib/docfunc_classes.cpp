// Type-library entry of DocFunc: the creatable document-logic object, one line per member in
// interface order — the three host objects as properties (read, assigned, assigned by
// reference), then the lifecycle handlers, then the amount, quantity and tax handlers, then
// prices and discounts, then the header field validations.
#include "docfunc/docfunc.h"
#include "runtime/binding.h"

namespace xal {
namespace {

void RegisterDocFunc() {
  using D = DocFunc;
  ClassBuilder<D>("DocFunc").Creatable()
      .Get<&D::Doc>("Doc")
      .Put<&D::SetDoc>("Doc", {Param("Value")})
      .PutRef<&D::SetDoc>("Doc", {Param("Value")})
      .Get<&D::DocData>("DocData")
      .Put<&D::SetDocData>("DocData", {Param("Value")})
      .PutRef<&D::SetDocData>("DocData", {Param("Value")})
      .Get<&D::XALServer>("XALServer")
      .Put<&D::SetXALServer>("XALServer", {Param("Value")})
      .PutRef<&D::SetXALServer>("XALServer", {Param("Value")})
      .Method<&D::Create>("Create")
      .Method<&D::Destroy>("Destroy")
      .Method<&D::Doc_TestScript>("Doc_TestScript")
      .Method<&D::Doc_Initialize>("Doc_Initialize")
      .Method<&D::Doc_Show>("Doc_Show")
      .Method<&D::Doc_Valid>("Doc_Valid")
      .Method<&D::AddNewDocument>("AddNewDocument")
      .Method<&D::WhenDocument>("WhenDocument")
      .Method<&D::VDocument>("VDocument")
      .Method<&D::DelRow>("DelRow")
      .Method<&D::SetRowOB>("SetRowOB", {Param("pRowOB")})
      .Method<&D::DoHeaderRefresh>("DoHeaderRefresh")
      .Method<&D::AdjustAllAmounts>("AdjustAllAmounts")
      .Method<&D::RecomputeDocAmounts>("RecomputeDocAmounts")
      .Method<&D::WAmount>("WAmount")
      .Method<&D::WCost>("WCost")
      .Method<&D::WQuantity>("WQuantity")
      .Method<&D::WTaxAmount>("WTaxAmount")
      .Method<&D::WRowTaxAmount>("WRowTaxAmount")
      .Method<&D::WRowTax>("WRowTax")
      .Method<&D::WDealState>("WDealState")
      .Method<&D::WSeries>("WSeries")
      .Method<&D::WDRStoreRow>("WDRStoreRow")
      .Method<&D::VAmount>("VAmount")
      .Method<&D::VQuantity>("VQuantity")
      .Method<&D::VCost>("VCost")
      .Method<&D::VUnit>("VUnit")
      .Method<&D::VTax>("VTax")
      .Method<&D::VTaxAmount>("VTaxAmount")
      .Method<&D::VRowTax>("VRowTax")
      .Method<&D::VRowTaxAmount>("VRowTaxAmount")
      .Method<&D::VDocRow>("VDocRow")
      .Method<&D::DQuantity>("DQuantity")
      .Method<&D::DSeries>("DSeries")
      .Method<&D::DRowDiscount>("DRowDiscount")
      .Method<&D::VPriceList>("VPriceList", {Def("pAsk", true)})
      .Method<&D::VPriceCut>("VPriceCut", {Def("pAsk", true)})
      .Method<&D::WPriceCut>("WPriceCut")
      .Method<&D::VDiscount>("VDiscount")
      .Method<&D::FillPrice>("FillPrice", {Param("pRowOB")})
      .Method<&D::ComputePercentAmount>("ComputePercentAmount")
      .Method<&D::ComputePercentPricelist>("ComputePercentPricelist")
      .Method<&D::VDealState>("VDealState")
      .Method<&D::VGRDocSeries>("VGRDocSeries")
      .Method<&D::VReferenceNo>("VReferenceNo")
      .Method<&D::VDocDate>("VDocDate")
      .Method<&D::VDealDate>("VDealDate")
      .Method<&D::VTermPayment>("VTermPayment")
      .Method<&D::VPromptDate>("VPromptDate")
      .Method<&D::VTermDelivery>("VTermDelivery")
      .Method<&D::VDeliveryDate>("VDeliveryDate")
      .Method<&D::VCountry>("VCountry")
      .Method<&D::VGRDepartment>("VGRDepartment")
      .Method<&D::VWorker>("VWorker")
      .Method<&D::VGRProject>("VGRProject")
      .Method<&D::VRegisters>("VRegisters")
      .Method<&D::VGRBankAccount>("VGRBankAccount")
      .Method<&D::VGRCurrency>("VGRCurrency")
      .Method<&D::VCode>("VCode")
      .Method<&D::VCompanyName>("VCompanyName")
      .Method<&D::VCompanyAddr>("VCompanyAddr")
      .Method<&D::VGRCompany>("VGRCompany")
      .Method<&D::VPartner>("VPartner", {Def("pFill", Variant(int16_t{1}))});
}

const bool kRegistered = (RegisterDocFunc(), true);

}  // namespace
}  // namespace xal
