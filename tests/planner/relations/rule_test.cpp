#include "planner/relations/Rule.h"

#include <gtest/gtest.h>

#include "planner/read/MistakeText.h"

namespace planner::relations {
namespace {

std::optional<Rule> Read(const std::string& text) {
  read::Mistakes mistakes;
  read::Place place;
  place.entry = "--gap";
  const std::optional<Rule> rule = ReadRule(text, place, &mistakes);
  EXPECT_EQ(rule.has_value(), mistakes.empty());
  return rule;
}

std::string Wrong(const std::string& text) {
  read::Mistakes mistakes;
  read::Place place;
  place.entry = "--gap";
  EXPECT_FALSE(ReadRule(text, place, &mistakes));
  return mistakes.size() == 1 ? TextOf(mistakes[0]) : "not one mistake";
}

TEST(Rule, GapsAreInNs) {
  EXPECT_EQ(Read("0.5")->gap, Rational(1, 2));
  EXPECT_EQ(Read("0.5ns")->gap, Rational(1, 2));
  EXPECT_EQ(Read("500 ps")->gap, Rational(1, 2));
  EXPECT_EQ(Read("1/3")->gap, Rational(1, 3));
  EXPECT_EQ(Read("1us")->gap, Rational(1000));
}

TEST(Rule, SharesAreInPercent) {
  const std::optional<Rule> rule = Read("20%");
  EXPECT_FALSE(rule->gap);
  EXPECT_EQ(rule->share, Rational(1, 5));
  EXPECT_EQ(Read("100 %")->share, Rational(1));
}

TEST(Rule, WhatIsWrongIsTold) {
  EXPECT_EQ(Wrong("0"), "--gap: 0 must be greater than 0");
  EXPECT_EQ(Wrong("-1ns"), "--gap: -1ns must be greater than 0");
  EXPECT_EQ(Wrong("2ms"), "--gap: 2ms must be at most 1 ms");
  EXPECT_EQ(Wrong("0%"), "--gap: 0% must be greater than 0");
  EXPECT_EQ(Wrong("101%"), "--gap: 101% must be between 0 and 100");
  EXPECT_EQ(Wrong("wide"), "--gap: \"wide\" is not a gap, such as 0.5, 0.5ns, 500ps or 20%");
  EXPECT_EQ(Wrong("1MHz"),
            "--gap: unknown unit \"MHz\" in \"1MHz\"; the units of a gap are fs, ps, ns, us, ms "
            "and %");
  EXPECT_EQ(Wrong("x%"), "--gap: \"x%\" is not a share, such as 25%");
}

}  // namespace
}  // namespace planner::relations
