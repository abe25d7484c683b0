// `xal`: call any public member of the component from a shell or a script.
//   xal call CLASS MEMBER [ARG…] [--kind method|get|put|putref] [--json]
//   xal session                 JSON lines on stdin/stdout (see session.h)
//   xal typelib [--json]        the type library
//   xal demo                    the main job: a walk through what the component does
#include "apps/xal/cli.h"

#include <cstdio>
#include <cstring>
#include <iostream>
#include <string>
#include <vector>

#include "apps/xal/call_args.h"
#include "apps/xal/demo.h"
#include "apps/xal/json_values.h"
#include "apps/xal/session.h"
#include "apps/xal/typelib_json.h"
#include "runtime/convert.h"
#include "runtime/dispatch.h"
#include "runtime/text.h"
#include "typelib/dump.h"

namespace xal::app {

namespace {

constexpr const char* kUsage =
    "usage: xal call CLASS MEMBER [ARG...] [--kind method|get|put|putref] [--json]\n"
    "       xal session\n"
    "       xal typelib [--json]\n"
    "       xal demo\n"
    "ARG: 5 1.5 word | i:5 l:5 f:1.5 c:12.34 d:2009-03-05 b:true s:text | null empty missing\n";

// Plain output of a result: its text as CStr gives it, with a few non-texts named.
std::string PlainText(const Variant& v) {
  switch (v.Type()) {
    case VarType::Null: return "Null";
    case VarType::Empty: return "";
    case VarType::Missing: return "Missing";
    case VarType::Object: return v.AsObject() ? "<" + std::string(ClassOf(*v.AsObject())->name()) + ">" : "Nothing";
    case VarType::Array: {
      std::string s;
      for (const auto& e : v.AsArray().Elements()) s += (s.empty() ? "" : "\n") + PlainText(e);
      return s;
    }
    default: return CStr(v);
  }
}

int CallCommand(const std::vector<std::string>& words) {
  bool json = false;
  std::string kindWord = "method";
  std::vector<std::string> rest;
  for (size_t i = 0; i < words.size(); ++i) {
    if (words[i] == "--json")
      json = true;
    else if (words[i] == "--kind" && i + 1 < words.size())
      kindWord = words[++i];
    else
      rest.push_back(words[i]);
  }
  if (rest.size() < 2) {
    std::fputs(kUsage, stderr);
    return 2;
  }
  try {
    const MemberKind kind = ParseMemberKind(kindWord);
    ObjectRef obj = CreateObject(rest[0]);
    std::vector<Variant> args;
    for (size_t i = 2; i < rest.size(); ++i) args.push_back(ParseCallArg(rest[i]));
    Variant result = Invoke(obj, rest[1], kind, args);
    if (json) {
      int64_t next = 1;
      HandleMap handles{[&](const ObjectRef&) { return Json(next++); }, [](const Json&) { return ObjectRef(); }};
      std::cout << ToJson(result, handles).dump() << "\n";
    } else {
      std::cout << PlainText(result) << "\n";
    }
    return 0;
  } catch (const VbError& e) {
    std::cerr << "error " << e.number() << ": " << e.description() << "\n";
    return 1;
  }
}

}  // namespace

int Main(int argc, char** argv) {
  std::vector<std::string> words(argv + 1, argv + argc);
  if (words.empty()) {
    std::fputs(kUsage, stderr);
    return 2;
  }
  const std::string cmd = words[0];
  words.erase(words.begin());
  if (cmd == "call") return CallCommand(words);
  if (cmd == "session") return RunSession();
  if (cmd == "typelib") {
    if (!words.empty() && words[0] == "--json")
      std::cout << TypeLibraryJson(TypeRegistry::Instance()).dump(2) << "\n";
    else
      std::cout << DumpTypeLibrary(TypeRegistry::Instance());
    return 0;
  }
  if (cmd == "demo") return RunDemo(std::cout);
  std::fputs(kUsage, stderr);
  return 2;
}

}  // namespace xal::app
