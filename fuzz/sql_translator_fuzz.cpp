// libFuzzer target for the SQL translator: arbitrary bytes are tokenized and translated for both
// database kinds. A VbError is the expected answer to text it cannot translate; a crash, a
// sanitizer report, another exception or a broken invariant (checked below) is a finding.
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "host/host_error.h"
#include "host/sql_tokenizer.h"
#include "host/sql_translator.h"
#include "runtime/error.h"

namespace {

void Check(bool ok) {
  if (!ok) __builtin_trap();
}

// The translation; `ok` false when the translator refused the text.
std::string Translate(std::string_view sql, int kind, bool* ok) {
  try {
    std::string out = xal::host::TranslateToSqlite(sql, kind);
    *ok = true;
    return out;
  } catch (const xal::VbError& e) {
    Check(e.number() == xal::host::kErrSql && !e.description().empty());
    *ok = false;
    return {};
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  std::string_view sql(reinterpret_cast<const char*>(data), size);

  // The tokens cover the text exactly, in order, and none is empty.
  size_t at = 0;
  for (const xal::host::SqlToken& t : xal::host::TokenizeSql(sql)) {
    Check(!t.text.empty() && t.text.data() == sql.data() + at);
    at += t.text.size();
  }
  Check(at == sql.size());

  for (int kind : {1, 2}) {
    bool ok = false;
    std::string once = Translate(sql, kind, &ok);
    if (!ok) continue;
    // On the server kind (where "x" stays a name) a translation is a fixed point, unless the second
    // pass refuses what the first produced (a serial written right before a ".", say).
    if (kind == 2) {
      bool again = false;
      std::string twice = Translate(once, 2, &again);
      Check(!again || twice == once);
    }
  }
  return 0;
}
