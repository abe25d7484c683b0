// Binding C++ members into member tables: the type library describes a class with one line per
// member, and the templates here derive the parameter types, by-reference flags and the thunk that
// converts Variants to the C++ parameter types, calls the member and writes by-ref results back.
//
//   ClassBuilder<Probe>("Probe").Creatable()
//       .Method<&Probe::Add>("Add", {Param("a"), Param("b").Default(1)})
//       .Get<&Probe::Name>("Name")
//       .Put<&Probe::SetName>("Name", {Param("value")});
#pragma once

#include <initializer_list>
#include <stdexcept>
#include <tuple>
#include <type_traits>
#include <typeinfo>
#include <utility>

#include "runtime/convert.h"
#include "runtime/member_table.h"

namespace xal {

// ---------------------------------------------------------------------------------------------
// Conversions between Variants and C++ parameter types
// ---------------------------------------------------------------------------------------------

template <class T, class = void>
struct ArgConv;

// A conversion that fails on an argument is a type mismatch for the caller, Null included.
template <class F>
auto ConvertArg(F&& f) -> decltype(f()) {
  try {
    return f();
  } catch (const VbError& e) {
    if (e.number() == kErrInvalidNull) Raise(kErrTypeMismatch);
    throw;
  }
}

#define XAL_ARGCONV(CppType, Vt, FromExpr)                                 \
  template <>                                                              \
  struct ArgConv<CppType> {                                                \
    static constexpr VarType type = Vt;                                    \
    static CppType From(const Variant& v) { return ConvertArg([&] { return FromExpr; }); } \
    static Variant To(const CppType& x) { return Variant(x); }             \
  };
XAL_ARGCONV(int16_t, VarType::Integer, CInt(v))
XAL_ARGCONV(int32_t, VarType::Long, CLng(v))
XAL_ARGCONV(double, VarType::Double, CDbl(v))
XAL_ARGCONV(Currency, VarType::Currency, CCur(v))
XAL_ARGCONV(Date, VarType::Date, CDate(v))
XAL_ARGCONV(bool, VarType::Boolean, CBool(v))
XAL_ARGCONV(std::string, VarType::String, CStr(v))
#undef XAL_ARGCONV

template <>
struct ArgConv<Variant> {
  static constexpr VarType type = VarType::Variant;
  static Variant From(const Variant& v) { return v; }
  static Variant To(const Variant& x) { return x; }
};

template <>
struct ArgConv<SafeArray> {
  static constexpr VarType type = VarType::Array;
  static SafeArray From(const Variant& v) {
    if (!v.IsArray()) Raise(kErrTypeMismatch);
    return v.AsArray();
  }
  static Variant To(const SafeArray& x) { return Variant(x); }
};

// Object parameters: Nothing is allowed; an object of another class, or a non-object, is error 13.
template <class T>
struct ArgConv<std::shared_ptr<T>, std::enable_if_t<std::is_base_of_v<Object, T>>> {
  static constexpr VarType type = VarType::Object;
  static std::shared_ptr<T> From(const Variant& v) {
    if (v.IsEmpty() || v.IsMissing()) return nullptr;
    if (!v.IsObject()) Raise(kErrTypeMismatch);
    if constexpr (std::is_same_v<T, Object>) {
      return v.AsObject();
    } else {
      if (!v.AsObject()) return nullptr;
      auto p = std::dynamic_pointer_cast<T>(v.AsObject());
      if (!p) Raise(kErrTypeMismatch);
      return p;
    }
  }
  static Variant To(const std::shared_ptr<T>& x) { return Variant(ObjectRef(x)); }
};

template <class T>
using Bare = std::remove_cvref_t<T>;

// A by-reference parameter is a non-const lvalue reference in the C++ signature.
template <class T>
constexpr bool kIsByRef = std::is_lvalue_reference_v<T> && !std::is_const_v<std::remove_reference_t<T>>;

template <class T>
ParamInfo DescribeParam() {
  ParamInfo p;
  p.type = ArgConv<Bare<T>>::type;
  if constexpr (requires { typename Bare<T>::element_type; }) p.objectType = &typeid(typename Bare<T>::element_type);
  p.byRef = kIsByRef<T>;
  return p;
}

// ---------------------------------------------------------------------------------------------
// Thunks from member-function pointers
// ---------------------------------------------------------------------------------------------

template <class>
struct MemberFnTraits;
template <class C, class R, class... A>
struct MemberFnTraits<R (C::*)(A...)> {
  using Class = C;
  using Result = R;
  using Args = std::tuple<A...>;
};
template <class C, class R, class... A>
struct MemberFnTraits<R (C::*)(A...) const> : MemberFnTraits<R (C::*)(A...)> {};

namespace internal {

// Holds one converted argument for the duration of the call.
template <class P>
struct ArgSlot {
  using T = Bare<P>;
  Variant& source;
  T value;
  explicit ArgSlot(Variant& v) : source(v), value(ArgConv<T>::From(v)) {}
  T& get() { return value; }
  void WriteBack() {
    if constexpr (kIsByRef<P>) source = ArgConv<T>::To(value);
  }
};
// Variant& binds straight to the caller's argument: nothing to convert or write back.
template <>
struct ArgSlot<Variant&> {
  Variant& source;
  explicit ArgSlot(Variant& v) : source(v) {}
  Variant& get() { return source; }
  void WriteBack() {}
};
template <>
struct ArgSlot<const Variant&> {
  Variant& source;
  explicit ArgSlot(Variant& v) : source(v) {}
  const Variant& get() { return source; }
  void WriteBack() {}
};

template <auto M, class... A, size_t... I>
Variant CallWith(Object& self, [[maybe_unused]] std::span<Variant> args, std::index_sequence<I...>) {
  using Traits = MemberFnTraits<decltype(M)>;
  using C = typename Traits::Class;
  using R = typename Traits::Result;
  auto& obj = static_cast<C&>(self);
  std::tuple<ArgSlot<A>...> slots{ArgSlot<A>(args[I])...};
  // A by-ref argument keeps what the member left in it even when the member fails, as a
  // variable passed by reference does.
  try {
    if constexpr (std::is_void_v<R>) {
      (obj.*M)(std::get<I>(slots).get()...);
      (std::get<I>(slots).WriteBack(), ...);
      return Variant();
    } else {
      Variant result = ArgConv<Bare<R>>::To((obj.*M)(std::get<I>(slots).get()...));
      (std::get<I>(slots).WriteBack(), ...);
      return result;
    }
  } catch (...) {
    (std::get<I>(slots).WriteBack(), ...);
    throw;
  }
}

template <auto M, class Tuple>
struct ThunkFor;
template <auto M, class... A>
struct ThunkFor<M, std::tuple<A...>> {
  static Variant Call(Object& self, std::span<Variant> args) {
    return CallWith<M, A...>(self, args, std::index_sequence_for<A...>{});
  }
  static std::vector<ParamInfo> Params() { return {DescribeParam<A>()...}; }
};

}  // namespace internal

// ---------------------------------------------------------------------------------------------
// Parameter descriptions and the class builder
// ---------------------------------------------------------------------------------------------

// The parts of a parameter the C++ signature cannot tell: its name, optional flag and default.
struct Param {
  std::string name;
  bool optional = false;
  Variant defaultValue = Variant::Missing();
  explicit Param(std::string n) : name(std::move(n)) {}
  Param& Optional() { optional = true; return *this; }
  Param& Default(Variant v) { optional = true; defaultValue = std::move(v); return *this; }
};
inline Param Opt(std::string name) { return Param(std::move(name)).Optional(); }
inline Param Def(std::string name, Variant v) { return Param(std::move(name)).Default(std::move(v)); }

template <class C>
class ClassBuilder {
 public:
  explicit ClassBuilder(std::string name) : info_(TypeRegistry::Instance().AddClass(std::move(name), typeid(C))) {
    info_.SetInterface("_" + info_.name());
  }
  ClassBuilder& Interface(std::string name) { info_.SetInterface(std::move(name)); return *this; }
  ClassBuilder& Creatable() {
    info_.SetFactory([] { return ObjectRef(MakeRef<C>()); });
    return *this;
  }
  template <auto M>
  ClassBuilder& Method(std::string name, std::vector<Param> params = {}) { return Add<M>(std::move(name), MemberKind::Method, params); }
  template <auto M>
  ClassBuilder& Get(std::string name, std::vector<Param> params = {}) { return Add<M>(std::move(name), MemberKind::Get, params); }
  template <auto M>
  ClassBuilder& Put(std::string name, std::vector<Param> params) { return Add<M>(std::move(name), MemberKind::Put, params); }
  template <auto M>
  ClassBuilder& PutRef(std::string name, std::vector<Param> params) { return Add<M>(std::move(name), MemberKind::PutRef, params); }
  // Marks the last member as the default member (dispatch id 0), as Item and Value are.
  ClassBuilder& Default() { last_->dispid = 0; return *this; }
  ClassBuilder& Hidden() { last_->hidden = true; return *this; }
  ClassInfo& info() { return info_; }

