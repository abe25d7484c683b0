// The handler template on the reference host: handlers that run inside another handler (here
// called by the host while the outer one waits on the status line) defer their refreshes and
// totals to the outermost one, which performs each once, in the fixed order.
#include <functional>
#include <stdexcept>

#include "docfunc/docfunc_fixture.h"

namespace xal::docfunc::testing {
namespace {

// Calls `inner` once, the first time the status line is cleared.
class OnStatusClear : public XALSBEproxyEvents {
 public:
  explicit OnStatusClear(std::function<void()> inner) : inner_(std::move(inner)) {}
  void DoStatusMsg(const std::string& Msg) override {
    if (!Msg.empty() || done_) return;
    done_ = true;
    inner_();
  }

 private:
  std::function<void()> inner_;
  bool done_ = false;
};

class Template : public DocFuncTest {
 protected:
  // A sales invoice with two rows of 10 and 20 and a 20 % tax code.
  void SetUp() override {
    DocFuncTest::SetUp();
    conn->db().ExecScript("INSERT INTO GRTax (ID, Code, TaxPercent) VALUES (1, 'VAT20', 20);");
    Open("SDInvoice");
    AddRow({{"IDGRArticle", Variant(1)}, {"Amount", Variant(10)}, {"BaseQuantity", Variant(1.0)}});
    AddRow({{"IDGRArticle", Variant(2)}, {"Amount", Variant(20)}, {"BaseQuantity", Variant(1.0)}});
  }
  // Runs Doc_Valid with `inner` handlers called inside it; the transcript of the whole.
  std::string Nested(std::initializer_list<const char*> inner) {
    std::vector<std::string> names(inner.begin(), inner.end());
    session->Proxy()->Events().Connect(std::make_shared<OnStatusClear>([this, names] {
      for (const std::string& n : names) Handler(n);
    }));
    session->ClearTranscript();
    EXPECT_EQ(Handler("Doc_Valid"), Variant(true));
    EXPECT_EQ(State().CallDepth, 0);
    return session->TranscriptText();
  }
};

TEST_F(Template, NestedHandlersRefreshOnceInTheFixedOrder) {
  EXPECT_EQ(Nested({"VTaxAmount", "VUnit", "DoHeaderRefresh", "VTaxAmount", "DoHeaderRefresh"}),
            "StatusMsg(\"\"); RefreshHeader(\"\"); RefreshRow(); RefreshBrowser(\"SDINVOICERow.@\"); "
            "RefreshHeader(\"@\"); RefreshHeader(\"TotalAmount\")");
  EXPECT_EQ(session->Header()->Field("@NetAmount"), Variant(Currency::FromInt(30)));
}

// A browser refresh takes the row refresh with it; rows to recompute are written back, all of
// them when the browser is refreshed too.
TEST_F(Template, BrowserRefreshCoversTheRowAndRowsAreWrittenBack) {
  session->Header()->SetField("IDGRTax", Variant(1));
  EXPECT_EQ(Nested({"VUnit", "VTax"}),
            "StatusMsg(\"\"); RefreshBrowser(\"\"); RefreshBrowser(\"SDINVOICERow.@\"); RefreshHeader(\"@\"); "
            "RefreshHeader(\"TotalAmount\")");
  EXPECT_EQ(conn->db().Scalar("SELECT count(*) FROM SDInvoiceRow WHERE IDGRTax = 1"), Variant(2));
  EXPECT_EQ(session->Header()->Field("@TaxAmount"), Variant(Currency::FromInt(6)));
}

// The totals deferred to the leave step may run WhenDocument, a handler of its own, inside the
// leave step. It leaves its own level only, so the next handler is the outermost again and
// refreshes for itself.
TEST_F(Template, HandlerInsideTheDeferredWorkLeavesItsOwnLevel) {
  session->Save();  // stored rows: their amount before the edit counts
  SetRowOB(session->Rows());
  session->Rows()->MoveFirst();
  EXPECT_EQ(Handler("WAmount"), Variant(true));
  session->Rows()->SetField("Amount", Variant(15));
  session->ClearTranscript();
  EXPECT_EQ(Handler("VAmount"), Variant(true));
  EXPECT_EQ(session->TranscriptText(), "RefreshHeader(\"@\"); RefreshHeader(\"TotalAmount\")");
  EXPECT_EQ(session->Header()->Field("@NetAmount"), Variant(Currency::FromInt(35)));
  EXPECT_EQ(State().CallDepth, 0);
  session->ClearTranscript();
  EXPECT_EQ(Handler("DoHeaderRefresh"), Variant(true));
  EXPECT_EQ(session->TranscriptText(), "RefreshHeader(\"\")");
}

// A host whose screen fails on the first header refresh.
class FailingScreen : public XALSBEproxyEvents {
 public:
  void DoRefreshHeader(const std::string&) override {
    if (failed_) return;
    failed_ = true;
    throw std::runtime_error("screen gone");
  }

 private:
  bool failed_ = false;
};

// A failure inside the deferred work is reported under the outer handler's name and ends only
// that step: the row refresh after it still happens.
TEST_F(Template, FailingDeferredStepIsReportedAndTheRestRuns) {
  session->Proxy()->Events().Connect(std::make_shared<FailingScreen>());
  EXPECT_EQ(Nested({"DoHeaderRefresh", "VUnit"}),
            "StatusMsg(\"\"); RefreshHeader(\"\"); StatusMsg(\"Error in script 'Doc_Valid': (440) screen gone\"); "
            "RefreshRow()");
}

}  // namespace
}  // namespace xal::docfunc::testing
