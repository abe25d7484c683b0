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
// The given arguments are moved into the call and moved back afterwards — also when the call
// fails — so a by-ref parameter leaves in the caller's argument whatever the member put there.
Variant CallMember(Object& self, const MemberInfo& m, std::span<Variant> args) {
  const size_t n = m.params.size();
  if (args.size() > n || n > 64) Raise(kErrWrongArgCount);
  uint64_t givenMask = 0;
  for (size_t i = 0; i < args.size(); ++i)
    if (!args[i].IsMissing()) givenMask |= uint64_t{1} << i;
  auto given = [&](size_t i) { return (givenMask >> i) & 1; };
  for (size_t i = 0; i < n; ++i)
    if (!given(i) && !m.params[i].optional) Raise(kErrNotOptional);

  constexpr size_t kInline = 8;
  std::array<Variant, kInline> inlineSlots;
  std::vector<Variant> heapSlots;
  if (n > kInline) heapSlots.resize(n);
  std::span<Variant> slots = n > kInline ? std::span<Variant>(heapSlots) : std::span<Variant>(inlineSlots.data(), n);
  for (size_t i = 0; i < n; ++i) {
    const ParamInfo& p = m.params[i];
    if (given(i))
      slots[i] = std::move(args[i]);
    else
      slots[i] = p.defaultValue.IsMissing() ? ZeroValue(p.type) : p.defaultValue;
  }
  struct GiveBack {
    std::span<Variant> args, slots;
    uint64_t mask;
    ~GiveBack() {
      for (size_t i = 0; i < args.size(); ++i)
        if ((mask >> i) & 1) args[i] = std::move(slots[i]);
    }
  } giveBack{args, slots, givenMask};
  return m.thunk(self, slots);
}

}  // namespace

Variant Invoke(const ObjectRef& obj, std::string_view name, MemberKind kind, std::span<Variant> args) {
  if (!obj) Raise(kErrObjectNotSet);
  const MemberInfo* m = ClassOf(*obj)->Find(name, kind);
  if (!m && kind == MemberKind::PutRef) m = ClassOf(*obj)->Find(name, MemberKind::Put);
  if (!m) Raise(kErrNoMember);
  return CallMember(*obj, *m, args);
}

Variant Invoke(const ObjectRef& obj, int32_t dispid, MemberKind kind, std::span<Variant> args) {
  if (!obj) Raise(kErrObjectNotSet);
  const MemberInfo* m = ClassOf(*obj)->FindById(dispid, kind);
  if (!m) Raise(kErrNoMember);
  return CallMember(*obj, *m, args);
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
