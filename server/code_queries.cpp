// Codes and identifiers of records: the external ("DX") code of a data object's current record,
// and the translation of a filter argument between user-typed codes and record identifiers
// through the table a linked field points to. All three trap every error and then return what
// they had built (usually an empty string): a filter or export must not fail because of a code.
#include <functional>

#include "runtime/convert.h"
#include "runtime/text.h"
#include "runtime/trap.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {

// A field value as text, Null and Empty as "" (as "&" joins them).
std::string FieldText(const Checked<DataObject>& obj, const std::string& field) {
  return ValueOr(obj->Field(field), std::string());
}

// "field <> 0" as a condition: Null is not true, Empty is 0.
bool NonZero(const Variant& v) { return ValueOr(v, 0.0) != 0; }

// The value of the field that the "DXCode" setting names for the table, `defaultField` unless set.
std::string CodeFieldValue(const Checked<DataObject>& obj, const std::string& table, const char* defaultField) {
  const Checked<XALConnect> conn = obj->Connection();
  const std::string field = CStr(conn->Setting("DXCode", table, Variant(defaultField)));
  return FieldText(obj, field);
}

// Appends each piece as it is computed, so a failure part-way leaves the part already built.
void BuildDXCode(const Checked<DataObject>& pObj, std::string& out) {
  const std::string table = UCase(CStr(pObj->Property(kPropTableName)));
  if (table == "GRBANKACCOUNT") {
    out += CodeFieldValue(pObj, table, "Name");
  } else if (table == "GRCOMPCONTPERSON") {
    // A company's contact person is known by the company's code and the surname.
    if (NonZero(pObj->Field("IDGRCompany"))) {
      out += FieldText(pObj, "GRCompany.DXCode");
      out += FieldText(pObj, "SurName");
    } else {
      out += FieldText(pObj, "SurName");
      out += FieldText(pObj, "FirstName");
    }
  } else if (table == "DRSTOCKRESERVE") {
    // A lot is known by its article's code followed by its own code (the serial number).
    if (NonZero(pObj->Field("IDGRArticle"))) out += FieldText(pObj, "GRArticle.DXCode");
    out += CodeFieldValue(pObj, table, "SerialNo");
  } else if (table == "XALFORMS" || table == "GRREPORT") {
    // The system's own forms and reports carry a fixed "XAL…" index that serves as their code.
    const std::string index = FieldText(pObj, "XALIndex");
    if (UCase(Left(Trim(index), 3)) == "XAL")
      out += index;
    else
      out += CodeFieldValue(pObj, table, "Code");
  } else {
    out += CodeFieldValue(pObj, table, "Code");
  }
}

bool IsListCondition(const std::string& condition) {
  for (const char* c : {"=", "<>", "IN", "NOT IN", "IN QUERY"})
    if (TextEquals(condition, c)) return true;
  return false;
}

// Whether a filter on `field` with `condition` is one whose argument is codes (or identifiers) of
// a linked table: a ".Code" or ".DXCode" field, or the "IN QUERY" condition.
bool TranslatesArgument(const std::string& field, const std::string& condition) {
  if (!IsListCondition(condition)) return false;
  return Like(field, "*.Code", CompareMode::Text) || Like(field, "*.DXCode", CompareMode::Text) ||
         TextEquals(condition, "IN QUERY");
}

struct LinkedCode {
  std::string table;
  std::string codeField;
};

// The table and code field the filter refers to. For a linked field the host names the table;
// a failure there is ignored and leaves the table empty.
LinkedCode LinkedCodeOf(const std::string& field, const std::string& condition, const Checked<DataObject>& source,
                        const std::string& queryLinkTable) {
  if (TextEquals(condition, "IN QUERY")) return {queryLinkTable, "Code"};
  LinkedCode lc;
  lc.table = TryOr(
      [&] {
        const Checked<XALServer> server = Checked<XALConnect>(source->Connection())->Server();
        const Checked<ParamList> params = server->NewParamList();
        params->Set("Field", Variant(field));
        return CStr(source->CallFunction("LinkedTableName", Variant(ObjectRef(params.get())), 0));
      },
      std::string());
  lc.codeField = Mid(field, InStrRev(field, ".") + 1);
  return lc;
}

