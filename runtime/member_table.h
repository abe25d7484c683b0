// Member tables: what a late-bound caller can know about a class — its members in interface order
// with dispatch ids, kinds, parameters (names, types, optional flags, defaults, by-reference), the
// event interface it raises, and how to create it. The runtime owns the registry; the type library
// fills it, so business classes never depend on their own descriptions.
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <typeindex>
#include <unordered_map>
#include <vector>

#include "runtime/object.h"
#include "runtime/variant.h"

namespace xal {

// Invoke kinds, numbered as the original dispatch interface numbers them.
enum class MemberKind : uint8_t { Method = 1, Get = 2, Put = 4, PutRef = 8 };
const char* MemberKindName(MemberKind k);  // "method", "get", "put", "putref"

struct ParamInfo {
  std::string name;
  VarType type = VarType::Variant;
  const std::type_info* objectType = nullptr;  // the class of an object parameter, if typed
  bool optional = false;
  Variant defaultValue = Variant::Missing();   // Missing: no default, the type's zero value is used
  bool byRef = false;
};

// Converts the arguments (already one per parameter, omitted ones filled) and calls the member.
// By-reference arguments are written back into `args`.
using Thunk = Variant (*)(Object& self, std::span<Variant> args);

struct MemberInfo {
  std::string name;
  int32_t dispid = 0;
  MemberKind kind = MemberKind::Method;
  std::vector<ParamInfo> params;
  VarType returns = VarType::Empty;            // Empty: no result (a Sub)
  const std::type_info* returnsObject = nullptr;
  Thunk thunk = nullptr;
  bool hidden = false;                         // NewEnum and the like
};

struct EventMemberInfo {
  std::string name;
  int32_t dispid = 0;
  std::vector<ParamInfo> params;
};

class GenericSink;

struct EventInterfaceInfo {
  std::string name;                            // "__XALSBEproxy"
  std::vector<EventMemberInfo> members;        // in interface order
  const EventMemberInfo* FindById(int32_t dispid) const;
};

// Connects a generic sink to an object's event source; returns a cookie for Disconnect.
using GenericConnectFn = uint32_t (*)(Object& source, std::shared_ptr<GenericSink> sink);
using GenericDisconnectFn = void (*)(Object& source, uint32_t cookie);

// Hash for maps keyed by std::string that are searched with a string_view (no allocation).
struct StringViewHash {
  using is_transparent = void;
  size_t operator()(std::string_view s) const { return std::hash<std::string_view>{}(s); }
};

class ClassInfo {
 public:
  ClassInfo(std::string name, std::type_index type) : name_(std::move(name)), type_(type) {}

  const std::string& name() const { return name_; }
  std::type_index type() const { return type_; }
  const std::string& interfaceName() const { return interface_; }
  bool creatable() const { return static_cast<bool>(factory_); }
  const std::vector<MemberInfo>& members() const { return members_; }
  const EventInterfaceInfo* events() const { return events_; }

  // Case-insensitive look-up, O(1). Get also finds a method of that name (a parameterless
  // function may be read as a property) and Method also finds a property get.
  const MemberInfo* Find(std::string_view name, MemberKind kind) const;
  const MemberInfo* FindById(int32_t dispid, MemberKind kind) const;
  // The default member (dispid 0) of the kind, if any.
  const MemberInfo* DefaultMember(MemberKind kind) const { return FindById(0, kind); }

  ObjectRef Create() const;
  uint32_t ConnectGeneric(Object& source, std::shared_ptr<GenericSink> sink) const;
  void DisconnectGeneric(Object& source, uint32_t cookie) const;

  // ---- Filled by the type library -------------------------------------------------------------
  void SetInterface(std::string name) { interface_ = std::move(name); }
  void SetFactory(std::function<ObjectRef()> f) { factory_ = std::move(f); }
  void SetEvents(const EventInterfaceInfo* e, GenericConnectFn c, GenericDisconnectFn d) {
    events_ = e;
    connect_ = c;
    disconnect_ = d;
  }
  // Appends a member; a property's get/put/putref share one dispatch id. Returns the stored entry.
  MemberInfo& AddMember(MemberInfo m);

 private:
  static uint64_t Key(std::string_view name, MemberKind kind);
  std::string name_;
  std::type_index type_;
  std::string interface_;
  std::vector<MemberInfo> members_;
  std::unordered_map<std::string, std::vector<size_t>, StringViewHash, std::equal_to<>> byName_;  // ASCII-lowered name -> members
  std::function<ObjectRef()> factory_;
  const EventInterfaceInfo* events_ = nullptr;
  GenericConnectFn connect_ = nullptr;
  GenericDisconnectFn disconnect_ = nullptr;
  int32_t nextDispid_ = 1;
};

struct EnumInfo {
  std::string name;
  std::vector<std::pair<std::string, int32_t>> values;  // in declaration order
};

// The process-wide type library: filled once while the library loads, read-only afterwards.
class TypeRegistry {
 public:
  static TypeRegistry& Instance();

  ClassInfo& AddClass(std::string name, std::type_index type);
  EventInterfaceInfo& AddEventInterface(std::string name);
  void AddEnum(EnumInfo e);

  const ClassInfo* ByType(std::type_index type) const;
  const ClassInfo* ByName(std::string_view name) const;  // case-insensitive
  const EventInterfaceInfo* EventsByName(std::string_view name) const;
  const std::vector<std::unique_ptr<ClassInfo>>& classes() const { return classes_; }
  const std::vector<std::unique_ptr<EventInterfaceInfo>>& eventInterfaces() const { return events_; }
  const std::vector<EnumInfo>& enums() const { return enums_; }

 private:
  std::vector<std::unique_ptr<ClassInfo>> classes_;
  std::vector<std::unique_ptr<EventInterfaceInfo>> events_;
  std::vector<EnumInfo> enums_;
  std::unordered_map<std::type_index, ClassInfo*> byType_;
  std::unordered_map<std::string, ClassInfo*> byName_;
};

// The member table of an object's dynamic class; error 438 when the class is not described.
const ClassInfo* ClassOf(const Object& obj);

// Creates a creatable class by name (case-insensitive): error 429 when unknown or not creatable.
ObjectRef CreateObject(std::string_view className);

}  // namespace xal
