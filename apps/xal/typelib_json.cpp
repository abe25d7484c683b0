// JSON form of the type library:
// {"classes":[{"name","creatable","interface","members":[{"name","dispid","kind","params":[{"name",
//  "type","optional","default","byref"}],"returns"}]}],"events":[{"name","source","members":[…]}],
//  "enums":[{"name","values":{…}}]}
#include "apps/xal/typelib_json.h"

#include "typelib/dump.h"

namespace xal::app {

namespace {
Json ParamsJson(const std::vector<ParamInfo>& params) {
  HandleMap none{[](const ObjectRef&) { return Json(); }, [](const Json&) { return ObjectRef(); }};
  Json out = Json::array();
  for (const auto& p : params)
    out.push_back({{"name", p.name},
                   {"type", TypeText(p.type, p.objectType)},
                   {"optional", p.optional},
                   {"default", p.defaultValue.IsMissing() ? Json() : ToJson(p.defaultValue, none)},
                   {"byref", p.byRef}});
  return out;
}
}  // namespace

Json TypeLibraryJson(const TypeRegistry& registry) {
  Json classes = Json::array();
  for (const auto& c : registry.classes()) {
    Json members = Json::array();
    for (const auto& m : c->members())
      members.push_back({{"name", m.name},
                         {"dispid", m.dispid},
                         {"kind", MemberKindName(m.kind)},
                         {"params", ParamsJson(m.params)},
                         {"returns", m.returns == VarType::Empty ? Json() : Json(TypeText(m.returns, m.returnsObject))}});
    Json cls = {{"name", c->name()}, {"creatable", c->creatable()}, {"interface", c->interfaceName()}, {"members", members}};
    if (c->events()) cls["events"] = c->events()->name;
    classes.push_back(cls);
  }
  Json events = Json::array();
  for (const auto& e : registry.eventInterfaces()) {
    Json sources = Json::array();
    for (const auto& c : registry.classes())
      if (c->events() == e.get()) sources.push_back(c->name());
    Json members = Json::array();
    for (const auto& m : e->members) members.push_back({{"name", m.name}, {"dispid", m.dispid}, {"params", ParamsJson(m.params)}});
    events.push_back({{"name", e->name}, {"source", sources.size() == 1 ? sources[0] : sources}, {"members", members}});
  }
  Json enums = Json::array();
  for (const auto& e : registry.enums()) {
    Json values = Json::object();
    for (const auto& [name, value] : e.values) values[name] = value;
    enums.push_back({{"name", e.name}, {"values", values}});
  }
  return {{"classes", classes}, {"events", events}, {"enums", enums}};
}

}  // namespace xal::app
