// The simulated user on its own, in front of no form: its answer policy, its transcript, and what
// it answers when the form has no data objects. SQLite names quoted for the host's own SQL.
#include "host/simulated_user.h"

#include <gtest/gtest.h>

#include "bridge/proxy.h"
#include "host/database.h"

namespace xal::host {
namespace {

TEST(SimulatedUser, MessageBoxesFollowThePolicy) {
  auto user = SimulatedUser::Create();
  auto proxy = MakeRef<XALSBEproxy>();
  SimulatedUser::Attach(proxy->Events(), user);
  user->AddMsgBoxAnswer(kAnswerNo);
  struct Row {
    int32_t buttons;
    int32_t answer;
  };
  const Row rows[] = {
      {kMbOK, kAnswerOK},                         // one button: OK, and the queue is not touched
      {kMbInformation, kAnswerOK},                // an icon alone is still an OK-only box
      {kMbYesNo, kAnswerNo},                      // the queued answer
      {kMbYesNoDefaultNo, kAnswerYes},            // queue empty: the default
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.buttons);
    EXPECT_EQ(proxy->MsgBox("Q", r.buttons, ""), r.answer);
  }
  user->Policy().msgBoxDefault = kAnswerCancel;
  EXPECT_EQ(proxy->MsgBox("Q", kMbYesNo, "T"), kAnswerCancel);
  EXPECT_EQ(user->TranscriptText(),
            "MsgBox(\"Q\",0)->1; MsgBox(\"Q\",64)->1; MsgBox(\"Q\",4)->7; MsgBox(\"Q\",260)->6; "
            "MsgBox(\"Q\",4,\"T\")->2");
  user->ClearTranscript();
  EXPECT_TRUE(user->Transcript().empty());
  proxy->Destroy();
}

TEST(SimulatedUser, WithoutAFormEveryLookUpIsNothing) {
  auto user = SimulatedUser::Create();
  Ref<DataObject> found;
  user->GetObject("DocData", obmDefault, found);
  EXPECT_EQ(found, nullptr);
  bool exists = true;
  user->DoCheckCache("Rows", "Next", exists);
  EXPECT_TRUE(exists);  // no form: the start value stays
  user->SetSettingAnswer("Rows", Variant(3));
  Variant setting;
  user->GetSettings("ROWS", Variant(1), setting);
  EXPECT_EQ(setting, Variant(3));
  user->GetSettings("Other", Variant(1), setting);
  EXPECT_EQ(setting, Variant(1));
  // Lines come from the transcript sink that Attach connects; calls made straight on the user write none.
  EXPECT_TRUE(user->Transcript().empty());
}

TEST(QuoteName, EveryNameStaysOneIdentifier) {
  struct Row {
    const char* name;
    const char* quoted;
  };
  const Row rows[] = {
      {"GRArticle", "\"GRArticle\""},
      {"", "\"\""},
      {"4711TmpDBalanceStore", "\"4711TmpDBalanceStore\""},
      {"a\"b", "\"a\"\"b\""},                         // a quote inside is doubled
      {"x\"; DROP TABLE t; --", "\"x\"\"; DROP TABLE t; --\""},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.name);
    EXPECT_EQ(QuoteName(r.name), r.quoted);
  }
  Database db(":memory:");
  db.ExecScript("CREATE TABLE " + QuoteName("we\"ird") + " (ID INTEGER)");
  EXPECT_TRUE(db.TableExists("we\"ird"));
}

}  // namespace
}  // namespace xal::host
