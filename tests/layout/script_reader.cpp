// The test interpreter for layout script text: one statement per line, parsed with a cursor, run
// against objects created and set by name through the type library.
#include "script_reader.h"

#include <cctype>
#include <charconv>
#include <map>
#include <stdexcept>
#include <vector>

#include "runtime/dispatch.h"

namespace xal::testing {
namespace {

[[noreturn]] void Fail(const std::string& what, const std::string& line) {
  throw std::runtime_error(what + " in line [" + line + "]");
}

// A cursor over the text of one statement.
class Cursor {
 public:
  Cursor(std::string_view s, const std::string& line) : s_(s), line_(line) {}

  bool Eat(std::string_view literal) {
    if (s_.substr(pos_, literal.size()) != literal) return false;
    pos_ += literal.size();
    return true;
  }
  void Expect(std::string_view literal) {
    if (!Eat(literal)) Fail("expected '" + std::string(literal) + "'", line_);
  }
  std::string Name() {
    size_t start = pos_;
    while (pos_ < s_.size() && (std::isalnum(static_cast<unsigned char>(s_[pos_])) || s_[pos_] == '_')) ++pos_;
    if (start == pos_) Fail("expected a name", line_);
    return std::string(s_.substr(start, pos_ - start));
  }
  int64_t Int() {
    int64_t value = 0;
    const char* begin = s_.data() + pos_;
    auto [end, ec] = std::from_chars(begin, s_.data() + s_.size(), value);
    // Only the canonical form: no leading zeros, no "+", no "-0".
    if (ec != std::errc() || std::string_view(begin, end) != std::to_string(value))
      Fail("expected a plain decimal", line_);
    pos_ = static_cast<size_t>(end - s_.data());
    return value;
  }
  // '"' { char | '""' } '"'
  std::string String() {
    Expect("\"");
    std::string out;
    while (true) {
      if (pos_ >= s_.size()) Fail("unterminated string", line_);
      char ch = s_[pos_++];
      if (ch != '"') {
        out += ch;
      } else if (pos_ < s_.size() && s_[pos_] == '"') {
        out += '"';
        ++pos_;
      } else {
        return out;
      }
    }
  }
  bool AtEnd() const { return pos_ == s_.size(); }
  void ExpectEnd() {
    if (!AtEnd()) Fail("unexpected text after the statement", line_);
  }
  char Peek() const { return pos_ < s_.size() ? s_[pos_] : '\0'; }

 private:
  std::string_view s_;
  size_t pos_ = 0;
  const std::string& line_;
};

std::string Lower(std::string s) {
  for (char& ch : s) ch = static_cast<char>(std::tolower(static_cast<unsigned char>(ch)));
  return s;
}

class Interpreter {
 public:
  Interpreter(const ObjectRef& root, int baseTabs) : baseTabs_(baseTabs) { with_.push_back(root); }

  void Line(const std::string& line) {
    if (line.empty()) return;
    size_t tabs = 0;
    while (tabs < line.size() && line[tabs] == '\t') ++tabs;
    Cursor c(std::string_view(line).substr(tabs), line);
    if (c.Eat("Dim ")) {
      if (tabs != 0) Fail("indented Dim", line);
      return Dim(c);
    }
    const bool endWith = c.Eat("End With");
    const size_t depth = with_.size() - 1 - (endWith ? 1 : 0);
    if (tabs != static_cast<size_t>(baseTabs_) + depth) Fail("wrong indentation", line);
    ++stats_.statements;
    if (endWith) {
      c.ExpectEnd();
      if (with_.size() == 1) Fail("End With without With", line);
      with_.pop_back();
    } else if (c.Eat("With ")) {
      With(c);
    } else if (c.Eat("ReDim ")) {
      ReDim(c);
    } else if (c.Eat("Set ")) {
      Set(c);
    } else if (c.Eat(".AddLangString ")) {
      std::string text = c.String();
      c.Expect(", ");
      Variant lang(static_cast<int32_t>(c.Int()));
      c.ExpectEnd();
      Call(with_.back(), "AddLangString", {Variant(text), lang});
    } else if (c.Eat(".")) {
      Assign(c);
    } else {
      Fail("unknown statement", line);
    }
  }

