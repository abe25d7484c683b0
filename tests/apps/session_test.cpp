// The `xal session` protocol end to end: requests and answers as JSON lines, value encodings both
// ways, by-ref results, events answered from the request, errors, and the real binary over a pipe.
#include "apps/xal/session.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <fstream>

#include <unistd.h>

#include "apps/xal/call_args.h"
#include "apps/xal/typelib_json.h"
#include "error_of.h"
#include "runtime/member_table.h"

namespace xal::app {
namespace {

using test::ErrorOf;

TEST(Session, TranscriptGolden) {
  Session s;
  struct Row {
    const char* request;
    const char* answer;
  } rows[] = {
      {R"({"id":1,"new":"XALProbe"})", R"({"id":1,"result":{"object":1}})"},
      {R"({"id":2,"call":1,"member":"add","args":[2,3]})",
       R"({"id":2,"result":{"type":"Long","value":5},"byref":{}})"},
      {R"({"id":3,"call":1,"member":"Add","args":[2]})",
       R"({"id":3,"result":{"type":"Long","value":3},"byref":{}})"},
      {R"({"id":4,"call":1,"member":"Name","kind":"put","args":["x"]})",
       R"({"id":4,"result":{"type":"Empty"},"byref":{}})"},
      {R"({"id":5,"call":1,"member":"NAME","kind":"get"})",
       R"({"id":5,"result":{"type":"String","value":"x"},"byref":{}})"},
      {R"({"id":6,"call":1,"member":"Append","args":["ab"]})",
       R"({"id":6,"result":{"type":"Long","value":3},"byref":{"0":{"type":"String","value":"ab!"}}})"},
      {R"({"id":7,"call":1,"member":"Describe","args":[{"type":"Currency","value":"12.3400"}]})",
       R"({"id":7,"result":{"type":"String","value":"Currency:12.34"},"byref":{}})"},
      {R"({"id":8,"call":1,"member":"Describe","args":[{"type":"Date","value":"2009-03-05T14:07:00"}]})",
       R"({"id":8,"result":{"type":"String","value":"Date:3/5/2009 2:07:00 PM"},"byref":{}})"},
      {R"({"id":9,"call":1,"member":"Describe","args":[null]})",
       R"({"id":9,"result":{"type":"String","value":"Null"},"byref":{}})"},
      {R"({"id":10,"call":1,"member":"Describe","args":[4000000000]})",
       R"({"id":10,"result":{"type":"String","value":"Double:4000000000"},"byref":{}})"},
      {R"({"id":11,"call":1,"member":"Child","kind":"get"})", R"({"id":11,"result":{"object":2},"byref":{}})"},
      {R"({"id":12,"call":1,"member":"SameAs","args":[{"object":1}]})",
       R"({"id":12,"result":{"type":"Boolean","value":true},"byref":{}})"},
      {R"({"id":13,"call":1,"member":"Nope"})",
       R"({"id":13,"error":{"number":438,"description":"Object doesn't support this property or method"}})"},
      {R"({"id":14,"call":1,"member":"Add"})", R"({"id":14,"error":{"number":449,"description":"Argument not optional"}})"},
      {R"({"id":15,"call":1,"member":"Fail","args":[5]})",
       R"({"id":15,"error":{"number":5,"description":"Invalid procedure call or argument"}})"},
      {R"({"id":16,"release":2})", R"({"id":16,"result":{"type":"Empty"}})"},
      {R"({"id":17,"call":2,"member":"Add","args":[1]})",
       R"({"id":17,"error":{"number":91,"description":"Object variable or With block variable not set: no handle 2"}})"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.request);
    EXPECT_EQ(s.Handle(r.request), r.answer);
  }
}

TEST(Session, ArraysRoundTrip) {
  Session s;
  s.Handle(R"({"id":1,"new":"Collection"})");
  s.Handle(R"({"id":2,"call":1,"member":"Add","args":[{"type":"Array","lbound":[1,0],"value":[[1,"a"],[2.5,true]]}]})");
  EXPECT_EQ(s.Handle(R"({"id":3,"call":1,"member":"Item","args":[1]})"),
            R"({"id":3,"result":{"type":"Array","lbound":[1,0],"value":[[{"type":"Long","value":1},{"type":"String","value":"a"}],[{"type":"Double","value":2.5},{"type":"Boolean","value":true}]]},"byref":{}})");
}

TEST(Session, EventsAnsweredFromTheRequest) {
  Session s;
  s.Handle(R"({"id":1,"new":"XALProbe"})");
  EXPECT_EQ(s.Handle(R"({"id":2,"advise":1,"answers":{"question":{"1":"yes"},"Computed":{"1":true}}})"),
            R"({"id":2,"result":{"type":"Long","value":1}})");
  EXPECT_EQ(s.Handle(R"({"id":3,"call":1,"member":"Ask","args":["Save?"]})"),
            R"({"id":3,"result":{"type":"String","value":"yes"},"byref":{},"events":[{"source":1,"name":"Question","dispid":2,"args":[{"type":"String","value":"Save?"},{"type":"String","value":"yes"}]}]})");
  EXPECT_EQ(s.Handle(R"({"id":4,"call":1,"member":"Add","args":[1,1]})"),
            R"({"id":4,"result":{"type":"Long","value":0},"byref":{},"events":[{"source":1,"name":"Computed","dispid":1,"args":[{"type":"Long","value":2},{"type":"Boolean","value":true}]}]})");
  s.Handle(R"({"id":5,"unadvise":1,"cookie":1})");
  EXPECT_EQ(s.Handle(R"({"id":6,"call":1,"member":"Add","args":[1,1]})"),
            R"({"id":6,"result":{"type":"Long","value":2},"byref":{}})");
}

TEST(Session, BadRequests) {
  Session s;
  const char* bad[] = {
      "not json",                                              // parse error
      "[1,2]",                                                 // not an object
      R"({"id":1})",                                           // no verb
      R"({"id":1,"new":"NoSuchClass"})",                       // unknown class
      R"({"id":1,"call":"x","member":"Add"})",                 // handle not a number
      R"({"id":1,"new":"XALProbe","x":{"type":"Bogus"}})",     // ignored extra member is fine: not an error
  };
  for (const char* line : bad) {
    SCOPED_TRACE(line);
    std::string answer = s.Handle(line);
    bool isLast = std::string(line).find("Bogus") != std::string::npos;
    EXPECT_EQ(answer.find("\"error\"") != std::string::npos, !isLast) << answer;
  }
  s.Handle(R"({"id":2,"new":"XALProbe"})");
  EXPECT_NE(s.Handle(R"({"id":3,"call":2,"member":"Describe","args":[{"type":"Bogus"}]})").find("\"number\":13"),
            std::string::npos);
  EXPECT_NE(s.Handle(R"({"id":4,"call":2,"member":"Describe","args":[{"type":"Currency"}]})").find("\"number\":13"),
            std::string::npos);
}

TEST(CallArgs, Words) {
  struct Row {
    const char* word;
    Variant expected;
  } rows[] = {
      {"5", Variant(5)},
      {"-7", Variant(-7)},
      {"1.5", Variant(1.5)},
      {"3000000000", Variant(3e9)},
      {"word", Variant("word")},
      {"true", Variant("true")},  // bare words are text; b: gives a Boolean
      {"i:5", Variant(int16_t{5})},
      {"l:5", Variant(5)},
      {"f:2", Variant(2.0)},
      {"c:12.34", Variant(Currency::FromRaw(123400))},
      {"d:2009-03-05", Variant(Date(39877))},
      {"b:true", Variant(true)},
      {"b:0", Variant(false)},
      {"s:5", Variant("5")},
      {"null", Variant::Null()},
      {"empty", Variant()},
      {"missing", Variant::Missing()},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.word);
    EXPECT_EQ(ParseCallArg(r.word), r.expected);
  }
}

// `xal call --kind` and the session's "kind" read the same words and refuse the same others.
TEST(CallArgs, MemberKinds) {
  struct Row {
    const char* word;
    MemberKind kind;
  } rows[] = {{"method", MemberKind::Method}, {"get", MemberKind::Get},   {"PUT", MemberKind::Put},
              {"PutRef", MemberKind::PutRef}, {"Method", MemberKind::Method}};
  for (const auto& r : rows) {
    SCOPED_TRACE(r.word);
    EXPECT_EQ(ParseMemberKind(r.word), r.kind);
  }
  for (const char* bad : {"bogus", "", "gets", "put ", "let"}) {
    SCOPED_TRACE(bad);
    EXPECT_EQ(ErrorOf([&] { ParseMemberKind(bad); }), kErrInvalidCall);
  }
  Session s;
  s.Handle(R"({"id":1,"new":"XALProbe"})");
  EXPECT_EQ(s.Handle(R"({"id":2,"call":1,"member":"Add","args":[2,3],"kind":"bogus"})"),
            R"({"id":2,"error":{"number":5,"description":"Invalid procedure call or argument: kind \"bogus\""}})");
}

