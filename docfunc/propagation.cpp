// Carrying a header value into the document's rows: the walk over the rows and the component rows
// of set rows, and the register question that decides whether a header register goes there.
#include "collections/ui_strings.h"
#include "docfunc/handler.h"
#include "docfunc/values.h"
#include "runtime/text.h"

namespace xal {

using namespace docfunc;  // NOLINT: the value readers of this folder

namespace {

// A row whose completion type names a set owns component rows under the link "Next".
bool IsSetRow(xal::DataObject& row, const std::string& completionTypeField) {
  return NameIn(TrimmedOf(row.Field(completionTypeField)), {"C", "D", "A", "R", "P"});
}

// A capital-asset receipt moves the asset from one side to the other, so a register written into
// one side's field ("IDReceiverDepartment") is written into the other's too; "" when the field
// names no side.
std::string OtherSide(const std::string& field) {
  if (InStr(field, "Sender", CompareMode::Text) > 0) return Replace(field, "Sender", "Receiver", 1, -1, CompareMode::Text);
  if (InStr(field, "Receiver", CompareMode::Text) > 0) return Replace(field, "Receiver", "Sender", 1, -1, CompareMode::Text);
  return "";
}

}  // namespace

bool DocFunc::HasRows() { return st_.RowOB && st_.RowOB->RowCount() > 0; }

// The walk, the same whichever header value it carries:
//   1. Every row of RowOB from the first to the end of the data.
//   2. A set row first takes its component rows ("Next"): an empty set is released; otherwise each
//      component gets the value and is committed (so the host's cached rows hold it at once).
//   3. Then the row itself gets the value.
//   4. On a capital-asset receipt, a field of one side ("Sender"/"Receiver") is written on the
//      other side as well, in the components and in the row.
//   5. The rows are refreshed and written back when the outermost handler leaves.
// The rows' position is put back by the handler template.
void DocFunc::PropagateToRows(const std::string& field, const Variant& value) {
  xal::DataObject& rows = *st_.RowOB;
  const std::string twin = TextEquals(st_.DocTable, "CDReceipts") ? OtherSide(field) : "";
  auto write = [&](xal::DataObject& row) {
    row.SetField(field, value);
    if (!twin.empty()) row.SetField(twin, value);
  };
  for (rows.MoveFirst(); !rows.IsEOF(); rows.MoveNext()) {
    if (IsSetRow(rows, st_.CompletionTypeField)) {
      Ref<xal::DataObject> parts = st_.Doc->CachedRows(st_.RowTable, "Next");
      if (!parts || parts->RowCount() == 0) {
        st_.Doc->FreeCachedRows(st_.RowTable, "Next");
      } else {
        for (parts->MoveFirst(); !parts->IsEOF(); parts->MoveNext()) {
          write(*parts);
          parts->UpdateRow(true, false, false);
        }
      }
    }
    write(rows);
  }
  st_.BrowserRefreshPending = st_.RowsRecalcPending = true;
}

// The register question: nothing happens for an empty register or a document without rows;
// otherwise the user's option "AskRegister" or the question (text 74 naming the registers)
// decides, and on yes the register goes into every row as a Long. The header keeps the new value
// either way.
void DocFunc::CarryRegisterToRows(const std::string& headerField, int32_t noun, const std::string& rowField) {
  const int32_t value = LongOf(st_.DocData->Field(headerField));
  if (value == 0 || !HasRows()) return;
  if (!CarryToRows("AskRegister", GetUIString(74, {Variant(GetUIString(noun))}))) return;
  PropagateToRows(rowField, Variant(value));
}

}  // namespace xal
