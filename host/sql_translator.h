// Turns the SQL the component writes — file-database syntax on every database kind, plus a few
// server forms — into SQLite text with the same meaning for the host's schema (dates as serial
// days, flags as -1/0, case-insensitive text). What it cannot carry over faithfully it refuses.
#pragma once

#include <string>
#include <string_view>

namespace xal::host {

// Translates one statement, or several separated by ";". `databaseKind` 2 is the server (where a
// double-quoted "x" is a name); any other kind is the file database (where "x" is a string).
// Raises VbError(kErrSql) with a text naming the construct when the statement would change meaning
// or cannot be translated; it never returns partly translated text.
// The connection running the result needs RegisterSqlFunctions (year, clng, format, int) and
// should have double-quoted strings switched off, so that a quoted name never falls back to text.
std::string TranslateToSqlite(std::string_view sql, int databaseKind);

}  // namespace xal::host
