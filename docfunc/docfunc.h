// DocFunc: the document logic behind one open document form. The host hands it the form's script
// proxy (Doc), the form's data object (DocData) and the server object (XALServer) and calls
// Create, which configures the object for the kind of document; from then on the form's scripts
// call its handlers by name — lifecycle handlers, field handlers (V… after a field was entered,
// W… before it is edited, D… defaults), and commands registered as menu items.
// Every handler runs through one template (docfunc/handler.h): errors end the handler, are shown
// in the status line and never reach the script; refreshes and totals are deferred to the
// outermost handler. The bodies are split by topic: lifecycle.cpp, profile.cpp, amounts.cpp,
// quantities.cpp, taxes.cpp, totals.cpp, prices.cpp, header_fields.cpp with company.cpp and
// propagation.cpp.
// Ownership: the object holds Refs to the proxy, the data objects, the connection and the server
// until Destroy releases them; the host keeps its own references.
#pragma once

#include <cstdint>
#include <functional>
#include <string>

#include "bridge/host_model.h"
#include "bridge/proxy.h"
#include "docfunc/state.h"
#include "runtime/trap.h"
#include "runtime/variant.h"

namespace xal {

// The tax sums stored with a document (GDTax); zero for a document that is not stored yet.
struct StoredTaxes {
  Currency tax, taxBase, taxRef;
};

// Members in interface order.
class DocFunc : public Object {
 public:
  // ---- Properties -------------------------------------------------------------------------------
  Ref<XALSBEproxy> Doc() const { return st_.Doc.get(); }
  void SetDoc(const Ref<XALSBEproxy>& value) { st_.Doc = value; }
  Ref<xal::DataObject> DocData() const { return st_.DocData.get(); }
  void SetDocData(const Ref<xal::DataObject>& value) { st_.DocData = value; }
  Ref<xal::XALServer> XALServer() const { return st_.Server.get(); }
  void SetXALServer(const Ref<xal::XALServer>& value) { st_.Server = value; }

  // ---- Lifecycle --------------------------------------------------------------------------------
  // Configures the object for the kind of document behind DocData. Needs Doc, DocData, XALServer.
  void Create();
  // Releases every reference; no handler may be called afterwards.
  void Destroy();
  bool Doc_TestScript();
  bool Doc_Initialize();
  bool Doc_Show();
  bool Doc_Valid();
  bool AddNewDocument();
  bool WhenDocument();
  bool VDocument();
  bool DelRow();
  // Binds RowOB and RowsOB to another row set.
  void SetRowOB(Ref<xal::DataObject>& pRowOB);

  // ---- Amounts, quantities and taxes ------------------------------------------------------------
  bool DoHeaderRefresh();
  bool AdjustAllAmounts();
  bool RecomputeDocAmounts();
  bool WAmount();
  bool WCost();
  bool WQuantity();
  bool WTaxAmount();
  bool WRowTaxAmount();
  bool WRowTax();
  bool WDealState();
  bool WSeries();
  bool WDRStoreRow();
  bool VAmount();
  bool VQuantity();
  bool VCost();
  bool VUnit();
  bool VTax();
  bool VTaxAmount();
  bool VRowTax();
  bool VRowTaxAmount();
  bool VDocRow();
  Variant DQuantity();
  Variant DSeries();
  Variant DRowDiscount();

  // ---- Prices and discounts (prices.cpp) --------------------------------------------------------
  bool VPriceList(bool pAsk = true);
  bool VPriceCut(bool pAsk = true);
  bool WPriceCut();
  bool VDiscount();
  // Fills the price fields of one row from the company prices and the price lists.
  bool FillPrice(Ref<xal::DataObject>& pRowOB);
  bool ComputePercentAmount();
  bool ComputePercentPricelist();

  // ---- Header field validations (header_fields.cpp, company.cpp) --------------------------------
  bool VDealState();
  bool VGRDocSeries();
  bool VReferenceNo();
  bool VDocDate();
  bool VDealDate();
  bool VTermPayment();
  bool VPromptDate();
  bool VTermDelivery();
  bool VDeliveryDate();
  bool VCountry();
  bool VGRDepartment();
  bool VWorker();
  bool VGRProject();
  bool VRegisters();
  bool VGRBankAccount();
  bool VGRCurrency();
  bool VCode();
  bool VCompanyName();
  bool VCompanyAddr();
  bool VGRCompany();
  // pFill 0: names, address and bank account only; 1: the partner's values override the
  // company's; 2: they fill only what the company leaves empty.
  bool VPartner(int16_t pFill = 1);

