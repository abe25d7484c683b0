// libFuzzer target for the numeric text paths: arbitrary bytes go through ParseNumber,
// IsNumericText, Val, CDbl, CLng, CCur and Format(text, "0.00") under both locales. A VbError is
// the expected way to reject text; any other exception, a crash or undefined behaviour is a
// finding. The two parsers must also agree: text IsNumericText accepts must parse.
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

#include "runtime/convert.h"
#include "runtime/format.h"
#include "runtime/locale.h"

namespace {

template <typename F>
void Guarded(F&& f) {
  try {
    f();
  } catch (const xal::VbError&) {
  }
}

void Exercise(std::string_view text) {
  bool numeric = xal::IsNumericText(text);
  Guarded([&] {
    double v = xal::ParseNumber(text);
    if (!numeric) std::abort();  // ParseNumber accepted what IsNumericText rejected
    (void)xal::CStr(xal::Variant(v));
  });
  if (numeric) {
    try {
      (void)xal::ParseNumber(text);
    } catch (const xal::VbError&) {
      std::abort();  // IsNumericText accepted what ParseNumber rejects
    }
  }
  xal::Variant value{std::string(text)};
  Guarded([&] { (void)xal::Val(text); });
  Guarded([&] { (void)xal::CDbl(value); });
  Guarded([&] { (void)xal::CLng(value); });
  Guarded([&] { (void)xal::CCur(value); });
  Guarded([&] { (void)xal::Format(value, "0.00"); });
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  std::string_view text(reinterpret_cast<const char*>(data), size);
  Exercise(text);
  {
    xal::RuntimeLocale comma;
    comma.decimal = ",";
    comma.thousands = "\u00A0";
    xal::ScopedLocale scoped(comma);
    Exercise(text);
  }
  // The text as a pattern too: Format must survive any picture string.
  Guarded([&] { (void)xal::Format(xal::Variant(-1234.5678), text); });
  return 0;
}
