// The reference host's parameter list: named entries in insertion order (names in any letter
// case), each with a value and optional attributes ("DateFormat", "SelectOnly", "Fixed",
// "DefaultValue"). Object entries hold their object as the value.
#pragma once

#include <map>
#include <string>

#include "bridge/host_model.h"
#include "runtime/collection.h"

namespace xal::host {

class HostParamList : public ParamList {
 public:
  explicit HostParamList(std::string key = "") : key_(std::move(key)) {}

  Variant Item(const std::string& name) override;
  bool Exists(const std::string& name) override { return entries_.Exists(name); }
  void Set(const std::string& name, const Variant& value) override;
  void SetObject(const std::string& name, const ObjectRef& object) override { Set(name, Variant(object)); }
  void Add(const std::string& name, const Variant& value) override;
  void SetAttribute(const std::string& name, const std::string& attribute, const Variant& value) override;
  Variant Attribute(const std::string& name, const std::string& attribute) override;
  std::string Key() override { return key_; }
  int32_t Count() override { return entries_.Count(); }
  std::string NameAt(int32_t position) override;

 private:
  struct Entry {
    Variant value;
    std::map<std::string, Variant> attributes;  // folded attribute name -> value
  };
  std::string key_;
  KeyedCollection<Entry> entries_;
};

}  // namespace xal::host
