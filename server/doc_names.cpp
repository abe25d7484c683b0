// Names derived from a document name: the row table of a document kind, the field in that row
// table that points back to its header, and the subsystem that owns the kind. Several document
// kinds share one row table (all store documents write DDStoreDRow rows, for instance), which is
// what the tables below record; a name they do not list follows the plain naming rule.
#include <string_view>

#include "runtime/text.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {

struct NameMapping {
  std::string_view docName;  // upper case, as the lookup key is normalised
  std::string_view result;
};

constexpr NameMapping kRowTables[] = {
    {"SDCONSIGNMD", "DDStoreDRow"},
    {"PDRECEIPTD", "DDStoreDRow"},
    {"DDMOVEMENT", "DDStoreDRow"},
    {"DDCOSTINVD", "DDStoreDRow"},
    {"SDEXPENSED", "DDStoreDRow"},
    {"DDPRODUCTION", "DDStoreDRow"},
    {"VDBANK", "VDVoucherRow"},
    {"VDCASH", "VDVoucherRow"},
    {"VDBALANCEDOC", "VDVoucherRow"},
    {"CADOCUMENT", "CADocRow"},
    {"CDAMORTIZING", "CADocRow"},
    {"CDCONSUMPTION", "CADocRow"},
    {"CDMOVEMENT", "CADocRow"},
    {"CDREBUILDING", "CADocRow"},
    {"CDRECEIPTS", "CADocRow"},
    {"DDORDER", "PDOrderRow"},
    {"WDOCUMENT", "WDocumentRow"},
    {"WDACCOUNT", "WDocumentRow"},
    {"WDHOLDBACK", "WDocumentRow"},
    {"WDPAYOUT", "WDocumentRow"},
    {"WPTAXRETINF1_09", "WPTaxRetINF1Row_09"},
};

constexpr NameMapping kIDFields[] = {
    {"SDCONSIGNMD", "IDGDocument"},
    {"PDRECEIPTD", "IDGDocument"},
    {"DDMOVEMENT", "IDGDocument"},
    {"DDCOSTINVD", "IDGDocument"},
    {"SDEXPENSED", "IDGDocument"},
    {"DDPRODUCTION", "IDGDocument"},
    {"CADOCUMENT", "IDCADocument"},
    {"CDAMORTIZING", "IDCADocument"},
    {"CDCONSUMPTION", "IDCADocument"},
    {"CDMOVEMENT", "IDCADocument"},
    {"CDREBUILDING", "IDCADocument"},
    {"CDRECEIPTS", "IDCADocument"},
    {"DDORDER", "IDPDOrder"},
    {"WDOCUMENT", "IDWDocument"},
    {"WDACCOUNT", "IDWDocument"},
    {"WDHOLDBACK", "IDWDocument"},
    {"WDPAYOUT", "IDWDocument"},
};

constexpr NameMapping kSystems[] = {
    {"SDORDER", "SALES"},
    {"SDINVOICE", "SALES"},
    {"PDORDER", "PURCHASE"},
    {"PDINVOICE", "PURCHASE"},
    {"VDVOUCHER", "BANK"},
    {"BDBOOKINGORDER", "BOOKINGORDER"},
    {"SDCONSIGNMD", "STORE"},
    {"PDRECEIPTD", "STORE"},
    {"DDMOVEMENT", "STORE"},
    {"DDCOSTINVD", "STORE"},
    {"SDEXPENSED", "STORE"},
    {"DDPRODUCTION", "STORE"},
    {"DDORDER", "STORE"},
    {"CADOCUMENT", "CAPITAL_ASSETS"},
    {"CDAMORTIZING", "CAPITAL_ASSETS"},
    {"CDCONSUMPTION", "CAPITAL_ASSETS"},
    {"CDMOVEMENT", "CAPITAL_ASSETS"},
    {"CDREBUILDING", "CAPITAL_ASSETS"},
    {"CDRECEIPTS", "CAPITAL_ASSETS"},
    {"WDOCUMENT", "WAGES"},
    {"WDACCOUNT", "WAGES"},
    {"WDHOLDBACK", "WAGES"},
    {"WDPAYOUT", "WAGES"},
};

// Document names are compared trimmed and in upper case.
std::string Key(const std::string& docName) { return UCase(Trim(docName)); }

template <size_t N>
const std::string_view* Lookup(const NameMapping (&table)[N], const std::string& key) {
  for (const NameMapping& m : table)
    if (m.docName == key) return &m.result;
  return nullptr;
}

}  // namespace

std::string GetRowName(const std::string& pDocName) {
  const std::string key = Key(pDocName);
  // A name that already is a row table stays as it is (in upper case).
  if (Right(key, 3) == "ROW") return key;
  if (const std::string_view* r = Lookup(kRowTables, key)) return std::string(*r);
  return key + "Row";
}

std::string GetIDFieldName(const std::string& pDocName) {
  const std::string key = Key(pDocName);
  if (const std::string_view* r = Lookup(kIDFields, key)) return std::string(*r);
  return "ID" + key;
}

std::string GetSysName(const std::string& pDocName) {
  const std::string key = Key(pDocName);
  if (const std::string_view* r = Lookup(kSystems, key)) return std::string(*r);
  return std::string();
}

}  // namespace xal::server
