// DocFunc through `xal session`: the one a document session offers (wired as a host wires it) and
// one made by hand (new, the three host objects assigned by reference, Create), with fields set,
// rows added, handlers called by name and the proxy's events in the transcript.
#include <gtest/gtest.h>
#include <unistd.h>

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

// A database file of this test and process (builds may run the same tests side by side).
std::string TempDb(const std::string& name) {
  return testing::TempDir() + name + "_" + std::to_string(::getpid()) + ".db";
}

std::string Answer(int id, const std::string& rest) { return "{\"id\":" + std::to_string(id) + "," + rest; }

TEST(DocFuncSession, ADocFuncWiredByHand) {
  std::string db = TempDb("xal_docfunc_session_plain");
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

// The worked example of the README, request for request.
TEST(DocFuncSession, ReadmeInvoice) {
  std::string db = TempDb("xal_docfunc_session_readme");
  std::remove(db.c_str());
  const std::string empty = R"("result":{"type":"Empty"},"byref":{}})";
  Session s;
  RunSteps(s, {
      {R"({"id":1,"open":")" + db + R"("})", R"({"id":1,"result":{"object":1}})"},
      {R"j({"id":2,"call":1,"member":"Execute","args":["INSERT INTO GRCompany (ID, Code, Name) VALUES (5, 'ACME', 'Acme Ltd')"]})j",
       R"({"id":2,"result":{"type":"Long","value":1},"byref":{}})"},
      {R"j({"id":3,"call":1,"member":"Execute","args":["INSERT INTO GRTax (ID, Code, TaxPercent) VALUES (1, 'VAT20', 20)"]})j",
       R"({"id":3,"result":{"type":"Long","value":1},"byref":{}})"},
      {R"({"id":4,"document":"SDInvoice","connection":1})", R"({"id":4,"result":{"object":2}})"},
      {R"({"id":5,"call":2,"member":"DocFunc","kind":"get"})", R"({"id":5,"result":{"object":3},"byref":{}})"},
      {R"({"id":6,"call":3,"member":"AddNewDocument"})", Answer(6, kTrue)},
      {R"({"id":7,"call":2,"member":"Header","kind":"get"})", R"({"id":7,"result":{"object":4},"byref":{}})"},
      {R"({"id":8,"call":4,"member":"Field","kind":"put","args":["IDGRCompany",5]})", Answer(8, empty)},
      {R"({"id":9,"call":2,"member":"Rows","kind":"get"})", R"({"id":9,"result":{"object":5},"byref":{}})"},
      {R"({"id":10,"call":5,"member":"AddNew"})", Answer(10, empty)},
      {R"({"id":11,"call":5,"member":"Field","kind":"put","args":["IDGRTax",1]})", Answer(11, empty)},
      {R"({"id":12,"call":2,"member":"ClearTranscript"})", Answer(12, empty)},
      {R"({"id":13,"call":3,"member":"WAmount"})", Answer(13, kTrue)},
      {R"({"id":14,"call":5,"member":"Field","kind":"put","args":["Amount",{"type":"Currency","value":"25.0000"}]})",
       Answer(14, empty)},
      {R"({"id":15,"call":3,"member":"VAmount"})", Answer(15, kTrue)},
      {R"({"id":16,"call":4,"member":"Field","args":["@NetAmount"]})",
       R"({"id":16,"result":{"type":"Currency","value":"25.0000"},"byref":{}})"},
      {R"({"id":17,"call":4,"member":"Field","args":["TotalAmount"]})",
       R"({"id":17,"result":{"type":"Currency","value":"30.0000"},"byref":{}})"},
      {R"({"id":18,"call":2,"member":"Transcript","kind":"get"})",
       R"j({"id":18,"result":{"type":"String","value":"OnNewRow(); RefreshHeader(\"@\"); RefreshHeader(\"TotalAmount\")"},"byref":{}})j"},
      {R"({"id":19,"call":2,"member":"Save"})", R"({"id":19,"result":{"type":"Long","value":1},"byref":{}})"},
      {R"({"id":20,"call":2,"member":"Close"})", Answer(20, empty)},
      // Destroyed with the session: nothing bound, nothing reported, the result as it started.
      {R"({"id":21,"call":3,"member":"WAmount"})", R"({"id":21,"result":{"type":"Boolean","value":false},"byref":{}})"},
  });
  std::remove(db.c_str());
}

}  // namespace
}  // namespace xal::app
