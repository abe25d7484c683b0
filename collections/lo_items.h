// LOItems: the ordered, keyed list of layout items (LOItem) behind the column and field lists of
// layout definitions. Each item knows its 1-based position (Index) and its list. The list owns its
// items; an item's reference to its list is a weak one, so a list freed while a script still holds
// one of its items is really freed, and the item then simply has no list.
#pragma once

#include <cstdint>
#include <string>

#include "runtime/collection.h"
#include "runtime/object.h"
#include "runtime/variant.h"

namespace xal {

class LOItems;

class LOItem : public Object {
 public:
  // ---- Plain fields: stored as given -------------------------------------------------------------
  bool Visible() const { return visible_; }
  void SetVisible(bool v) { visible_ = v; }
  bool Skip() const { return skip_; }
  void SetSkip(bool v) { skip_ = v; }
  int16_t Width() const { return width_; }
  void SetWidth(int16_t v) { width_ = v; }
  std::string Name() const { return name_; }
  void SetName(const std::string& v) { name_ = v; }
  bool Locked() const { return locked_; }
  void SetLocked(bool v) { locked_ = v; }
  std::string Script() const { return script_; }
  void SetScript(const std::string& v) { script_ = v; }
  std::string Show() const { return show_; }
  void SetShow(const std::string& v) { show_ = v; }
  std::string When() const { return when_; }
  void SetWhen(const std::string& v) { when_ = v; }
  std::string Valid() const { return valid_; }
  void SetValid(const std::string& v) { valid_ = v; }
  std::string AddNew() const { return addNew_; }
  void SetAddNew(const std::string& v) { addNew_ = v; }
  std::string Delete() const { return delete_; }
  void SetDelete(const std::string& v) { delete_ = v; }
  std::string Filter() const { return filter_; }
  void SetFilter(const std::string& v) { filter_ = v; }
  std::string Order() const { return order_; }
  void SetOrder(const std::string& v) { order_ = v; }

  // ---- Properties --------------------------------------------------------------------------------
  // Tag may hold an object; it is handed back as that same object.
  Variant Tag() const { return tag_; }
  void SetTag(const Variant& v) { tag_ = v; }
  // Caption and ToolTipText keep their old text when the new one differs only in letter case.
  std::string Caption() const { return caption_; }
  void SetCaption(const std::string& v);
  bool Enabled() const { return enabled_; }
  void SetEnabled(bool v);
  std::string ToolTipText() const { return toolTipText_; }
  void SetToolTipText(const std::string& v);
  // Set by LOItems only.
  std::string Key() const { return key_; }
  int16_t Index() const { return index_; }

  // The list that holds the item, counted for as long as the caller keeps the result; nullptr when
  // the item was never added, was removed or cleared out, or its list is gone.
  Ref<LOItems> List() const { return list_.lock(); }

 private:
  friend class LOItems;
  bool visible_ = false;
  bool skip_ = false;
  int16_t width_ = 0;
  std::string name_;
  bool locked_ = false;
  std::string script_, show_, when_, valid_, addNew_, delete_, filter_, order_;
  Variant tag_;
  std::string caption_;
  bool enabled_ = false;
  std::string toolTipText_;
  std::string key_;
  int16_t index_ = 0;
  WeakRef<LOItems> list_;  // non-owning: the list owns the item, never the other way round
};

class LOItems : public Object {
 public:
  // Creates an item with `caption` and `key`, adds it under `key` (without a key when `key` is
  // empty) at the end or before/after the item named by position or key. Errors of the keyed
  // collection (457 duplicate key, 5, 9, 13) reach the caller, and then nothing is added.
  // The item refers back to the list only when the list is held by a Ref.
  Ref<LOItem> Add(const std::string& caption, const std::string& key = {}, const Variant& before = Variant::Missing(),
                  const Variant& after = Variant::Missing());
  // By 1-based position or key; error 9 or 5 when there is no such item.
  Ref<LOItem> Item(const Variant& indexOrKey) const { return items_.Item(indexOrKey); }
  // Whether Item would find something; never fails.
  bool Exists(const Variant& indexOrKey) const;
  int32_t Count() const { return items_.Count(); }
  // Removes one item and closes the gap in the indices of those after it; errors as Item.
  void Remove(const Variant& indexOrKey);
  // Empties the list; items held elsewhere keep their last index.
  void Clear();
  // The items in order, as a 0-based array.
  Variant NewEnum() const;

  const KeyedCollection<Ref<LOItem>>& items() const { return items_; }

 private:
  KeyedCollection<Ref<LOItem>> items_;
};

}  // namespace xal
