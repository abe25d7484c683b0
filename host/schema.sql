-- Schema of the reference host's database. Dates are serial days (REAL, declared DATE), money is
-- REAL declared CURRENCY (read back as 4-decimal currency), flags are -1/0 integers declared BOOL,
-- text compares without regard to case and is never NULL; on DDStoreDRow a missing store is NULL.
-- Every non-identifier number has REAL affinity so that divisions never truncate.
-- The document row tables (DDStoreDRow, SDInvoiceRow, …, CADocRow) share one column list and are
-- made before this script by host/schema.cpp.

CREATE TABLE GDocument (
  ID INTEGER PRIMARY KEY,
  RefType TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DocName TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DocNo INTEGER NOT NULL DEFAULT 0,
  SourceDocNo TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  ReferenceNo TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DealState TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DocState TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IsCertified BOOL INTEGER NOT NULL DEFAULT 0,
  IsApproximated BOOL INTEGER NOT NULL DEFAULT 0,
  APInvoice BOOL INTEGER NOT NULL DEFAULT 0,
  DocDate DATE REAL NOT NULL DEFAULT 0,
  DealDate DATE REAL NOT NULL DEFAULT 0,
  PromptDate DATE REAL NOT NULL DEFAULT 0,
  DeliveryDate DATE REAL NOT NULL DEFAULT 0,
  ExchangeRate REAL NOT NULL DEFAULT 0,
  ExchangeRateRef REAL NOT NULL DEFAULT 0,
  PriceCut REAL NOT NULL DEFAULT 0,
  PenaltyPercent REAL NOT NULL DEFAULT 0,
  TotalAmount CURRENCY REAL NOT NULL DEFAULT 0,
  TotalAmountBase CURRENCY REAL NOT NULL DEFAULT 0,
  TotalAmountRef CURRENCY REAL NOT NULL DEFAULT 0,
  TaxAmount CURRENCY REAL NOT NULL DEFAULT 0,
  TaxAmountBase CURRENCY REAL NOT NULL DEFAULT 0,
  TaxAmountRef CURRENCY REAL NOT NULL DEFAULT 0,
  ApproxDifference CURRENCY REAL NOT NULL DEFAULT 0,
  ApproxDifferenceBase CURRENCY REAL NOT NULL DEFAULT 0,
  ApproxDifferenceRef CURRENCY REAL NOT NULL DEFAULT 0,
  CompanyName TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  CompanyAddr TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  PartnerName TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  PartnerAddr TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Country TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DeliveryLocation TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  PriceList TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Notes TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DocType TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDGRCompany INTEGER NOT NULL DEFAULT 0,
  IDPartner INTEGER NOT NULL DEFAULT 0,
  IDGRDocType INTEGER NOT NULL DEFAULT 0,
  IDGRDocSeries INTEGER NOT NULL DEFAULT 0,
  IDGRPriceList INTEGER NOT NULL DEFAULT 0,
  IDGRCPriceList INTEGER NOT NULL DEFAULT 0,
  IDDRStore INTEGER NOT NULL DEFAULT 0,
  IDSenderStore INTEGER NOT NULL DEFAULT 0,
  IDReceiverStore INTEGER NOT NULL DEFAULT 0,
  IDGARegister1 INTEGER NOT NULL DEFAULT 0,
  IDGARegister2 INTEGER NOT NULL DEFAULT 0,
  IDGARegister3 INTEGER NOT NULL DEFAULT 0,
  IDGARegister4 INTEGER NOT NULL DEFAULT 0,
  IDGARegister5 INTEGER NOT NULL DEFAULT 0,
  IDGBRegister1 INTEGER NOT NULL DEFAULT 0,
  IDGBRegister2 INTEGER NOT NULL DEFAULT 0,
  IDGBRegister3 INTEGER NOT NULL DEFAULT 0,
  IDGBRegister4 INTEGER NOT NULL DEFAULT 0,
  IDGBRegister5 INTEGER NOT NULL DEFAULT 0,
  IDXALUser INTEGER NOT NULL DEFAULT 0,
  IDGRCurrency INTEGER NOT NULL DEFAULT 0,
  IDGRTermPayment INTEGER NOT NULL DEFAULT 0,
  IDGRTermDelivery INTEGER NOT NULL DEFAULT 0,
  IDGRBankAccount INTEGER NOT NULL DEFAULT 0,
  IDPartnerBAcc INTEGER NOT NULL DEFAULT 0,
  IDGRCompContPerson INTEGER NOT NULL DEFAULT 0,
  IDGRCompanyPriceCat INTEGER NOT NULL DEFAULT 0,
  IDSalesManager INTEGER NOT NULL DEFAULT 0,
  IDPurchasingAgent INTEGER NOT NULL DEFAULT 0,
  IDGDPrompDate INTEGER NOT NULL DEFAULT 0,
  IDVRCashDesk INTEGER NOT NULL DEFAULT 0,
  -- What the document logic fills on a new or changed header: tax, worker, owner company and its
  -- bank account, the employee who made it, department, project, the article register, accounts,
  -- foreign-trade terms, and the documents a receipt or shipment follows.
  IDGRTax INTEGER NOT NULL DEFAULT 0,
  IDWorker INTEGER NOT NULL DEFAULT 0,
  IDOwner INTEGER NOT NULL DEFAULT 0,
  IDOwnerBAcc INTEGER NOT NULL DEFAULT 0,
  IDEREmployee INTEGER NOT NULL DEFAULT 0,
  IDGRDepartment INTEGER NOT NULL DEFAULT 0,
  IDGRProject INTEGER NOT NULL DEFAULT 0,
  IDGRArticle INTEGER NOT NULL DEFAULT 0,
  IDBRAccount INTEGER NOT NULL DEFAULT 0,
  IDPurchaseAccount INTEGER NOT NULL DEFAULT 0,
  IDDebtAccount INTEGER NOT NULL DEFAULT 0,
  IDDRIntrTermDelivery INTEGER NOT NULL DEFAULT 0,
  IDDRIntrTransport INTEGER NOT NULL DEFAULT 0,
  IDDRIntrCustomsProc INTEGER NOT NULL DEFAULT 0,
  IDPDInvoice INTEGER NOT NULL DEFAULT 0,
  IDPDOrder INTEGER NOT NULL DEFAULT 0,
  IDSDInvoice INTEGER NOT NULL DEFAULT 0,
  IDSDOrder INTEGER NOT NULL DEFAULT 0,
  Record_state TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
-- Store rows by article and store, for the balances.
CREATE INDEX DDStoreDRow_ArtRecv ON DDStoreDRow (IDGRArticle, IDReceiverStore);
CREATE INDEX DDStoreDRow_ArtSend ON DDStoreDRow (IDGRArticle, IDSenderStore);
CREATE TABLE SDInvoiceRowPenalty (
  ID INTEGER PRIMARY KEY,
  IDSDInvoiceRow INTEGER NOT NULL DEFAULT 0,
  Amount CURRENCY REAL NOT NULL DEFAULT 0,
  PenaltyDate DATE REAL NOT NULL DEFAULT 0
);
CREATE TABLE BRAccountingYear (
  ID INTEGER PRIMARY KEY,
  BeginDate DATE REAL NOT NULL DEFAULT 0,
  EndDate DATE REAL NOT NULL DEFAULT 0,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE GDTax (
  ID INTEGER PRIMARY KEY,
  IDGDocument INTEGER NOT NULL DEFAULT 0,
  IDGRTax INTEGER NOT NULL DEFAULT 0,
  TaxAmount CURRENCY REAL NOT NULL DEFAULT 0,
  TaxAmountBase CURRENCY REAL NOT NULL DEFAULT 0,
  TaxAmountRef CURRENCY REAL NOT NULL DEFAULT 0,
  Amount CURRENCY REAL NOT NULL DEFAULT 0,
  AmountBase CURRENCY REAL NOT NULL DEFAULT 0
);
CREATE TABLE GDocRel (
  ID INTEGER PRIMARY KEY,
  PrevDocName TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDPrevDoc INTEGER NOT NULL DEFAULT 0,
  NextDocName TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDNextDoc INTEGER NOT NULL DEFAULT 0
);
CREATE TABLE BBooking (
  ID INTEGER PRIMARY KEY,
  IsCertified BOOL INTEGER NOT NULL DEFAULT 0,
  DealDate DATE REAL NOT NULL DEFAULT 0,
  DocDate DATE REAL NOT NULL DEFAULT 0
);
-- An inventory computation (server command "DPInventoryB"): what was asked, and the quantity per
-- article and store it found; deleting the header deletes its rows.
CREATE TABLE DPInventoryB (
  ID INTEGER PRIMARY KEY,
  DocDate DATE REAL NOT NULL DEFAULT 0,
  IDDRStore INTEGER NOT NULL DEFAULT 0,
  IDXALUser INTEGER NOT NULL DEFAULT 0,
  Documents TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  GRArticleIDs TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  ReservedD BOOL INTEGER NOT NULL DEFAULT 0,
  CountPreReservations BOOL INTEGER NOT NULL DEFAULT 0,
  PreReservedD BOOL INTEGER NOT NULL DEFAULT 0,
  MakeReport BOOL INTEGER NOT NULL DEFAULT 0
);
CREATE TABLE DPInventoryBRow (
  ID INTEGER PRIMARY KEY,
  IDDPInventoryB INTEGER NOT NULL DEFAULT 0,
  IDGRArticle INTEGER NOT NULL DEFAULT 0,
  IDDRStore INTEGER NOT NULL DEFAULT 0,
  Quantity REAL NOT NULL DEFAULT 0,    -- what counts as on hand under the computation's switches
  RQuantity REAL NOT NULL DEFAULT 0,   -- of all stored rows: the reserved part (state R)
  PQuantity REAL NOT NULL DEFAULT 0    -- the pre-reserved part (state P)
);
CREATE INDEX DPInventoryBRow_Head ON DPInventoryBRow (IDDPInventoryB);
CREATE TRIGGER DPInventoryB_ad AFTER DELETE ON DPInventoryB BEGIN
  DELETE FROM DPInventoryBRow WHERE IDDPInventoryB = OLD.ID;
END;
CREATE TABLE GRArticle (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DXCode TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  ArticleType TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  QuantityType TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  CompletionTypeIn TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  CompletionTypeOut TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Country TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Record_state TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Cost CURRENCY REAL NOT NULL DEFAULT 0,
  NetMass REAL NOT NULL DEFAULT 0,
  MnQuantity REAL NOT NULL DEFAULT 0,
  IDGRUnit INTEGER NOT NULL DEFAULT 0,
  IDGRArticlePriceCat INTEGER NOT NULL DEFAULT 0,
  IDGRTax INTEGER NOT NULL DEFAULT 0,
  IDDRStore INTEGER NOT NULL DEFAULT 0,
  IDExpenseAccount INTEGER NOT NULL DEFAULT 0,
  IDRealAccount INTEGER NOT NULL DEFAULT 0,
  IDGRCompany INTEGER NOT NULL DEFAULT 0,
  IDDRIntrCNCode INTEGER NOT NULL DEFAULT 0,
  IsLot BOOL INTEGER NOT NULL DEFAULT 0,
  IsSerial BOOL INTEGER NOT NULL DEFAULT 0
);
CREATE UNIQUE INDEX GRArticle_Code ON GRArticle (Code);
CREATE TABLE GRCompany (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DXCode TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  LocationAddr TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DeliveryAddr TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  LegalAddr TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  ReferenceNo TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Message TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  CreditLimit CURRENCY REAL NOT NULL DEFAULT 0,
  IDSettlCompany INTEGER NOT NULL DEFAULT 0,
  IDGRCurrency INTEGER NOT NULL DEFAULT 0,
  IDGRTax INTEGER NOT NULL DEFAULT 0,
  IDSalesManager INTEGER NOT NULL DEFAULT 0,
  IDPurchasingAgent INTEGER NOT NULL DEFAULT 0,
  IDPurchaseAccount INTEGER NOT NULL DEFAULT 0,
  IDDebtAccount INTEGER NOT NULL DEFAULT 0,
  IDDRIntr INTEGER NOT NULL DEFAULT 0,
  IDDRIntrTermDelivery INTEGER NOT NULL DEFAULT 0,
  IDDRIntrTransport INTEGER NOT NULL DEFAULT 0,
  IDDRIntrCustomsProc INTEGER NOT NULL DEFAULT 0,
  DeliveryLocation TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Country TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Record_state TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDGRPriceList INTEGER NOT NULL DEFAULT 0,
  IDGRPriceListP INTEGER NOT NULL DEFAULT 0,
  IDGRPriceListC INTEGER NOT NULL DEFAULT 0,
  IDGRPriceListCP INTEGER NOT NULL DEFAULT 0,
  IDGRCompanyPriceCat INTEGER NOT NULL DEFAULT 0,
  IDGRCompanyPriceCatP INTEGER NOT NULL DEFAULT 0,
  IDGRTermPayment INTEGER NOT NULL DEFAULT 0,
  IDGRTermPaymentP INTEGER NOT NULL DEFAULT 0,
  IDGRTermDelivery INTEGER NOT NULL DEFAULT 0,
  IDGRTermDeliveryP INTEGER NOT NULL DEFAULT 0,
  PriceCut REAL NOT NULL DEFAULT 0,
  PriceCutP REAL NOT NULL DEFAULT 0
);
CREATE UNIQUE INDEX GRCompany_Code ON GRCompany (Code);
CREATE TABLE GRCompDeliveryAddr (
  ID INTEGER PRIMARY KEY,
  IDGRCompany INTEGER NOT NULL DEFAULT 0,
  DeliveryAddr TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE GRCompContPerson (
  ID INTEGER PRIMARY KEY,
  IDGRCompany INTEGER NOT NULL DEFAULT 0,
  IsDefault BOOL INTEGER NOT NULL DEFAULT 0,
  ShowInReport BOOL INTEGER NOT NULL DEFAULT 0,
  CardNo TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  SurName TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  FirstName TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE GRBankAccount (
  ID INTEGER PRIMARY KEY,
  IDGRCompany INTEGER NOT NULL DEFAULT 0,
  IsDefault BOOL INTEGER NOT NULL DEFAULT 0,
  ShowInReport BOOL INTEGER NOT NULL DEFAULT 0,
  ReferenceNo TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDGRCurrency INTEGER NOT NULL DEFAULT 0
);
CREATE TABLE GRPriceList (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDFirst INTEGER NOT NULL DEFAULT 0,
  BeginDate DATE REAL NOT NULL DEFAULT 0,
  EndDate DATE REAL NOT NULL DEFAULT 0,
  IsBruto BOOL INTEGER NOT NULL DEFAULT 0,
  WithoutPriceCut BOOL INTEGER NOT NULL DEFAULT 0,
  IDGRCurrency INTEGER NOT NULL DEFAULT 0
);
CREATE TABLE GRPriceListRel (
  ID INTEGER PRIMARY KEY,
  IDGRPriceList INTEGER NOT NULL DEFAULT 0,
  IDGRArticle INTEGER NOT NULL DEFAULT 0,
  IDGRUnit INTEGER NOT NULL DEFAULT 0,
  Price CURRENCY REAL NOT NULL DEFAULT 0,
  BeginDate DATE REAL NOT NULL DEFAULT 0,
  EndDate DATE REAL NOT NULL DEFAULT 0
);
CREATE INDEX GRPriceListRel_ArtList ON GRPriceListRel (IDGRArticle, IDGRPriceList);
CREATE TABLE GRPriceLQuantity (
  ID INTEGER PRIMARY KEY,
  IDGRPriceListRel INTEGER NOT NULL DEFAULT 0,
  Quantity REAL NOT NULL DEFAULT 0,
  Price CURRENCY REAL NOT NULL DEFAULT 0,
  QuantityPercent REAL NOT NULL DEFAULT 0
);
CREATE INDEX GRPriceLQuantity_Rel ON GRPriceLQuantity (IDGRPriceListRel, Quantity);
CREATE TABLE GRPriceCatRel (
  ID INTEGER PRIMARY KEY,
  IDGRArticlePriceCat INTEGER NOT NULL DEFAULT 0,
  IDGRCompanyPriceCat INTEGER NOT NULL DEFAULT 0,
  IDGRPriceList INTEGER NOT NULL DEFAULT 0,
  PriceCut REAL NOT NULL DEFAULT 0,
  MinMarkup REAL NOT NULL DEFAULT 0
);
CREATE TABLE GRCPriceList (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IsCertified BOOL INTEGER NOT NULL DEFAULT 0,
  BeginDate DATE REAL NOT NULL DEFAULT 0,
  EndDate DATE REAL NOT NULL DEFAULT 0
);
CREATE TABLE GRCPriceListRel (
  ID INTEGER PRIMARY KEY,
  IDGRCPriceList INTEGER NOT NULL DEFAULT 0,
  IDGRArticle INTEGER NOT NULL DEFAULT 0,
  IDGRUnit INTEGER NOT NULL DEFAULT 0,
  Price CURRENCY REAL NOT NULL DEFAULT 0
);
CREATE INDEX GRCPriceListRel_Art ON GRCPriceListRel (IDGRArticle, IDGRCPriceList);
CREATE TABLE GRCPriceLCompany (
  ID INTEGER PRIMARY KEY,
  IDGRCPriceList INTEGER NOT NULL DEFAULT 0,
  IDGRCompany INTEGER NOT NULL DEFAULT 0
);
CREATE INDEX GRCPriceLCompany_List ON GRCPriceLCompany (IDGRCPriceList, IDGRCompany);
CREATE TABLE GRCurrency (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  FixedRate REAL NOT NULL DEFAULT 0,
  DivThreshold REAL NOT NULL DEFAULT 0,
  IsTriangulation BOOL INTEGER NOT NULL DEFAULT 0
);
CREATE TABLE GRCurValue (
  ID INTEGER PRIMARY KEY,
  IDGRCurrency INTEGER NOT NULL DEFAULT 0,
  ChangeDate DATE REAL NOT NULL DEFAULT 0,
  ConversionRate REAL NOT NULL DEFAULT 0
);
CREATE INDEX GRCurValue_Cur ON GRCurValue (IDGRCurrency, ChangeDate);
CREATE TABLE GRUnit (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Code_ENG TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDFirst INTEGER NOT NULL DEFAULT 0,
  Relation REAL NOT NULL DEFAULT 0
);
CREATE TABLE GRBarCode (
  ID INTEGER PRIMARY KEY,
  IDGRArticle INTEGER NOT NULL DEFAULT 0,
  IDGRUnit INTEGER NOT NULL DEFAULT 0,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  ContentQuantity REAL NOT NULL DEFAULT 0
);
CREATE INDEX GRBarCode_Code ON GRBarCode (Code);
CREATE TABLE GRTax (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  TaxPercent REAL NOT NULL DEFAULT 0
);
CREATE TABLE GRTermPayment (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  PromptTime INTEGER NOT NULL DEFAULT 0,
  PenaltyPercent REAL NOT NULL DEFAULT 0
);
CREATE TABLE GRTermPaymentRow (
  ID INTEGER PRIMARY KEY,
  IDGRTermPayment INTEGER NOT NULL DEFAULT 0,
  PromptTime INTEGER NOT NULL DEFAULT 0,
  PenaltyPercent REAL NOT NULL DEFAULT 0
);
CREATE TABLE GRTermDelivery (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DeliveryTime INTEGER NOT NULL DEFAULT 0
);
CREATE TABLE GRDocType (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DocType TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  XALType TEXT COLLATE NOCASE NOT NULL DEFAULT ''   -- the document kind the type is for
);
CREATE TABLE GRDocSeries (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DocType TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  LastNo INTEGER NOT NULL DEFAULT 0
);
CREATE TABLE GRArtCompletion (
  ID INTEGER PRIMARY KEY,
  IDGRArticle INTEGER NOT NULL DEFAULT 0,
  IDDRStore INTEGER NOT NULL DEFAULT 0
);
CREATE TABLE GRArtCompletionRow (
  ID INTEGER PRIMARY KEY,
  IDGRArtCompletion INTEGER NOT NULL DEFAULT 0,
  IDGRArticle INTEGER NOT NULL DEFAULT 0,
  IDGRUnit INTEGER NOT NULL DEFAULT 0,
  IDDRStore INTEGER NOT NULL DEFAULT 0,
  Quantity REAL NOT NULL DEFAULT 0,
  PriceRegulations REAL NOT NULL DEFAULT 0
);
-- Registers the document rows name by id: departments, projects, customs codes (with the unit the
-- customs quantity is counted in).
CREATE TABLE GRDepartment (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE GRProject (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE DRIntrCNCode (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDGRUnit INTEGER NOT NULL DEFAULT 0
);
CREATE TABLE DRStore (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDGRCompany INTEGER NOT NULL DEFAULT 0,
  IDGRPriceList INTEGER NOT NULL DEFAULT 0,
  IDComplPriceList INTEGER NOT NULL DEFAULT 0
);
-- A reservation or lot; a lot made by a receipt names the receipt's row (its sub-rows on the form)
-- and the store it came into. A relation is the part of a store row taken from (or returned to)
-- one reservation; it carries the row's article.
CREATE TABLE DRStockReserve (
  ID INTEGER PRIMARY KEY,
  IDGRArticle INTEGER NOT NULL DEFAULT 0,
  Quantity REAL NOT NULL DEFAULT 0,
  SerialNo TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DocDate DATE REAL NOT NULL DEFAULT 0,
  IDDDStoreDRow INTEGER NOT NULL DEFAULT 0,
  IDDRStore INTEGER NOT NULL DEFAULT 0
);
CREATE INDEX DRStockReserve_Row ON DRStockReserve (IDDDStoreDRow);
CREATE TABLE DRStockReserveRel (
  ID INTEGER PRIMARY KEY,
  IDDRStockReserve INTEGER NOT NULL DEFAULT 0,
  IDDDStoreDRow INTEGER NOT NULL DEFAULT 0,
  Quantity REAL NOT NULL DEFAULT 0,
  IDGRArticle INTEGER NOT NULL DEFAULT 0
);
CREATE INDEX DRStockReserveRel_Res ON DRStockReserveRel (IDDRStockReserve);
CREATE INDEX DRStockReserveRel_Row ON DRStockReserveRel (IDDDStoreDRow);
CREATE TABLE VRCashDesk (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDGRCurrency INTEGER NOT NULL DEFAULT 0
);
CREATE TABLE XALUser (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDEREmployee INTEGER NOT NULL DEFAULT 0,
  LangID INTEGER NOT NULL DEFAULT 0,
  Password TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE XALOptionList (
  ID INTEGER PRIMARY KEY,
  Category TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  TableName TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Type TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE xalurights (
  ID INTEGER PRIMARY KEY,
  idxaluser INTEGER NOT NULL DEFAULT 0,
  objectname TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  category TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  fcondition TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  factive BOOL INTEGER NOT NULL DEFAULT 0
);
CREATE TABLE GRReport (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  XALType TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  XALIndex TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE ERPerson (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Record_state TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE EREmployee (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDERPerson INTEGER NOT NULL DEFAULT 0,
  Record_state TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE WRPerson (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDEREmployee INTEGER NOT NULL DEFAULT 0,
  Record_state TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE CRCapitalAssets (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Record_state TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
-- Price categories of articles and companies (GRPriceCatRel pairs them with a list and a price
-- cut), and plain categories with their membership tables (T + "Rel": IDT, IDTCat).
CREATE TABLE GRArticlePriceCat (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Category TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE GRCompanyPriceCat (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Category TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE GRArticleCat (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Category TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE GRArticleCatRel (
  ID INTEGER PRIMARY KEY,
  IDGRArticle INTEGER NOT NULL DEFAULT 0,
  IDGRArticleCat INTEGER NOT NULL DEFAULT 0
);
CREATE INDEX GRArticleCatRel_Art ON GRArticleCatRel (IDGRArticle);
CREATE TABLE GRCompanyCat (
  ID INTEGER PRIMARY KEY,
  Code TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Category TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);
CREATE TABLE GRCompanyCatRel (
  ID INTEGER PRIMARY KEY,
  IDGRCompany INTEGER NOT NULL DEFAULT 0,
  IDGRCompanyCat INTEGER NOT NULL DEFAULT 0
);
CREATE INDEX GRCompanyCatRel_Comp ON GRCompanyCatRel (IDGRCompany);
CREATE TABLE GRHoliday (
  ID INTEGER PRIMARY KEY,
  HolidayDate DATE REAL NOT NULL DEFAULT 0,
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT ''
);

-- ---------------------------------------------------------------------------------------------
-- Options, settings, rights, messages and the table catalogue
-- ---------------------------------------------------------------------------------------------

-- One table for user options (IDXALUser > 0), system options and settings (IDXALUser = 0).
CREATE TABLE XALUserOption (
  ID INTEGER PRIMARY KEY,
  IDXALUser INTEGER NOT NULL DEFAULT 0,
  Category TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  OptValue TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  UNIQUE (IDXALUser, Category, Name)
);

-- Server locks ("Lock"/"UnLock"): one holder (a connection's session number) per kind, lock type
-- and record; IDRecord 0 locks the whole kind.
CREATE TABLE XALLock (
  XALType TEXT COLLATE NOCASE NOT NULL,
  LockType INTEGER NOT NULL DEFAULT 0,
  IDRecord INTEGER NOT NULL DEFAULT 0,
  Holder INTEGER NOT NULL,
  TakenAt DATE REAL NOT NULL DEFAULT 0,
  PRIMARY KEY (XALType, LockType, IDRecord)
);

-- Tables whose changes are logged (Kind '' for every kind; Flags the operations, as bits, -1 all),
-- and the log.
CREATE TABLE XALLogTable (
  TableName TEXT COLLATE NOCASE NOT NULL,
  Kind TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Flags INTEGER NOT NULL DEFAULT -1,
  PRIMARY KEY (TableName, Kind)
);
CREATE TABLE XALLog (
  ID INTEGER PRIMARY KEY,
  IDXALUser INTEGER NOT NULL DEFAULT 0,
  Kind TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  TableName TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDRecord INTEGER NOT NULL DEFAULT 0,
  LogText TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  LogTime DATE REAL NOT NULL DEFAULT 0
);

-- Rights by user, kind and object; a missing row means the right is granted.
CREATE TABLE XALRight (
  IDXALUser INTEGER NOT NULL,
  Kind TEXT COLLATE NOCASE NOT NULL,
  ObjectName TEXT COLLATE NOCASE NOT NULL,
  Denied INTEGER NOT NULL DEFAULT 0,   -- bit mask of the denied operations
  PRIMARY KEY (IDXALUser, Kind, ObjectName)
);

-- Keyed messages and table captions in English and Estonian (Kind 2: message, 1: caption).
CREATE TABLE XALMessage (
  MsgKey TEXT COLLATE NOCASE NOT NULL,
  Kind INTEGER NOT NULL DEFAULT 2,
  English TEXT NOT NULL DEFAULT '',
  Estonian TEXT NOT NULL DEFAULT '',
  PRIMARY KEY (MsgKey, Kind)
);

-- The table catalogue: what each table or document kind is, and where its rows are stored.
CREATE TABLE XALTable (
  TableName TEXT COLLATE NOCASE PRIMARY KEY,
  BaseTable TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  RowTable TEXT COLLATE NOCASE NOT NULL DEFAULT '',   -- a document kind's row table
  isDocument BOOL INTEGER NOT NULL DEFAULT 0,
  isRegister BOOL INTEGER NOT NULL DEFAULT 0,
  isReport BOOL INTEGER NOT NULL DEFAULT 0,
  CanAdminister BOOL INTEGER NOT NULL DEFAULT 0,
  SystemTable BOOL INTEGER NOT NULL DEFAULT 0
);

-- Links whose name is not the linked table's: a dotted path "Partner.Name" reads GRCompany
-- through the field IDPartner. Other links follow the "ID" + table name convention.
CREATE TABLE XALLink (
  LinkName TEXT COLLATE NOCASE PRIMARY KEY,
  FieldName TEXT COLLATE NOCASE NOT NULL,
  TargetTable TEXT COLLATE NOCASE NOT NULL
);
INSERT INTO XALLink VALUES
  ('Partner', 'IDPartner', 'GRCompany'),
  ('SettlCompany', 'IDSettlCompany', 'GRCompany'),
  ('SenderStore', 'IDSenderStore', 'DRStore'),
  ('ReceiverStore', 'IDReceiverStore', 'DRStore'),
  ('PartnerBAcc', 'IDPartnerBAcc', 'GRBankAccount'),
  ('SalesManager', 'IDSalesManager', 'EREmployee'),
  ('PurchasingAgent', 'IDPurchasingAgent', 'EREmployee'),
  ('ComplPriceList', 'IDComplPriceList', 'GRPriceList'),
  ('First', 'IDFirst', 'GRPriceList'),
  ('Worker', 'IDWorker', 'EREmployee'),
  ('Owner', 'IDOwner', 'GRCompany'),
  ('OwnerBAcc', 'IDOwnerBAcc', 'GRBankAccount'),
  ('ReceiverArticle', 'IDReceiverArticle', 'GRArticle'),
  ('SenderArticle', 'IDSenderArticle', 'GRArticle'),
  ('Doc', 'IDDoc', 'GDocument');

-- ---------------------------------------------------------------------------------------------
-- Document kinds: every header lives in GDocument; each kind is a view over its DocName.
-- ---------------------------------------------------------------------------------------------
CREATE VIEW SDInvoice AS SELECT * FROM GDocument WHERE DocName = 'SDInvoice';
CREATE VIEW PDInvoice AS SELECT * FROM GDocument WHERE DocName = 'PDInvoice';
CREATE VIEW SDOrder AS SELECT * FROM GDocument WHERE DocName = 'SDOrder';
CREATE VIEW PDOrder AS SELECT * FROM GDocument WHERE DocName = 'PDOrder';
CREATE VIEW SDConsignmD AS SELECT * FROM GDocument WHERE DocName = 'SDConsignmD';
CREATE VIEW SDExpenseD AS SELECT * FROM GDocument WHERE DocName = 'SDExpenseD';
CREATE VIEW PDReceiptD AS SELECT * FROM GDocument WHERE DocName = 'PDReceiptD';
CREATE VIEW DDMovement AS SELECT * FROM GDocument WHERE DocName = 'DDMovement';
CREATE VIEW DDProduction AS SELECT * FROM GDocument WHERE DocName = 'DDProduction';
CREATE VIEW DDOrder AS SELECT * FROM GDocument WHERE DocName = 'DDOrder';
CREATE VIEW DDCostInvD AS SELECT * FROM GDocument WHERE DocName = 'DDCostInvD';
CREATE VIEW GUDocument AS SELECT * FROM GDocument WHERE DocName = 'GUDocument';
CREATE VIEW VDBank AS SELECT * FROM GDocument WHERE DocName = 'VDBank';
CREATE VIEW VDCash AS SELECT * FROM GDocument WHERE DocName = 'VDCash';
CREATE VIEW VDBalanceDoc AS SELECT * FROM GDocument WHERE DocName = 'VDBalanceDoc';
CREATE VIEW BDBookingO AS SELECT * FROM GDocument WHERE DocName = 'BDBookingO';
CREATE VIEW GDContract AS SELECT * FROM GDocument WHERE DocName = 'GDContract';
CREATE VIEW WDAccount AS SELECT * FROM GDocument WHERE DocName = 'WDAccount';
CREATE VIEW WDHoldback AS SELECT * FROM GDocument WHERE DocName = 'WDHoldback';
CREATE VIEW WDPayout AS SELECT * FROM GDocument WHERE DocName = 'WDPayout';
CREATE VIEW CADocument AS SELECT * FROM GDocument WHERE DocName = 'CADocument';
CREATE VIEW CDReceipts AS SELECT * FROM GDocument WHERE DocName = 'CDReceipts';
CREATE VIEW CDRebuilding AS SELECT * FROM GDocument WHERE DocName = 'CDRebuilding';
CREATE VIEW CDMovement AS SELECT * FROM GDocument WHERE DocName = 'CDMovement';
CREATE VIEW CDConsumption AS SELECT * FROM GDocument WHERE DocName = 'CDConsumption';
CREATE VIEW CDAmortizing AS SELECT * FROM GDocument WHERE DocName = 'CDAmortizing';
INSERT INTO XALTable (TableName, BaseTable, isDocument) VALUES
  ('GDocument', '', -1), ('SDInvoice', 'GDocument', -1), ('PDInvoice', 'GDocument', -1),
  ('SDOrder', 'GDocument', -1), ('PDOrder', 'GDocument', -1), ('SDConsignmD', 'GDocument', -1),
  ('SDExpenseD', 'GDocument', -1), ('PDReceiptD', 'GDocument', -1), ('DDMovement', 'GDocument', -1),
  ('DDProduction', 'GDocument', -1), ('DDOrder', 'GDocument', -1), ('DDCostInvD', 'GDocument', -1),
  ('GUDocument', 'GDocument', -1), ('VDBank', 'GDocument', -1), ('VDCash', 'GDocument', -1),
  ('VDBalanceDoc', 'GDocument', -1), ('BDBookingO', 'GDocument', -1), ('GDContract', 'GDocument', -1),
  ('WDAccount', 'GDocument', -1), ('WDHoldback', 'GDocument', -1), ('WDPayout', 'GDocument', -1),
  ('CADocument', 'GDocument', -1), ('CDReceipts', 'GDocument', -1), ('CDRebuilding', 'GDocument', -1),
  ('CDMovement', 'GDocument', -1), ('CDConsumption', 'GDocument', -1), ('CDAmortizing', 'GDocument', -1);
UPDATE XALTable SET RowTable = CASE TableName
    WHEN 'SDInvoice' THEN 'SDInvoiceRow' WHEN 'PDInvoice' THEN 'PDInvoiceRow' WHEN 'SDOrder' THEN 'SDOrderRow'
    WHEN 'PDOrder' THEN 'PDOrderRow' WHEN 'DDOrder' THEN 'PDOrderRow' WHEN 'GUDocument' THEN 'GUDocumentRow'
    WHEN 'VDBank' THEN 'VDVoucherRow' WHEN 'VDCash' THEN 'VDVoucherRow' WHEN 'VDBalanceDoc' THEN 'VDVoucherRow'
    WHEN 'BDBookingO' THEN 'BDBookingORow' WHEN 'GDContract' THEN 'GDContractRow'
    WHEN 'WDAccount' THEN 'WDocumentRow' WHEN 'WDHoldback' THEN 'WDocumentRow' WHEN 'WDPayout' THEN 'WDocumentRow'
    WHEN 'CADocument' THEN 'CADocRow' WHEN 'CDReceipts' THEN 'CADocRow' WHEN 'CDRebuilding' THEN 'CADocRow'
    WHEN 'CDMovement' THEN 'CADocRow' WHEN 'CDConsumption' THEN 'CADocRow' WHEN 'CDAmortizing' THEN 'CADocRow'
    ELSE 'DDStoreDRow' END
  WHERE isDocument <> 0 AND TableName <> 'GDocument';
INSERT INTO XALTable (TableName, isRegister) VALUES
  ('GRArticle', -1), ('GRCompany', -1), ('GRPriceList', -1), ('GRCPriceList', -1), ('GRCurrency', -1),
  ('GRUnit', -1), ('GRBarCode', -1), ('GRTax', -1), ('GRTermPayment', -1), ('GRTermDelivery', -1),
  ('GRDocType', -1), ('GRDocSeries', -1), ('DRStore', -1), ('DRStockReserve', -1), ('GRBankAccount', -1),
  ('VRCashDesk', -1), ('EREmployee', -1), ('ERPerson', -1), ('WRPerson', -1), ('CRCapitalAssets', -1),
  ('GRDepartment', -1), ('GRProject', -1), ('DRIntrCNCode', -1);
INSERT INTO XALTable (TableName, isRegister) VALUES
  ('GRArticlePriceCat', -1), ('GRCompanyPriceCat', -1), ('GRArticleCat', -1), ('GRCompanyCat', -1);
INSERT INTO XALTable (TableName, isReport) VALUES ('GRReport', -1);
INSERT INTO XALTable (TableName, SystemTable, CanAdminister) VALUES
  ('XALUser', -1, -1), ('XALUserOption', -1, 0), ('XALOptionList', -1, 0), ('xalurights', -1, -1);

-- ---------------------------------------------------------------------------------------------
-- Balances
-- ---------------------------------------------------------------------------------------------
CREATE TABLE DBalanceStore (
  ID INTEGER PRIMARY KEY,
  DocDate DATE REAL NOT NULL DEFAULT 0,
  IDGRArticle INTEGER NOT NULL DEFAULT 0,
  IDDRStore INTEGER NOT NULL DEFAULT 0,
  DebitQFlow REAL NOT NULL DEFAULT 0,
  CreditQFlow REAL NOT NULL DEFAULT 0,
  DebitFlowBase CURRENCY REAL NOT NULL DEFAULT 0,
  CreditFlowBase CURRENCY REAL NOT NULL DEFAULT 0,
  DebitFlowRef CURRENCY REAL NOT NULL DEFAULT 0,
  CreditFlowRef CURRENCY REAL NOT NULL DEFAULT 0,
  UNIQUE (IDGRArticle, IDDRStore, DocDate)
);
CREATE TABLE VBalanceBank (
  ID INTEGER PRIMARY KEY,
  DocDate DATE REAL NOT NULL DEFAULT 0,
  IDGRBankAccount INTEGER NOT NULL DEFAULT 0,
  IDGRCurrency INTEGER NOT NULL DEFAULT 0,
  DebitFlow CURRENCY REAL NOT NULL DEFAULT 0,
  CreditFlow CURRENCY REAL NOT NULL DEFAULT 0,
  DebitFlowBase CURRENCY REAL NOT NULL DEFAULT 0,
  CreditFlowBase CURRENCY REAL NOT NULL DEFAULT 0,
  DebitFlowRef CURRENCY REAL NOT NULL DEFAULT 0,
  CreditFlowRef CURRENCY REAL NOT NULL DEFAULT 0,
  UNIQUE (IDGRBankAccount, IDGRCurrency, DocDate)
);
CREATE TABLE VBalanceCash (
  ID INTEGER PRIMARY KEY,
  DocDate DATE REAL NOT NULL DEFAULT 0,
  IDVRCashDesk INTEGER NOT NULL DEFAULT 0,
  IDGRCurrency INTEGER NOT NULL DEFAULT 0,
  DebitFlow CURRENCY REAL NOT NULL DEFAULT 0,
  CreditFlow CURRENCY REAL NOT NULL DEFAULT 0,
  DebitFlowBase CURRENCY REAL NOT NULL DEFAULT 0,
  CreditFlowBase CURRENCY REAL NOT NULL DEFAULT 0,
  DebitFlowRef CURRENCY REAL NOT NULL DEFAULT 0,
  CreditFlowRef CURRENCY REAL NOT NULL DEFAULT 0,
  UNIQUE (IDVRCashDesk, IDGRCurrency, DocDate)
);
CREATE TABLE DCurPosBalance (
  ID INTEGER PRIMARY KEY,
  IDGRArticle INTEGER NOT NULL DEFAULT 0,
  IDDRStore INTEGER NOT NULL DEFAULT 0,
  Quantity REAL NOT NULL DEFAULT 0,
  PackageQuantity REAL NOT NULL DEFAULT 0
);

-- The kept balances below are kept by difference, as a server keeps them: every change of a store
-- row or of a reservation relation takes the old row's part away and adds the new row's part, so
-- a write costs the same in a database of any age. Each kept table has a defining view that gives
-- the same rows from scratch; quantities are kept to 9 decimals (both ways), so that a balance
-- that comes back to zero is exactly zero. keeps_balances() is the host's switch: a bulk load turns
-- it off and rebuilds the kept tables from their views once at the end (see host/kept_balances.h).

-- Current stock per article and store: the row's DealState picks the column ('' on hand,
-- R reserved, P pre-reserved); receipts add, issues subtract; services (article type S) are left
-- out. The value of a receipt counts in state '', that of an issue in every state but P; Cost is
-- the value per unit on hand and reserved.
CREATE TABLE DCurBalanceStore (
  IDGRArticle INTEGER NOT NULL,
  IDDRStore INTEGER NOT NULL,
  Quantity REAL NOT NULL DEFAULT 0,
  RQuantity REAL NOT NULL DEFAULT 0,
  PQuantity REAL NOT NULL DEFAULT 0,
  AltQuantity REAL NOT NULL DEFAULT 0,
  RAltQuantity REAL NOT NULL DEFAULT 0,
  PAltQuantity REAL NOT NULL DEFAULT 0,
  AmountBase CURRENCY REAL NOT NULL DEFAULT 0,
  Cost CURRENCY REAL NOT NULL DEFAULT 0,
  PRIMARY KEY (IDGRArticle, IDDRStore)
);
CREATE VIEW vCurBalanceStore AS SELECT *,
  CASE WHEN Quantity + RQuantity <> 0 THEN AmountBase / (Quantity + RQuantity) ELSE 0 END Cost
FROM (SELECT IDGRArticle, IDDRStore,
  round(total(CASE WHEN St='' THEN Q END), 9) Quantity, round(total(CASE WHEN St='R' THEN Q END), 9) RQuantity,
  round(total(CASE WHEN St='P' THEN Q END), 9) PQuantity, round(total(CASE WHEN St='' THEN AQ END), 9) AltQuantity,
  round(total(CASE WHEN St='R' THEN AQ END), 9) RAltQuantity, round(total(CASE WHEN St='P' THEN AQ END), 9) PAltQuantity,
  total(AB) AmountBase
FROM (SELECT IDGRArticle, IDReceiverStore IDDRStore, upper(DealState) St, BaseQuantity Q, AltQuantity AQ,
             CASE WHEN DealState='' THEN Cost ELSE 0 END AB
        FROM DDStoreDRow WHERE IDReceiverStore IS NOT NULL AND ArticleType<>'S'
      UNION ALL
      SELECT IDGRArticle, IDSenderStore, upper(DealState), -BaseQuantity, -AltQuantity,
             CASE WHEN DealState<>'P' THEN -Cost ELSE 0 END
        FROM DDStoreDRow WHERE IDSenderStore IS NOT NULL AND ArticleType<>'S')
GROUP BY 1, 2);
-- Inserting a key here rebuilds that key of DCurBalanceStore from its defining view.
CREATE VIEW DCurBalanceStoreRefresh (IDGRArticle, IDDRStore) AS SELECT 0, 0 WHERE 0;
CREATE TRIGGER DCurBalanceStoreRefresh_ii INSTEAD OF INSERT ON DCurBalanceStoreRefresh BEGIN
  DELETE FROM DCurBalanceStore WHERE IDGRArticle = NEW.IDGRArticle AND IDDRStore = NEW.IDDRStore;
  INSERT INTO DCurBalanceStore
    SELECT * FROM vCurBalanceStore WHERE IDGRArticle = NEW.IDGRArticle AND IDDRStore = NEW.IDDRStore;
END;

-- Inserting a store row's values here adds its part to the balances of its receiving and sending
-- store (Sign 1) or takes it away (Sign -1). A key that no row gives any more is dropped.
CREATE VIEW DCurBalanceStoreDelta (IDGRArticle, IDReceiverStore, IDSenderStore, DealState, ArticleType,
  BaseQuantity, AltQuantity, Cost, Sign) AS SELECT 0, 0, 0, '', '', 0, 0, 0, 0 WHERE 0;
CREATE TRIGGER DCurBalanceStoreDelta_ii INSTEAD OF INSERT ON DCurBalanceStoreDelta
    WHEN upper(NEW.ArticleType) <> 'S' BEGIN
  INSERT INTO DCurBalanceStore (IDGRArticle, IDDRStore, Quantity, RQuantity, PQuantity, AltQuantity, RAltQuantity,
                                PAltQuantity, AmountBase)
    SELECT NEW.IDGRArticle, S, CASE WHEN St='' THEN Q ELSE 0 END, CASE WHEN St='R' THEN Q ELSE 0 END,
           CASE WHEN St='P' THEN Q ELSE 0 END, CASE WHEN St='' THEN AQ ELSE 0 END, CASE WHEN St='R' THEN AQ ELSE 0 END,
           CASE WHEN St='P' THEN AQ ELSE 0 END, AB
    FROM (SELECT S, upper(NEW.DealState) St, NEW.Sign * D * NEW.BaseQuantity Q, NEW.Sign * D * NEW.AltQuantity AQ,
                 NEW.Sign * D * CASE WHEN (D > 0 AND NEW.DealState = '') OR (D < 0 AND upper(NEW.DealState) <> 'P')
                                     THEN NEW.Cost ELSE 0 END AB
          FROM (SELECT NEW.IDReceiverStore S, 1 D UNION ALL SELECT NEW.IDSenderStore, -1))
    WHERE S IS NOT NULL
  ON CONFLICT (IDGRArticle, IDDRStore) DO UPDATE SET
    Quantity = round(Quantity + excluded.Quantity, 9), RQuantity = round(RQuantity + excluded.RQuantity, 9),
    PQuantity = round(PQuantity + excluded.PQuantity, 9), AltQuantity = round(AltQuantity + excluded.AltQuantity, 9),
    RAltQuantity = round(RAltQuantity + excluded.RAltQuantity, 9),
    PAltQuantity = round(PAltQuantity + excluded.PAltQuantity, 9), AmountBase = AmountBase + excluded.AmountBase;
  UPDATE DCurBalanceStore
    SET Cost = CASE WHEN Quantity + RQuantity <> 0 THEN AmountBase / (Quantity + RQuantity) ELSE 0 END
    WHERE IDGRArticle = NEW.IDGRArticle AND IDDRStore IN (NEW.IDReceiverStore, NEW.IDSenderStore);
  DELETE FROM DCurBalanceStore
    WHERE NEW.Sign < 0 AND IDGRArticle = NEW.IDGRArticle AND IDDRStore IN (NEW.IDReceiverStore, NEW.IDSenderStore)
      AND NOT EXISTS (SELECT 1 FROM DDStoreDRow R WHERE R.IDGRArticle = NEW.IDGRArticle
                        AND R.IDReceiverStore = DCurBalanceStore.IDDRStore AND R.ArticleType <> 'S')
      AND NOT EXISTS (SELECT 1 FROM DDStoreDRow R WHERE R.IDGRArticle = NEW.IDGRArticle
                        AND R.IDSenderStore = DCurBalanceStore.IDDRStore AND R.ArticleType <> 'S');
END;

-- Current quantities per reservation and store: receipts not pre-reserved go to Quantity, P
-- receipts to PQuantity; issues subtract from Quantity (state '') or RQuantity (other states).
-- IDGRArticle is the greatest article of the store rows that take part.
CREATE TABLE DCurDRStockReserve (
  IDDRStockReserve INTEGER NOT NULL,
  IDGRArticle INTEGER NOT NULL DEFAULT 0,
  IDDRStore INTEGER NOT NULL,
  Quantity REAL NOT NULL DEFAULT 0,
  RQuantity REAL NOT NULL DEFAULT 0,
  PQuantity REAL NOT NULL DEFAULT 0,
  PRIMARY KEY (IDDRStockReserve, IDDRStore)
);
CREATE VIEW vCurDRStockReserve AS SELECT IDDRStockReserve, max(IDGRArticle) IDGRArticle, IDDRStore,
  round(total(CASE WHEN C='Q' THEN Q END), 9) Quantity, round(total(CASE WHEN C='R' THEN Q END), 9) RQuantity,
  round(total(CASE WHEN C='P' THEN Q END), 9) PQuantity
FROM (SELECT X.IDDRStockReserve, Y.IDGRArticle, Y.IDReceiverStore IDDRStore, X.Quantity Q,
             CASE WHEN upper(Y.DealState)='P' THEN 'P' ELSE 'Q' END C
        FROM DRStockReserveRel X JOIN DDStoreDRow Y ON X.IDDDStoreDRow = Y.ID WHERE Y.IDReceiverStore IS NOT NULL
      UNION ALL
      SELECT X.IDDRStockReserve, Y.IDGRArticle, Y.IDSenderStore, -X.Quantity,
             CASE WHEN Y.DealState='' THEN 'Q' ELSE 'R' END
        FROM DRStockReserveRel X JOIN DDStoreDRow Y ON X.IDDDStoreDRow = Y.ID WHERE Y.IDSenderStore IS NOT NULL)
GROUP BY 1, 3;

-- Inserting a relation's quantity with its store row's values here adds its part to the
-- reservation's balance in the row's receiving and sending store (Sign 1) or takes it away
-- (Sign -1); taking away recomputes the key's article and drops a key no relation gives any more.
CREATE VIEW DCurDRStockReserveDelta (IDDRStockReserve, Quantity, IDGRArticle, IDReceiverStore, IDSenderStore,
  DealState, Sign) AS SELECT 0, 0, 0, 0, 0, '', 0 WHERE 0;
CREATE TRIGGER DCurDRStockReserveDelta_ii INSTEAD OF INSERT ON DCurDRStockReserveDelta BEGIN
  INSERT INTO DCurDRStockReserve (IDDRStockReserve, IDGRArticle, IDDRStore, Quantity, RQuantity, PQuantity)
    SELECT NEW.IDDRStockReserve, NEW.IDGRArticle, S, CASE WHEN C='Q' THEN Q ELSE 0 END,
           CASE WHEN C='R' THEN Q ELSE 0 END, CASE WHEN C='P' THEN Q ELSE 0 END
    FROM (SELECT NEW.IDReceiverStore S, NEW.Sign * NEW.Quantity Q,
                 CASE WHEN upper(NEW.DealState)='P' THEN 'P' ELSE 'Q' END C
          UNION ALL
          SELECT NEW.IDSenderStore, -NEW.Sign * NEW.Quantity, CASE WHEN NEW.DealState='' THEN 'Q' ELSE 'R' END)
    WHERE S IS NOT NULL
  ON CONFLICT (IDDRStockReserve, IDDRStore) DO UPDATE SET
    Quantity = round(Quantity + excluded.Quantity, 9), RQuantity = round(RQuantity + excluded.RQuantity, 9),
    PQuantity = round(PQuantity + excluded.PQuantity, 9), IDGRArticle = max(IDGRArticle, excluded.IDGRArticle);
  DELETE FROM DCurDRStockReserve
    WHERE NEW.Sign < 0 AND IDDRStockReserve = NEW.IDDRStockReserve
      AND IDDRStore IN (NEW.IDReceiverStore, NEW.IDSenderStore)
      AND NOT EXISTS (SELECT 1 FROM DRStockReserveRel X JOIN DDStoreDRow Y ON X.IDDDStoreDRow = Y.ID
                       WHERE X.IDDRStockReserve = NEW.IDDRStockReserve
                         AND DCurDRStockReserve.IDDRStore IN (Y.IDReceiverStore, Y.IDSenderStore));
  UPDATE DCurDRStockReserve
    SET IDGRArticle = (SELECT max(Y.IDGRArticle) FROM DRStockReserveRel X JOIN DDStoreDRow Y ON X.IDDDStoreDRow = Y.ID
                        WHERE X.IDDRStockReserve = NEW.IDDRStockReserve
                          AND DCurDRStockReserve.IDDRStore IN (Y.IDReceiverStore, Y.IDSenderStore))
    WHERE NEW.Sign < 0 AND IDDRStockReserve = NEW.IDDRStockReserve
      AND IDDRStore IN (NEW.IDReceiverStore, NEW.IDSenderStore);
END;

-- A store row's own part in the stock balances, and the parts of the relations that name it (a
-- relation saved before its row counts from the moment the row comes).
CREATE TRIGGER DDStoreDRow_bal_ai AFTER INSERT ON DDStoreDRow WHEN keeps_balances() BEGIN
  INSERT INTO DCurBalanceStoreDelta VALUES (NEW.IDGRArticle, NEW.IDReceiverStore, NEW.IDSenderStore, NEW.DealState,
    NEW.ArticleType, NEW.BaseQuantity, NEW.AltQuantity, NEW.Cost, 1);
  INSERT INTO DCurDRStockReserveDelta SELECT IDDRStockReserve, Quantity, NEW.IDGRArticle, NEW.IDReceiverStore,
    NEW.IDSenderStore, NEW.DealState, 1 FROM DRStockReserveRel WHERE IDDDStoreDRow = NEW.ID;
END;
CREATE TRIGGER DDStoreDRow_bal_ad AFTER DELETE ON DDStoreDRow WHEN keeps_balances() BEGIN
  INSERT INTO DCurBalanceStoreDelta VALUES (OLD.IDGRArticle, OLD.IDReceiverStore, OLD.IDSenderStore, OLD.DealState,
    OLD.ArticleType, OLD.BaseQuantity, OLD.AltQuantity, OLD.Cost, -1);
END;
-- The relations go first, while their row still gives their parts (their own trigger takes them away).
CREATE TRIGGER DDStoreDRow_rel_bd BEFORE DELETE ON DDStoreDRow BEGIN
  DELETE FROM DRStockReserveRel WHERE IDDDStoreDRow = OLD.ID;
END;
CREATE TRIGGER DDStoreDRow_bal_au AFTER UPDATE OF IDGRArticle, IDReceiverStore, IDSenderStore, ArticleType,
    DealState, BaseQuantity, AltQuantity, Cost ON DDStoreDRow WHEN keeps_balances() BEGIN
  INSERT INTO DCurBalanceStoreDelta VALUES (OLD.IDGRArticle, OLD.IDReceiverStore, OLD.IDSenderStore, OLD.DealState,
    OLD.ArticleType, OLD.BaseQuantity, OLD.AltQuantity, OLD.Cost, -1);
  INSERT INTO DCurBalanceStoreDelta VALUES (NEW.IDGRArticle, NEW.IDReceiverStore, NEW.IDSenderStore, NEW.DealState,
    NEW.ArticleType, NEW.BaseQuantity, NEW.AltQuantity, NEW.Cost, 1);
END;
CREATE TRIGGER DDStoreDRow_res_au AFTER UPDATE OF ID, IDGRArticle, IDReceiverStore, IDSenderStore, DealState
    ON DDStoreDRow WHEN keeps_balances() BEGIN
  INSERT INTO DCurDRStockReserveDelta SELECT IDDRStockReserve, Quantity, OLD.IDGRArticle, OLD.IDReceiverStore,
    OLD.IDSenderStore, OLD.DealState, -1 FROM DRStockReserveRel WHERE IDDDStoreDRow = OLD.ID;
  INSERT INTO DCurDRStockReserveDelta SELECT IDDRStockReserve, Quantity, NEW.IDGRArticle, NEW.IDReceiverStore,
    NEW.IDSenderStore, NEW.DealState, 1 FROM DRStockReserveRel WHERE IDDDStoreDRow = NEW.ID;
END;

-- A relation's part in its reservation's balance, with the values of the store row it names (none
-- while that row is not stored).
CREATE TRIGGER DRStockReserveRel_ai AFTER INSERT ON DRStockReserveRel WHEN keeps_balances() BEGIN
  INSERT INTO DCurDRStockReserveDelta SELECT NEW.IDDRStockReserve, NEW.Quantity, IDGRArticle, IDReceiverStore,
    IDSenderStore, DealState, 1 FROM DDStoreDRow WHERE ID = NEW.IDDDStoreDRow;
END;
CREATE TRIGGER DRStockReserveRel_ad AFTER DELETE ON DRStockReserveRel WHEN keeps_balances() BEGIN
  INSERT INTO DCurDRStockReserveDelta SELECT OLD.IDDRStockReserve, OLD.Quantity, IDGRArticle, IDReceiverStore,
    IDSenderStore, DealState, -1 FROM DDStoreDRow WHERE ID = OLD.IDDDStoreDRow;
END;
CREATE TRIGGER DRStockReserveRel_au AFTER UPDATE OF IDDRStockReserve, IDDDStoreDRow, Quantity ON DRStockReserveRel
    WHEN keeps_balances() BEGIN
  INSERT INTO DCurDRStockReserveDelta SELECT OLD.IDDRStockReserve, OLD.Quantity, IDGRArticle, IDReceiverStore,
    IDSenderStore, DealState, -1 FROM DDStoreDRow WHERE ID = OLD.IDDDStoreDRow;
  INSERT INTO DCurDRStockReserveDelta SELECT NEW.IDDRStockReserve, NEW.Quantity, IDGRArticle, IDReceiverStore,
    IDSenderStore, DealState, 1 FROM DDStoreDRow WHERE ID = NEW.IDDDStoreDRow;
END;
