#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "planner/report/TclDict.h"

namespace planner::report {
namespace {

using nlohmann::ordered_json;

TEST(TclDict, WordsOfAList) {
  EXPECT_EQ(TclWord(""), "{}");
  EXPECT_EQ(TclWord("vk40b484-2"), "vk40b484-2");
  EXPECT_EQ(TclWord("100/3"), "100/3");
  EXPECT_EQ(TclWord("two words"), "{two words}");
  EXPECT_EQ(TclWord("a $x [y] \"z\";"), "{a $x [y] \"z\";}");
  EXPECT_EQ(TclWord("#"), "{#}");
  EXPECT_EQ(TclWord("a{b"), "a\\{b");
  EXPECT_EQ(TclWord("}\\ \n"), "\\}\\\\\\ \\n");
  EXPECT_EQ(TclWord("}\t\r"), "\\}\\t\\r");
  EXPECT_EQ(TclWord("line\nline"), "{line\nline}");
}

TEST(TclDict, AnEntryALine) {
  const ordered_json data = {
      {"text", "a b"},    {"none", nullptr},         {"flag", true},
      {"number", 1188.0}, {"list", {1, 2.5, "x y"}}, {"empty", ordered_json::array()}};
  EXPECT_EQ(TclDict(data),
            "text {a b}\n"
            "none {}\n"
            "flag true\n"
            "number 1188.0\n"
            "list {1 2.5 {x y}}\n"
            "empty {}\n");
}

TEST(TclDict, ObjectsAreDicts) {
  const ordered_json data = {{"one", {{"m", 44}, {"deep", {{"d", 1}}}}},
                             {"outputs", {{{"index", 0}}, {{"index", 1}}, "-"}}};
  EXPECT_EQ(TclDict(data),
            "one {\n"
            "  m 44\n"
            "  deep {\n"
            "    d 1\n"
            "  }\n"
            "}\n"
            "outputs {\n"
            "  {\n"
            "    index 0\n"
            "  }\n"
            "  {\n"
            "    index 1\n"
            "  }\n"
            "  -\n"
            "}\n");
}

}  // namespace
}  // namespace planner::report
