// StringArray: a growable list of text lines that also reads and writes itself as one text with
// CR LF line ends — the form in which scripts and layout definitions hand multi-line texts
// around. Lines are numbered from 1; the array owns plain strings only.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "runtime/object.h"

namespace xal {

class StringArray : public Object {
 public:
  // Appends `text` as the next line. The result is always 0; callers only ever ignored it.
  int32_t Add(const std::string& text);
  // Line -1: every line followed by CR LF ("" with no lines). 1..Count: that line. Else "".
  std::string Text(int32_t line = -1) const;
  // Line -1: the text, cut at every CR LF, replaces all lines. Line >= 1: sets that line, first
  // growing the array with empty lines when it is beyond the count. Line 0 or < -1: nothing.
  void SetText(int32_t line, const std::string& text);
  int32_t Count() const { return static_cast<int32_t>(lines_.size()); }

 private:
  void Grow(size_t lines);
  std::vector<std::string> lines_;
};

}  // namespace xal
