// How the text of a request is written.
#include "planner/read/Form.h"

#include <gtest/gtest.h>

namespace planner::read {
namespace {

TEST(Form, IsThatOfTheName) {
  EXPECT_EQ(FormOf("a.json", "input 100"), Form::kJson);
  EXPECT_EQ(FormOf("A.JSON", ""), Form::kJson);
  EXPECT_EQ(FormOf("a.toml", "{}"), Form::kToml);
  EXPECT_EQ(FormOf("a.tcl", "{}"), Form::kTcl);
}

TEST(Form, IsElseThatOfTheText) {
  EXPECT_EQ(FormOf("-", " \n{\"inputs\": [1]}"), Form::kJson);
  EXPECT_EQ(FormOf("-", "\xef\xbb\xbf["), Form::kJson);
  EXPECT_EQ(FormOf("json", "# why\n\ninputs = [1]"), Form::kToml);
  EXPECT_EQ(FormOf("-", "low-1_a\t=1"), Form::kToml);
  EXPECT_EQ(FormOf("-", "# why =\ninput 100"), Form::kTcl);
  EXPECT_EQ(FormOf("-", "input =100"), Form::kToml);
  EXPECT_EQ(FormOf("-", "set x =1"), Form::kTcl);
  EXPECT_EQ(FormOf("-", ""), Form::kTcl);
  EXPECT_EQ(FormOf(".json", "input 1"), Form::kTcl);  // a name without an ending
}

}  // namespace
}  // namespace planner::read
