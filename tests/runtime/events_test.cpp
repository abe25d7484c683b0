// Events: an unanswered event leaves its start value, several sinks see each other's answers in
// connection order, generic sinks answer by-ref arguments, and disconnecting stops delivery.
#include "runtime/events.h"

#include <gtest/gtest.h>

#include "runtime/dispatch.h"
#include "typelib/probe.h"

namespace xal {
namespace {

class CancelSink : public ProbeEvents {
 public:
  int seen = 0;
  void Computed(const Variant& Result, bool& Cancel) override {
    ++seen;
    Cancel = CLng(Result) > 100;
  }
};

class AnswerSink : public ProbeEvents {
 public:
  std::string answer;
  std::vector<std::string> log;
  explicit AnswerSink(std::string a) : answer(std::move(a)) {}
  void Question(const std::string& Prompt, Variant& Answer) override {
    log.push_back(Prompt + "<-" + (Answer.IsEmpty() ? "Empty" : CStr(Answer)));
    Answer = Variant(answer);
  }
};

class RecordingGeneric : public GenericSink {
 public:
  std::vector<std::string> log;
  Variant reply;
  void OnEvent(int32_t dispid, const std::string& name, std::span<Variant> args) override {
    log.push_back(std::to_string(dispid) + ":" + name + ":" + std::to_string(args.size()));
    if (name == "Question") args[1] = reply;
    if (name == "Computed") args[1] = Variant(true);
  }
};

TEST(Events, NoSinkLeavesStartValues) {
  auto probe = MakeRef<XALProbe>();
  EXPECT_EQ(probe->Add(2, 3), 5);              // Cancel stays False
  EXPECT_TRUE(probe->Ask("anyone?").IsEmpty());  // Answer stays Empty
}

TEST(Events, TwoSinksInConnectionOrder) {
  auto probe = MakeRef<XALProbe>();
  auto first = std::make_shared<AnswerSink>("first");
  auto second = std::make_shared<AnswerSink>("second");
  probe->Events().Connect(first);
  probe->Events().Connect(second);
  EXPECT_EQ(probe->Ask("q"), Variant("second"));
  EXPECT_EQ(first->log, std::vector<std::string>{"q<-Empty"});
  EXPECT_EQ(second->log, std::vector<std::string>{"q<-first"});  // sees the first answer
}

TEST(Events, ByRefBooleanAnswer) {
  auto probe = MakeRef<XALProbe>();
  auto sink = std::make_shared<CancelSink>();
  uint32_t cookie = probe->Events().Connect(sink);
  EXPECT_EQ(probe->Add(50, 60), 0);  // cancelled
  EXPECT_EQ(probe->Add(1, 2), 3);
  probe->Events().Disconnect(cookie);
  EXPECT_EQ(probe->Add(50, 60), 110);
  EXPECT_EQ(sink->seen, 2);
}

TEST(Events, GenericSinkThroughTypeLibrary) {
  ObjectRef probe = CreateObject("XALProbe");
  auto generic = std::make_shared<RecordingGeneric>();
  generic->reply = Variant(int16_t{7});
  uint32_t cookie = ClassOf(*probe)->ConnectGeneric(*probe, generic);
  EXPECT_EQ(Call(probe, "Ask", {Variant("n?")}), Variant(int16_t{7}));
  EXPECT_EQ(Call(probe, "Add", {Variant(1)}), Variant(0));  // generic sink cancels
  EXPECT_EQ(generic->log, (std::vector<std::string>{"2:Question:2", "1:Computed:2"}));
  ClassOf(*probe)->DisconnectGeneric(*probe, cookie);
  EXPECT_EQ(Call(probe, "Add", {Variant(1)}), Variant(2));
  const EventInterfaceInfo* info = ClassOf(*probe)->events();
  ASSERT_NE(info, nullptr);
  EXPECT_EQ(info->name, "__XALProbe");
  ASSERT_EQ(info->members.size(), 2u);
  EXPECT_TRUE(info->members[0].params[1].byRef);   // Cancel
  EXPECT_FALSE(info->members[0].params[0].byRef);  // Result
}

TEST(Events, SinkMayDisconnectItselfWhileRaised) {
  auto probe = MakeRef<XALProbe>();
  struct SelfRemoving : ProbeEvents {
    XALProbe* probe = nullptr;
    uint32_t cookie = 0;
    int calls = 0;
    void Computed(const Variant&, bool&) override {
      ++calls;
      probe->Events().Disconnect(cookie);
    }
  };
  auto sink = std::make_shared<SelfRemoving>();
  sink->probe = probe.get();
  sink->cookie = probe->Events().Connect(sink);
  probe->Add(1, 1);
  probe->Add(1, 1);
  EXPECT_EQ(sink->calls, 1);
}

}  // namespace
}  // namespace xal
