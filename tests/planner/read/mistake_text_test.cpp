// Places and mistakes as sentences, where the tests of the readers do not have them.
#include "planner/read/MistakeText.h"

#include <gtest/gtest.h>

namespace planner::read {
namespace {

TEST(PlaceText, NamesOptionsEntriesAndOutputs) {
  EXPECT_EQ(TextOf(Place{"", 0, 0, "--in", -1, ""}), "--in");
  EXPECT_EQ(TextOf(Place{"f.json", 1, 13, "inputs", 0, ""}), "f.json:1:13: input 0");
  EXPECT_EQ(TextOf(Place{"f.json", 1, 58, "outputs", 2, "phase"}), "f.json:1:58: output 2: phase");
  EXPECT_EQ(TextOf(Place{"f.tcl", 3, 0, "output", 0, "-phase"}), "f.tcl:3: output 0: -phase");
  EXPECT_EQ(TextOf(Place{"f.tcl", 3, 0, "input", -1, ""}), "f.tcl:3: input");
  EXPECT_EQ(TextOf(Place{"f.tcl", 0, 0, "", -1, ""}), "f.tcl");
  // A name that would move the cursor.
  EXPECT_EQ(TextOf(Place{"f\n\x1b", 1, 0, "", -1, ""}), "f\\x0a\\x1b:1");
}

TEST(MistakeText, KeepsSentencesOfScriptsOnOneLine) {
  Mistake mistake;
  mistake.kind = MistakeKind::kScript;
  mistake.place = {"f.tcl", 7, 0, "", -1, ""};
  mistake.text = "can't read \"x\": no such variable";
  EXPECT_EQ(TextOf(mistake), "f.tcl:7: can't read \"x\": no such variable");
}

}  // namespace
}  // namespace planner::read
