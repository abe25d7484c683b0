// Captions in several languages at once, for the four definitions that have them (data sheets,
// sheets, cells, browsers). A definition keeps its plain caption (the base caption) and, once a
// caption in a given language is added, a ValueTexts list with one entry per language, keyed "_"
// and the decimal language identifier ("_4" for Estonian). Which text a definition shows depends
// on its LangID: Estonian falls back to the base caption only; every other language first to
// English ("_3"), then to the base caption.
#pragma once

#include <cstdint>
#include <string>

#include "collections/value_texts.h"
#include "layout/script_writer.h"

namespace xal {

class LangStrings {
 public:
  const std::string& base() const { return base_; }
  void SetBase(const std::string& text) { base_ = text; }

  // AddLangString: stores `text` as the caption for `langID`, replacing an earlier one. The list
  // is created on first use and lives as long as its owner.
  void Add(const std::string& text, int32_t langID);
  // Caption put: while a language is set and a base caption exists, the text goes to that
  // language; otherwise it becomes the base caption.
  void PutCaption(const std::string& text, int32_t langID);
  // Caption get: the text for `langID` (with the English fallback) when there is a non-empty one,
  // otherwise the base caption.
  std::string Caption(int32_t langID) const;
  // The language text alone, with the English fallback; empty when there is none, when the list
  // was never created, or when `langID` is 0.
  std::string Translation(int32_t langID) const;

  // One ".AddLangString" line per entry, in list order.
  void WriteLines(ScriptWriter& w) const;

 private:
  static std::string KeyOf(int32_t langID) { return "_" + std::to_string(langID); }
  std::string base_;
  Ref<ValueTexts> list_;
};

}  // namespace xal