 private:
  template <auto M>
  ClassBuilder& Add(std::string name, MemberKind kind, const std::vector<Param>& given) {
    using Traits = MemberFnTraits<decltype(M)>;
    static_assert(std::is_base_of_v<typename Traits::Class, C> || std::is_same_v<typename Traits::Class, C>);
    using Thunks = internal::ThunkFor<M, typename Traits::Args>;
    MemberInfo m;
    m.name = std::move(name);
    m.kind = kind;
    m.params = Thunks::Params();
    if (given.size() != m.params.size())
      throw std::logic_error("member table of " + info_.name() + "." + m.name + ": parameter count differs");
    for (size_t i = 0; i < given.size(); ++i) {
      m.params[i].name = given[i].name;
      m.params[i].optional = given[i].optional;
      m.params[i].defaultValue = given[i].defaultValue;
    }
    using R = Bare<typename Traits::Result>;
    if constexpr (!std::is_void_v<R>) {
      m.returns = ArgConv<R>::type;
      if constexpr (requires { typename R::element_type; }) m.returnsObject = &typeid(typename R::element_type);
    }
    m.thunk = &Thunks::Call;
    last_ = &info_.AddMember(std::move(m));
    return *this;
  }
  ClassInfo& info_;
  MemberInfo* last_ = nullptr;
};

}  // namespace xal
