// Text dump of the type library.
#include "typelib/dump.h"

#include <sstream>

#include "runtime/convert.h"

namespace xal {

std::string TypeText(VarType type, const std::type_info* objectType) {
  if (type == VarType::Object && objectType) {
    if (const ClassInfo* c = TypeRegistry::Instance().ByType(*objectType)) return c->name();
    return "Object";
  }
  return VarTypeName(type);
}

namespace {
std::string DefaultText(const Variant& v) {
  if (v.IsString()) return "\"" + v.AsString() + "\"";
  if (v.IsObject()) return "Nothing";
  if (v.IsNull()) return "Null";
  if (v.IsEmpty()) return "Empty";
  return CStr(v);
}

std::string ParamList(const std::vector<ParamInfo>& params) {
  std::string s;
  for (size_t i = 0; i < params.size(); ++i) s += (i ? ", " : "") + DescribeParam(params[i]);
  return s;
}
}  // namespace

std::string DescribeParam(const ParamInfo& p) {
  std::string s = (p.byRef ? "ByRef " : "") + p.name + " As " + TypeText(p.type, p.objectType);
  if (!p.optional) return s;
  if (!p.defaultValue.IsMissing()) s += " = " + DefaultText(p.defaultValue);
  return "[" + s + "]";
}

std::string DumpTypeLibrary(const TypeRegistry& registry) {
  std::ostringstream out;
  for (const auto& c : registry.classes()) {
    out << "class " << c->name() << (c->creatable() ? " (creatable)" : "") << " : " << c->interfaceName();
    if (c->events()) out << ", events " << c->events()->name;
    out << "\n";
    for (const auto& m : c->members()) {
      out << "  [" << m.dispid << "] " << MemberKindName(m.kind) << " " << m.name << "(" << ParamList(m.params) << ")";
      if (m.returns != VarType::Empty) out << " As " << TypeText(m.returns, m.returnsObject);
      if (m.hidden) out << " (hidden)";
      out << "\n";
    }
  }
  for (const auto& e : registry.eventInterfaces()) {
    out << "events " << e->name << "\n";
    for (const auto& m : e->members) out << "  [" << m.dispid << "] " << m.name << "(" << ParamList(m.params) << ")\n";
  }
  for (const auto& e : registry.enums()) {
    out << "enum " << e.name << "\n";
    for (const auto& [name, value] : e.values) out << "  " << name << " = " << value << "\n";
  }
  return out.str();
}

}  // namespace xal
