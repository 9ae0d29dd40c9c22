// Requests in TOML.
#include "planner/read/RequestToml.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "planner/read/Options.h"
#include "planner/read/RequestJson.h"
#include "tests/planner/read/read_support.h"

namespace planner::read {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::StartsWith;

// The options that say the same as a draft.
std::string Words(const Draft& draft) {
  std::string words;
  for (const Option& option : OptionsOf(draft)) words += option.name + " " + option.value + "\n";
  return words;
}

TEST(RequestToml, SaysTheSameAsJson) {
  Mistakes mistakes;
  const Draft toml = ReadToml(R"(
# A comment
device = "vk40"
inputs = ["27MHz"]
outputs = [148.5, {frequency = "74.25MHz", phase = 90, tolerance = 20, max_jitter = "200ps"},
  "-", 27]
tolerance = "30ppm"
bandwidth = "LOW"
prefer_max_vco = true
)",
                              "f", &mistakes);
  const Draft json = ReadJson(R"({"device": "vk40", "inputs": ["27MHz"],
    "outputs": [148.5, {"frequency": "74.25MHz", "phase": 90, "tolerance": 20,
      "max_jitter": "200ps"}, "-", 27],
    "tolerance": "30ppm", "bandwidth": "LOW", "prefer_max_vco": true})",
                              "f", &mistakes);
  EXPECT_THAT(TextsOf(mistakes), IsEmpty());
  EXPECT_EQ(Words(toml), Words(json));
  EXPECT_EQ(Words(toml),
            "--in 27\n--out 148.5,74.25,-,27\n--phase -,90,-,-\n--device vk40\n--bandwidth LOW\n"
            "--prefer-max-vco \n--tolerance 30,20,30,30\n--max-jitter -,200,-,-\n");
}

// As a double the first is 33.33300000000000000001 no more.
TEST(RequestToml, TakesNumbersAsTheirDecimalsStandThere) {
  Mistakes mistakes;
  const Draft draft = ReadToml(
      "outputs = [33.33300000000000001, 1_000.5,\n  0x10,4e1 ]  # \xc3\xa4\n"
      "[[not_there]]\ninputs = [1]\n",
      "f", &mistakes);
  ASSERT_TRUE(draft.outputs);
  EXPECT_THAT(draft.outputs->value,
              ElementsAre(Rational(3333300000000000001, 100000000000000000), Rational(2001, 2),
                          Rational(16), Rational(40)));
  EXPECT_THAT(TextsOf(mistakes), ElementsAre(StartsWith("f:3:3: unknown entry \"not_there\"")));
}

TEST(RequestToml, TakesOutputsAsTablesOfTheirOwn) {
  Mistakes mistakes;
  const Draft draft = ReadToml("inputs = [1]\n[[outputs]]\nfrequency = 5\nphase = 90\n"
                               "[[outputs]]\nfrequency = \"7.5 MHz\"\n",
                               "f", &mistakes);
  EXPECT_THAT(TextsOf(mistakes), IsEmpty());
  EXPECT_EQ(Words(draft), "--in 1\n--out 5,7.5\n--phase 90,-\n");
}

TEST(RequestToml, TellsMistakesWithTheirPlaces) {
  Mistakes mistakes;
  ReadToml("inputs = [0]\noutputs = [1, {frequency = 5, duty = 1979-05-27}, inf]\nexact = 1\n", "f",
           &mistakes);
  EXPECT_THAT(TextsOf(mistakes),
              ElementsAre("f:1:11: input 0: 0 must be greater than 0",
                          "f:2:38: output 1: duty must be a number, a text in quotes or null, not "
                          "a date",
                          "f:2:51: output 2: \"inf\" is not a frequency, such as 100, 148.5MHz, "
                          "100/3 or 8ns",
                          "f:3:9: exact must be true or false, not a number"));
}

TEST(RequestToml, TellsWhereItIsNoToml) {
  Mistakes mistakes;
  ReadToml("inputs = [1]\noutputs = [1\n", "f", &mistakes);
  ASSERT_EQ(mistakes.size(), 1U);
  EXPECT_EQ(mistakes[0].kind, MistakeKind::kSyntax);
  EXPECT_EQ(mistakes[0].place.line, 2);
  EXPECT_THAT(TextOf(mistakes[0]), StartsWith("f:2:"));
}

TEST(RequestToml, IsNotNestedWithoutEnd) {
  std::string dots = "a";
  for (int i = 0; i < 50000; ++i) dots += ".a";
  Mistakes mistakes;
  ReadToml(dots + " = 1\n", "f", &mistakes);
  EXPECT_THAT(TextsOf(mistakes),
              ElementsAre("f:1:1: no valid TOML: it has more dots than any request"));
  mistakes.clear();
  ReadToml("a = " + std::string(50000, '['), "f", &mistakes);
  EXPECT_EQ(mistakes.size(), 1U);
}

}  // namespace
}  // namespace planner::read
