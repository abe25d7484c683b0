// Type-library entries of the reference host's objects, so that scripts, `xal session` and tests
// reach a connection, its server, data objects, parameter lists and document sessions by name,
// exactly as they reach the component's own classes.
#include "host/connection.h"
#include "host/data_object.h"
#include "host/document_session.h"
#include "host/param_list.h"
#include "runtime/binding.h"

namespace xal::host {
namespace {

void RegisterConnection() {
  using C = HostConnection;
  ClassBuilder<C>("XALConnect")
      .Interface("XALConnect")
      .Get<&C::Server>("Server")
      .Get<&C::DatabaseKind>("DatabaseKind")
      .Get<&C::UserID>("UserID")
      .Get<&C::UserObject>("UserObject")
      .Method<&C::UserOption>("UserOption", {Param("User"), Param("Section"), Param("Key"), Opt("Default")})
      .Method<&C::Setting>("Setting", {Param("Category"), Param("Name"), Opt("Default")})
      .Method<&C::SetSetting>("SetSetting", {Param("Category"), Param("Name"), Param("Value")})
      .Method<&C::Execute>("Execute", {Param("SQL"), Opt("Options")})
      .Method<&C::ServerCommand>("ServerCommand", {Param("Name"), Opt("Params")})
      .Method<&C::CheckRight>("CheckRight", {Param("User"), Param("Kind"), Param("Object"), Opt("A"), Opt("B")})
      .Method<&C::LogCheck>("LogCheck", {Param("Kind"), Param("Table"), Opt("Flags")})
      .Method<&C::WriteLog>("WriteLog", {Param("Kind"), Param("Table"), Param("ID"), Param("Text")})
      .Get<&C::Property>("Property", {Param("Number")})
      .Method<&C::BeginTransaction>("BeginTransaction")
      .Method<&C::CommitTransaction>("CommitTransaction")
      .Method<&C::RollbackTransaction>("RollbackTransaction")
      .Method<&C::SetUserOption>("SetUserOption", {Param("User"), Param("Section"), Param("Key"), Param("Value")})
      .Method<&C::SetLanguage>("SetLanguage", {Param("LangID")})
      .Method<&C::SetUserID>("SetUserID", {Param("UserID")});
}

void RegisterServer() {
  using S = HostServer;
  ClassBuilder<S>("XALServer")
      .Interface("XALServer")
      .Method<&S::OpenQuery>("OpenQuery", {Param("Source"), Opt("Mode"), Opt("Filter"), Opt("Fields")})
      .Method<&S::OpenDataObject>("OpenDataObject", {Param("Table")})
      .Method<&S::NewParamList>("NewParamList")
      .Get<&S::Connection>("Connection")
      .Method<&S::Text>("Text", {Param("Key"), Def("Kind", 2), Opt("Lang")})
      .Get<&S::Property>("Property", {Param("Number")})
      .Put<&S::SetProperty>("Property", {Param("Number"), Param("Value")})
      .Get<&S::TableCatalogue>("TableCatalogue");
}

void RegisterDataObject() {
  using D = HostDataObject;
  ClassBuilder<D>("DataObject")
      .Interface("DataObject")
      .Get<&D::Field>("Field", {Param("Name")}).Default()
      .Put<&D::SetField>("Field", {Param("Name"), Param("Value")})
      .Method<&D::MoveFirst>("MoveFirst")
      .Method<&D::MoveNext>("MoveNext")
      .Get<&D::IsEOF>("EOF")
      .Get<&D::IsBOF>("BOF")
      .Get<&D::RowCount>("RowCount")
      .Method<&D::FindFirst>("FindFirst", {Param("Condition"), Opt("Mode")})
      .Method<&D::AddNew>("AddNew")
      .Method<&D::Delete>("Delete")
      .Get<&D::Bookmark>("Bookmark")
      .Method<&D::GoToBookmark>("GoToBookmark", {Param("Bookmark")})
      .Method<&D::UpdateRow>("UpdateRow", {Opt("A"), Opt("B"), Opt("C")})
      .Method<&D::RowState>("RowState", {Param("State")})
      .Get<&D::Owner>("Owner")
      .Get<&D::TableName>("TableName")
      .Get<&D::Property>("Property", {Param("Number")})
      .Method<&D::CallFunction>("CallFunction", {Param("Name"), Opt("Params"), Opt("Flags")})
      .Method<&D::RecordOperation>("RecordOperation", {Param("Code"), Opt("Arg")})
      .Get<&D::Connection>("Connection")
      .Method<&D::Save>("Save")
      .Get<&D::ActualRowCount>("ActualRowCount");
}

void RegisterParamList() {
  using P = HostParamList;
  ClassBuilder<P>("ParamList")
      .Interface("ParamList")
      .Creatable()
      .Get<&P::Item>("Item", {Param("Name")}).Default()
      .Put<&P::Set>("Item", {Param("Name"), Param("Value")})
      .Method<&P::Exists>("Exists", {Param("Name")})
      .Method<&P::Set>("Set", {Param("Name"), Param("Value")})
      .Method<&P::SetObject>("SetObject", {Param("Name"), Param("Object")})
      .Method<&P::Add>("Add", {Param("Name"), Opt("Value")})
      .Method<&P::SetAttribute>("SetAttribute", {Param("Name"), Param("Attribute"), Param("Value")})
      .Method<&P::Attribute>("Attribute", {Param("Name"), Param("Attribute")})
      .Get<&P::Key>("Key")
      .Get<&P::Count>("Count")
      .Method<&P::NameAt>("NameAt", {Param("Position")});
}

void RegisterDocumentSession() {
  using S = DocumentSession;
  ClassBuilder<S>("DocumentSession")
      .Get<&S::Proxy>("Proxy")
      .Get<&S::Header>("Header")
      .Get<&S::Rows>("Rows")
      .Get<&S::Connection>("Connection")
      .Get<&S::DocFunc>("DocFunc")
      .Method<&S::Save>("Save")
      .Method<&S::Close>("Close")
      .Get<&S::TranscriptText>("Transcript")
      .Method<&S::ClearTranscript>("ClearTranscript")
      .Method<&S::AddMsgBoxAnswer>("AddMsgBoxAnswer", {Param("Answer")})
      .Method<&S::SetSettingAnswer>("SetSettingAnswer", {Param("Key"), Param("Value")})
      .Method<&S::SetFunctionAnswer>("SetFunctionAnswer", {Param("Name"), Param("Value")})
      .Method<&S::SetInputBoxAnswer>("SetInputBoxAnswer", {Param("Confirm"), Opt("Values")});
}

const bool kRegistered = (RegisterConnection(), RegisterServer(), RegisterDataObject(), RegisterParamList(),
                          RegisterDocumentSession(), true);

}  // namespace
}  // namespace xal::host
