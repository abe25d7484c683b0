// The document logic of a session's form: a DocFunc wired as a host wires one — its Doc, DocData
// and XALServer set, Create called, the form's rows bound and Doc_Initialize called — made on
// first use, so that a session that never asks for it records no menu events, and destroyed with
// the session. It is reached late-bound by name, as the form's scripts reach it.
#include "host/document_session.h"
#include "runtime/dispatch.h"
#include "runtime/trap.h"

namespace xal::host {

namespace {
void PutRef(const ObjectRef& obj, const char* name, const ObjectRef& value) {
  std::vector<Variant> args{Variant(value)};
  Invoke(obj, name, MemberKind::PutRef, args);
}
}  // namespace

ObjectRef DocumentSession::DocFunc() {
  if (docFunc_ || !proxy_) return docFunc_;
  ObjectRef df = CreateObject("DocFunc");
  PutRef(df, "Doc", proxy_);
  PutRef(df, "DocData", header_);
  PutRef(df, "XALServer", conn_->Server());
  Call(df, "Create");
  std::vector<Variant> rows{Variant(ObjectRef(rows_))};
  Invoke(df, "SetRowOB", MemberKind::Method, rows);
  Call(df, "Doc_Initialize");
  docFunc_ = df;
  return docFunc_;
}

void DocumentSession::ReleaseDocFunc() {
  if (docFunc_) TryStep([&] { Call(docFunc_, "Destroy"); });
  docFunc_.reset();
}

}  // namespace xal::host
