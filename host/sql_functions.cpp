// SQL functions the translated statements still call by their file-engine names. Each one follows
// the component's runtime rules (date serials, half-to-even CLng, Format's patterns) so that a
// statement gives the same answer on SQLite as the same expression evaluated in the component.
#include "host/sql_functions.h"

#include <sqlite3.h>

#include <cmath>
#include <string>

#include "runtime/convert.h"
#include "runtime/dates.h"
#include "runtime/format.h"

namespace xal::host {
namespace {

// The Variant a SQL value stands for: integers that fit 32 bits are Longs, other numbers Doubles,
// text and blobs strings, NULL Null.
Variant ToVariant(sqlite3_value* v) {
  switch (sqlite3_value_type(v)) {
    case SQLITE_INTEGER: {
      sqlite3_int64 i = sqlite3_value_int64(v);
      if (i >= INT32_MIN && i <= INT32_MAX) return Variant(static_cast<int32_t>(i));
      return Variant(static_cast<double>(i));
    }
    case SQLITE_FLOAT:
      return Variant(sqlite3_value_double(v));
    case SQLITE_NULL:
      return Variant::Null();
    default: {
      const char* text = reinterpret_cast<const char*>(sqlite3_value_text(v));
      return Variant(std::string_view(text ? text : "", static_cast<size_t>(sqlite3_value_bytes(v))));
    }
  }
}

// Runs `body` and reports a runtime error as an SQL error of the statement.
template <typename F>
void Guard(sqlite3_context* ctx, F body) {
  try {
    body();
  } catch (const VbError& e) {
    sqlite3_result_error(ctx, e.description().c_str(), -1);
  } catch (const std::bad_alloc&) {
    sqlite3_result_error_nomem(ctx);
  }
}

// year(serial): the calendar year of a date serial; year(0) is 1899. Null gives Null.
void YearFn(sqlite3_context* ctx, int, sqlite3_value** argv) {
  if (sqlite3_value_type(argv[0]) == SQLITE_NULL) return sqlite3_result_null(ctx);
  Guard(ctx, [&] { sqlite3_result_int(ctx, Year(CDate(ToVariant(argv[0])))); });
}

// clng(x): rounded half to even into 32 bits (overflow is an error). Null gives Null.
void ClngFn(sqlite3_context* ctx, int, sqlite3_value** argv) {
  if (sqlite3_value_type(argv[0]) == SQLITE_NULL) return sqlite3_result_null(ctx);
  Guard(ctx, [&] { sqlite3_result_int(ctx, CLng(ToVariant(argv[0]))); });
}

// format(x[, pattern]): the component's Format. Null gives Null, as SQL functions do, where the
// runtime's Format would give "".
void FormatFn(sqlite3_context* ctx, int argc, sqlite3_value** argv) {
  if (sqlite3_value_type(argv[0]) == SQLITE_NULL) return sqlite3_result_null(ctx);
  Guard(ctx, [&] {
    std::string pattern;
    if (argc > 1 && sqlite3_value_type(argv[1]) != SQLITE_NULL)
      pattern = reinterpret_cast<const char*>(sqlite3_value_text(argv[1]));
    std::string s = Format(ToVariant(argv[0]), pattern);
    sqlite3_result_text(ctx, s.data(), static_cast<int>(s.size()), SQLITE_TRANSIENT);
  });
}

// int(x): the largest whole number not above x; integers come back unchanged. Null gives Null.
void IntFn(sqlite3_context* ctx, int, sqlite3_value** argv) {
  switch (sqlite3_value_type(argv[0])) {
    case SQLITE_NULL:
      return sqlite3_result_null(ctx);
    case SQLITE_INTEGER:
      return sqlite3_result_int64(ctx, sqlite3_value_int64(argv[0]));
    case SQLITE_FLOAT:
      return sqlite3_result_double(ctx, std::floor(sqlite3_value_double(argv[0])));
    default:
      Guard(ctx, [&] { sqlite3_result_double(ctx, CDbl(Int(ToVariant(argv[0])))); });
  }
}

struct FunctionEntry {
  const char* name;
  int args;
  void (*fn)(sqlite3_context*, int, sqlite3_value**);
};

// One line per registered function and arity. Registering "format" replaces SQLite's own printf
// alias of that name for these arities, which would otherwise take the value as a format string.
constexpr FunctionEntry kFunctions[] = {
    {"year", 1, YearFn},
    {"clng", 1, ClngFn},
    {"format", 1, FormatFn},
    {"format", 2, FormatFn},
    {"int", 1, IntFn},
};

}  // namespace

void RegisterSqlFunctions(sqlite3* db) {
  for (const FunctionEntry& f : kFunctions)
    sqlite3_create_function_v2(db, f.name, f.args, SQLITE_UTF8 | SQLITE_DETERMINISTIC | SQLITE_INNOCUOUS, nullptr,
                               f.fn, nullptr, nullptr, nullptr);
}

}  // namespace xal::host
