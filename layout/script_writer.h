// The script text of the layout definitions. A definition writes itself as statements of the host's
// script language which, run inside a With block on a fresh object of its class, build an equal
// definition again; the host stores and exchanges forms this way. Every definition class writes
// through the one ScriptWriter below, so indentation, line ends, "Dim once" and the literal forms
// are the same everywhere.
//
// Grammar of the text (every line ends in CR LF; TABS is n tab characters, n = the Tabs of the
// GetScript call that writes the line; a container hands Tabs + 1 to its children):
//
//   text       := { line }
//   line       := CRLF                                     blank line, never indented
//               | "Dim " name " As " ("Object" | "Variant") CRLF
//                                                          never indented; written only when the text
//                                                          does not hold it yet (any letter case)
//               | TABS statement CRLF
//   statement  := "ReDim " var "(" int ")"                 one-dimensional: the full upper bound
//               | "ReDim " var "(" int "," int ")"         the cell grid: rows, columns
//               | "Set " var " = New " class
//               | "With " var  |  "With .LnkInfo"  |  "End With"
//               | "Set " var "(" int ") = " var  |  "Set " var "(" int "," int ") = " var
//               | "." name " = " value                     forms, sheets, data sheets, column sets,
//                                                          browsers
//               | "." name "=" value                       cells, links, and OnGetStyle everywhere
//               | ".AddLangString " raw ", " int          one per caption language, in list order
//   value      := int | "True" | raw | quoted | var
//   int        := ["-"] digit {digit}                      plain decimal, no blanks
//   raw        := '"' chars '"'                            chars written unchanged: a quote inside is
//                                                          not doubled (the stored forms rely on it)
//   quoted     := '"' { char | '""' } '"'                  links only: quotes doubled
//
// A number is written only when it is not 0, a flag only when it is True (as "= True"), a text only
// when it is not empty; the reader gets the defaults of a fresh object for everything else.
#pragma once

#include <cstdint>
#include <initializer_list>
#include <span>
#include <string>
#include <string_view>
#include <variant>

#include "runtime/variant.h"

namespace xal {

class ScriptWriter {
 public:
  // Appends to `sc`, which the caller owns and which keeps whatever was written when a later step
  // fails. Statement lines are indented by `tabs` tab characters.
  ScriptWriter(std::string& sc, int16_t tabs) : sc_(sc), tabs_(tabs) {}

  std::string& text() { return sc_; }
  int16_t tabs() const { return tabs_; }
  // A writer on the same text one level deeper, for the children of a container. Tabs is a 16-bit
  // integer in the interface, so going past 32767 is an overflow (error 6).
  ScriptWriter Child() const;

  // "Dim ..." at column 0, unless the text already holds it in any letter case.
  void Dim(std::string_view declaration);
  void Blank();
  // One statement line made of `parts`; error 5 when Tabs is negative (a negative count of tabs).
  void Line(std::initializer_list<std::string_view> parts);
  void Line(std::string_view text) { Line({text}); }

  // "Set <var> = New <cls>", "With <var>", the object's lines from `body` one level deeper,
  // "End With": how a container writes each child object.
  template <class Body>
  void NewObjectBlock(std::string_view var, std::string_view cls, Body&& body) {
    Line({"Set ", var, " = New ", cls});
    Line({"With ", var});
    ScriptWriter inner = Child();
    body(inner);
    Line("End With");
  }

  // The property forms: `prefix` holds everything before the value, blanks and "=" included.
  void Number(std::string_view prefix, int32_t value);         // when not 0
  void Flag(std::string_view line, bool set);                  // the whole line, when set
  void Text(std::string_view prefix, std::string_view text);   // prefix ends in '"'; when not empty
  void Quoted(std::string_view prefix, std::string_view text); // prefix, QuoteText; when not empty

  // A quote, the text with every quote doubled, a quote.
  static std::string QuoteText(std::string_view text);
  // The decimal form of an integer, as numbers appear in the text.
  static std::string Decimal(int64_t value);

 private:
  std::string& sc_;
  int16_t tabs_;
};

// A row of a definition's property-line table: the literal prefix of the line and what supplies the
// value. Numbers, flags and texts follow the rules of ScriptWriter; a row whose value needs more than
// that (a condition, several lines) names a function instead.
template <class C>
struct ScriptRow {
  using Special = void (*)(const C&, ScriptWriter&);
  std::string_view prefix;
  std::variant<int16_t C::*, int32_t C::*, bool C::*, std::string C::*, Special> value;
};

template <class C>
void WriteRows(const C& obj, std::span<const ScriptRow<C>> rows, ScriptWriter& w) {
  for (const ScriptRow<C>& row : rows) {
    switch (row.value.index()) {
      case 0: w.Number(row.prefix, obj.*std::get<0>(row.value)); break;
      case 1: w.Number(row.prefix, obj.*std::get<1>(row.value)); break;
      case 2: w.Flag(row.prefix, obj.*std::get<2>(row.value)); break;
      case 3: w.Text(row.prefix, obj.*std::get<3>(row.value)); break;
      default: std::get<4>(row.value)(obj, w); break;
    }
  }
}

// How the arrays of a definition hold their objects: Empty elements are holes that are skipped;
// anything else must be an object of class T. Another class or a non-object is a type mismatch
// (error 13) and Nothing is error 91, as the typed variable of the original code gave them.
template <class T>
const T* ElementAs(const Variant& element) {
  if (element.IsEmpty()) return nullptr;
  if (!element.IsObject()) Raise(kErrTypeMismatch);
  const ObjectRef& obj = element.AsObject();
  if (!obj) Raise(kErrObjectNotSet);
  const T* typed = dynamic_cast<const T*>(obj.get());
  if (!typed) Raise(kErrTypeMismatch);
  return typed;
}

}  // namespace xal
