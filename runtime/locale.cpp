// Per-thread locale settings of the runtime.
#include "runtime/locale.h"

namespace xal {

namespace {
RuntimeLocale& Current() {
  thread_local RuntimeLocale locale;
  return locale;
}
}  // namespace

const RuntimeLocale& CurrentLocale() { return Current(); }

void SetLocale(const RuntimeLocale& locale) { Current() = locale; }

void SetDecimalSeparator(std::string_view sep) {
  RuntimeLocale& l = Current();
  l.decimal = std::string(sep);
  l.thousands = (sep == ",") ? "\u00A0" : ",";
}

}  // namespace xal
