// XALProbe: behaviour of the binding test class.
#include "typelib/probe.h"

#include "runtime/convert.h"
#include "runtime/error.h"

namespace xal {

int32_t XALProbe::Add(int32_t a, int32_t b) {
  int32_t sum = 0;
  if (__builtin_add_overflow(a, b, &sum)) Raise(kErrOverflow);
  bool cancel = false;
  events_.Raise(&ProbeEvents::Computed, Variant(sum), cancel);
  return cancel ? 0 : sum;
}

int32_t XALProbe::Append(std::string& text, const std::string& suffix) {
  text += suffix;
  return static_cast<int32_t>(text.size());
}

std::string XALProbe::Describe(const Variant& value) {
  std::string type = VarTypeName(value.Type());
  switch (value.Type()) {
    case VarType::Empty: case VarType::Null: case VarType::Missing: case VarType::Object: case VarType::Array:
      return type;
    default:
      return type + ":" + CStr(value);
  }
}

std::string XALProbe::Typed(int16_t i, int32_t l, double d, Currency c, Date dt, bool b, const std::string& s) {
  return CStr(Variant(i)) + "|" + CStr(Variant(l)) + "|" + CStr(Variant(d)) + "|" + CStr(Variant(c)) + "|" +
         CStr(Variant(dt.serial)) + "|" + CStr(Variant(b)) + "|" + s;
}

void XALProbe::Fail(int32_t number, const std::string& description) {
  if (description.empty()) Raise(number);
  Raise(number, description);
}

Variant XALProbe::Ask(const std::string& prompt) {
  Variant answer;
  events_.Raise(&ProbeEvents::Question, prompt, answer);
  return answer;
}

Ref<XALProbe> XALProbe::Child() {
  if (!child_) child_ = MakeRef<XALProbe>();
  return child_;
}

bool XALProbe::SameAs(const Ref<XALProbe>& other) { return other.get() == this; }

}  // namespace xal