  // ---- For the host and tests (not in the type library) ----------------------------------------
  const DocState& State() const { return st_; }
  // The credit-limit check (company.cpp): mode 0 warns when a company is chosen; any other mode
  // is the save-time check, which asks whether to save. False only when the user declines to save
  // a document over the limit.
  bool VerifyCreditLimit(int16_t mode);

 private:
  // ---- The handler template (handler.h, handler.cpp) -------------------------------------------
  enum class ResultRule {
    AsLastSet,       // the result as the body last set it, also after an error
    TrueAfterLeave,  // True once the leave step ran, whatever happened in the body
  };
  template <class T, class F>
  T RunHandler(const char* name, T start, ResultRule rule, F&& body);
  // A boolean handler: starts False; the body sets its result through the reference.
  template <class F>
  bool Handle(const char* name, F&& body);
  // A boolean handler that returns True even when its body failed.
  template <class F>
  bool HandleAlwaysTrue(const char* name, F&& body);
  // A default-value handler: starts Empty.
  template <class F>
  Variant HandleDefault(const char* name, F&& body);
  void EnterHandler(const std::string& Name);
  void LeaveHandler(const std::string& Name, const TrappedError& error);
  void RunDeferredWork(const std::string& Name);
  void ReportError(const std::string& Name, const TrappedError& error);
  // Whether a header change is carried into the rows (see handler.cpp).
  bool CarryToRows(const std::string& key, const std::string& question);

  // ---- Options and small reads shared by all topics ---------------------------------------------
  Variant UserOption(const std::string& section, const std::string& key, const Variant& defaultValue);
  Variant SystemOption(const std::string& section, const std::string& key, const Variant& defaultValue);
  // A read-only snapshot of an SQL query on its first row; never Nothing (error 91 instead).
  Ref<xal::DataObject> OpenQuery(const std::string& sql);
  Ref<ParamList> NewParams();
  // A keyed host message ("Err_DocDateMissing") in the current language.
  std::string HostText(const std::string& key);
  void Status(const std::string& text);

  // ---- Profile (profile.cpp) --------------------------------------------------------------------
  void ApplyDefaults();
  void ApplyProfile();
  void ApplyClosingSteps();
  void FillValueLists();
  void FillRegisterLists();
  void BindRowForm();

  // ---- Header validations (propagation.cpp, header_fields.cpp, company.cpp) --------------------
  // Whether rows are bound and hold at least one row.
  bool HasRows();
  // Writes `value` into `field` of every row, the component rows of a set row first.
  void PropagateToRows(const std::string& field, const Variant& value);
  // The register question: the header's `headerField` carried into the rows' `rowField` when the
  // user agrees; `noun` is the UI text that names the registers in the question.
  void CarryRegisterToRows(const std::string& headerField, int32_t noun, const std::string& rowField);
  // Steps 1-4 of the date validation on the header's `field`; False when the date is refused.
  bool DateAccepted(const std::string& field, const std::string& missingKey, const std::string& closedKey);
  // Shows a company's message; True when its marker refuses the company on this kind.
  bool ShowCompanyMessage(const std::string& field);
  bool CheckCompanyChange();
  void FillFromCompany(int32_t company);
  void RefillFromCompany();
  int32_t SavedPriceCategory();
  void FillFromPartner(int16_t pFill);
  void TakePriceListMode();
  void ResetExchangeRates();

  // ---- Lifecycle helpers (lifecycle.cpp) --------------------------------------------------------
  void SetNewDocDefaults();
  std::string OptionName();
  bool IsEmptyRow();
  bool HasDuplicate();
  void UnlockDocument();
  bool CompanyMessageBlocks();
  bool CheckOnHand();
  std::string CodeOf(const std::string& table, int32_t id);
  void RunHeaderHandler(const char* name);

