// JSON with places.
#include "planner/read/JsonTree.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <ostream>

#include "tests/planner/read/read_support.h"

namespace planner::read {
namespace {

using ::testing::ElementsAre;

Node Parse(const std::string& text) {
  Mistakes mistakes;
  std::optional<Node> node = ReadJsonTree(text, "f", &mistakes);
  EXPECT_THAT(TextsOf(mistakes), ElementsAre());
  return node ? *node : Node{};
}

TEST(JsonTree, KeepsValuesTypesAndPlaces) {
  const Node root = Parse("{\n  \"a\": [1.50, -2e+3, true],\n  \"\xc3\xa4\": {\"b\": null}, "
                          "\"c\": \"x\"\n}\n");
  ASSERT_EQ(root.type, NodeType::kObject);
  ASSERT_EQ(root.members.size(), 3U);
  EXPECT_EQ(root.members[0].position, (Position{2, 3}));
  const Node& list = root.members[0].value;
  EXPECT_EQ(list.position, (Position{2, 8}));
  ASSERT_EQ(list.items.size(), 3U);
  EXPECT_EQ(list.items[0].text, "1.50");
  EXPECT_EQ(list.items[1].text, "-2e+3");
  EXPECT_EQ(list.items[1].position, (Position{2, 15}));
  EXPECT_EQ(list.items[2].type, NodeType::kBoolean);
  EXPECT_TRUE(list.items[2].truth);
  EXPECT_EQ(root.members[1].name, "\xc3\xa4");
  ASSERT_NE(root.members[1].value.Find("b"), nullptr);
  EXPECT_EQ(root.members[1].value.Find("b")->type, NodeType::kNull);
  EXPECT_EQ(root.members[1].value.Find("c"), nullptr);
  // The letter of two bytes is one column.
  EXPECT_EQ(root.Find("c")->position, (Position{3, 26}));
}

TEST(JsonTree, ReadsEscapes) {
  EXPECT_EQ(Parse(R"("\"\\\/\b\f\n\r\t")").text, "\"\\/\b\f\n\r\t");
  EXPECT_EQ(Parse(R"("\u0041\u00e4\u20AC\ud83d\udd50")").text,
            "A\xc3\xa4\xe2\x82\xac\xf0\x9f\x95\x90");
}

TEST(JsonTree, PassesOverTheMarkOfTheEncoding) {
  EXPECT_EQ(Parse("\xef\xbb\xbf[1]").items[0].position, (Position{1, 2}));
}

struct Wrong {
  std::string text;
  std::string sentence;
};
void PrintTo(const Wrong& wrong, std::ostream* stream) { *stream << wrong.text.substr(0, 40); }

class WrongJson : public testing::TestWithParam<Wrong> {};

// Lines and columns are counted by hand.
TEST_P(WrongJson, IsTold) {
  Mistakes mistakes;
  EXPECT_FALSE(ReadJsonTree(GetParam().text, "f", &mistakes));
  EXPECT_THAT(TextsOf(mistakes), ElementsAre("f:" + GetParam().sentence));
}

std::string At(const std::string& place, const std::string& reason) {
  return place + ": no valid JSON: " + reason;
}

INSTANTIATE_TEST_SUITE_P(
    Syntax, WrongJson,
    testing::Values(
        Wrong{"{\n  \"inputs\": [100]\n  \"outputs\": [50]\n}",
              At("3:3", "a comma or } must be here, not '\"'")},
        Wrong{"{\"inputs\": [100,]}", At("1:17", "a value must be here, not \"]\"")},
        Wrong{"{\"inputs\": [100],}", At("1:18", "a name in quotes must be here, not \"}\"")},
        Wrong{"{inputs: [100]}", At("1:2", "a name in quotes must be here, not \"inputs\"")},
        Wrong{"{\"inputs\" [100]}", At("1:11", "a colon must be here, not \"[\"")},
        Wrong{"{\"inputs\": [01]}", At("1:14", "a comma or ] must be here, not \"1\"")},
        Wrong{"[.5]", At("1:2", "a value must be here, not \".5\"")},
        Wrong{"[5.]", At("1:3", "a comma or ] must be here, not \".\"")},
        Wrong{"[1e]", At("1:3", "a comma or ] must be here, not \"e\"")},
        Wrong{"[-]", At("1:2", "a value must be here, not \"-\"")},
        Wrong{"[+1]", At("1:2", "a value must be here, not \"+1\"")},
        Wrong{"[NaN]", At("1:2", "a value must be here, not \"NaN\"")},
        Wrong{"[true1]", At("1:2", "a value must be here, not \"true1\"")},
        Wrong{"{\n\"device\": \"vk40\n}",
              At("2:11", "the text in quotes that begins here does not end")},
        Wrong{"\"a", At("1:1", "the text in quotes that begins here does not end")},
        Wrong{"{\"device\": \"\\x\"}", At("1:13", "JSON has no such escape")},
        Wrong{"\"\\u12g4\"", At("1:2", "JSON has no such escape")},
        Wrong{"\"\\ud800\"", At("1:2", "JSON has no such escape")},
        Wrong{"\"\\udc00\"", At("1:2", "JSON has no such escape")},
        Wrong{"\"\\ud800\\u0041\"", At("1:2", "JSON has no such escape")},
        Wrong{"\"a\tb\"", At("1:3", "a control character must be written as an escape")},
        Wrong{"{} {}", At("1:4", "there is more behind the end, \"{\"")},
        Wrong{"[] // why", At("1:4", "there is more behind the end, \"/\"")},
        Wrong{"{\n\n", At("3:1", "a name in quotes must be here, not the end of the file")},
        Wrong{"", At("1:1", "a value must be here, not the end of the file")},
        Wrong{"[1\xff]", At("1:3", "the text is not UTF-8 here")},
        // A blank in two and in three bytes, half of a pair, and one beyond the last letter.
        Wrong{"\"\xc0\xa0\"", At("1:2", "the text is not UTF-8 here")},
        Wrong{"\"\xe0\x80\xa0\"", At("1:2", "the text is not UTF-8 here")},
        Wrong{"\"\xed\xa0\x80\"", At("1:2", "the text is not UTF-8 here")},
        Wrong{"\"\xf4\x90\x80\x80\"", At("1:2", "the text is not UTF-8 here")},
        Wrong{"{\"a\": 1,\n\"\\u0061\": 2}", At("2:1", "the entry \"a\" is there twice")},
        Wrong{std::string(50000, '['), At("1:22", "it is nested too deeply")}));

TEST(JsonTree, TakesANulByteForWhatItIs) {
  Mistakes mistakes;
  EXPECT_FALSE(ReadJsonTree(std::string_view("[1\0]", 4), "f", &mistakes));
  EXPECT_THAT(TextsOf(mistakes),
              ElementsAre("f:1:3: no valid JSON: a comma or ] must be here, not \"\\x00\""));
}

}  // namespace
}  // namespace planner::read
