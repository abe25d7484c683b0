// The document proxy: registries in any letter case, data objects asked of the host, forwarding
// with start values when nobody answers, by-ref answers through typed and generic sinks, and
// Destroy breaking the cycles between documents, proxies and data objects.
#include "bridge/proxy.h"

#include <gtest/gtest.h>

#include "bridge/cmd_stat.h"
#include "fake_host.h"
#include "runtime/dispatch.h"

namespace xal {
namespace {

using testing::FakeDataObject;
using testing::FakeParamList;
using testing::RecordingHost;

struct Document {
  Ref<XALSBEproxy> proxy = MakeRef<XALSBEproxy>();
  std::shared_ptr<RecordingHost> host = std::make_shared<RecordingHost>();
  Document() {
    host->proxy = proxy.get();
    proxy->Events().Connect(host);
  }
};

TEST(Proxy, DataObjectAsksTheHostUntilAnswered) {
  Document d;
  EXPECT_EQ(d.proxy->DataObject("DocData"), nullptr);
  EXPECT_EQ(d.proxy->DataObject("DocData"), nullptr);  // nothing registered: asked again
  auto header = MakeRef<FakeDataObject>("header");
  d.host->objects["DocData"] = header;
  EXPECT_EQ(d.proxy->DataObject(), header);  // no argument: "DocData"
  EXPECT_EQ(d.proxy->DataObject("docdata"), header);  // registered now: no more events
  EXPECT_EQ(d.host->transcript,
            (std::vector<std::string>{"GetObject(DocData,0)", "GetObject(DocData,0)", "GetObject(DocData,0)"}));
}

TEST(Proxy, HostRegistersFromInsideGetObject) {
  Document d;
  auto rows = MakeRef<FakeDataObject>("rows");
  d.host->objects["Rows"] = rows;
  d.host->addFromInsideGetObject = true;
  EXPECT_EQ(d.proxy->DataObject("Rows"), rows);
  EXPECT_EQ(d.proxy->DataObject("ROWS"), rows);
  EXPECT_EQ(d.host->transcript.size(), 1u);
}

TEST(Proxy, RegistriesIgnoreLetterCase) {
  Document d;
  Ref<DataObject> first = MakeRef<FakeDataObject>("first"), second = MakeRef<FakeDataObject>("second");
  d.proxy->AddDataOB("DocData", first);
  d.proxy->AddDataOB("DOCDATA", second);  // replaces the first
  EXPECT_EQ(d.proxy->DataObject("docdata"), second);
  EXPECT_EQ(second->Field("Name"), Variant("second"));  // OB left referring to the same object

  d.proxy->SetValues("Total", Variant(12.5));
  EXPECT_EQ(d.proxy->Values("TOTAL"), Variant(12.5));
  EXPECT_TRUE(d.proxy->Values("never").IsEmpty());
  d.proxy->SetValues("total", Variant("x"));
  EXPECT_EQ(d.proxy->CValues()->Count(), 1);  // one key in any case
  auto obj = MakeRef<FakeDataObject>("o");
  d.proxy->SetValues("Obj", Variant(obj));
  EXPECT_EQ(d.proxy->Values("obj").AsObject(), obj);  // an object comes back as itself

  auto ui = MakeRef<IXALUIObject>();
  d.proxy->AddUIOB("Grid", ui);
  EXPECT_EQ(d.proxy->UIObject("GRID"), ui);
  EXPECT_EQ(d.proxy->UIObject("none"), nullptr);
  EXPECT_TRUE(d.host->transcript.empty());  // UI objects never ask the host
}

TEST(Proxy, ValueListsPerField) {
  XALSBEproxy p;
  EXPECT_EQ(p.ValueLists(""), nullptr);
  Ref<ValueTexts> a = p.ValueLists("IDGRCompany");
  ASSERT_NE(a, nullptr);
  EXPECT_EQ(a->Name(), "IDGRCompany");
  EXPECT_EQ(p.ValueLists("idgrcompany"), a);
  EXPECT_EQ(p.CValuelists()->Count(), 1);
}

TEST(Proxy, StartValuesWithNoSink) {
  XALSBEproxy p;
  auto params = MakeRef<FakeParamList>();
  Ref<ParamList> byRef = params;
  EXPECT_EQ(p.MsgBox("?", 4, "t"), 0);
  EXPECT_FALSE(p.ReloadSheet(5));
  EXPECT_FALSE(p.InputBox(params, 1, ""));
  EXPECT_FALSE(p.CheckCachedRows("Rows", "Next"));
  EXPECT_EQ(p.CachedRows("Rows", "Next"), nullptr);
  EXPECT_FALSE(p.OnNewRow());
  EXPECT_TRUE(p.Settings("Key", Variant(10)).IsEmpty());  // the default is not applied
  EXPECT_EQ(p.AddMenuItem("Cap", "Fn", false, 0, 0, ""), "");
  EXPECT_FALSE(p.AddCmdTarget("@Cmd", "Fn", false));
  EXPECT_TRUE(p.InvokeFunc("Fn").IsEmpty());
  EXPECT_EQ(p.SelBookmarks(), nullptr);
  EXPECT_TRUE(p.XALExecuteCB(nullptr, "Fn", params, "").IsEmpty());
  EXPECT_FALSE(p.ReloadLayout(Variant(1), "Header"));
  EXPECT_TRUE(p.PrintReport(1, Variant()).IsEmpty());
  EXPECT_TRUE(p.SendReport(1, Variant(), "a@b", "pdf").IsEmpty());
  EXPECT_TRUE(p.Properties("Name").IsEmpty());
  EXPECT_TRUE(p.SendMail(byRef).IsEmpty());
  EXPECT_TRUE(p.ExportReport(1, Variant(), "f", byRef).IsEmpty());
  EXPECT_EQ(p.GetISDObject(), nullptr);
  EXPECT_EQ(p.DataObject("DocData"), nullptr);
  // Methods without an answer simply return.
  p.DataChanged();
  p.RefreshData("");
  p.StatusMsg("x");
  p.CmdPost("@X");
}

TEST(Proxy, SettingsPassesTheDefaultOnAndReturnsTheAnswer) {
  Document d;
  d.host->settingsAnswer = Variant(3);
  EXPECT_EQ(d.proxy->Settings("Rows", Variant(10)), Variant(3));
  ObjectRef p = d.proxy;
  EXPECT_EQ(Call(p, "Settings", {Variant("Cols")}), Variant(3));  // Default omitted: Missing
  EXPECT_EQ(d.host->transcript, (std::vector<std::string>{"GetSettings(Rows,Long 10)", "GetSettings(Cols,Missing)"}));
}

TEST(Proxy, CmdPostAndCmdExecuteAndCmdStat) {
  Document d;
  d.proxy->CmdPost("@Save");
  d.proxy->CmdExecute("@Print", Variant(3));
  ObjectRef p = d.proxy;
  Call(p, "CmdExecute", {Variant("@Bare")});
  auto cs = MakeRef<CmdStat>();
  cs->Message("no doc yet", 0);  // no Doc: nothing, no error
  cs->SetDoc(d.proxy);
  cs->Message("Saved", 1);
  cs->Post("@Next");
  cs->Execute("@Go", Variant::Missing());
  EXPECT_EQ(d.host->transcript, (std::vector<std::string>{
                                    "CmdExecute(@Save,True,Empty)",
                                    "CmdExecute(@Print,False,Long 3)",
                                    "CmdExecute(@Bare,False,Missing)",
                                    "StatusMsg(\"Saved\")",
                                    "CmdExecute(@Next,True,Empty)",
                                    "CmdExecute(@Go,False,Missing)",
                                }));
}

TEST(Proxy, PlainState) {
  XALSBEproxy p;
  p.SetValue(Variant(12.5));
  EXPECT_EQ(p.Value(), Variant("12.5"));
  p.SetItemArray(Variant(1));  // no Cell: ignored
  EXPECT_TRUE(p.ItemArray().IsEmpty());
  p.SetText("t");
  p.SetLinkIDList("1,2");
  EXPECT_EQ(p.Text(), "t");
  EXPECT_EQ(p.LinkIDList(), "1,2");
}

// A generic sink that answers by-ref parameters, as a script host does.
class AnsweringSink : public GenericSink {
 public:
  std::vector<std::string> log;
  Ref<DataObject> cache;
  void OnEvent(int32_t dispid, const std::string& name, std::span<Variant> args) override {
    log.push_back(std::to_string(dispid) + " " + name);
    if (name == "DoMsgBox") args[3] = Variant(7);
    if (name == "DoGetCache") args[2] = Variant(cache);
    if (name == "DoReloadLayout") args[2] = Variant(true);
    if (name == "DoAddMenuItem") args[2] = Variant("cmd42");
    if (name == "GetSettings") args[2] = args[1];  // echo the default
  }
};

TEST(Proxy, EveryMemberByNameWithGenericSink) {
  ObjectRef p = CreateObject("XALSBEproxy");
  auto sink = std::make_shared<AnsweringSink>();
  sink->cache = MakeRef<FakeDataObject>("cache");
  ClassOf(*p)->ConnectGeneric(*p, sink);
  EXPECT_EQ(Call(p, "MsgBox", {Variant("Sure?"), Variant(4)}), Variant(7));
  EXPECT_EQ(Call(p, "CachedRows", {Variant("Rows"), Variant("Next")}), Variant(ObjectRef(sink->cache)));
  EXPECT_EQ(Call(p, "ReloadLayout", {Variant(1)}), Variant(true));
  EXPECT_EQ(Call(p, "AddMenuItem", {Variant("Cap"), Variant("Fn")}), Variant("cmd42"));
  EXPECT_EQ(Call(p, "Settings", {Variant("k"), Variant(10)}), Variant(10));
  PutProperty(p, "Value", Variant(3));
  EXPECT_EQ(GetProperty(p, "value"), Variant("3"));
  std::vector<Variant> args{Variant("Key"), Variant(5)};
  Invoke(p, "Values", MemberKind::Put, args);
  EXPECT_EQ(GetProperty(p, "Values", {Variant("KEY")}), Variant(5));
  EXPECT_EQ(sink->log, (std::vector<std::string>{"7 DoMsgBox", "10 DoGetCache", "23 DoReloadLayout",
                                                  "14 DoAddMenuItem", "13 GetSettings"}));
  // The event table keeps the interface's order: ids 1..25, then 27, 26, 28.
  const EventInterfaceInfo* ev = ClassOf(*p)->events();
  ASSERT_EQ(ev->members.size(), 28u);
  std::vector<int32_t> ids;
  for (const auto& m : ev->members) ids.push_back(m.dispid);
  EXPECT_EQ(std::vector<int32_t>(ids.end() - 4, ids.end()), (std::vector<int32_t>{25, 27, 26, 28}));
  for (int i = 0; i < 24; ++i) EXPECT_EQ(ids[i], i + 1);
}

// Every member of the interface answers a late-bound call (arguments from the member table's types).
TEST(Proxy, EveryMemberReachableByName) {
  ObjectRef p = CreateObject("XALSBEproxy");
  for (const auto& m : ClassOf(*p)->members()) {
    if (m.name == "Destroy") continue;
    SCOPED_TRACE(m.name + " " + MemberKindName(m.kind));
    std::vector<Variant> args;
    for (const auto& prm : m.params) {
      if (prm.optional) break;
      args.push_back(prm.type == VarType::Object ? Variant::Nothing()
                     : prm.type == VarType::String ? Variant("x")
                     : prm.type == VarType::Variant ? Variant(1)
                                                    : ZeroValue(prm.type));
    }
    EXPECT_NO_THROW(Invoke(p, m.name, m.kind, args));
  }
  Call(p, "Destroy");
}

TEST(Proxy, DestroyBreaksCycles) {
  std::weak_ptr<XALSBEproxy> watchDoc, watchChild;
  std::weak_ptr<DataObject> watchData;
  {
    auto doc = MakeRef<XALSBEproxy>();
    auto child = MakeRef<XALSBEproxy>();
    auto data = MakeRef<FakeDataObject>("DocData");
    data->keepAlive = doc;  // data object -> document
    Ref<DataObject> asData = data;
    doc->AddDataOB("DocData", asData);  // document -> data object
    child->SetParent(doc);
    doc->SetValues("Child", Variant(child));  // document -> child -> document
    auto host = std::make_shared<RecordingHost>();
    doc->Events().Connect(host);
    watchDoc = doc;
    watchChild = child;
    watchData = data;
    child->Destroy();
    doc->Destroy();
  }
  EXPECT_TRUE(watchDoc.expired());
  EXPECT_TRUE(watchChild.expired());
  EXPECT_TRUE(watchData.expired());
}

TEST(Proxy, UsableWithoutErrorsAfterDestroy) {
  Document d;
  d.proxy->Destroy();
  EXPECT_EQ(d.proxy->DataObject(), nullptr);
  EXPECT_TRUE(d.proxy->Values("x").IsEmpty());
  d.proxy->SetValues("x", Variant(1));
  EXPECT_EQ(d.proxy->UIObject("x"), nullptr);
  EXPECT_EQ(d.proxy->MsgBox("gone", 0, ""), 0);  // sinks were released too
}

}  // namespace
}  // namespace xal
