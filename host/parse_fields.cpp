// The host's "ParseFields" named function: turns a condition over a data object's table, whose
// names may be dotted paths through the table's links ("Partner.Code = 'X'"), into the FROM and
// WHERE parts of a query over that table, the table itself under the alias "A" + n and every link
// on a path joined once under "A" + n + "_" + k.
//
//   SelectQuery := condition [ "<<<" digits ">>>" ]      digits: n of the alias (default 0)
//   LeftJoin    := True for LEFT JOINs, False for inner JOINs
//   out From    := table An { join linked-table An_k ON An_k.ID = prev.field }
//   out Where   := the condition with each column of the table prefixed "An." and each path
//                  "l1.….lm.field" replaced by "An_k.field" (k: the join of l1.….lm)
//
// Names inside sub-selects, function names and names that are neither columns nor resolvable
// paths are left as they are. On the file database every join but the last is bracketed, as that
// engine requires.
#include <string>
#include <unordered_map>
#include <vector>

#include "host/connection.h"
#include "host/data_object.h"
#include "host/sql_tokenizer.h"
#include "runtime/convert.h"
#include "runtime/error.h"
#include "runtime/text.h"

namespace xal::host {

namespace {

using K = SqlTokenKind;

bool IsName(const SqlToken& t) { return t.kind == K::kIdentifier || t.kind == K::kBracketed; }
std::string NameOf(const SqlToken& t) { return t.kind == K::kBracketed ? SqlTokenValue(t) : std::string(t.text); }

// Splits "condition<<<n>>>" into the condition and the alias "An".
void SplitAliasSuffix(const std::string& query, std::string& condition, std::string& alias) {
  condition = query;
  alias = "A0";
  const size_t open = query.rfind("<<<");
  if (open == std::string::npos || query.size() < open + 7 || query.compare(query.size() - 3, 3, ">>>") != 0) return;
  const std::string digits = query.substr(open + 3, query.size() - open - 6);
  if (digits.empty() || digits.find_first_not_of("0123456789") != std::string::npos) return;
  condition = query.substr(0, open);
  alias = "A" + digits;
}

class ConditionParser {
 public:
  ConditionParser(HostDataObject& self, std::string alias, bool leftJoin)
      : self_(self), conn_(*self.HostConn()), alias_(std::move(alias)), leftJoin_(leftJoin) {}

  std::string Where(const std::string& condition) {
    const std::vector<SqlToken> tokens = TokenizeSql(condition);
    std::vector<bool> frames;  // one per open parenthesis: whether a sub-select runs inside it
    bool topSelect = false;
    std::string out;
    for (size_t i = 0; i < tokens.size(); ++i) {
      const SqlToken& t = tokens[i];
      if (t.kind == K::kLParen) frames.push_back(false);
      if (t.kind == K::kRParen && !frames.empty()) frames.pop_back();
      if (IsSqlWord(t, "SELECT")) {
        if (frames.empty())
          topSelect = true;
        else
          frames.back() = true;
      }
      if (!IsName(t)) {
        out += t.text;
        continue;
      }
      // A name, or a dotted path of names written without blanks.
      std::vector<std::string> parts{NameOf(t)};
      size_t last = i;
      while (last + 2 < tokens.size() && tokens[last + 1].kind == K::kDot && IsName(tokens[last + 2])) {
        parts.push_back(NameOf(tokens[last + 2]));
        last += 2;
      }
      std::string original;
      for (size_t k = i; k <= last; ++k) original += tokens[k].text;
      const bool isCall = last + 1 < tokens.size() && tokens[last + 1].kind == K::kLParen;
      bool inSelect = topSelect;
      for (bool f : frames) inSelect = inSelect || f;
      out += (isCall || inSelect) ? original : Rewrite(parts, original);
      i = last;
    }
    const std::string where = Trim(out);
    return where.empty() ? "0=0" : where;
  }

  // The table under its alias with every join the condition needed.
  std::string From() const {
    const bool bracket = !IsServerDialect(conn_.DatabaseKind());
    std::string from = self_.TableName() + " " + alias_;
    for (size_t k = 0; k < joins_.size(); ++k) {
      const bool wrap = bracket && k + 1 < joins_.size();
      from = (wrap ? "(" : "") + from + joins_[k] + (wrap ? ")" : "");
    }
    return from;
  }

 private:
  std::string Rewrite(const std::vector<std::string>& parts, const std::string& original) {
    if (parts.size() == 1) return self_.HasColumn(parts[0]) ? alias_ + "." + parts[0] : original;
    // "Table.Field" on the table itself.
    if (parts.size() == 2 && TextEquals(parts[0], self_.TableName()) && self_.HasColumn(parts[1]))
      return alias_ + "." + parts[1];
    std::string prev = alias_, key;
    for (size_t k = 0; k + 1 < parts.size(); ++k) {
      key += FoldCase(parts[k]) + ".";
      auto it = aliases_.find(key);
      if (it == aliases_.end()) {
        std::string field, table;
        if (!conn_.ResolveLink(parts[k], field, table)) return original;
        const std::string a = alias_ + "_" + std::to_string(joins_.size() + 1);
        joins_.push_back(std::string(leftJoin_ ? " LEFT JOIN " : " INNER JOIN ") + table + " " + a + " ON " + a +
                         ".ID = " + prev + "." + field);
        it = aliases_.emplace(key, a).first;
      }
      prev = it->second;
    }
    return prev + "." + parts.back();
  }

  HostDataObject& self_;
  HostConnection& conn_;
  std::string alias_;
  bool leftJoin_;
  std::vector<std::string> joins_;
  std::unordered_map<std::string, std::string> aliases_;  // folded "link.link." -> alias
};

// Params: "SelectQuery" and "LeftJoin" in, "From" and "Where" out. True.
Variant ParseFields(HostDataObject& self, const Variant& params, int32_t) {
  Ref<ParamList> list;
  if (params.IsObject()) list = std::dynamic_pointer_cast<ParamList>(params.AsObject());
  if (!list) Raise(kErrInvalidCall, "ParseFields needs a parameter list");
  std::string condition, alias;
  SplitAliasSuffix(CStr(list->Item("SelectQuery")), condition, alias);
  ConditionParser parser(self, alias, IsTrue(list->Item("LeftJoin")));
  const std::string where = parser.Where(condition);
  list->Set("Where", Variant(where));
  list->Set("From", Variant(parser.From()));
  return Variant(true);
}

const bool kRegistered = [] {
  RegisterDataObjectFunction("ParseFields", ParseFields);
  return true;
}();

}  // namespace

}  // namespace xal::host