  // ---- Amounts, quantities, taxes and totals (amounts.cpp, quantities.cpp, taxes.cpp, totals.cpp)
  void ComputeDocTotals(bool Full);
  bool RecomputeRows(bool Full);
  bool RecomputeRow(Ref<xal::DataObject>& Row, bool Full);
  void ResetDiscountChecks();
  // The header totals WhenDocument builds: a full pass in the document currency, and the base and
  // reference totals from the stored taxes. Must not run WhenDocument itself.
  void InitialTotals(const StoredTaxes& taxes);
  // The quantity `quantity` of unit `unit` in unit `baseUnit`, through the units' relations.
  double UnitToBase(double quantity, int32_t unit, int32_t baseUnit);
  // The top of a unit's chain of first units, and how many of it the unit holds.
  struct UnitChain {
    int32_t top;
    double factor;
  };
  UnitChain ChainOfUnit(int32_t unit);
  // Totals (totals.cpp).
  void IncrementalTotals(Currency& net, Currency& tax);
  void FullTotals(Currency& net, Currency& tax, bool currentRowFlips);
  void WriteTotals(Currency net, Currency tax);
  void WriteColumnTotals();
  void WriteCurrencyTotals(const std::string& suffix, Currency storedTax);
  bool InDelRow() const;
  // Rows and the particulars of set rows (taxes.cpp).
  std::string CompletionType(xal::DataObject& row);
  void ForEachPart(const std::function<void(Ref<xal::DataObject>&)>& step);
  void ForEachRowAndPart(const std::function<void(xal::DataObject&)>& step);
  void SetRowTax(xal::DataObject& row, int32_t tax, Currency factor);
  void ClearRowTaxes(xal::DataObject& row);
  // Row amounts and figures (amounts.cpp).
  void ComputeRowAmount(xal::DataObject& row, bool Full);
  Currency CutAmount(xal::DataObject& row, double listAmount);
  bool PriceIsCutFree() const;
  // A value of the price-category pair of the row's article and the document's company
  // (GRPriceCatRel: "PriceCut", "MinMarkup"); Empty when no pair applies.
  Variant CategoryPairValue(xal::DataObject& row, const std::string& column);
  void ShowRowFigures(xal::DataObject& row);
  double UnitPriceWithTax(xal::DataObject& row, Currency amount, double quantity);
  void SetMargins(xal::DataObject& row);
  void CheckMinimumMarkup(xal::DataObject& row, double quantity);
  // Quantities (quantities.cpp).
  void SetStatQuantities(xal::DataObject& row, double baseQuantity);
  void CheckMinimumQuantity(xal::DataObject& row, double baseQuantity);
  bool CreditRowAmount(xal::DataObject& row, double baseQuantity);
  bool OrderRowAmount(xal::DataObject& row, double baseQuantity);
  void SpreadSetCost(xal::DataObject& row);
  bool CheckLotQuantities(xal::DataObject& row);

  // ---- Prices (prices.cpp) ----------------------------------------------------------------------
  // The price look-up for an article: fills CompanyPriceRow, PriceListRow and the look-up flags.
  void LookUpPriceOnce(int32_t article);
  void LookUpPrice(int32_t article);
  Date PriceDate();
  Ref<xal::DataObject> CompanyPrice(int32_t article, int32_t company, Date date);
  int32_t OrdinaryPriceList(int32_t article);
  // The first price row valid on `date` in the chain from `list`; nullptr when there is none.
  Ref<xal::DataObject> PriceRowInChain(int32_t article, int32_t list, Date date);
  int32_t PriceListOnDate(int32_t list, Date date, int32_t& next);
  // How many of the article's unit one price unit holds.
  double UnitFactor(int32_t articleUnit, int32_t priceUnit);
  void FillCompanyPrice(xal::DataObject& row);
  void FillListPrice(xal::DataObject& row);
  bool KeepsAmount(xal::DataObject& row);
  void DiscountRow(Ref<xal::DataObject>& row);
  void RederivePrice(xal::DataObject& row);
  bool ComputePercent(int32_t title, bool fromPriceList);
  void ChangeByPercent(xal::DataObject& row, double factor, bool fromPriceList);
  double CategoryCut(xal::DataObject& row);

  DocState st_;
};

}  // namespace xal
