// HostParamList.
#include "host/param_list.h"

#include "runtime/text.h"

namespace xal::host {

Variant HostParamList::Item(const std::string& name) {
  const Entry* e = entries_.Find(name);
  return e ? e->value : Variant();
}

void HostParamList::Set(const std::string& name, const Variant& value) {
  if (Entry* e = entries_.Find(name))
    e->value = value;
  else
    entries_.Add(Entry{value, {}}, name);
}

// Adding a name that exists replaces its value: a list never holds one name twice.
void HostParamList::Add(const std::string& name, const Variant& value) { Set(name, value); }

void HostParamList::SetAttribute(const std::string& name, const std::string& attribute, const Variant& value) {
  Entry* e = entries_.Find(name);
  if (!e) {
    entries_.Add(Entry{}, name);
    e = entries_.Find(name);
  }
  e->attributes[FoldCase(attribute)] = value;
}

Variant HostParamList::Attribute(const std::string& name, const std::string& attribute) {
  const Entry* e = entries_.Find(name);
  if (!e) return Variant();
  auto it = e->attributes.find(FoldCase(attribute));
  return it == e->attributes.end() ? Variant() : it->second;
}

std::string HostParamList::NameAt(int32_t position) {
  if (position < 1 || position > entries_.Count()) Raise(kErrSubscript);
  int32_t i = 0;
  for (const auto& e : entries_)
    if (++i == position) return *e.key;
  return "";
}

}  // namespace xal::host
