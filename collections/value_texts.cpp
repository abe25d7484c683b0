// ValueTexts and ValueText.
#include "collections/value_texts.h"

#include "runtime/convert.h"
#include "runtime/text.h"

namespace xal {

bool KeyText(const Variant& value, std::string& key) {
  try {
    key = CStr(value);
    return true;
  } catch (const VbError&) {
    return false;
  }
}

Ref<ValueText> ValueTexts::Add(const Variant& value, const std::string& text, int32_t) {
  std::string key;
  if (!KeyText(value, key)) return nullptr;
  Ref<ValueText>* found = entries_.Find(key);
  Ref<ValueText> entry = found ? *found : MakeRef<ValueText>();
  if (!found) entries_.Add(entry, key);
  entry->key_ = key;
  entry->text_ = text;
  entry->value_ = value;
  return entry;
}

Variant ValueTexts::Value(const std::string& text, int32_t) const {
  for (const auto& e : entries_)
    if (TextEquals(e.value->text_, text)) return e.value->value_;
  return Variant();
}

Ref<ValueText> ValueTexts::Item(const Variant& value) const {
  std::string key;
  if (!KeyText(value, key)) return nullptr;
  const Ref<ValueText>* found = entries_.Find(key);
  return found ? *found : nullptr;
}

void ValueTexts::Remove(const Variant& value) {
  std::string key;
  if (KeyText(value, key)) entries_.RemoveKey(key);
}

Variant ValueTexts::NewEnum() const {
  std::vector<Variant> out;
  for (const auto& e : entries_) out.push_back(Variant(e.value));
  return Variant(SafeArray::Vector(std::move(out)));
}

}  // namespace xal
