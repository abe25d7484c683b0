// The reference host's schema: host/schema.sql plus the document row tables, which all carry the
// same document row columns and are therefore made here from one list. One schema serves both
// database kinds: the translator turns either dialect into SQLite's.
#pragma once

#include <string>

#include "host/database.h"

namespace xal::host {

// Creates every table, view and trigger in an empty database (the caller holds the transaction).
void CreateSchema(Database& db);

// The CREATE statements of the document row tables.
std::string DocumentRowTablesSql();

// The column of a document row table that names its document ("IDDoc"; "IDVDVoucher" on
// VDVoucherRow, "IDCADocument" on CADocRow, …); "IDDoc" for a table not made here.
std::string DocumentLinkColumn(const std::string& rowTable);

}  // namespace xal::host
