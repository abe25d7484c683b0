// The host object model: the objects the host application hands the component — data objects
// (a document area or query result with a current row), the connection, the server object,
// parameter lists and the callback interface. The component calls the host only through these
// abstract classes; any host that performs these operations with the stated results serves it.
// The host owns every object here; the component holds Refs only while it uses them.
#pragma once

#include <cstdint>
#include <string>

#include "collections/ui_strings.h"
#include "runtime/object.h"
#include "runtime/variant.h"

namespace xal {

class XALConnect;
class XALServer;
class ParamList;

// ---------------------------------------------------------------------------------------------
// The host's numbers. The host's type library passes its enumerations through as integers; these
// names are the only place the component spells them out.
// ---------------------------------------------------------------------------------------------

// XALConnect::DatabaseKind: which SQL dialect the connection speaks.
enum DatabaseKind : int32_t {
  kDbFile = 1,    // the file database (the host answers any value but 2 for it)
  kDbServer = 2,  // the SQL server
};
// True when the connection's kind asks for the SQL server dialect; every other value is the file
// database, as the host documents it.
inline bool IsServerDialect(int32_t kind) { return kind == kDbServer; }

// Row states the component tests with DataObject::RowState.
constexpr int32_t kRowMarkedDeleted = 16;  // the user marked the row deleted; it is saved as a delete
constexpr int32_t kRowNotStored = 17;      // the row was added and has no stored record yet

// DataObject::Property numbers.
constexpr int32_t kPropTableName = 14;  // the table behind the data object
constexpr int32_t kPropLastError = 37;  // the text of the last failed host operation ("" after success)
// XALConnect::Property numbers.
constexpr int32_t kConnPropLanguage = 8;  // the user's language identifier (see LanguageID)
// XALServer::Property numbers.
constexpr int32_t kServerPropLanguage = 5;       // the language identifier of the server's texts
constexpr int32_t kServerPropRowRights = 8;      // row-level rights are in force
constexpr int32_t kServerPropRowRightsAlt = 50;  // row-level rights are in force (second switch)

// XALServer::OpenQuery modes: how the host opens the result. The reference host treats them alike;
// a real host uses them to choose cursor and locking.
enum QueryMode : int32_t {
  kQueryEditable = 1,  // an updatable, positioned result (the row may be written back)
  kQueryReadOnly = 3,  // a read-only snapshot
  kQueryForward = 4,   // read once from the first row on (counts, existence tests)
  kQueryServer = 11,   // run on the server as written, no client-side rewrite (server dialect)
};

// Language identifiers the host reports (connection property 8, server property 5) are the UI
// string table's columns: kLangEnglish 3, kLangEstonian 4, kLangThird 5; any other reads English.
using LanguageID = UILanguage;

// DataObject::RecordOperation codes.
constexpr int32_t kRecordOpMoveReferences = 41;  // every reference to the current record moves to the target
// XALServer::Text kinds.
constexpr int32_t kTextMessage = 2;  // a message by key (the other kinds are table captions)
// XALConnect::LogCheck flags.
constexpr int32_t kLogRecordChanges = 16;  // merges and deletions of register records

// XALConnect::CheckRight: the user right asked for with kind "DOCUMENT".
constexpr int32_t kRightNone = 0;      // argument a: no sub-right
constexpr int32_t kRightExecute = 4;   // argument b: may run the document's special functions

class DataObject : public Object {
 public:
  // Field value by name, dotted path through linked tables ("GRArticle.Code") or "@" pseudo-field;
  // Empty when there is no current row.
  virtual Variant Field(const std::string& name) = 0;
  virtual void SetField(const std::string& name, const Variant& value) = 0;
  virtual void MoveFirst() = 0;
  virtual void MoveNext() = 0;
  virtual bool IsEOF() = 0;  // True when there is no current row (past the last, or no rows)
  virtual bool IsBOF() = 0;  // True when positioned before the first row
  virtual int32_t RowCount() = 0;
  // Moves to the first row matching `condition` ("ID=" & id); returns 0 when one was found.
  virtual int32_t FindFirst(const std::string& condition, int32_t mode) = 0;
  virtual void AddNew() = 0;
  virtual void Delete() = 0;  // deleting moves on to the next row
  virtual Variant Bookmark() = 0;
  virtual void GoToBookmark(const Variant& bookmark) = 0;
  // Writes the current row back to the form. a: refresh the row on the screen from the data;
  // b: run the host's own field validations for it; c: the row set is empty and only the form's
  // view of it is to be refreshed (used after deleting the last cached sub-row).
  virtual void UpdateRow(bool a, bool b, bool c) = 0;
  // True when the current row is in state `state` (16 marked deleted, 17 not stored yet).
  virtual bool RowState(int32_t state) = 0;
  // The owning record; on a header, the values as they were saved.
  virtual Ref<DataObject> Owner() = 0;
  virtual std::string TableName() = 0;
  virtual Variant Property(int32_t number) = 0;  // kPropTableName, kPropLastError
  // A named function of the host ("ActualRowCount", "GetBalance", …) with a ParamList or object.
  virtual Variant CallFunction(const std::string& name, const Variant& params, int32_t flags) = 0;
  // A record-level operation by code (kRecordOpMoveReferences).
  virtual Variant RecordOperation(int32_t code, const Variant& arg) = 0;
  virtual Ref<XALConnect> Connection() = 0;
};

class XALConnect : public Object {
 public:
  virtual Ref<XALServer> Server() = 0;
  // A DatabaseKind: kDbServer speaks the SQL server dialect, any other value the file database.
  virtual int32_t DatabaseKind() = 0;
  virtual int32_t UserID() = 0;
  virtual Ref<DataObject> UserObject() = 0;
  // A user's option (user 0: the system option), or `defaultValue` when it is not set.
  virtual Variant UserOption(int32_t user, const std::string& section, const std::string& key,
                             const Variant& defaultValue) = 0;
  virtual Variant Setting(const std::string& category, const std::string& name, const Variant& defaultValue) = 0;
  virtual void SetSetting(const std::string& category, const std::string& name, const Variant& value) = 0;
  // Runs an SQL statement; the result is the number of rows it affected where the host knows it.
  virtual Variant Execute(const std::string& sql, int32_t options) = 0;
  virtual Variant ServerCommand(const std::string& name, const Ref<ParamList>& params) = 0;
  // Whether `user` holds a right on `object` of `kind` ("DOCUMENT", table name): `a` names a
  // sub-right (0: none), `b` the right itself as a bit (4: may run the object's special functions).
  virtual bool CheckRight(int32_t user, const std::string& kind, const std::string& object, int32_t a,
                          int32_t b) = 0;
  virtual bool LogCheck(const std::string& kind, const std::string& table, int32_t flags) = 0;
  virtual void WriteLog(const std::string& kind, const std::string& table, int32_t id, const std::string& text) = 0;
  virtual Variant Property(int32_t number) = 0;  // kConnPropLanguage

