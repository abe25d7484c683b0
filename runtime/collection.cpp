// The script-visible Collection object over the keyed collection.
#include "runtime/collection.h"

namespace xal {

void Collection::Add(const Variant& item, const Variant& key, const Variant& before, const Variant& after) {
  std::optional<std::string> k;
  if (!key.IsMissing() && !key.IsEmpty()) {
    if (!key.IsString()) Raise(kErrTypeMismatch);  // keys must be text
    k = key.AsString();
  }
  items_.Add(item, std::move(k), before, after);
}

Variant Collection::Item(const Variant& index) const {
  return items_.Item(index);
}

Variant Collection::NewEnum() const {
  std::vector<Variant> out;
  out.reserve(static_cast<size_t>(items_.Count()));
  for (const auto& e : items_) out.push_back(e.value);
  return Variant(SafeArray::Vector(std::move(out)));
}

}  // namespace xal
