// Numbers as documents have them, and documents that differ.
#include "planner/verify/Difference.h"

#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "planner/read/JsonTree.h"
#include "planner/verify/Entries.h"

namespace planner::verify {

namespace {

using hardware::Rational;
using nlohmann::ordered_json;

Discrepancies Between(const ordered_json& expected, const std::string& found) {
  read::Mistakes mistakes;
  const auto node = read::ReadJsonTree(found, "", &mistakes);
  Discrepancies all;
  Differ(expected, *node, "", &all);
  return all;
}

TEST(Difference, NumbersAreExact) {
  EXPECT_EQ(NumberOf("148.5"), Rational(297, 2));
  EXPECT_EQ(NumberOf("-1.25e1"), Rational(-25, 2));
  EXPECT_EQ(NumberOf("5E-3"), Rational(1, 200));
  EXPECT_EQ(NumberOf("-0"), Rational(0));
}

TEST(Difference, NumbersThatNobodyWritesAreNone) {
  EXPECT_FALSE(NumberOf("1e999999999999999999"));
  EXPECT_FALSE(NumberOf("1e-401"));
  EXPECT_FALSE(NumberOf(std::string(801, '1')));
  EXPECT_TRUE(NumberOf(std::string(800, '1')));
}

TEST(Difference, ANumberIsRightWhenItIsTheSameDouble) {
  EXPECT_TRUE(Between({{"a", 0.1}}, R"({"a": 0.1})").empty());
  EXPECT_TRUE(Between({{"a", 0.1}}, R"({"a": 1.0e-1})").empty());
  EXPECT_TRUE(Between({{"a", 0.1}}, R"({"a": 0.1000000000000000055511151231257827})").empty());
  const auto wrong = Between({{"a", 0.1}}, R"({"a": 0.10000000000000002})");
  ASSERT_EQ(wrong.size(), 1u);
  EXPECT_EQ(wrong[0].kind, DiscrepancyKind::kDiffers);
  EXPECT_EQ(wrong[0].path, "a");
  EXPECT_EQ(wrong[0].found, "0.10000000000000002");
  EXPECT_EQ(wrong[0].expected, "0.1");
  EXPECT_EQ(wrong[0].line, 1);
  EXPECT_EQ(wrong[0].column, 7);
  // Whole numbers are compared as such: no double tells these apart.
  EXPECT_EQ(Between({{"a", 9007199254740992}}, R"({"a": 9007199254740993})").size(), 1u);
}

TEST(Difference, WhatIsMissingTooMuchOrOfAnotherType) {
  const ordered_json expected = {{"a", {1, 2}}, {"b", {{"c", true}}}, {"d", nullptr}};
  const auto wrong = Between(expected, "{\"a\": [1],\n \"b\": {\"c\": \"true\", \"e\": 1},"
                                       "\n \"d\": 0}");
  ASSERT_EQ(wrong.size(), 4u);
  EXPECT_EQ(wrong[0].path, "a[1]");
  EXPECT_EQ(wrong[0].kind, DiscrepancyKind::kMissing);
  EXPECT_EQ(wrong[0].expected, "2");
  EXPECT_EQ(wrong[0].found, "");
  EXPECT_EQ(wrong[1].path, "b.c");
  EXPECT_EQ(wrong[1].kind, DiscrepancyKind::kWrongType);
  EXPECT_EQ(wrong[2].path, "b.e");
  EXPECT_EQ(wrong[2].kind, DiscrepancyKind::kUnknown);
  EXPECT_EQ(wrong[2].line, 2);
  EXPECT_EQ(wrong[3].path, "d");
  EXPECT_EQ(wrong[3].kind, DiscrepancyKind::kDiffers);
  EXPECT_EQ(wrong[3].expected, "null");
}

TEST(Difference, AnyTextIsAText) {
  EXPECT_TRUE(Between({{"a", AnyText()}}, R"({"a": "whatever"})").empty());
  EXPECT_EQ(Between({{"a", AnyText()}}, R"({"a": 1})").size(), 1u);
  EXPECT_TRUE(Between({{"a", AnyTexts()}}, R"({"a": ["x", "y"]})").empty());
  EXPECT_EQ(Between({{"a", AnyTexts()}}, R"({"a": ["x", 1]})").size(), 1u);
}

}  // namespace

}  // namespace planner::verify