  // Optional transactions: a host that offers none returns False from BeginTransaction, and the
  // component then runs its statements one by one.
  virtual bool BeginTransaction() { return false; }
  virtual void CommitTransaction() {}
  virtual void RollbackTransaction() {}
};

class XALServer : public Object {
 public:
  // A query (SQL text or a table name) positioned on its first row; `mode` is a QueryMode, `filter` a
  // condition added to a table query, `fields` the columns to read ("" all).
  virtual Ref<DataObject> OpenQuery(const std::string& sqlOrTable, int32_t mode, const std::string& filter,
                                    const std::string& fields) = 0;
  virtual Ref<DataObject> OpenDataObject(const std::string& table) = 0;
  virtual Ref<ParamList> NewParamList() = 0;
  virtual Ref<XALConnect> Connection() = 0;
  // A message or table caption by key, in language `lang` (kind kTextMessage: a message).
  virtual std::string Text(const std::string& key, int32_t kind, int32_t lang) = 0;
  virtual Variant Property(int32_t number) = 0;  // kServerPropLanguage, kServerPropRowRights(Alt)
  // One ParamList per table, keyed by table name, with "isDocument", "isRegister", "isReport",
  // "CanAdminister" and "SystemTable".
  virtual Ref<ParamList> TableCatalogue() = 0;
};

class ParamList : public Object {
 public:
  // The entry's value (its Item); Empty when there is no such entry.
  virtual Variant Item(const std::string& name) = 0;
  virtual bool Exists(const std::string& name) = 0;
  // Sets the value of the entry, adding it when missing.
  virtual void Set(const std::string& name, const Variant& value) = 0;
  virtual void SetObject(const std::string& name, const ObjectRef& object) = 0;
  virtual void Add(const std::string& name, const Variant& value) = 0;
  // Entry attributes: "DateFormat", "SelectOnly", "Fixed", "DefaultValue".
  virtual void SetAttribute(const std::string& name, const std::string& attribute, const Variant& value) = 0;
  virtual Variant Attribute(const std::string& name, const std::string& attribute) = 0;
  virtual std::string Key() = 0;
  virtual int32_t Count() = 0;
  virtual std::string NameAt(int32_t position) = 0;  // 1-based, in order
};

// The host's callback interface, through which a server-side routine asks the user something.
class IXALCallback : public Object {
 public:
  virtual Variant CallBack(int32_t callerID, const std::string& sCommand, const std::string& sMessage,
                           const Variant& vParam) = 0;
  virtual bool Notify(int32_t callerID, int32_t eNotify, const std::string& sMessage, const Variant& vParam) = 0;
  // The answer code: kAnswerYes, kAnswerNo, kAnswerOK, kAnswerCancel.
  virtual int32_t MsgBox(int32_t callerID, const std::string& Prompt, int32_t Buttons, const std::string& Title,
                         const std::string& Helpfile, int32_t Context) = 0;
  virtual bool InputBox(int32_t callerID, Ref<ParamList>& Params, int32_t Buttons, const std::string& Title) = 0;
};

// Message-box buttons (added together) and answers.
constexpr int32_t kMbOK = 0;
constexpr int32_t kMbOKCancel = 1;
constexpr int32_t kMbYesNo = 4;
constexpr int32_t kMbButtonsMask = 7;      // the buttons part of a Buttons value
constexpr int32_t kMbDefaultSecond = 256;  // the second button is preselected
constexpr int32_t kMbYesNoDefaultNo = kMbYesNo + kMbDefaultSecond;
constexpr int32_t kMbInformation = 64;
constexpr int32_t kMbQuestion = 32;     // icons, added to the buttons
constexpr int32_t kMbExclamation = 48;
constexpr int32_t kAnswerOK = 1;
constexpr int32_t kAnswerCancel = 2;
constexpr int32_t kAnswerYes = 6;
constexpr int32_t kAnswerNo = 7;

// IXALCallback::Notify kinds the component sends while it works (the host shows progress).
constexpr int32_t kNotifyProgressStart = 2;  // value: the number of steps that follow
constexpr int32_t kNotifyProgressStep = 4;

}  // namespace xal
