// The demo run: value semantics, late-bound calls and events, printed as a short report.
#include "apps/xal/demo.h"

#include "runtime/convert.h"
#include "runtime/dispatch.h"
#include "runtime/events.h"
#include "runtime/format.h"
#include "runtime/locale.h"
#include "runtime/member_table.h"

namespace xal::app {

namespace {

// A script host's sink: prints each event and answers questions with "Yes".
class PrintingSink : public GenericSink {
 public:
  explicit PrintingSink(std::ostream& out) : out_(out) {}
  void OnEvent(int32_t dispid, const std::string& name, std::span<Variant> args) override {
    out_ << "    event " << name << " (" << dispid << ")";
    for (const auto& a : args) out_ << " " << DebugString(a);
    out_ << "\n";
    if (name == "Question") args[1] = Variant("Yes");
  }

 private:
  std::ostream& out_;
};

void Values(std::ostream& out) {
  out << "Values as the document scripts see them\n";
  struct Row {
    const char* what;
    std::string text;
  };
  const Row rows[] = {
      {"CStr(0.1 + 0.2)", CStr(Variant(0.1 + 0.2))},
      {"CStr(1 / 3)", CStr(Variant(1.0 / 3.0))},
      {"Format(2.675, \"0.00\")", Format(Variant(2.675), "0.00")},
      {"Format(1234.5, \"#,##0.00\")", Format(Variant(1234.5), "#,##0.00")},
      {"CLng(2.5), CLng(3.5)", CStr(Variant(CLng(Variant(2.5)))) + ", " + CStr(Variant(CLng(Variant(3.5))))},
      {"CCur(10 / 3)", CStr(Variant(CCur(Variant(10.0 / 3.0))))},
  };
  for (const auto& r : rows) out << "  " << r.what << " = " << r.text << "\n";
  ScopedLocale estonian{RuntimeLocale{",", "\u00A0", DateOrder::DayMonthYear, "True", "False"}};
  out << "  with \",\" as decimal separator: Format(1234.5, \"#,##0.00\") = " << Format(Variant(1234.5), "#,##0.00")
      << "\n";
}

void LateBound(std::ostream& out) {
  out << "Late-bound calls by name\n";
  ObjectRef probe = CreateObject("XALProbe");
  const ClassInfo* cls = ClassOf(*probe);
  auto sink = std::make_shared<PrintingSink>(out);
  uint32_t cookie = cls->ConnectGeneric(*probe, sink);
  PutProperty(probe, "name", Variant("demo"));
  out << "  Name = " << CStr(GetProperty(probe, "NAME")) << "\n";
  std::vector<Variant> args{Variant(40)};
  out << "  Add(40) with b left out = " << CStr(Invoke(probe, "Add", MemberKind::Method, args)) << "\n";
  std::vector<Variant> byref{Variant("total"), Variant(": 42")};
  Invoke(probe, "Append", MemberKind::Method, byref);
  out << "  Append(ByRef \"total\", \": 42\") leaves \"" << CStr(byref[0]) << "\"\n";
  out << "  Ask(\"Continue?\") = " << CStr(Call(probe, "Ask", {Variant("Continue?")})) << "\n";
  try {
    Call(probe, "NoSuchMember");
  } catch (const VbError& e) {
    out << "  NoSuchMember -> error " << e.number() << ": " << e.description() << "\n";
  }
  cls->DisconnectGeneric(*probe, cookie);
}

}  // namespace

int RunDemo(std::ostream& out) {
  Values(out);
  LateBound(out);
  out << "Type library: " << TypeRegistry::Instance().classes().size() << " classes (xal typelib lists them)\n";
  return 0;
}

}  // namespace xal::app
