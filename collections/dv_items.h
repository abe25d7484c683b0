// DVItems: two-level lists of named values with defaults — a user's or a form's default values.
// Top-level items are sections with a value of their own and named sub-items; every item holds a
// current Value and a DefaultValue, so one list can carry the defaults and the user's choices at
// once. The list reads and writes a small text format (Create, ToString; grammar in dv_items.cpp).
// A list owns its items and an item owns its sub-list; nothing refers back up the tree.
#pragma once

#include <cstdint>
#include <string>

#include "runtime/collection.h"
#include "runtime/object.h"
#include "runtime/variant.h"

namespace xal {

class DVItems;

class DVItem : public Object {
 public:
  // Releasing an item empties its sub-list, even when someone else still holds that list.
  ~DVItem() override;

  std::string Category() const { return category_; }
  void SetCategory(const std::string& v) { category_ = v; }
  std::string State() const { return state_; }
  void SetState(const std::string& v) { state_ = v; }
  Variant Value() const { return value_; }
  void SetValue(const Variant& v) { value_ = v; }
  Variant DefaultValue() const { return defaultValue_; }
  void SetDefaultValue(const Variant& v) { defaultValue_ = v; }
  // Value unless it is Empty, then DefaultValue. An empty string is a value, not a gap.
  Variant DValue() const { return value_.IsEmpty() ? defaultValue_ : value_; }
  // The named sub-items; an empty list is made on the first read.
  Ref<DVItems> SubItems();
  // Tag may hold an object; it is handed back as that same object.
  Variant Tag() const { return tag_; }
  void SetTag(const Variant& v) { tag_ = v; }
  // The name the item is held under; set by DVItems only.
  std::string Key() const { return key_; }

  // The sub-list if it has been made, without making it.
  const Ref<DVItems>& ExistingSubItems() const { return subItems_; }

 private:
  friend class DVItems;
  std::string category_, state_;
  Variant value_, defaultValue_;
  Ref<DVItems> subItems_;
  Variant tag_;
  std::string key_;
};

class DVItems : public Object {
 public:
  // The item under `name` (appended when there is none), renamed to `name`'s spelling; `value`
  // and `defaultValue` are stored unless they are Missing, so adding again updates.
  Ref<DVItem> Add(const std::string& name, const Variant& value = Variant::Missing(),
                  const Variant& defaultValue = Variant::Missing());
  // The item under `name` in any letter case; nullptr when there is none. Never fails.
  Ref<DVItem> Item(const std::string& name) const;
  bool Exists(const std::string& name) const { return items_.Exists(name); }
  int32_t Count() const { return items_.Count(); }
  // A missing name is no error.
  void Remove(const std::string& name) { items_.RemoveKey(name); }
  void Clear() { items_.Clear(); }
  // The items in order, as a 0-based array.
  Variant NewEnum() const;
  // A deep copy: new items with the same key, Value, DefaultValue, Tag (the same object, if one)
  // and Category, and copies of their sub-lists. State is not copied.
  Ref<DVItems> Clone() const;

  // Merges the text into the list: values go to Value, or to DefaultValue with `asDefault`.
  // False when a sub-item line has no "="; the lines before it stay applied.
  bool Create(const std::string& source, bool asDefault = false);
  // Writes the list as text: the values only, or with `useDefault` defaults filling the gaps.
  // "" when a value has no text form.
  std::string ToString(bool useDefault = false) const;

  const KeyedCollection<Ref<DVItem>>& items() const { return items_; }

 private:
  KeyedCollection<Ref<DVItem>> items_;
};

}  // namespace xal
