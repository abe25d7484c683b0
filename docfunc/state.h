// The state of one DocFunc object: what Create derives from the document kind, the bindings to the
// form's data objects, the handler call stack with its deferred refresh flags, and the working
// fields the handlers share while the user edits. Every docfunc/*.cpp reads and writes it under
// the names the handlers use, so a flag set by one topic (a field validation) is the flag another
// topic (the totals) tests. Defaults here are the ones an object has before Create runs.
// Ownership: the object references are owning; Destroy (DocFunc::Destroy) releases them all.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "bridge/host_model.h"
#include "bridge/proxy.h"
#include "runtime/currency.h"
#include "runtime/trap.h"
#include "runtime/variant.h"

namespace xal {

struct DocState {
  // ---- The objects the host hands over ----------------------------------------------------------
  Checked<XALSBEproxy> Doc;
  Checked<DataObject> DocData;
  Checked<xal::XALServer> Server;  // the property XALServer

  // ---- Bindings ---------------------------------------------------------------------------------
  std::string RowTable, DocTable, RefType, DocName;
  Checked<DataObject> RowOB, HeaderOB, RowsOB;
  // Transient bindings of the set and reservation code, released by Destroy with the others.
  Checked<DataObject> SetRowsOB, TransientOB, TransientRowOB;

  // ---- Field names that differ by document kind -------------------------------------------------
  std::string PriceListField = "IDGRPriceList";
  std::string CompanyFieldSuffix;  // "" on sales documents, "P" on the supplier side
  std::string UnitPriceField = "UnitPrice", PriceField = "Price";
  std::string PriceListIDField = "IDGRPriceList", CPriceListField = "IDGRCPriceList";
  int16_t DocDateLimit = 0;

  // ---- Profile flags ----------------------------------------------------------------------------
  bool UseCampaignStock = false, UsePriceCat = false, UseTermDelivery = false, UseTermPayment = false;
  bool ComputePrices = false, UseSets = false, UseRowTax = false, UseTax = false, DefaultTax = false;
  bool UseClientCard = false, IsStoreRow = false, IsAssetRow = false, IsStockDoc = false;
  bool UsesStockReserve = false, UsesReserveRel = false;
  std::string ReserveTable;  // "DRStockReserve" or "DRStockReserveRel"; "" when neither flag is set
  int16_t FillReserveFifo = 0;
  bool UseDeliveryDate = false;
  bool SetRefillPending = false;  // the set rows are to be refilled from their definition
  bool SetFillRunning = false;    // a fill of set rows is in progress
  bool DropEmptyRows = false;
  bool IsSales = false, ComputeTotals = false, UseDiscounts = false, UseProductionCost = false;
  bool NewDocPending = false, NewDocument = false, IsPurchase = false;

  // ---- Options read once by Create --------------------------------------------------------------
  bool CheckStockReserve = false;
  int16_t ComputeSetQuantity = 0;
  bool CheckLotReserve = false, CheckCreditLimit = false, MinQuantityMessage = false;
  bool CreatePreReservation = false, CostByStore = false, StockReservePreReservation = false;
  bool UseCompanyMessage = false, CompanyMessageDoc = false, TaxQuestionOff = false;
  bool CostRows = false;
  std::string RowValueField = "Cost";
  bool CheckCreditRows = true, AmountFromOrder = false, UseStatFields = false, PriceByOrderedQuantity = false;

  // ---- Row field names --------------------------------------------------------------------------
  std::string ArticleField = "IDGRArticle", StoreField = "IDDRStore", DepartmentField = "IDGRDepartment";
  std::string ProjectField = "IDGRProject", WorkerField = "IDWorker";
  std::string ARegisterField = "IDGARegister", BRegisterField = "IDGBRegister";
  std::string CompletionTypeField = "CompletionType", UnitField = "GRArticle.IDGRUnit";
  int16_t RoundingQuantity = 0;

  // ---- Handler call stack -----------------------------------------------------------------------
  int16_t CallDepth = 0;
  std::string CallName;
  std::vector<Variant> RowMarks = std::vector<Variant>(11);  // bounds 0 to 10; grown by 10

  // ---- Work deferred to the outermost handler ---------------------------------------------------
  bool RowRefreshPending = false, RowsRecalcPending = false, HeaderRefreshPending = false;
  bool BrowserRefreshPending = false, TotalsPending = false, FullTotalsPending = false;

  bool RecalcRowsAnswer = false, IsRowArea = false;
  Checked<XALConnect> Connect;
  int32_t UserID = 0;

  // ---- Values before the current edit -----------------------------------------------------------
  Currency OldAmount;    // the row "Amount"
  double OldQuantity = 0;  // the row "BaseQuantity"
  Currency OldRowTax;    // the row "TaxAmount" or its tax rate

  // ---- Price look-up of the current row ---------------------------------------------------------
  bool PriceIsGross = false;       // the list in use holds prices with tax
  bool PriceNoCut = false;         // the list in use is not subject to price cuts
  bool QuantityPriceUsed = false;  // the last price came from a quantity step
  int32_t PriceListID = 0;
  bool CompanyListUsed = false;    // the company's or partner's own list was used
  bool CompanyPriceFound = false;  // a certified company price was found
  Ref<DataObject> CompanyPriceRow, PriceListRow;

  bool HasQuantityPrices = false, TwoStores = false;
  bool TotalsReady = false, RowTaxEntered = false;
  // Values of price-category pairs looked up while RecomputeRows runs, by column, article
  // category, company category and price list: a document of many rows asks for few pairs.
  std::map<std::string, Variant> PairValues;
  bool KeepPairValues = false;
  // The price look-up of each article while RecomputeRows runs: the header (company, partner,
  // list, date) does not change during the run, so the look-up depends on the article alone.
  struct PriceLookUp {
    Ref<DataObject> companyRow, listRow;
    bool companyFound = false, companyListUsed = false, gross = false, noCut = false;
  };
  std::map<int32_t, PriceLookUp> PriceLookUps;

  // ---- Bookkeeping of the handler template ------------------------------------------------------
  ObjectRef Evaluator;  // the expression evaluator, created on first use
  bool EnterGuard = false, LeaveGuard = false;
};

}  // namespace xal
