// SQL functions the component's statements call that SQLite does not have: year(), clng(),
// format() and int(), with the original engine's rules.
#pragma once

struct sqlite3;

namespace xal::host {
void RegisterSqlFunctions(sqlite3* db);
}
