// StringArray: lines in order, joined and split at CR LF.
#include "collections/string_array.h"

#include <new>
#include <stdexcept>

#include "runtime/error.h"
#include "runtime/text.h"

namespace xal {

namespace {
constexpr std::string_view kLineEnd = "\r\n";
constexpr size_t kGrowStep = 10;  // room is made ten lines at a time, keeping the contents
constexpr int32_t kAllLines = -1;
}  // namespace

// A script can ask for line two billion; that is an out-of-memory error for it, not a crash.
void StringArray::Grow(size_t lines) {
  try {
    if (lines > lines_.capacity()) lines_.reserve((lines + kGrowStep - 1) / kGrowStep * kGrowStep);
    lines_.resize(lines);
  } catch (const std::bad_alloc&) {
    Raise(kErrOutOfMemory);
  } catch (const std::length_error&) {
    Raise(kErrOutOfMemory);
  }
}

int32_t StringArray::Add(const std::string& text) {
  Grow(lines_.size() + 1);
  lines_.back() = text;
  return 0;
}

std::string StringArray::Text(int32_t line) const {
  if (line == kAllLines) {
    std::string all;
    for (const auto& l : lines_) {
      all += l;
      all += kLineEnd;
    }
    return all;
  }
  if (line >= 1 && line <= Count()) return lines_[static_cast<size_t>(line - 1)];
  return {};
}

void StringArray::SetText(int32_t line, const std::string& text) {
  if (line == kAllLines) {
    // A trailing CR LF leaves an empty last line, and "" leaves no lines at all.
    std::vector<std::string> pieces = Split(text, kLineEnd);
    lines_.clear();
    Grow(pieces.size());
    for (size_t i = 0; i < pieces.size(); ++i) lines_[i] = std::move(pieces[i]);
    return;
  }
  if (line < 1) return;
  if (line > Count()) Grow(static_cast<size_t>(line));
  lines_[static_cast<size_t>(line - 1)] = text;
}

}  // namespace xal
