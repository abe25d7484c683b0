// LOItems and LOItem: keyed layout items that keep their 1-based position in their list.
#include "collections/lo_items.h"

#include <limits>

#include "runtime/text.h"

namespace xal {

// ---------------------------------------------------------------------------------------------
// LOItem
// ---------------------------------------------------------------------------------------------

// Layout data is typed by hand and compared case-insensitively everywhere else; a caption that
// only changes its letter case is the same caption and keeps the spelling it had.
void LOItem::SetCaption(const std::string& v) {
  if (!TextEquals(caption_, v)) caption_ = v;
}

void LOItem::SetEnabled(bool v) {
  if (enabled_ != v) enabled_ = v;
}

void LOItem::SetToolTipText(const std::string& v) {
  if (!TextEquals(toolTipText_, v)) toolTipText_ = v;
}

// ---------------------------------------------------------------------------------------------
// LOItems
// ---------------------------------------------------------------------------------------------

namespace {
// Before/After count as given on the same terms as the keyed collection reads them.
bool Given(const Variant& v) { return !v.IsMissing() && !v.IsEmpty(); }
}  // namespace

Ref<LOItem> LOItems::Add(const std::string& caption, const std::string& key, const Variant& before,
                         const Variant& after) {
  // Index is a 16-bit integer: a list that long cannot number another item.
  if (Count() >= std::numeric_limits<int16_t>::max()) Raise(kErrOverflow);
  auto item = MakeRef<LOItem>();
  std::optional<std::string> k;
  if (!key.empty()) k = key;
  items_.Add(item, std::move(k), before, after);  // fails before anything is added
  item->list_ = RefTo(*this);
  item->SetCaption(caption);
  item->key_ = key;
  if (!Given(before) && !Given(after)) {
    item->index_ = static_cast<int16_t>(Count());
  } else {
    // An insertion shifts everything behind it: number the whole list afresh.
    int16_t position = 0;
    for (const auto& e : items_) e.value->index_ = ++position;
  }
  return item;
}

bool LOItems::Exists(const Variant& indexOrKey) const {
  try {
    Item(indexOrKey);
    return true;
  } catch (const VbError&) {
    return false;
  }
}

void LOItems::Remove(const Variant& indexOrKey) {
  Ref<LOItem> gone = Item(indexOrKey);  // a missing item fails here, before any index changes
  const int16_t index = gone->index_;
  for (const auto& e : items_)
    if (e.value->index_ > index) --e.value->index_;
  items_.Remove(indexOrKey);
  gone->list_.reset();
}

void LOItems::Clear() {
  for (const auto& e : items_) e.value->list_.reset();
  items_.Clear();
}

Variant LOItems::NewEnum() const {
  std::vector<Variant> out;
  out.reserve(static_cast<size_t>(Count()));
  for (const auto& e : items_) out.push_back(Variant(e.value));
  return Variant(SafeArray::Vector(std::move(out)));
}

}  // namespace xal