  const ReaderStats& stats() const { return stats_; }
  size_t depth() const { return with_.size() - 1; }

 private:
  Variant& Var(const std::string& name, Cursor& c) {
    auto it = vars_.find(Lower(name));
    if (it == vars_.end()) throw std::runtime_error("undeclared variable " + name);
    return it->second;
  }

  void Dim(Cursor& c) {
    std::string name = c.Name();
    c.Expect(" As ");
    std::string type = c.Name();
    c.ExpectEnd();
    if (type != "Object" && type != "Variant") throw std::runtime_error("unknown type " + type);
    vars_[Lower(name)] = type == "Object" ? Variant::Nothing() : Variant();
  }

  void With(Cursor& c) {
    ObjectRef obj;
    if (c.Eat(".")) {
      obj = GetProperty(with_.back(), c.Name()).AsObject();
    } else {
      obj = Var(c.Name(), c).AsObject();
    }
    c.ExpectEnd();
    if (!obj) throw std::runtime_error("With on Nothing");
    with_.push_back(obj);
  }

  std::vector<int32_t> Indices(Cursor& c) {
    std::vector<int32_t> out;
    c.Expect("(");
    do out.push_back(static_cast<int32_t>(c.Int()));
    while (c.Eat(","));
    c.Expect(")");
    return out;
  }

  void ReDim(Cursor& c) {
    Variant& var = Var(c.Name(), c);
    std::vector<SafeArray::Bound> bounds;
    for (int32_t upper : Indices(c)) bounds.push_back(SafeArray::Bound{0, upper});
    c.ExpectEnd();
    var = Variant(SafeArray(std::move(bounds)));
  }

  void Set(Cursor& c) {
    Variant& target = Var(c.Name(), c);
    if (c.Peek() == '(') {
      std::vector<int32_t> at = Indices(c);
      c.Expect(" = ");
      const Variant& source = Var(c.Name(), c);
      c.ExpectEnd();
      target.MutableArray().At(at) = source;
      return;
    }
    c.Expect(" = New ");
    std::string cls = c.Name();
    c.ExpectEnd();
    target = Variant(CreateObject(cls));
    ++stats_.objects;
  }

  void Assign(Cursor& c) {
    std::string name = c.Name();
    if (!c.Eat(" = ")) c.Expect("=");
    Variant value;
    if (c.Peek() == '"') {
      value = Variant(c.String());
    } else if (c.Peek() == '-' || std::isdigit(static_cast<unsigned char>(c.Peek()))) {
      value = Variant(static_cast<int32_t>(c.Int()));
    } else if (c.Eat("True")) {
      value = Variant(true);
    } else {
      value = Var(c.Name(), c);
    }
    c.ExpectEnd();
    PutProperty(with_.back(), name, std::move(value));
    ++stats_.properties;
  }

  int baseTabs_;
  std::vector<ObjectRef> with_;
  std::map<std::string, Variant> vars_;
  ReaderStats stats_;
};

}  // namespace

ReaderStats RunScript(const std::string& text, const ObjectRef& root, int baseTabs) {
  if (!text.empty() && !text.ends_with("\r\n")) throw std::runtime_error("text does not end in CR LF");
  Interpreter in(root, baseTabs);
  size_t start = 0;
  while (start < text.size()) {
    size_t end = text.find("\r\n", start);
    std::string line = text.substr(start, end - start);
    if (line.find_first_of("\r\n") != std::string::npos) throw std::runtime_error("stray CR or LF");
    in.Line(line);
    start = end + 2;
  }
  if (in.depth() != 0) throw std::runtime_error("unclosed With");
  return in.stats();
}

}  // namespace xal::testing
