// DocFunc through `xal session`: the one a document session offers (wired as a host wires it) and
// one made by hand (new, the three host objects assigned by reference, Create), with fields set,
// rows added and moved, handlers called by name and the proxy's events in the transcript.
#include <gtest/gtest.h>

#include <cstdio>
#include <string>

#include "apps/xal/session.h"

namespace xal::app {
namespace {

struct Step {
  std::string request;
  std::string answer;  // the whole answer line
};

void RunSteps(Session& s, const std::vector<Step>& steps) {
  for (const Step& st : steps) {
    SCOPED_TRACE(st.request);
    EXPECT_EQ(s.Handle(st.request), st.answer);
  }
}

const char* kTrue = R"("result":{"type":"Boolean","value":true},"byref":{}})";

std::string Answer(int id, const std::string& rest) { return "{\"id\":" + std::to_string(id) + "," + rest; }

TEST(DocFuncSession, TheSessionsDocFunc) {
  std::string db = testing::TempDir() + "xal_docfunc_session.db";
  std::remove(db.c_str());
  Session s;
  RunSteps(s, {
      {R"({"id":1,"open":")" + db + R"("})", R"({"id":1,"result":{"object":1}})"},
      {R"j({"id":2,"call":1,"member":"Execute","args":["INSERT INTO GRCompany (ID, Code, Name, Message) VALUES (5, 'A', 'Acme', '@$Pay first')"]})j",
       R"({"id":2,"result":{"type":"Long","value":1},"byref":{}})"},
      {R"({"id":3,"document":"SDInvoice","connection":1})", R"({"id":3,"result":{"object":2}})"},
      {R"({"id":4,"call":2,"member":"DocFunc","kind":"get"})", R"({"id":4,"result":{"object":3},"byref":{}})"},
      {R"({"id":5,"call":3,"member":"AddNewDocument"})", Answer(5, kTrue)},
      {R"({"id":6,"call":2,"member":"Header","kind":"get"})", R"({"id":6,"result":{"object":4},"byref":{}})"},
      {R"({"id":7,"call":4,"member":"Field","kind":"put","args":["IDGRCompany",5]})",
       R"({"id":7,"result":{"type":"Empty"},"byref":{}})"},
      {R"({"id":8,"call":2,"member":"Rows","kind":"get"})", R"({"id":8,"result":{"object":5},"byref":{}})"},
      {R"({"id":9,"call":5,"member":"AddNew"})", R"({"id":9,"result":{"type":"Empty"},"byref":{}})"},
      {R"({"id":10,"call":5,"member":"Field","kind":"put","args":["BaseQuantity",2]})",
       R"({"id":10,"result":{"type":"Empty"},"byref":{}})"},
      {R"({"id":11,"call":5,"member":"AddNew"})", R"({"id":11,"result":{"type":"Empty"},"byref":{}})"},
      {R"({"id":12,"call":5,"member":"MoveFirst"})", R"({"id":12,"result":{"type":"Empty"},"byref":{}})"},
      {R"({"id":13,"call":3,"member":"VDocument"})", Answer(13, kTrue)},
      {R"({"id":14,"call":5,"member":"ActualRowCount","kind":"get"})",
       R"({"id":14,"result":{"type":"Long","value":1},"byref":{}})"},
      {R"({"id":15,"call":3,"member":"Doc_Valid"})",
       R"({"id":15,"result":{"type":"Boolean","value":false},"byref":{}})"},
      {R"({"id":16,"call":2,"member":"Transcript","kind":"get"})",
       R"({"id":16,"result":{"type":"String","value":"AddMenuItem(\"Amount discount\",\"@ComputePercentAmount\"); )"
       R"(AddMenuItem(\"Pricelist discount\",\"@ComputePercentPricelist\"); AddMenuItem(\"Client card\",\"@ClientCard\"); )"
       R"(AddMenuItem(\"Interest note info\",\"@InterestNoteInfo\"); StatusMsg(\"\"); )"
       R"(StatusMsg(\"Missing doc. series\"); RefreshHeader(\"@\"); RefreshHeader(\"TotalAmount\"); StatusMsg(\"\"); )"
       R"(MsgBox(\"Pay first\",64)->1"},"byref":{}})"},
      {R"({"id":17,"call":2,"member":"Close"})", R"({"id":17,"result":{"type":"Empty"},"byref":{}})"},
      {R"({"id":18,"call":3,"member":"Doc_Valid"})",
       R"({"id":18,"result":{"type":"Boolean","value":true},"byref":{}})"},  // destroyed with the session
  });
  std::remove(db.c_str());
}

TEST(DocFuncSession, ADocFuncWiredByHand) {
  std::string db = testing::TempDir() + "xal_docfunc_session_plain.db";
  std::remove(db.c_str());
  Session s;
  RunSteps(s, {
      {R"({"id":1,"open":")" + db + R"("})", R"({"id":1,"result":{"object":1}})"},
      {R"({"id":2,"document":"SDOrder","connection":1})", R"({"id":2,"result":{"object":2}})"},
      {R"({"id":3,"new":"DocFunc"})", R"({"id":3,"result":{"object":3}})"},
      {R"({"id":4,"call":2,"member":"Proxy","kind":"get"})", R"({"id":4,"result":{"object":4},"byref":{}})"},
      {R"({"id":5,"call":2,"member":"Header","kind":"get"})", R"({"id":5,"result":{"object":5},"byref":{}})"},
      {R"({"id":6,"call":1,"member":"Server","kind":"get"})", R"({"id":6,"result":{"object":6},"byref":{}})"},
      {R"({"id":7,"call":3,"member":"Doc","kind":"putref","args":[{"object":4}]})",
       R"({"id":7,"result":{"type":"Empty"},"byref":{}})"},
      {R"({"id":8,"call":3,"member":"DocData","kind":"putref","args":[{"object":5}]})",
       R"({"id":8,"result":{"type":"Empty"},"byref":{}})"},
      {R"({"id":9,"call":3,"member":"XALServer","kind":"putref","args":[{"object":6}]})",
       R"({"id":9,"result":{"type":"Empty"},"byref":{}})"},
      {R"({"id":10,"call":3,"member":"Create"})", R"({"id":10,"result":{"type":"Empty"},"byref":{}})"},
      {R"({"id":11,"call":3,"member":"Doc_Valid"})", Answer(11, kTrue)},
      {R"({"id":12,"call":3,"member":"DocData","kind":"get"})", R"({"id":12,"result":{"object":5},"byref":{}})"},
      {R"({"id":13,"call":2,"member":"Transcript","kind":"get"})",
       R"j({"id":13,"result":{"type":"String","value":"StatusMsg(\"\")"},"byref":{}})j"},
      {R"({"id":14,"call":3,"member":"Destroy"})", R"({"id":14,"result":{"type":"Empty"},"byref":{}})"},
  });
  std::remove(db.c_str());
}

}  // namespace
}  // namespace xal::app
