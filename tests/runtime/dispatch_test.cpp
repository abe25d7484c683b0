// Late-bound calls: look-up by name in any letter case and by dispatch id, optional arguments with
// and without defaults, by-ref write-back, argument conversion, and every error number.
#include "runtime/dispatch.h"

#include <gtest/gtest.h>

#include "error_of.h"

#include "runtime/binding.h"

namespace xal {
namespace {

class Widget : public Object {
 public:
  int32_t Scale(int32_t value, int32_t factor) { return value * factor; }
  std::string Label() const { return label_; }
  void SetLabel(const std::string& s) { label_ = s; }
  void Swap(Variant& a, Variant& b) { std::swap(a, b); }
  int32_t Bump(int32_t& counter) { return ++counter; }
  std::string Zeroes(int16_t i, double d, Currency c, Date dt, bool b, const std::string& s, const Variant& v,
                     const Ref<Widget>& w) {
    return std::to_string(i) + "|" + CStr(Variant(d)) + "|" + CStr(Variant(c)) + "|" + CStr(Variant(dt.serial)) + "|" +
           (b ? "T" : "F") + "|" + s + "|" + VarTypeName(v.Type()) + "|" + (w ? "obj" : "nothing");
  }
  bool IsSelf(const Ref<Widget>& w) { return w.get() == this; }
  Currency Price(Currency c) { return c.MulInt(2); }

 private:
  std::string label_;
};

class Other : public Object {};

const bool kRegistered = [] {
  ClassBuilder<Widget>("Widget").Creatable()
      .Method<&Widget::Scale>("Scale", {Param("Value"), Def("Factor", 10)})
      .Get<&Widget::Label>("Label").Default()
      .Put<&Widget::SetLabel>("Label", {Param("Value")})
      .Method<&Widget::Swap>("Swap", {Param("A"), Param("B")})
      .Method<&Widget::Bump>("Bump", {Param("Counter")})
      .Method<&Widget::Zeroes>("Zeroes", {Opt("i"), Opt("d"), Opt("c"), Opt("dt"), Opt("b"), Opt("s"), Opt("v"), Opt("w")})
      .Method<&Widget::IsSelf>("IsSelf", {Param("Other")})
      .Method<&Widget::Price>("Price", {Param("Amount")});
  ClassBuilder<Other>("Other").Creatable();
  return true;
}();

using ::xal::test::ErrorOf;

TEST(Dispatch, NamesAreCaseInsensitive) {
  ObjectRef w = CreateObject("wIdGeT");
  for (const char* name : {"Scale", "scale", "SCALE", "sCaLe"}) {
    SCOPED_TRACE(name);
    EXPECT_EQ(Call(w, name, {Variant(3), Variant(4)}), Variant(12));
  }
}

TEST(Dispatch, PropertyGetPutShareDispidAndDefaultIsZero) {
  ObjectRef w = CreateObject("Widget");
  PutProperty(w, "label", Variant("x"));
  EXPECT_EQ(GetProperty(w, "LABEL"), Variant("x"));
  const ClassInfo* cls = ClassOf(*w);
  const MemberInfo* get = cls->Find("Label", MemberKind::Get);
  const MemberInfo* put = cls->Find("Label", MemberKind::Put);
  ASSERT_TRUE(get && put);
  EXPECT_EQ(get->dispid, 0);
  EXPECT_EQ(put->dispid, 0);
  std::vector<Variant> none;
  EXPECT_EQ(Invoke(w, 0, MemberKind::Get, none), Variant("x"));
  // Dispatch ids follow interface order and differ between members.
  EXPECT_NE(cls->Find("Scale", MemberKind::Method)->dispid, cls->Find("Swap", MemberKind::Method)->dispid);
}

TEST(Dispatch, OmittedOptionalArguments) {
  ObjectRef w = CreateObject("Widget");
  struct Row {
    std::vector<Variant> args;
    Variant expected;
  } rows[] = {
      {{Variant(3)}, Variant(30)},                       // default 10
      {{Variant(3), Variant::Missing()}, Variant(30)},   // Missing is omitted
      {{Variant(3), Variant(2)}, Variant(6)},
  };
  for (auto& r : rows) {
    SCOPED_TRACE(DebugString(r.expected));
    EXPECT_EQ(Invoke(w, "Scale", MemberKind::Method, r.args), r.expected);
  }
  // Optional without default: the type's zero value; a Variant parameter receives Missing.
  EXPECT_EQ(Call(w, "Zeroes"), Variant("0|0|0|0|F||Missing|nothing"));
}

TEST(Dispatch, ByRefWriteBack) {
  ObjectRef w = CreateObject("Widget");
  std::vector<Variant> args{Variant("a"), Variant(2)};
  Invoke(w, "Swap", MemberKind::Method, args);
  EXPECT_EQ(args[0], Variant(2));
  EXPECT_EQ(args[1], Variant("a"));
  // A typed by-ref parameter converts in and writes the typed value back.
  std::vector<Variant> counter{Variant("41")};
  EXPECT_EQ(Invoke(w, "Bump", MemberKind::Method, counter), Variant(42));
  EXPECT_EQ(counter[0], Variant(42));
}

TEST(Dispatch, ArgumentConversion) {
  ObjectRef w = CreateObject("Widget");
  EXPECT_EQ(Call(w, "Scale", {Variant("2.5"), Variant(int16_t{2})}), Variant(4));  // "2.5" -> 2 (half-even)
  EXPECT_EQ(Call(w, "Price", {Variant(1.5)}), Variant(Currency::FromRaw(30000)));
  EXPECT_EQ(Call(w, "IsSelf", {Variant(w)}), Variant(true));
}

TEST(Dispatch, ErrorNumbers) {
  ObjectRef w = CreateObject("Widget");
  ObjectRef other = CreateObject("Other");
  struct Row {
    const char* what;
    std::function<void()> call;
    int expected;
  } rows[] = {
      {"no such member", [&] { Call(w, "Nope"); }, 438},
      {"put of a method", [&] { PutProperty(w, "Scale", Variant(1)); }, 438},
      {"required argument left out", [&] { Call(w, "Scale"); }, 449},
      {"required argument Missing", [&] { Call(w, "Scale", {Variant::Missing()}); }, 449},
      {"too many arguments", [&] { Call(w, "Scale", {Variant(1), Variant(2), Variant(3)}); }, 450},
      {"text that is no number", [&] { Call(w, "Scale", {Variant("abc")}); }, 13},
      {"Null into a typed parameter", [&] { Call(w, "Scale", {Variant::Null()}); }, 13},
      {"object of another class", [&] { Call(w, "IsSelf", {Variant(other)}); }, 13},
      {"number for an object", [&] { Call(w, "IsSelf", {Variant(1)}); }, 13},
      {"overflow converting", [&] { Call(w, "Scale", {Variant(3e10)}); }, 6},
      {"call on Nothing", [&] { Call(nullptr, "Scale", {Variant(1)}); }, 91},
      {"unknown class", [&] { CreateObject("NoSuchClass"); }, 429},
      {"by id: unknown", [&] { std::vector<Variant> a; Invoke(w, 999, MemberKind::Method, a); }, 438},
  };
  for (auto& r : rows) {
    SCOPED_TRACE(r.what);
    EXPECT_EQ(ErrorOf(r.call), r.expected);
  }
}

TEST(Dispatch, FailedCallLeavesArgumentsIntact) {
  ObjectRef w = CreateObject("Widget");
  std::vector<Variant> args{Variant("keep"), Variant("abc")};
  EXPECT_EQ(ErrorOf([&] { Invoke(w, "Scale", MemberKind::Method, args); }), 13);
  EXPECT_EQ(args[0], Variant("keep"));
  EXPECT_EQ(args[1], Variant("abc"));
}

TEST(Dispatch, MethodReadAsPropertyAndBack) {
  ObjectRef w = CreateObject("Widget");
  PutProperty(w, "Label", Variant("z"));
  EXPECT_EQ(Call(w, "Label"), Variant("z"));  // a property get called like a method
  EXPECT_EQ(GetProperty(w, "Scale", {Variant(2)}), Variant(20));
}

}  // namespace
}  // namespace xal

