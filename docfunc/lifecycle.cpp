// Lifecycle handlers of DocFunc (being written).
#include "docfunc/handler.h"

namespace xal {

void DocFunc::Destroy() {}
bool DocFunc::Doc_TestScript() { return false; }
bool DocFunc::Doc_Initialize() { return false; }
bool DocFunc::Doc_Show() { return false; }
bool DocFunc::Doc_Valid() { return false; }
bool DocFunc::AddNewDocument() { return false; }
bool DocFunc::WhenDocument() { return false; }
bool DocFunc::VDocument() { return false; }
bool DocFunc::DelRow() { return false; }
void DocFunc::SetRowOB(Ref<xal::DataObject>& pRowOB) {
  st_.RowOB = pRowOB;
  st_.RowsOB = pRowOB;
}

}  // namespace xal