TEST(TypeLibraryJson, ProbeMembersInInterfaceOrder) {
  Json lib = TypeLibraryJson(TypeRegistry::Instance());
  const Json* probe = nullptr;
  for (const auto& c : lib["classes"])
    if (c["name"] == "XALProbe") probe = &c;
  ASSERT_NE(probe, nullptr);
  EXPECT_EQ((*probe)["creatable"], true);
  EXPECT_EQ((*probe)["members"][0]["name"], "Add");
  EXPECT_EQ((*probe)["members"][0]["params"][1].dump(),
            R"({"name":"b","type":"Long","optional":true,"default":{"type":"Long","value":1},"byref":false})");
  EXPECT_EQ((*probe)["members"][1]["dispid"], 0);  // Name is the default member
  bool found = false;
  for (const auto& e : lib["events"])
    if (e["name"] == "__XALProbe") found = e["source"] == "XALProbe" && e["members"].size() == 2;
  EXPECT_TRUE(found);
}

// The real binary: `xal session` over a pipe, and `xal call`.
std::string RunXal(const std::string& args, const std::string& input = "") {
  const char* bin = std::getenv("XAL_BIN");
  if (!bin) return "no XAL_BIN";
  // One input file per test and process: ctest runs tests side by side.
  const auto* info = testing::UnitTest::GetInstance()->current_test_info();
  std::string inFile = testing::TempDir() + "xal_in_" + info->name() + "_" + std::to_string(getpid()) + ".txt";
  std::ofstream(inFile) << input;
  std::string cmd = std::string(bin) + "/xal " + args + " < " + inFile + " 2>&1";
  FILE* p = popen(cmd.c_str(), "r");
  std::string out;
  char buf[4096];
  size_t n;
  while ((n = fread(buf, 1, sizeof buf, p)) > 0) out.append(buf, n);
  pclose(p);
  std::remove(inFile.c_str());
  return out;
}

