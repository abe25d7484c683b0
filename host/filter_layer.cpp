// The host's filter layer over the connection's tables.
#include "host/filter_layer.h"

#include <cctype>

#include "host/connection.h"
#include "runtime/text.h"

namespace xal::host {

bool IsPlainName(const std::string& s) {
  if (s.empty()) return false;
  for (char ch : s)
    if (!(std::isalnum(static_cast<unsigned char>(ch)) || ch == '_')) return false;
  return true;
}

std::string FormFilterCondition(HostConnection& conn, const std::string& table, const std::string& filter) {
  std::string f = Trim(filter);
  if (f.size() >= 2 && f.front() == '{' && f.back() == '}') return Trim(f.substr(1, f.size() - 2));
  const size_t dot = f.find('.');
  if (dot == std::string::npos || !IsPlainName(f.substr(0, dot))) return f;
  const std::string rel = f.substr(0, dot);
  if (TextEquals(rel, table)) return f;
  size_t end = dot + 1;
  while (end < f.size() && (std::isalnum(static_cast<unsigned char>(f[end])) || f[end] == '_')) ++end;
  const std::string rest = f.substr(dot + 1);
  if (end == dot + 1 || rest.find('.') != std::string::npos) return f;
  const std::string key = "ID" + table;
  for (const std::string& col : conn.db().TableColumns(rel))
    if (TextEquals(col, key)) return "ID IN (SELECT " + key + " FROM " + rel + " WHERE " + rest + ")";
  return f;
}

}  // namespace xal::host
