// The demo database: a small, realistic data set of an Estonian trading company with Latvian,
// Swedish, British and American partners — registers, prices, currencies, settings, users,
// messages, and stored documents whose stock the balance triggers have kept. Tests, benchmarks
// and `xal demo` start from it. Every date is a fixed serial day, so two builds are identical.
#pragma once

#include <cstdint>
#include <string>

#include "host/connection.h"

namespace xal::host {

// Fills a connection's database (fresh schema, no data) with the demo data in one transaction.
void BuildDemoDatabase(HostConnection& conn);

// Opens the demo database at `path` with database kind `kind`; a missing or empty file (or one
// holding only the schema) is created and filled first.
Ref<HostConnection> OpenDemoDatabase(const std::string& path, int32_t kind);

// The serial day of a calendar date (1899-12-30 is day 0), as the demo data writes dates.
constexpr int32_t DemoDay(int year, int month, int day) {
  const int y = year - (month <= 2 ? 1 : 0);
  const int era = (y >= 0 ? y : y - 399) / 400;
  const int yoe = y - era * 400;
  const int doy = (153 * (month + (month > 2 ? -3 : 9)) + 2) / 5 + day - 1;
  const int doe = yoe * 365 + yoe / 4 - yoe / 100 + doy;
  return era * 146097 + doe - 719468 + 25569;
}
static_assert(DemoDay(1899, 12, 30) == 0 && DemoDay(2010, 1, 1) == 40179);

}  // namespace xal::host
