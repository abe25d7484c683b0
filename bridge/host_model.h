// The host object model: the objects the host application hands the component — data objects
// (a document area or query result with a current row), the connection, the server object,
// parameter lists and the callback interface. The component calls the host only through these
// abstract classes; any host that performs these operations with the stated results serves it.
// The host owns every object here; the component holds Refs only while it uses them.
#pragma once

#include <cstdint>
#include <string>

#include "runtime/object.h"
#include "runtime/variant.h"

namespace xal {

class XALConnect;
class XALServer;
class ParamList;

// Row states the component tests with DataObject::RowState.
constexpr int32_t kRowMarkedDeleted = 16;
constexpr int32_t kRowNotStored = 17;
// DataObject::Property numbers the component reads.
constexpr int32_t kPropTableName = 14;

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
  // Stores the current row; the three flags are passed through to the host's update.
  virtual void UpdateRow(bool a, bool b, bool c) = 0;
  // True when the current row is in state `state` (16 marked deleted, 17 not stored yet).
  virtual bool RowState(int32_t state) = 0;
  // The owning record; on a header, the values as they were saved.
  virtual Ref<DataObject> Owner() = 0;
  virtual std::string TableName() = 0;
  virtual Variant Property(int32_t number) = 0;  // 14: the table name
  // A named function of the host ("ActualRowCount", "GetBalance", …) with a ParamList or object.
  virtual Variant CallFunction(const std::string& name, const Variant& params, int32_t flags) = 0;
  // A record-level operation by code (41: move the references of the current record to another).
  virtual Variant RecordOperation(int32_t code, const Variant& arg) = 0;
  virtual Ref<XALConnect> Connection() = 0;
};

class XALConnect : public Object {
 public:
  virtual Ref<XALServer> Server() = 0;
  // 2: the SQL server dialect; any other value: the file database.
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
  // Whether `user` may do `a`/`b` on `object` of `kind` ("DOCUMENT", table, 0, 4).
  virtual bool CheckRight(int32_t user, const std::string& kind, const std::string& object, int32_t a,
                          int32_t b) = 0;
  virtual bool LogCheck(const std::string& kind, const std::string& table, int32_t flags) = 0;
  virtual void WriteLog(const std::string& kind, const std::string& table, int32_t id, const std::string& text) = 0;
  virtual Variant Property(int32_t number) = 0;  // 8: the language identifier

  // Optional transactions: a host that offers none returns False from BeginTransaction, and the
  // component then runs its statements one by one.
  virtual bool BeginTransaction() { return false; }
  virtual void CommitTransaction() {}
  virtual void RollbackTransaction() {}
};

class XALServer : public Object {
 public:
  // A query (SQL text or a table name) positioned on its first row.
  virtual Ref<DataObject> OpenQuery(const std::string& sqlOrTable, int32_t mode, const std::string& filter,
                                    const std::string& fields) = 0;
  virtual Ref<DataObject> OpenDataObject(const std::string& table) = 0;
  virtual Ref<ParamList> NewParamList() = 0;
  virtual Ref<XALConnect> Connection() = 0;
  // A message or table caption by key, in language `lang` (kind 2: a message).
  virtual std::string Text(const std::string& key, int32_t kind, int32_t lang) = 0;
  virtual Variant Property(int32_t number) = 0;  // 5: the language identifier
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
  // The answer code: 6 Yes, 7 No, 1 OK, 2 Cancel.
  virtual int32_t MsgBox(int32_t callerID, const std::string& Prompt, int32_t Buttons, const std::string& Title,
                         const std::string& Helpfile, int32_t Context) = 0;
  virtual bool InputBox(int32_t callerID, Ref<ParamList>& Params, int32_t Buttons, const std::string& Title) = 0;
};

// Message-box buttons and answers.
constexpr int32_t kMbOK = 0;
constexpr int32_t kMbYesNo = 4;
constexpr int32_t kMbYesNoDefaultNo = 260;
constexpr int32_t kMbInformation = 64;
constexpr int32_t kAnswerYes = 6;
constexpr int32_t kAnswerNo = 7;

}  // namespace xal
