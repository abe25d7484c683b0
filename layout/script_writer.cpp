// ScriptWriter: the line and literal forms shared by every definition's GetScript — indentation,
// CR LF, "Dim once", numbers, flags, raw and quoted texts.
#include "layout/script_writer.h"

#include <charconv>
#include <limits>

#include "runtime/text.h"

namespace xal {

ScriptWriter ScriptWriter::Child() const {
  if (tabs_ == std::numeric_limits<int16_t>::max()) Raise(kErrOverflow);
  return ScriptWriter(sc_, static_cast<int16_t>(tabs_ + 1));
}

void ScriptWriter::Dim(std::string_view declaration) {
  if (InStr(sc_, declaration, CompareMode::Text) != 0) return;
  sc_.append(declaration);
  sc_.append("\r\n");
}

void ScriptWriter::Blank() { sc_.append("\r\n"); }

void ScriptWriter::Line(std::initializer_list<std::string_view> parts) {
  if (tabs_ < 0) Raise(kErrInvalidCall);
  sc_.append(static_cast<size_t>(tabs_), '\t');
  for (std::string_view p : parts) sc_.append(p);
  sc_.append("\r\n");
}

void ScriptWriter::Number(std::string_view prefix, int32_t value) {
  if (value != 0) Line({prefix, Decimal(value)});
}

void ScriptWriter::Flag(std::string_view line, bool set) {
  if (set) Line(line);
}

void ScriptWriter::Text(std::string_view prefix, std::string_view text) {
  if (!text.empty()) Line({prefix, text, "\""});
}

void ScriptWriter::Quoted(std::string_view prefix, std::string_view text) {
  if (!text.empty()) Line({prefix, QuoteText(text)});
}

std::string ScriptWriter::QuoteText(std::string_view text) { return DoubleQuoted(text); }

std::string ScriptWriter::Decimal(int64_t value) {
  char buf[24];
  auto [end, ec] = std::to_chars(buf, buf + sizeof buf, value);
  return std::string(buf, end);
}

}  // namespace xal
