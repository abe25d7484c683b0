// ServerFunctions end to end through the `xal session` protocol: a database opened by request, a
// data object read from its server, and ServerFunctions members called with the connection and
// the data object as arguments, checked against the rows left in the database.
#include <gtest/gtest.h>

#include <filesystem>

#include "apps/xal/session.h"

namespace xal::app {
namespace {

TEST(ServerFunctionsSession, ConnectionAndDataObjectArguments) {
  const std::string db = (std::filesystem::temp_directory_path() / "xal_server_functions_session.db").string();
  std::filesystem::remove(db);
  Session s;
  struct Row {
    std::string request;
    std::string answer;
  } rows[] = {
      {R"j({"id":1,"open":")j" + db + R"j(","kind":1})j", R"j({"id":1,"result":{"object":1}})j"},
      {R"j({"id":2,"call":1,"member":"Execute","args":["INSERT INTO GRArticle (ID, Code, DXCode) VALUES (5, 'A5', 'ART5'), (6, 'A6', '')"]})j",
       R"j({"id":2,"result":{"type":"Long","value":2},"byref":{}})j"},
      {R"j({"id":3,"call":1,"member":"Server","kind":"get"})j", R"j({"id":3,"result":{"object":2},"byref":{}})j"},
      {R"j({"id":4,"call":2,"member":"OpenQuery","args":["GRArticle",1,"ID = 5"]})j",
       R"j({"id":4,"result":{"object":3},"byref":{}})j"},
      {R"j({"id":5,"new":"ServerFunctions"})j", R"j({"id":5,"result":{"object":4}})j"},
      // The external code of the data object's current record (default field Code).
      {R"j({"id":6,"call":4,"member":"GetDXCode","args":[{"object":3}]})j",
       R"j({"id":6,"result":{"type":"String","value":"A5"},"byref":{"0":{"object":3}}})j"},
      // The code field named by the connection's setting.
      {R"j({"id":7,"call":1,"member":"SetSetting","args":["DXCode","GRARTICLE","DXCode"]})j",
       R"j({"id":7,"result":{"type":"Empty"},"byref":{}})j"},
      {R"j({"id":8,"call":4,"member":"GetDXCode","args":[{"object":3}]})j",
       R"j({"id":8,"result":{"type":"String","value":"ART5"},"byref":{"0":{"object":3}}})j"},
      // A delete through the connection handle; pOptions left out.
      {R"j({"id":9,"call":4,"member":"SQLDelete","args":[{"object":1},"DELETE FROM GRArticle WHERE ID=6"]})j",
       R"j({"id":9,"result":{"type":"Boolean","value":true},"byref":{"0":{"object":1}}})j"},
      {R"j({"id":10,"call":2,"member":"OpenQuery","args":["GRArticle",1]})j",
       R"j({"id":10,"result":{"object":5},"byref":{}})j"},
      {R"j({"id":11,"call":5,"member":"RowCount","kind":"get"})j",
       R"j({"id":11,"result":{"type":"Long","value":1},"byref":{}})j"},
      // A failing delete answers False; it is not an error of the call.
      {R"j({"id":12,"call":4,"member":"SQLDelete","args":[{"object":1},"DELETE FROM NoSuchTable WHERE ID=1"]})j",
       R"j({"id":12,"result":{"type":"Boolean","value":false},"byref":{"0":{"object":1}}})j"},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.request);
    EXPECT_EQ(s.Handle(r.request), r.answer);
  }
  std::filesystem::remove(db);
}

}  // namespace
}  // namespace xal::app