namespace xal {
namespace {

class Writer : public Object {
 public:
  void AppendThenFail(std::string& text) {
    text += "partial";
    Raise(kErrTypeMismatch);
  }
};

const bool kWriterRegistered = [] {
  ClassBuilder<Writer>("DispatchWriter").Creatable().Method<&Writer::AppendThenFail>("AppendThenFail", {Param("Text")});
  return true;
}();

TEST(Dispatch, ByRefKeepsWhatTheMemberWroteBeforeFailing) {
  ObjectRef w = CreateObject("DispatchWriter");
  std::vector<Variant> args{Variant("so far: ")};
  EXPECT_THROW(Invoke(w, "AppendThenFail", MemberKind::Method, args), VbError);
  EXPECT_EQ(args[0], Variant("so far: partial"));
}

}  // namespace
}  // namespace xal

namespace xal {
namespace {

class Lines : public Object {
 public:
  std::string Text(int32_t line) const { return line == -1 ? all_ : "line " + std::to_string(line); }
  void SetText(int32_t line, const std::string& value) { all_ = std::to_string(line) + ":" + value; }

 private:
  std::string all_;
};

const bool kLinesRegistered = [] {
  ClassBuilder<Lines>("DispatchLines").Creatable()
      .Get<&Lines::Text>("Text", {Def("Line", -1)})
      .Put<&Lines::SetText>("Text", {Def("Line", -1), Param("Value")});
  return true;
}();

TEST(Dispatch, AssignmentValueIsTheLastArgument) {
  ObjectRef o = CreateObject("DispatchLines");
  PutProperty(o, "Text", Variant("all"));  // the optional line is left out
  EXPECT_EQ(GetProperty(o, "Text"), Variant("-1:all"));
  std::vector<Variant> args{Variant(3), Variant("third")};
  Invoke(o, "Text", MemberKind::Put, args);
  EXPECT_EQ(GetProperty(o, "Text"), Variant("3:third"));
  std::vector<Variant> none;
  EXPECT_EQ(ErrorOf([&] { Invoke(o, "Text", MemberKind::Put, none); }), 449);  // no value at all
}

}  // namespace
}  // namespace xal
