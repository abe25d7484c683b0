// The registry of member tables and the case-insensitive member look-up behind late-bound calls.
#include "runtime/member_table.h"

#include <algorithm>

#include "runtime/error.h"

namespace xal {

namespace {
// Member and class names are ASCII, so lowering ASCII letters is the whole case rule for them.
std::string AsciiLower(std::string_view s) {
  std::string out(s);
  for (char& c : out)
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
  return out;
}
}  // namespace

const char* MemberKindName(MemberKind k) {
  switch (k) {
    case MemberKind::Method: return "method";
    case MemberKind::Get: return "get";
    case MemberKind::Put: return "put";
    case MemberKind::PutRef: return "putref";
  }
  return "method";
}

const EventMemberInfo* EventInterfaceInfo::FindById(int32_t dispid) const {
  for (const auto& m : members)
    if (m.dispid == dispid) return &m;
  return nullptr;
}

// ---------------------------------------------------------------------------------------------
// ClassInfo
// ---------------------------------------------------------------------------------------------

MemberInfo& ClassInfo::AddMember(MemberInfo m) {
  std::string key = AsciiLower(m.name);
  auto& slots = byName_[key];
  // A property's get, put and putref share one dispatch id, as in the original interfaces.
  if (!slots.empty())
    m.dispid = members_[slots.front()].dispid;
  else
    m.dispid = nextDispid_++;
  slots.push_back(members_.size());
  members_.push_back(std::move(m));
  return members_.back();
}

const MemberInfo* ClassInfo::Find(std::string_view name, MemberKind kind) const {
  char buf[64];
  std::string lowered;
  std::string_view key;
  if (name.size() <= sizeof buf) {
    for (size_t i = 0; i < name.size(); ++i) {
      char c = name[i];
      buf[i] = (c >= 'A' && c <= 'Z') ? static_cast<char>(c - 'A' + 'a') : c;
    }
    key = std::string_view(buf, name.size());
  } else {
    lowered = AsciiLower(name);
    key = lowered;
  }
  auto it = byName_.find(key);
  if (it == byName_.end()) return nullptr;
  const MemberInfo* fallback = nullptr;
  for (size_t i : it->second) {
    const MemberInfo& m = members_[i];
    if (m.kind == kind) return &m;
    // A script may read a function as a property, and call a property get like a method.
    if ((kind == MemberKind::Get && m.kind == MemberKind::Method) ||
        (kind == MemberKind::Method && m.kind == MemberKind::Get))
      fallback = &m;
  }
  return fallback;
}

const MemberInfo* ClassInfo::FindById(int32_t dispid, MemberKind kind) const {
  const MemberInfo* fallback = nullptr;
  for (const auto& m : members_) {
    if (m.dispid != dispid) continue;
    if (m.kind == kind) return &m;
    if ((kind == MemberKind::Get && m.kind == MemberKind::Method) ||
        (kind == MemberKind::Method && m.kind == MemberKind::Get))
      fallback = &m;
  }
  return fallback;
}

ObjectRef ClassInfo::Create() const {
  if (!factory_) Raise(kErrCannotCreate);
  return factory_();
}

uint32_t ClassInfo::ConnectGeneric(Object& source, std::shared_ptr<GenericSink> sink) const {
  if (!connect_) Raise(kErrNoMember, "The object raises no events");
  return connect_(source, std::move(sink));
}

void ClassInfo::DisconnectGeneric(Object& source, uint32_t cookie) const {
  if (disconnect_) disconnect_(source, cookie);
}

// ---------------------------------------------------------------------------------------------
// TypeRegistry
// ---------------------------------------------------------------------------------------------

TypeRegistry& TypeRegistry::Instance() {
  static TypeRegistry registry;
  return registry;
}

ClassInfo& TypeRegistry::AddClass(std::string name, std::type_index type) {
  auto info = std::make_unique<ClassInfo>(std::move(name), type);
  ClassInfo* p = info.get();
  classes_.push_back(std::move(info));
  byType_[type] = p;
  byName_[AsciiLower(p->name())] = p;
  return *p;
}

EventInterfaceInfo& TypeRegistry::AddEventInterface(std::string name) {
  events_.push_back(std::make_unique<EventInterfaceInfo>());
  events_.back()->name = std::move(name);
  return *events_.back();
}

void TypeRegistry::AddEnum(EnumInfo e) { enums_.push_back(std::move(e)); }

const ClassInfo* TypeRegistry::ByType(std::type_index type) const {
  auto it = byType_.find(type);
  return it == byType_.end() ? nullptr : it->second;
}

const ClassInfo* TypeRegistry::ByName(std::string_view name) const {
  auto it = byName_.find(AsciiLower(name));
  return it == byName_.end() ? nullptr : it->second;
}

const EventInterfaceInfo* TypeRegistry::EventsByName(std::string_view name) const {
  std::string key = AsciiLower(name);
  for (const auto& e : events_)
    if (AsciiLower(e->name) == key) return e.get();
  return nullptr;
}

const ClassInfo* ClassOf(const Object& obj) {
  if (!obj.classInfo_) {
    obj.classInfo_ = TypeRegistry::Instance().ByType(typeid(obj));
    if (!obj.classInfo_) Raise(kErrNoMember);
  }
  return obj.classInfo_;
}

ObjectRef CreateObject(std::string_view className) {
  const ClassInfo* info = TypeRegistry::Instance().ByName(className);
  if (!info || !info->creatable()) Raise(kErrCannotCreate);
  return info->Create();
}

}  // namespace xal
