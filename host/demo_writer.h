// What the demo data writers (host/demo_db.cpp, host/demo_documents.cpp) share: a row of values,
// the day the demo's periods are closed before, money rounding, and the batch insert.
#pragma once

#include <cstdint>
#include <vector>

#include "host/database.h"
#include "host/demo_db.h"

namespace xal::host::demo {

using Row = std::vector<Variant>;

constexpr int32_t kDateFixed = DemoDay(2010, 1, 1);  // store, sales and purchase periods closed before

// Money: rounded to four decimals, then to cents, halves away from zero.
double Money(double x);

// Inserts rows into one table through one prepared statement; a row with another number of
// values than `columns` names is an error.
void Insert(Database& db, const char* table, const char* columns, const std::vector<Row>& rows);

// The stored documents, their taxes and series numbers, and the closed-period stock flows.
void WriteDocuments(Database& db);

}  // namespace xal::host::demo
