// Data as a text in JSON.
#include "planner/report/JsonText.h"

#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <string>

namespace planner::report {
namespace {

using nlohmann::ordered_json;

TEST(JsonText, LettersThatMoveTheCursorAreNumbers) {
  EXPECT_EQ(JsonText({{"a", "x\x7f\xc2\x9b" "31m\xe2\x80\xae\xef\xbb\xbf.\x1b"}}),
            R"({"a":"x\u007f\u009b31m\u202e\ufeff.\u001b"})");
  EXPECT_EQ(JsonText("\xe2\x80\x8b"), R"("\u200b")");
}

TEST(JsonText, OtherLettersStay) {
  const std::string text = "\xc3\xa4\xe2\x82\xac\xc2\xa0\xf0\x9f\x9b\x80\xe2\x80\xaf~";
  EXPECT_EQ(JsonText(text), '"' + text + '"');
}

TEST(JsonText, WhatIsNoUtf8IsReplaced) { EXPECT_EQ(JsonText("a\xff"), "\"a\xef\xbf\xbd\""); }

TEST(JsonText, IsIndented) { EXPECT_EQ(JsonText({{"a", 1}}, 2), "{\n  \"a\": 1\n}"); }

TEST(JsonText, ReadsBackAsItWas) {
  const ordered_json data = {{"k\xc2\x85", {"\x7f", "\xe2\x81\xa0", 1.5, nullptr}}};
  EXPECT_EQ(ordered_json::parse(JsonText(data)), data);
}

}  // namespace
}  // namespace planner::report
