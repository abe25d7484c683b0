// "%s" filling, shared by the UI texts and the period-closing texts.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "collections/ui_strings.h"

namespace xal {
namespace {

TEST(FillPlaceholders, ArgumentsAndPlaceholdersPairInOrder) {
  struct Row {
    const char* text;
    std::vector<std::string> args;
    const char* expected;
  };
  const Row rows[] = {
      {"On hand %s, critical %s", {"5", "10"}, "On hand 5, critical 10"},
      {"On hand %s, critical %s", {"5"}, "On hand 5, critical "},         // a placeholder left over is dropped
      {"Total %s", {"5", "EUR", "!"}, "Total 5EUR!"},                     // arguments left over are appended
      {"%s%s", {"a", "b"}, "ab"},                                        // placeholders side by side
      {"no placeholders", {}, "no placeholders"},
      {"%s", {}, ""},
      {"100%", {"x"}, "100%x"},                                          // a lone "%" is text
      {"%%s", {"x"}, "%x"},
      {"%s", {"%s"}, "%s"},                                              // an argument is not filled again
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.text);
    EXPECT_EQ(FillPlaceholders(r.text, r.args), r.expected);
  }
}

}  // namespace
}  // namespace xal
