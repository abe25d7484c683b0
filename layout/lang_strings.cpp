// Language strings of captions: adding and replacing a language's text, the look-up with its
// English fallback, and the ".AddLangString" lines that rebuild the list.
#include "layout/lang_strings.h"

namespace xal {

namespace {
// The language whose caption stands in for a missing one; Estonian has no stand-in.
constexpr int32_t kEnglish = 3;
constexpr int32_t kEstonian = 4;
}  // namespace

void LangStrings::Add(const std::string& text, int32_t langID) {
  if (!list_) list_ = MakeRef<ValueTexts>();
  const std::string key = KeyOf(langID);
  if (Ref<ValueText> entry = list_->Item(Variant(key)))
    entry->SetText(0, text);
  else
    list_->Add(Variant(key), text);
}

void LangStrings::PutCaption(const std::string& text, int32_t langID) {
  if (langID != 0 && !base_.empty())
    Add(text, langID);
  else
    base_ = text;
}

std::string LangStrings::Translation(int32_t langID) const {
  if (!list_ || langID == 0) return {};
  Ref<ValueText> entry = list_->Item(Variant(KeyOf(langID)));
  if (!entry && langID != kEstonian) entry = list_->Item(Variant(KeyOf(kEnglish)));
  return entry ? entry->Text() : std::string();
}

std::string LangStrings::Caption(int32_t langID) const {
  std::string text = Translation(langID);
  return text.empty() ? base_ : text;
}

void LangStrings::WriteLines(ScriptWriter& w) const {
  if (!list_) return;
  for (const auto& entry : list_->entries()) {
    const std::string key = entry.value->Key();
    const std::string_view langID = std::string_view(key).substr(key.empty() ? 0 : 1);  // without "_"
    w.Line({".AddLangString \"", entry.value->Text(), "\", ", langID});
  }
}

}  // namespace xal