// Runs `sql` (query mode 3) and joins `render(row)` of every row with ",".
std::string JoinRows(const Checked<DataObject>& source, const std::string& sql,
                     const std::function<std::string(const Checked<DataObject>&)>& render) {
  const Checked<XALServer> server = Checked<XALConnect>(source->Connection())->Server();
  const Checked<DataObject> rows = server->OpenQuery(sql, kQueryReadOnly, "", "");
  std::vector<std::string> parts;
  for (; !rows->IsEOF(); rows->MoveNext()) parts.push_back(render(rows));
  return Join(parts, ",");
}

std::string CodeToID(const std::string& pField, const std::string& pCondition, const std::string& pArgument,
                     const Ref<DataObject>& pSourceTableOB, const std::string& pQueryLinkTable) {
  if (!TranslatesArgument(pField, pCondition)) return pArgument;
  // ",," in the argument is a comma inside a code. Every code becomes a quoted literal, its own
  // quotes doubled: the codes are typed by the user and must not end the literal early.
  std::string codes;
  for (const std::string& piece : Split(Replace(pArgument, ",,", "@$"), ","))
    codes += SQLText(Replace(piece, "@$", ",")) + ",";
  if (codes.empty()) return std::string();
  codes.pop_back();
  const LinkedCode lc = LinkedCodeOf(pField, pCondition, pSourceTableOB, pQueryLinkTable);
  if (lc.table.empty()) return std::string();
  return JoinRows(pSourceTableOB, "SELECT ID FROM " + lc.table + " WHERE " + lc.codeField + " In (" + codes + ")",
                  [](const Checked<DataObject>& row) { return FieldText(row, "ID"); });
}

std::string IDToCode(const std::string& pField, const std::string& pCondition, const std::string& pArgument,
                     const Ref<DataObject>& pSourceTableOB, const std::string& pQueryLinkTable) {
  if (!TranslatesArgument(pField, pCondition)) return pArgument;
  // Identifiers are typed by the user too: each must be a whole number, so nothing but digits
  // reaches the SQL text (anything else is a type mismatch and ends the translation).
  std::vector<std::string> ids;
  for (const std::string& piece : Split(pArgument, ",")) ids.push_back(std::to_string(CLng(Variant(Trim(piece)))));
  if (ids.empty()) return std::string();
  const LinkedCode lc = LinkedCodeOf(pField, pCondition, pSourceTableOB, pQueryLinkTable);
  if (lc.table.empty()) return std::string();
  // A comma inside a code is written ",," so the list can be split again.
  return JoinRows(pSourceTableOB,
                  "SELECT " + lc.codeField + " FROM " + lc.table + " WHERE ID In (" + Join(ids, ",") + ")",
                  [&](const Checked<DataObject>& row) { return Replace(FieldText(row, lc.codeField), ",", ",,"); });
}

}  // namespace

std::string GetDXCode(const Ref<DataObject>& pObj) {
  std::string code;
  TryStep([&] { BuildDXCode(pObj, code); });
  return code;
}

std::string QueryCodeToID(const std::string& pField, const std::string& pCondition, const std::string& pArgument,
                          const Ref<DataObject>& pSourceTableOB, const std::string& pQueryLinkTable) {
  return TryOr([&] { return CodeToID(pField, pCondition, pArgument, pSourceTableOB, pQueryLinkTable); }, std::string());
}

std::string QueryIDToCode(const std::string& pField, const std::string& pCondition, const std::string& pArgument,
                          const Ref<DataObject>& pSourceTableOB, const std::string& pQueryLinkTable) {
  return TryOr([&] { return IDToCode(pField, pCondition, pArgument, pSourceTableOB, pQueryLinkTable); }, std::string());
}

}  // namespace xal::server
