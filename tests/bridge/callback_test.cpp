// The callback proxy and the UI object: start values with nobody listening, answers through the
// last by-ref parameter, the parameter list passed by reference, and the inert UI property bag.
#include "bridge/callback_proxy.h"

#include <gtest/gtest.h>

#include "bridge/ui_object.h"
#include "fake_host.h"
#include "runtime/dispatch.h"

namespace xal {
namespace {

TEST(CallbackProxy, StartValuesWithNoHandler) {
  XALCBProxy cb;
  Ref<ParamList> params = MakeRef<testing::FakeParamList>();
  EXPECT_TRUE(cb.CallBack(1, "cmd", "msg", Variant(2)).IsEmpty());
  EXPECT_FALSE(cb.Notify(1, 0, "m", Variant()));
  EXPECT_EQ(cb.MsgBox(1, "Close?", 4, "T", "", 0), 0);
  EXPECT_FALSE(cb.InputBox(1, params, 1, "T"));
}

class Answering : public XALCBProxyEvents {
 public:
  std::vector<std::string> log;
  void MsgBox(int32_t callerID, const std::string& Prompt, int32_t Buttons, const std::string&, const std::string&,
              int32_t, int32_t& Result) override {
    log.push_back("MsgBox(" + std::to_string(callerID) + "," + Prompt + "," + std::to_string(Buttons) + ")");
    Result = 6;
  }
  void Notify(int32_t, int32_t eNotify, const std::string& sMessage, const Variant&, bool& Result) override {
    log.push_back("Notify(" + std::to_string(eNotify) + "," + sMessage + ")");
    Result = true;
  }
  void InputBox(int32_t, Ref<ParamList>& Params, int32_t, const std::string&, bool& Result) override {
    auto replaced = MakeRef<testing::FakeParamList>();
    replaced->Set("Answer", Variant(42));
    Params = replaced;  // the handler may replace the list
    Result = true;
  }
  void CallBack(int32_t, const std::string& sCommand, const std::string&, const Variant& vParam,
                Variant& Result) override {
    Result = Variant(sCommand + ":" + CStr(vParam));
  }
};

TEST(CallbackProxy, AnswersComeBack) {
  auto cb = MakeRef<XALCBProxy>();
  auto h = std::make_shared<Answering>();
  cb->Events().Connect(h);
  EXPECT_EQ(cb->MsgBox(3, "Close period?", 4, "", "", 0), 6);
  EXPECT_TRUE(cb->Notify(3, 2, "done", Variant()));
  Ref<ParamList> params = MakeRef<testing::FakeParamList>();
  EXPECT_TRUE(cb->InputBox(3, params, 1, ""));
  EXPECT_EQ(params->Item("Answer"), Variant(42));
  EXPECT_EQ(cb->CallBack(0, "go", "", Variant(5)), Variant("go:5"));
  EXPECT_EQ(h->log, (std::vector<std::string>{"MsgBox(3,Close period?,4)", "Notify(2,done)"}));
  // Through the type library, as a script reaches it.
  ObjectRef asObj = cb;
  EXPECT_EQ(Call(asObj, "MsgBox", {Variant(1), Variant("x"), Variant(4), Variant(""), Variant(""), Variant(0)}),
            Variant(6));
}

TEST(UIObject, ReadsEmptyAfterAnyWrite) {
  ObjectRef ui = CreateObject("IXALUIObject");
  std::vector<Variant> args{Variant("Caption"), Variant("x")};
  Invoke(ui, "Properties", MemberKind::Put, args);
  EXPECT_TRUE(GetProperty(ui, "Properties", {Variant("Caption")}).IsEmpty());
}

}  // namespace
}  // namespace xal
