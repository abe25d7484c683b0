// libFuzzer target for the default-value list text: arbitrary bytes are read with Create (as
// values or as defaults) and written back with ToString (values only or with defaults). What
// ToString writes must be a fixed point: reading it into a fresh list and writing that list
// gives the same text again, and a deep copy writes the same text as its original.
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "collections/dv_items.h"
#include "runtime/error.h"

namespace {

void Check(bool ok) {
  if (!ok) __builtin_trap();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  if (size == 0) return 0;
  // The first byte picks the flags; the rest is the text. A second Create with the same text
  // in the other mode exercises the merge of values and defaults into existing items.
  const uint8_t flags = data[0];
  const bool asDefault = flags & 1;
  const bool useDefault = flags & 2;
  const bool mergeOther = flags & 4;
  const std::string text(reinterpret_cast<const char*>(data + 1), size - 1);

  try {
    auto list = xal::MakeRef<xal::DVItems>();
    list->Create(text, asDefault);
    if (mergeOther) list->Create(text, !asDefault);
    const std::string written = list->ToString(useDefault);

    // Every value read from text is a string, so nothing here lacks a text form: the writer
    // cannot have failed, and the output ends each line it writes.
    Check(written.empty() || written.ends_with("\r\n"));
    Check(list->Clone()->ToString(useDefault) == written);

    // The format cannot hold what the first reading dropped (entries without a value, text
    // around the separators), but everything the writer does put out is read back unchanged.
    xal::DVItems again;
    Check(again.Create(written, false));
    Check(again.ToString(false) == written);
    Check(again.ToString(true) == written);
  } catch (const xal::VbError&) {
    __builtin_trap();  // neither Create nor ToString lets a run-time error out
  }
  return 0;
}
