// libFuzzer target for the `xal session` reader: any bytes as one request line. Every input must
// give an answer line (an error answer is fine); a crash, a sanitizer report or an escaping
// exception is a finding.
#include <cstddef>
#include <cstdint>
#include <string_view>

#include "apps/xal/session.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static xal::app::Session* session = [] {
    auto* s = new xal::app::Session();
    s->Handle(R"({"id":0,"new":"XALProbe"})");  // handle 1 exists for calls
    return s;
  }();
  std::string_view line(reinterpret_cast<const char*>(data), size);
  std::string answer = session->Handle(line);
  if (answer.empty() || answer.front() != '{') __builtin_trap();
  // Keep the handle table from growing without bound across runs.
  if (session->LiveHandles() > 1000) {
    delete session;
    session = new xal::app::Session();
    session->Handle(R"({"id":0,"new":"XALProbe"})");
  }
  return 0;
}
