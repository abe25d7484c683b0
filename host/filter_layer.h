// The host's filter layer: what a form's filter may hold besides a plain condition on its table,
// and the test for a plain table name that decides whether a query source is a table or SQL.
//   {condition}             braces mark raw SQL for the host: the condition inside is used as it is
//   Rel.Column op value     one condition on a relation table that names the filtered table's rows
//                           (a column "ID" + table), as "GRArticleCatRel.IDGRArticleCat = 3" on
//                           GRArticle: ID IN (SELECT IDGRArticle FROM GRArticleCatRel WHERE …)
// Anything else is passed on as given.
#pragma once

#include <string>

namespace xal::host {

class HostConnection;

// True for a non-empty name of letters, digits and "_" only.
bool IsPlainName(const std::string& s);

// The condition on `table` that the form filter `filter` stands for (see above); `conn` supplies
// the relation table's columns.
std::string FormFilterCondition(HostConnection& conn, const std::string& table, const std::string& filter);

}  // namespace xal::host