TEST(XalBinary, SessionOverPipe) {
  std::string out = RunXal("session", "{\"id\":1,\"new\":\"XALProbe\"}\n\n{\"id\":2,\"call\":1,\"member\":\"Add\",\"args\":[40,2]}\n");
  EXPECT_EQ(out, "{\"id\":1,\"result\":{\"object\":1}}\n{\"id\":2,\"result\":{\"type\":\"Long\",\"value\":42},\"byref\":{}}\n");
}

TEST(XalBinary, CallCommand) {
  EXPECT_EQ(RunXal("call XALProbe Add 2 3"), "5\n");
  EXPECT_EQ(RunXal("call XALProbe Add 2 --json"), "{\"type\":\"Long\",\"value\":3}\n");
  EXPECT_EQ(RunXal("call XALProbe Typed i:1 l:2 f:2.5 c:1.25 d:2009-03-05 b:true s:x"),
            "1|2|2.5|1.25|39877|True|x\n");
  EXPECT_EQ(RunXal("call XALProbe Nope"), "error 438: Object doesn't support this property or method\n");
  EXPECT_EQ(RunXal("call XALProbe Add 2 3 --kind bogus"),
            "error 5: Invalid procedure call or argument: kind \"bogus\"\n");
  EXPECT_EQ(RunXal("call XALProbe Add 2 3 --kind METHOD"), "5\n");
}

}  // namespace
}  // namespace xal::app

namespace xal::app {
namespace {

TEST(Session, DatabaseAndDocumentThroughTheProtocol) {
  std::string db = testing::TempDir() + "xal_session_doc.db";
  std::remove(db.c_str());
  Session s;
  EXPECT_EQ(s.Handle(R"({"id":1,"open":")" + db + R"(","kind":2})"), R"({"id":1,"result":{"object":1}})");
  EXPECT_EQ(s.Handle(R"({"id":2,"call":1,"member":"DatabaseKind","kind":"get"})"),
            R"({"id":2,"result":{"type":"Long","value":2},"byref":{}})");
  s.Handle(R"j({"id":3,"call":1,"member":"Execute","args":["INSERT INTO GRCompany (ID, Code, Name) VALUES (5, 'A', 'Acme')"]})j");
  EXPECT_EQ(s.Handle(R"({"id":4,"document":"SDInvoice","connection":1})"), R"({"id":4,"result":{"object":2}})");
  EXPECT_EQ(s.Handle(R"({"id":5,"call":2,"member":"Header","kind":"get"})"),
            R"({"id":5,"result":{"object":3},"byref":{}})");
  s.Handle(R"({"id":6,"call":3,"member":"Field","kind":"put","args":["IDGRCompany",5]})");
  EXPECT_EQ(s.Handle(R"({"id":7,"call":3,"member":"Field","args":["GRCompany.Name"]})"),
            R"({"id":7,"result":{"type":"String","value":"Acme"},"byref":{}})");
  s.Handle(R"({"id":8,"call":2,"member":"AddMsgBoxAnswer","args":[7]})");
  s.Handle(R"({"id":9,"call":2,"member":"Proxy","kind":"get"})");  // handle 4
  EXPECT_EQ(s.Handle(R"({"id":10,"call":4,"member":"MsgBox","args":["Sure?",4]})"),
            R"({"id":10,"result":{"type":"Long","value":7},"byref":{}})");
  EXPECT_EQ(s.Handle(R"({"id":11,"call":2,"member":"Save"})"), R"({"id":11,"result":{"type":"Long","value":1},"byref":{}})");
  EXPECT_EQ(s.Handle(R"({"id":12,"call":2,"member":"Transcript","kind":"get"})"),
            R"({"id":12,"result":{"type":"String","value":"MsgBox(\"Sure?\",4)->7"},"byref":{}})");
  EXPECT_NE(s.Handle(R"({"id":13,"document":"GRArticle","connection":1})").find("\"error\""), std::string::npos);
  s.Handle(R"({"id":14,"call":2,"member":"Close"})");
  std::remove(db.c_str());
}

}  // namespace
}  // namespace xal::app
