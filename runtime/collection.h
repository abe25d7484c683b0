// The standard keyed collection: items in insertion order, reached by 1-based position or by a
// string key compared without regard to letter case. Every registry and item collection of the
// component is built on it, so they all share its rules and error numbers:
//   Add: duplicate key 457, both Before and After 5, unknown key in Before/After 5, position
//        outside 1..Count 9; a failing Add adds nothing.
//   Item/Remove: a number is a position (9 outside 1..Count), a string is a key (5 when absent),
//        anything else 13.
#pragma once

#include <cmath>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "runtime/convert.h"
#include "runtime/member_table.h"
#include "runtime/text.h"
#include "runtime/variant.h"

namespace xal {

template <class T>
class KeyedCollection {
 public:
  struct Entry {
    std::optional<std::string> key;  // as given by the caller
    T value;
  };

  int32_t Count() const { return static_cast<int32_t>(entries_.size()); }
  bool Empty() const { return entries_.empty(); }

  // Adds `value` at the end, or before/after the entry named by position or key (Missing/Empty =
  // not given).
  void Add(T value, std::optional<std::string> key = std::nullopt, const Variant& before = Variant::Missing(),
           const Variant& after = Variant::Missing()) {
    const bool hasBefore = Given(before), hasAfter = Given(after);
    if (hasBefore && hasAfter) Raise(kErrInvalidCall);
    size_t at = entries_.size();
    if (hasBefore) at = PositionOf(before, /*forInsert=*/true);
    if (hasAfter) at = PositionOf(after, /*forInsert=*/true) + 1;
    std::string folded;
    if (key) {
      folded = FoldCase(*key);
      if (index_.count(folded)) Raise(kErrDuplicateKey);
    }
    auto entry = std::make_unique<Entry>(Entry{std::move(key), std::move(value)});
    if (entry->key) index_.emplace(std::move(folded), entry.get());
    entries_.insert(entries_.begin() + static_cast<std::ptrdiff_t>(at), std::move(entry));
  }

  // The entry by position (number) or key (string); errors as described above.
  T& Item(const Variant& indexOrKey) { return entries_[PositionOf(indexOrKey, false)]->value; }
  const T& Item(const Variant& indexOrKey) const {
    return entries_[const_cast<KeyedCollection*>(this)->PositionOf(indexOrKey, false)]->value;
  }
  // The entry at 1-based `position`; error 9 outside 1..Count.
  T& At(int32_t position) {
    if (position < 1 || position > Count()) Raise(kErrSubscript);
    return entries_[static_cast<size_t>(position - 1)]->value;
  }
  const T& At(int32_t position) const { return const_cast<KeyedCollection*>(this)->At(position); }

  // Look-up by key without an error: nullptr when absent.
  T* Find(std::string_view key) {
    auto it = index_.find(FoldCase(key));
    return it == index_.end() ? nullptr : &it->second->value;
  }
  const T* Find(std::string_view key) const { return const_cast<KeyedCollection*>(this)->Find(key); }
  bool Exists(std::string_view key) const { return Find(key) != nullptr; }

  void Remove(const Variant& indexOrKey) {
    size_t pos = PositionOf(indexOrKey, false);
    if (entries_[pos]->key) index_.erase(FoldCase(*entries_[pos]->key));
    entries_.erase(entries_.begin() + static_cast<std::ptrdiff_t>(pos));
  }
  // Removes the entry under `key` if there is one; true when something was removed.
  bool RemoveKey(std::string_view key) {
    auto it = index_.find(FoldCase(key));
    if (it == index_.end()) return false;
    Entry* target = it->second;
    index_.erase(it);
    std::erase_if(entries_, [&](const std::unique_ptr<Entry>& e) { return e.get() == target; });
    return true;
  }
  void Clear() {
    entries_.clear();
    index_.clear();
  }

  // Entries in order, for enumeration.
  class Iterator {
   public:
    using Inner = typename std::vector<std::unique_ptr<Entry>>::const_iterator;
    explicit Iterator(Inner it) : it_(it) {}
    Entry& operator*() const { return **it_; }
    Entry* operator->() const { return it_->get(); }
    Iterator& operator++() { ++it_; return *this; }
    bool operator==(const Iterator& o) const { return it_ == o.it_; }
   private:
    Inner it_;
  };
  Iterator begin() const { return Iterator(entries_.begin()); }
  Iterator end() const { return Iterator(entries_.end()); }

 private:
  static bool Given(const Variant& v) { return !v.IsMissing() && !v.IsEmpty(); }

  // 0-based position of the entry named by a number (1-based) or a key.
  size_t PositionOf(const Variant& indexOrKey, bool forInsert) {
    if (indexOrKey.IsString()) {
      auto it = index_.find(FoldCase(indexOrKey.AsString()));
      if (it == index_.end()) Raise(kErrInvalidCall);
      for (size_t i = 0; i < entries_.size(); ++i)
        if (entries_[i].get() == it->second) return i;
    }
    switch (indexOrKey.Type()) {
      case VarType::Integer: case VarType::Long: case VarType::Double:
      case VarType::Currency: case VarType::Boolean: case VarType::Date: {
        const int32_t pos = CLng(indexOrKey);
        if (pos < 1 || pos > Count()) Raise(kErrSubscript);
        return static_cast<size_t>(pos - 1);
      }
      default:
        (void)forInsert;
        Raise(kErrTypeMismatch);
    }
  }

  std::vector<std::unique_ptr<Entry>> entries_;
  std::unordered_map<std::string, Entry*> index_;  // folded key -> entry
};

// The collection object scripts create ("Collection"): Variants under optional keys.
class Collection : public Object {
 public:
  void Add(const Variant& item, const Variant& key, const Variant& before, const Variant& after);
  int32_t Count() const { return items_.Count(); }
  Variant Item(const Variant& index) const;
  void Remove(const Variant& index) { items_.Remove(index); }
  // A snapshot of the items in order, as a 0-based array (what For Each walks).
  Variant NewEnum() const;

  KeyedCollection<Variant>& items() { return items_; }

 private:
  KeyedCollection<Variant> items_;
};

}  // namespace xal
