// A hand-written fake host for the bridge tests: data objects that only know their name, a
// parameter list in memory, and an event sink that records a transcript of every proxy event and
// answers from a script of canned replies.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "bridge/host_model.h"
#include "bridge/proxy.h"
#include "runtime/convert.h"

namespace xal::testing {

class FakeDataObject : public DataObject {
 public:
  explicit FakeDataObject(std::string name) : name(std::move(name)) {}
  std::string name;
  ObjectRef keepAlive;  // lets a test build a cycle through the host's objects

  Variant Field(const std::string& f) override { return f == "Name" ? Variant(name) : Variant(); }
  void SetField(const std::string&, const Variant&) override {}
  void MoveFirst() override {}
  void MoveNext() override {}
  bool IsEOF() override { return true; }
  bool IsBOF() override { return true; }
  int32_t RowCount() override { return 0; }
  int32_t FindFirst(const std::string&, int32_t) override { return 1; }
  void AddNew() override {}
  void Delete() override {}
  Variant Bookmark() override { return Variant(); }
  void GoToBookmark(const Variant&) override {}
  void UpdateRow(bool, bool, bool) override {}
  bool RowState(int32_t) override { return false; }
  Ref<DataObject> Owner() override { return nullptr; }
  std::string TableName() override { return name; }
  Variant Property(int32_t) override { return Variant(); }
  Variant CallFunction(const std::string&, const Variant&, int32_t) override { return Variant(); }
  Variant RecordOperation(int32_t, const Variant&) override { return Variant(); }
  Ref<XALConnect> Connection() override { return nullptr; }
};

class FakeParamList : public ParamList {
 public:
  std::map<std::string, Variant> entries;
  Variant Item(const std::string& n) override { return entries.count(n) ? entries[n] : Variant(); }
  bool Exists(const std::string& n) override { return entries.count(n) > 0; }
  void Set(const std::string& n, const Variant& v) override { entries[n] = v; }
  void SetObject(const std::string& n, const ObjectRef& o) override { entries[n] = Variant(o); }
  void Add(const std::string& n, const Variant& v) override { entries[n] = v; }
  void SetAttribute(const std::string&, const std::string&, const Variant&) override {}
  Variant Attribute(const std::string&, const std::string&) override { return Variant(); }
  std::string Key() override { return "fake"; }
  int32_t Count() override { return static_cast<int32_t>(entries.size()); }
  std::string NameAt(int32_t i) override {
    auto it = entries.begin();
    std::advance(it, i - 1);
    return it->first;
  }
};

// Records "Event(arg, …)" lines and answers the events it is told to answer.
class RecordingHost : public XALSBEproxyEvents {
 public:
  std::vector<std::string> transcript;
  std::map<std::string, Ref<DataObject>> objects;  // GetObject answers by name
  XALSBEproxy* proxy = nullptr;                     // for re-entrant calls
  bool addFromInsideGetObject = false;
  int32_t msgBoxAnswer = 6;
  Variant settingsAnswer;

  void GetObject(const std::string& Name, int32_t Mode, Ref<DataObject>& DataOB) override {
    transcript.push_back("GetObject(" + Name + "," + std::to_string(Mode) + ")");
    auto it = objects.find(Name);
    if (it == objects.end()) return;
    DataOB = it->second;
    if (addFromInsideGetObject && proxy) proxy->AddDataOB(Name, DataOB);
  }
  void DoMsgBox(const std::string& Prompt, int32_t Buttons, const std::string& Title, int32_t& RetVal) override {
    transcript.push_back("MsgBox(\"" + Prompt + "\"," + std::to_string(Buttons) + ",\"" + Title + "\")->" +
                         std::to_string(msgBoxAnswer));
    RetVal = msgBoxAnswer;
  }
  void DoStatusMsg(const std::string& Msg) override { transcript.push_back("StatusMsg(\"" + Msg + "\")"); }
  void DoCmdExecute(const std::string& Cmd, bool Posted, const Variant& Param) override {
    transcript.push_back("CmdExecute(" + Cmd + "," + (Posted ? "True" : "False") + "," + DebugString(Param) + ")");
  }
  void GetSettings(const std::string& sKey, const Variant& vDefault, Variant& vRetVal) override {
    transcript.push_back("GetSettings(" + sKey + "," + DebugString(vDefault) + ")");
    vRetVal = settingsAnswer;
  }
};

}  // namespace xal::testing
