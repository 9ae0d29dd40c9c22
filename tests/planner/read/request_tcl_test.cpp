// What the program that reads requests in Tcl answers.
#include "planner/read/RequestTcl.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <stdexcept>

#include "planner/read/Options.h"
#include "tests/planner/read/read_support.h"

namespace planner::read {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

TEST(RequestTcl, SaysWhatTheScriptSays) {
  Mistakes mistakes;
  const Draft draft = ReadTclAnswer(R"({"request": {"device": "vk40", "inputs": ["27 MHz", "12.5ns"],
    "outputs": [{"frequency": "148.5MHz"}, {"frequency": "74.25", "phase": "90deg", "duty": "50%"},
      {"frequency": "-"}],
    "input_jitter": "50ps", "bandwidth": "low", "primitive": "tsyn", "tolerance": "20ppm",
    "feedback": true},
    "lines": {"device": 1, "inputs": [2, 3], "outputs": [3, 4, 4], "input_jitter": 2,
      "bandwidth": 5, "primitive": 6, "tolerance": 7, "feedback": 9}})",
                                    "f", &mistakes);
  EXPECT_THAT(TextsOf(mistakes), IsEmpty());
  std::string words;
  for (const Option& option : OptionsOf(draft)) words += option.name + " " + option.value + " ";
  EXPECT_EQ(words,
            "--in 27,80 --out 148.5,74.25,- --phase -,90,- --duty -,50,- --device vk40 "
            "--primitive TSYN --bandwidth LOW --feedback  --input-jitter 50 --tolerance 20 ");
}

TEST(RequestTcl, TellsMistakesWithTheLinesOfTheScript) {
  Mistakes mistakes;
  const Draft draft = ReadTclAnswer(R"({"request": {"inputs": ["fast"], "input_jitter": "x",
    "outputs": [{"frequency": "50", "phase": "x"}, {"frequency": "0"}], "bandwidth": "wide"},
    "lines": {"inputs": [1], "input_jitter": 1, "outputs": [2, 3], "bandwidth": 7}})",
                                    "f", &mistakes);
  EXPECT_THAT(TextsOf(mistakes),
              ElementsAre("f:1: input: \"fast\" is not a frequency, such as 100, 148.5MHz, 100/3 or "
                          "8ns",
                          "f:1: input: -jitter: \"x\" is not a jitter, such as 50, 50ps or 0.05ns",
                          "f:2: output 0: -phase: \"x\" is not a phase, such as 90, 90deg or -45",
                          "f:3: output 1: 0 must be greater than 0",
                          "f:7: bandwidth: \"wide\" must be LOW, HIGH or OPTIMIZED"));
}

TEST(RequestTcl, NamesTheLastLineOfAList) {
  Mistakes mistakes;
  const Draft draft = ReadTclAnswer(
      R"({"request": {"inputs": ["1", "2", "3"], "outputs": [{"frequency": "5"}]},
      "lines": {"inputs": [1, 2, 3], "outputs": [4]}})",
      "f", &mistakes);
  EXPECT_FALSE(Finish(draft, Reader{std::nullopt, "f"}, &mistakes));
  EXPECT_THAT(TextsOf(mistakes), ElementsAre("f:3: input: at most 2 frequencies, not 3"));
}

TEST(RequestTcl, TellsWhatTheScriptHasFailedWith) {
  Mistakes mistakes;
  ReadTclAnswer(R"({"error": {"line": 3, "message": "tolerance needs a value"}})", "f", &mistakes);
  ReadTclAnswer(R"({"error": {"line": 1, "message": "unknown command \"outptu\"", "name": "outptu",
    "commands": ["input", "output"]}})",
                "f", &mistakes);
  EXPECT_THAT(TextsOf(mistakes),
              ElementsAre("f:3: tolerance needs a value",
                          "f:1: unknown command \"outptu\"; did you mean output?"));
}

TEST(RequestTcl, RefusesWhatIsNoAnswer) {
  Mistakes mistakes;
  for (const char* const answer :
       {"", "{}", R"({"request": {}})", R"({"request": {"device": "x"}, "lines": {}})",
        R"({"request": {"inputs": ["1", "2"]}, "lines": {"inputs": [1]}})",
        R"({"request": {"device": "x"}, "lines": {"device": "1"}})", R"({"error": {}})"}) {
    EXPECT_THROW(ReadTclAnswer(answer, "f", &mistakes), std::invalid_argument) << answer;
  }
}

}  // namespace
}  // namespace planner::read
