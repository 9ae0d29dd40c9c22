#include "planner/batch/Lines.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace planner::batch {
namespace {

std::vector<Line> LinesOf(const std::vector<std::string>& pieces, std::size_t most = 100) {
  std::vector<Line> found;
  Lines lines(most);
  const auto take = [&](Line line) { found.push_back(std::move(line)); };
  for (const std::string& piece : pieces) lines.Add(piece, take);
  lines.End(take);
  return found;
}

std::vector<std::string> Texts(const std::vector<Line>& lines) {
  std::vector<std::string> texts;
  for (const Line& line : lines) texts.push_back(line.text);
  return texts;
}

using Strings = std::vector<std::string>;

TEST(Lines, AreCountedFromOne) {
  const std::vector<Line> lines = LinesOf({"a\nb\n\nc\n"});
  EXPECT_EQ(Texts(lines), (Strings{"a", "b", "", "c"}));
  for (std::size_t i = 0; i < lines.size(); ++i) {
    EXPECT_EQ(lines[i].number, static_cast<std::int64_t>(i) + 1);
    EXPECT_EQ(lines[i].size, lines[i].text.size());
  }
}

TEST(Lines, LastOneNeedsNoEnd) {
  EXPECT_EQ(Texts(LinesOf({"a\nb"})), (Strings{"a", "b"}));
  EXPECT_TRUE(LinesOf({""}).empty());
  EXPECT_TRUE(LinesOf({}).empty());
}

// However a text is cut into pieces, its lines are the same.
TEST(Lines, DoNotDependOnThePieces) {
  const std::string text = "one\ntwo\r\n\nfour\nfive";
  const std::vector<Line> whole = LinesOf({text});
  for (std::size_t i = 0; i <= text.size(); ++i) {
    for (std::size_t k = i; k <= text.size(); ++k) {
      const std::vector<Line> cut =
          LinesOf({text.substr(0, i), text.substr(i, k - i), text.substr(k)});
      ASSERT_EQ(Texts(cut), Texts(whole));
      for (std::size_t n = 0; n < cut.size(); ++n) ASSERT_EQ(cut[n].digest, whole[n].digest);
    }
  }
}

TEST(Lines, OfALongOneTheBeginningIsKept) {
  const std::vector<Line> lines = LinesOf({"abc", "def\nabcd\nabcde"}, 4);
  EXPECT_EQ(Texts(lines), (Strings{"abcd", "abcd", "abcd"}));
  EXPECT_TRUE(lines[0].is_too_long);
  EXPECT_FALSE(lines[1].is_too_long);
  EXPECT_TRUE(lines[2].is_too_long);
  EXPECT_EQ(lines[0].size, 6u);
  // The digest is that of all of it.
  EXPECT_NE(lines[0].digest, lines[2].digest);
}

TEST(Lines, BlankOnes) {
  const std::vector<Line> lines = LinesOf({"\n \t\r\n.\n     x"}, 4);
  ASSERT_EQ(lines.size(), 4u);
  EXPECT_TRUE(lines[0].IsBlank());
  EXPECT_TRUE(lines[1].IsBlank());
  EXPECT_FALSE(lines[2].IsBlank());
  EXPECT_FALSE(lines[3].IsBlank());  // what is not kept may be no blank
}

// Published values: the offset basis for nothing, and those of "a" and "foobar".
TEST(Digest, IsFnv1a) {
  EXPECT_EQ(Digest::Text(Digest().Value()), "cbf29ce484222325");
  EXPECT_EQ(Digest::Text(Digest("a").Value()), "af63dc4c8601ec8c");
  EXPECT_EQ(Digest::Text(Digest("foobar").Value()), "85944171f73967e8");
}

TEST(Digest, OfLinesBeginsWithThatOfTheLines) {
  Lines lines(100, Digest("foo"));
  lines.Add("bar\nbar\n", [](const Line& line) {
    EXPECT_EQ(Digest::Text(line.digest), "85944171f73967e8");
  });
}

TEST(Shard, TakesEveryLineOnce) {
  for (const std::int64_t of : {1, 2, 3, 7}) {
    for (std::int64_t number = 1; number <= 20; ++number) {
      Line line;
      line.number = number;
      int taken = 0;
      for (std::int64_t index = 1; index <= of; ++index) taken += Shard{index, of}.Has(line);
      EXPECT_EQ(taken, 1);
    }
  }
  Line line;
  line.number = 4;
  EXPECT_TRUE((Shard{1, 3}.Has(line)));
}

}  // namespace
}  // namespace planner::batch
