// Late-bound invocation: argument count and optional-argument rules, then the member's thunk.
#include "runtime/dispatch.h"

#include <array>

namespace xal {

Variant ZeroValue(VarType type) {
  switch (type) {
    case VarType::Integer: return Variant(int16_t{0});
    case VarType::Long: return Variant(int32_t{0});
    case VarType::Double: return Variant(0.0);
    case VarType::Currency: return Variant(Currency());
    case VarType::Date: return Variant(Date(0));
    case VarType::String: return Variant(std::string());
    case VarType::Boolean: return Variant(false);
    case VarType::Object: return Variant::Nothing();
    case VarType::Array: return Variant(SafeArray());
    default: return Variant::Missing();
  }
}

namespace {

// Lays the caller's arguments out one per parameter, filling omitted optional ones, then calls.
// A property assignment's last argument is always the value: with fewer arguments than
// parameters it goes to the last parameter and the optional indexes before it are omitted
// (`sa.Text = "x"` puts line -1). The given arguments are moved into the call and moved back
// afterwards — also when the call fails — so a by-ref parameter leaves in the caller's argument
// whatever the member put there.
Variant CallMember(Object& self, const MemberInfo& m, MemberKind kind, std::span<Variant> args) {
  const size_t n = m.params.size(), k = args.size();
  if (k > n || n > 64) Raise(kErrWrongArgCount);
  constexpr size_t kNone = SIZE_MAX;
  std::array<size_t, 64> source;  // the argument each parameter takes, or kNone
  const bool assignment = (kind == MemberKind::Put || kind == MemberKind::PutRef) && k > 0 && k < n;
  for (size_t i = 0; i < n; ++i) {
    size_t a = i < k ? i : kNone;
    if (assignment) a = i == n - 1 ? k - 1 : (i < k - 1 ? i : kNone);
    source[i] = (a != kNone && !args[a].IsMissing()) ? a : kNone;
    if (source[i] == kNone && !m.params[i].optional) Raise(kErrNotOptional);
  }

  constexpr size_t kInline = 8;
  std::array<Variant, kInline> inlineSlots;
  std::vector<Variant> heapSlots;
  if (n > kInline) heapSlots.resize(n);
  std::span<Variant> slots = n > kInline ? std::span<Variant>(heapSlots) : std::span<Variant>(inlineSlots.data(), n);
  for (size_t i = 0; i < n; ++i) {
    const ParamInfo& p = m.params[i];
    if (source[i] != kNone)
      slots[i] = std::move(args[source[i]]);
    else
      slots[i] = p.defaultValue.IsMissing() ? ZeroValue(p.type) : p.defaultValue;
  }
  struct GiveBack {
    std::span<Variant> args, slots;
    const std::array<size_t, 64>& source;
    ~GiveBack() {
      for (size_t i = 0; i < slots.size(); ++i)
        if (source[i] != SIZE_MAX) args[source[i]] = std::move(slots[i]);
    }
  } giveBack{args, slots, source};
  return m.thunk(self, slots);
}

}  // namespace

Variant Invoke(const ObjectRef& obj, std::string_view name, MemberKind kind, std::span<Variant> args) {
  if (!obj) Raise(kErrObjectNotSet);
  const MemberInfo* m = ClassOf(*obj)->Find(name, kind);
  if (!m && kind == MemberKind::PutRef) m = ClassOf(*obj)->Find(name, MemberKind::Put);
  if (!m) Raise(kErrNoMember);
  return CallMember(*obj, *m, kind, args);
}

Variant Invoke(const ObjectRef& obj, int32_t dispid, MemberKind kind, std::span<Variant> args) {
  if (!obj) Raise(kErrObjectNotSet);
  const MemberInfo* m = ClassOf(*obj)->FindById(dispid, kind);
  if (!m) Raise(kErrNoMember);
  return CallMember(*obj, *m, kind, args);
}

Variant Call(const ObjectRef& obj, std::string_view name, std::vector<Variant> args) {
  return Invoke(obj, name, MemberKind::Method, args);
}

Variant GetProperty(const ObjectRef& obj, std::string_view name, std::vector<Variant> args) {
  return Invoke(obj, name, MemberKind::Get, args);
}

void PutProperty(const ObjectRef& obj, std::string_view name, Variant value) {
  std::vector<Variant> args{std::move(value)};
  Invoke(obj, name, MemberKind::Put, args);
}

}  // namespace xal
