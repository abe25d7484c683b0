// ValueTexts: a named list of values, each with one display text (ValueText) — the value list of a
// list cell, the per-field value lists a document keeps, and the caption-per-language lists of
// layout definitions. Entries are keyed by the text form of their value, without regard to case.
// The list owns its entries; an entry does not refer back to its list.
#pragma once

#include <string>

#include "runtime/collection.h"
#include "runtime/object.h"
#include "runtime/variant.h"

namespace xal {

class ValueText : public Object {
 public:
  Variant Value() const { return value_; }
  // One text per entry: the language argument is accepted and ignored.
  std::string Text(int32_t LangID = 0) const { return text_; }
  void SetText(int32_t LangID, const std::string& text) { text_ = text; }
  Variant Tag() const { return tag_; }
  void SetTag(const Variant& tag) { tag_ = tag; }
  std::string Key() const { return key_; }

 private:
  friend class ValueTexts;
  Variant value_;
  std::string text_;
  Variant tag_;
  std::string key_;
};

class ValueTexts : public Object {
 public:
  std::string Name() const { return name_; }
  void SetName(const std::string& name) { name_ = name; }

  // Adds or updates the entry under the text form of `value`; nullptr (and nothing added) when the
  // value has no text form, as an array or Null has none.
  Ref<ValueText> Add(const Variant& value, const std::string& text, int32_t LangID = 0);
  // The value of the first entry, in order, whose text equals `text` in any letter case; Empty if none.
  Variant Value(const std::string& text, int32_t LangID = 0) const;
  // The entry under the text form of `value`; nullptr when there is none. Never fails.
  Ref<ValueText> Item(const Variant& value) const;
  bool Exists(const Variant& value) const { return Item(value) != nullptr; }
  int32_t Count() const { return entries_.Count(); }
  void Remove(const Variant& value);
  void Clear() { entries_.Clear(); }
  Variant NewEnum() const;

  const KeyedCollection<Ref<ValueText>>& entries() const { return entries_; }

 private:
  std::string name_;
  KeyedCollection<Ref<ValueText>> entries_;
};

// The text form of a value used as a key, or false when it has none.
bool KeyText(const Variant& value, std::string& key);

}  // namespace xal
