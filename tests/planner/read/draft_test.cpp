// Options beside a file, and what they replace of it.
#include "planner/read/Draft.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "planner/read/Options.h"
#include "planner/read/RequestJson.h"
#include "tests/planner/read/read_support.h"

namespace planner::read {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

const char* const kFile = R"({"device": "vk40", "inputs": [25], "tolerance": 30,
  "outputs": [{"frequency": 125, "phase": 90, "duty": 25, "tolerance": 5}, 62.5],
  "max_jitter": 200, "bandwidth": "LOW", "rank": "error"})";

// The options that say what a file and options beside it say together.
std::string Together(const std::string& file, const std::vector<Option>& options) {
  Mistakes mistakes;
  const Draft draft = Over(ReadOptions(options, &mistakes), ReadJson(file, "f", &mistakes));
  EXPECT_THAT(TextsOf(mistakes), IsEmpty());
  std::string words;
  for (const Option& option : OptionsOf(draft)) {
    words += (words.empty() ? "" : " ") + option.name +
             (option.value.empty() ? "" : " " + option.value);
  }
  return words;
}

TEST(Over, KeepsOfTheFileWhatNoOptionSays) {
  EXPECT_EQ(Together(kFile, {}),
            "--in 25 --out 125,62.5 --phase 90,- --duty 25,- --device vk40 --bandwidth LOW "
            "--rank error --tolerance 5,30 --max-jitter 200");
  EXPECT_EQ(Together(kFile, {{"--in", "27"}, {"--device", "vk10"}, {"--feedback", ""}}),
            "--in 27 --out 125,62.5 --phase 90,- --duty 25,- --device vk10 --bandwidth LOW "
            "--rank error --feedback --tolerance 5,30 --max-jitter 200");
}

TEST(Over, LeavesNothingOfOutputsThatAreOthers) {
  EXPECT_EQ(Together(kFile, {{"--out", "200,100,50"}}),
            "--in 25 --out 200,100,50 --device vk40 --bandwidth LOW --rank error --tolerance 30 "
            "--max-jitter 200");
  // A demand that was only of single outputs is gone.
  EXPECT_EQ(Together(R"({"inputs": [25], "outputs": [{"frequency": 5, "max_jitter": 90}]})",
                     {{"--out", "200"}}),
            "--in 25 --out 200");
}

TEST(Over, TakesTwoWaysToSayOneThingAsOne) {
  EXPECT_EQ(Together(R"({"exact": true, "bandwidth": "HIGH"})",
                     {{"--tolerance", "5"}, {"--low-bandwidth", ""}}),
            "--low-bandwidth --tolerance 5");
  EXPECT_EQ(Together(R"({"tolerance": 7})", {{"--exact", ""}}), "--exact");
  // Also of what a file says of its outputs.
  EXPECT_EQ(Together(kFile, {{"--tolerance", "7"}}),
            "--in 25 --out 125,62.5 --phase 90,- --duty 25,- --device vk40 --bandwidth LOW "
            "--rank error --tolerance 7 --max-jitter 200");
}

TEST(Over, WritesExactBesideTolerancesOfOutputsAsOneList) {
  EXPECT_EQ(Together(R"({"exact": true, "outputs": [1, {"frequency": 2, "tolerance": 9}]})", {}),
            "--out 1,2 --tolerance 0,9");
}

TEST(Finish, NamesTheFileOrTheOptionThatIsWrong) {
  Mistakes mistakes;
  const std::vector<Option> options = {{"--phase", "1,2,3"}};
  const Draft draft = Over(ReadOptions(options, &mistakes),
                           ReadJson("{\"inputs\":\n [1, 2, 3], \"outputs\": [5, 6]}", "f",
                                    &mistakes));
  EXPECT_FALSE(Finish(draft, Reader{std::nullopt, "f"}, &mistakes));
  EXPECT_THAT(TextsOf(mistakes),
              ElementsAre("--phase: 3 in the list, but there are 2 outputs",
                          "f:2:2: inputs: at most 2 frequencies, not 3"));
  EXPECT_FALSE(mistakes[0].place.IsInFile());
  EXPECT_TRUE(mistakes[1].place.IsInFile());
}

TEST(Finish, DoesNotAskForWhatWasWrong) {
  Mistakes mistakes;
  const Draft draft = ReadJson(R"({"inputs": ["x"]})", "f", &mistakes);
  EXPECT_FALSE(Finish(draft, Reader{std::nullopt, "f"}, &mistakes));
  EXPECT_EQ(mistakes.size(), 1U);
}

TEST(MistakeError, SaysTheFirstOfAll) {
  Mistakes mistakes;
  ReadOptions(std::vector<Option>{{"--in", "0"}, {"--out", "x"}}, &mistakes);
  const MistakeError error(mistakes);
  EXPECT_STREQ(error.what(), "--in: 0 must be greater than 0");
  EXPECT_EQ(error.All().size(), 2U);
}

}  // namespace
}  // namespace planner::read
