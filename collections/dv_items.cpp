// DVItems and DVItem, and the text format the lists read (Create) and write (ToString).
//
// Grammar. Lines are separated by CR LF; each line is trimmed of blanks (U+0020) before it is
// looked at, so blanks around names and values never count.
//
//   text      = { line CRLF } [ line ]
//   line      = header | own-value | entry | ""
//   header    = "[" name "]"              more than two characters; the name is kept as written
//   own-value = "*" [ text-1 "=" ] value  the section's own value: what follows the first "=",
//                                         trimmed, or the whole line ("*" included) without one
//   entry     = name "=" value            cut at the first "="; name and value trimmed
//   value     = any characters            plain text: no quotes, no escapes, "=" allowed
//
// Lines before the first header and empty lines are skipped. Inside a section, a line that is
// none of the above — one without "=", "[]" among them — ends the read with False. Names match
// without regard to letter case, so a header or entry seen twice continues the earlier item and
// its last spelling is kept; reading merges into the list and never clears it first.
//
// Writing produces, for every section in order:
//   "[" name "]" CRLF  [ "*=" value CRLF ]  { name "=" value CRLF }
// where an own-value or entry line appears only when there is a non-empty value to write.
#include "collections/dv_items.h"

#include <optional>
#include <string_view>

#include "runtime/convert.h"
#include "runtime/text.h"

namespace xal {

namespace {

constexpr std::string_view kLineEnd = "\r\n";

bool IsHeader(std::string_view line) {
  return line.size() > 2 && line.front() == '[' && line.back() == ']';
}

// Text read from a line becomes the current value, or the default when the text holds defaults.
void Assign(DVItem& item, std::string text, bool asDefault) {
  if (asDefault)
    item.SetDefaultValue(Variant(std::move(text)));
  else
    item.SetValue(Variant(std::move(text)));
}

// The text to write for an item, or nothing. Without defaults only a value that was set and is
// not "" is written. With defaults, DValue is tried first; a value set to "" would hide the
// default behind it, so the default is tried next. A value without a text form (Null, an
// object, an array) raises, and the caller gives up on the whole text.
std::optional<std::string> TextToWrite(const DVItem& item, bool useDefault) {
  Variant v = useDefault ? item.DValue() : item.Value();
  if (v.IsEmpty()) return std::nullopt;
  std::string text = CStr(v);
  if (!text.empty()) return text;
  if (!useDefault) return std::nullopt;
  Variant d = item.DefaultValue();
  if (d.IsEmpty()) return std::nullopt;
  text = CStr(d);
  if (text.empty()) return std::nullopt;
  return text;
}

}  // namespace

// ---------------------------------------------------------------------------------------------
// DVItem
// ---------------------------------------------------------------------------------------------

DVItem::~DVItem() {
  if (subItems_) subItems_->Clear();
}

Ref<DVItems> DVItem::SubItems() {
  if (!subItems_) subItems_ = MakeRef<DVItems>();
  return subItems_;
}

// ---------------------------------------------------------------------------------------------
// DVItems
// ---------------------------------------------------------------------------------------------

Ref<DVItem> DVItems::Add(const std::string& name, const Variant& value, const Variant& defaultValue) {
  Ref<DVItem> item = Item(name);
  if (!item) {
    item = MakeRef<DVItem>();
    items_.Add(item, name);
  }
  item->key_ = name;
  if (!value.IsMissing()) item->value_ = value;
  if (!defaultValue.IsMissing()) item->defaultValue_ = defaultValue;
  return item;
}

Ref<DVItem> DVItems::Item(const std::string& name) const {
  const Ref<DVItem>* found = items_.Find(name);
  return found ? *found : nullptr;
}

Variant DVItems::NewEnum() const {
  std::vector<Variant> out;
  out.reserve(static_cast<size_t>(Count()));
  for (const auto& e : items_) out.push_back(Variant(e.value));
  return Variant(SafeArray::Vector(std::move(out)));
}

Ref<DVItems> DVItems::Clone() const {
  auto copy = MakeRef<DVItems>();
  for (const auto& e : items_) {
    const DVItem& from = *e.value;
    Ref<DVItem> to = copy->Add(from.key_, from.value_, from.defaultValue_);
    to->tag_ = from.tag_;
    to->category_ = from.category_;
    if (from.subItems_) to->subItems_ = from.subItems_->Clone();
  }
  return copy;
}

bool DVItems::Create(const std::string& source, bool asDefault) {
  Ref<DVItem> section;
  for (const std::string& raw : Split(source, kLineEnd)) {
    const std::string line = Trim(raw);
    if (IsHeader(line)) {
      section = Add(line.substr(1, line.size() - 2));
      continue;
    }
    if (line.empty() || !section) continue;
    const size_t eq = line.find('=');
    if (line.front() == '*') {
      Assign(*section, eq == std::string::npos ? line : Trim(std::string_view(line).substr(eq + 1)), asDefault);
      continue;
    }
    if (eq == std::string::npos) return false;
    const std::string_view text(line);
    Ref<DVItem> sub = section->SubItems()->Add(Trim(text.substr(0, eq)));
    Assign(*sub, Trim(text.substr(eq + 1)), asDefault);
  }
  return true;
}

std::string DVItems::ToString(bool useDefault) const {
  try {
    std::string out;
    for (const auto& s : items_) {
      const DVItem& section = *s.value;
      out.append("[").append(section.key_).append("]").append(kLineEnd);
      if (auto own = TextToWrite(section, useDefault)) out.append("*=").append(*own).append(kLineEnd);
      if (!section.subItems_) continue;
      for (const auto& e : section.subItems_->items_) {
        if (auto text = TextToWrite(*e.value, useDefault))
          out.append(e.value->key_).append("=").append(*text).append(kLineEnd);
      }
    }
    return out;
  } catch (const VbError&) {
    return {};
  }
}

}  // namespace xal
