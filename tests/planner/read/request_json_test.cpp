// Requests in JSON.
#include "planner/read/RequestJson.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <ostream>

#include "tests/planner/read/read_support.h"

namespace planner::read {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

std::optional<Reading> Read(const std::string& text, Mistakes* mistakes) {
  const Draft draft = ReadJson(text, "FILE", mistakes);
  return Finish(draft, Reader{std::nullopt, "FILE"}, mistakes);
}

Reading ReadGood(const std::string& text) {
  Mistakes mistakes;
  std::optional<Reading> reading = Read(text, &mistakes);
  EXPECT_THAT(TextsOf(mistakes), IsEmpty());
  return reading ? *reading : Reading{};
}

TEST(RequestJson, SaysAllThatThereIs) {
  const Reading reading = ReadGood(R"({
    "device": "vk40", "primitive": "tsyn", "inputs": ["27MHz", "12.5ns"],
    "outputs": [{"frequency": "8ns", "phase": -90, "duty": "25%"}, "-", 33.333,
      {"frequency": 27, "tolerance": "20ppm", "phase_tolerance": 1, "duty_tolerance": "2%",
       "max_jitter": "0.15ns", "phase": null, "duty": "-"}],
    "input_jitter": "0.05ns", "bandwidth": "low", "tolerance": 50, "phase_tolerance": "2deg",
    "duty_tolerance": 3, "max_jitter": 200, "feedback": true, "prefer_max_vco": true,
    "int_div0": true, "rank": "margin", "engine": true, "any_order": true})");
  const Request& request = reading.request;
  ASSERT_TRUE(reading.device);
  EXPECT_EQ(reading.device->value, "vk40");
  EXPECT_EQ(request.primitive, Primitive::kTsyn);
  EXPECT_THAT(request.inputs, ElementsAre(Rational(27), Rational(80)));
  ASSERT_EQ(request.outputs.size(), 4U);
  EXPECT_EQ(Shape(request.outputs[0].frequency), "125/1");
  EXPECT_EQ(Shape(request.outputs[0].phase), "-90/1");
  EXPECT_EQ(Shape(request.outputs[0].duty), "25/1");
  EXPECT_EQ(Shape(request.outputs[0].tolerance), "nothing");
  EXPECT_FALSE(request.outputs[1].used);
  EXPECT_EQ(Shape(request.outputs[2].frequency), "33333/1000");
  const Output& last = request.outputs[3];
  EXPECT_EQ(Shape(last.phase), "nothing");
  EXPECT_EQ(Shape(last.duty), "nothing");
  EXPECT_EQ(Shape(last.tolerance), "20/1");
  EXPECT_EQ(Shape(last.phase_tolerance), "1/1");
  EXPECT_EQ(Shape(last.duty_tolerance), "2/1");
  EXPECT_EQ(Shape(last.max_jitter), "150/1");
  EXPECT_EQ(Shape(request.input_jitter), "50/1");
  EXPECT_EQ(request.bandwidth, Bandwidth::kLow);
  EXPECT_EQ(Shape(request.tolerance), "50/1");
  EXPECT_EQ(Shape(request.phase_tolerance), "2/1");
  EXPECT_EQ(Shape(request.duty_tolerance), "3/1");
  EXPECT_EQ(Shape(request.max_jitter), "200/1");
  EXPECT_TRUE(request.feedback);
  EXPECT_TRUE(request.prefer_max_vco);
  EXPECT_TRUE(request.whole_divider_0);
  EXPECT_TRUE(request.engine_only);
  EXPECT_TRUE(request.any_order);
  EXPECT_EQ(request.rank, Rank::kMargin);
}

// 0.1 + 0.2 as a double is 0.30000000000000004.
TEST(RequestJson, TakesNumbersAsTheirDecimalsStandThere) {
  EXPECT_EQ(ReadGood(R"({"inputs": [0.30000000000000004], "outputs": [1]})").request.inputs[0],
            Rational(30000000000000004, 100000000000000000));
}

TEST(RequestJson, HasWhatIsUsualWhereItSaysNothing) {
  const Request request = ReadGood(R"({"inputs": [27], "outputs": [54], "exact": false})").request;
  EXPECT_EQ(request.tolerance, 100);
  EXPECT_EQ(Shape(request.phase_tolerance), "1/2");
  EXPECT_EQ(Shape(request.max_jitter), "nothing");
  EXPECT_EQ(request.rank, Rank::kJitter);
  EXPECT_FALSE(request.primitive);
  EXPECT_FALSE(request.bandwidth);
  EXPECT_EQ(ReadGood(R"({"inputs": [27], "outputs": [54], "exact": true})").request.tolerance, 0);
}

struct Wrong {
  std::string text;
  std::vector<std::string> sentences;
};
void PrintTo(const Wrong& wrong, std::ostream* stream) { *stream << wrong.text; }

class WrongRequest : public testing::TestWithParam<Wrong> {};

// Lines and columns are counted by hand.
TEST_P(WrongRequest, IsTold) {
  Mistakes mistakes;
  EXPECT_FALSE(Read(GetParam().text, &mistakes));
  EXPECT_EQ(TextsOf(mistakes), GetParam().sentences);
}

const char* const kEntries =
    "device, primitive, inputs, outputs, input_jitter, input_tolerance, bandwidth, tolerance, "
    "exact, feedback, "
    "prefer_max_vco, int_div0, rank, engine, any_order, phase_tolerance, duty_tolerance, "
    "max_jitter";

INSTANTIATE_TEST_SUITE_P(
    One, WrongRequest,
    testing::Values(
        Wrong{R"({"inputs": [100], "outputs": [50], "speed": 1})",
              {std::string("FILE:1:36: unknown entry \"speed\"; the entries are ") + kEntries}},
        Wrong{R"({"bandwith": "LOW"})",
              {std::string("FILE:1:2: unknown entry \"bandwith\"; the entries are ") + kEntries +
               "; did you mean bandwidth?"}},
        Wrong{R"({"inputs": ["fast"]})",
              {"FILE:1:13: input 0: \"fast\" is not a frequency, such as 100, 148.5MHz, 100/3 or "
               "8ns"}},
        Wrong{R"({"inputs": ["148,5"]})",
              {"FILE:1:13: input 0: \"148,5\" is not a frequency, such as 100, 148.5MHz, 100/3 or "
               "8ns; with a decimal point it is 148.5"}},
        Wrong{R"({"inputs": [100], "outputs": [50, {"freq": 25}]})",
              {"FILE:1:36: output 1: unknown entry \"freq\"; the entries are frequency, phase, "
               "duty, tolerance, phase_tolerance, duty_tolerance, max_jitter"}},
        Wrong{R"({"inputs": [100], "outputs": [50, {"phase": 25}]})",
              {"FILE:1:35: output 1 has no frequency"}},
        Wrong{R"({"inputs": [100], "outputs": [{"frequency": 50, "phase": "x"}]})",
              {"FILE:1:58: output 0: phase: \"x\" is not a phase, such as 90, 90deg or -45"}},
        Wrong{R"({"exact": 1})", {"FILE:1:11: exact must be true or false, not a number"}},
        Wrong{R"({"exact": "true"})",
              {"FILE:1:11: exact must be true or false, not a text in quotes"}},
        Wrong{R"({"tolerance": true})",
              {"FILE:1:15: tolerance must be a number or a text in quotes, not a boolean"}},
        Wrong{"[100]", {"FILE:1:1: no request: it must be an object, not an array"}},
        Wrong{R"({"inputs": [100]})",
              {"FILE has no outputs, and --out is missing: the output frequencies, such as --out "
               "200,50"}},
        Wrong{"{}",
              {"FILE has no inputs, and --in is missing: the input frequency, such as --in 100",
               "FILE has no outputs, and --out is missing: the output frequencies, such as --out "
               "200,50"}},
        Wrong{"{\n  \"inputs\": 100\n}", {"FILE:2:13: inputs must be an array, not a number"}},
        Wrong{"{\n  \"inputs\": [100,\n [5]]}",
              {"FILE:3:2: input 1 must be a number or a text in quotes, not an array"}},
        Wrong{"{\n\"bandwidth\":\n\"wide\"}",
              {"FILE:3:1: bandwidth: \"wide\" must be LOW, HIGH or OPTIMIZED"}},
        Wrong{R"({"primitive": "DLL"})",
              {"FILE:1:15: primitive: \"DLL\" must be auto, PLL, TSYN, KRU_SP or KRU_CLKGEN"}},
        Wrong{R"({"rank": "fast"})",
              {"FILE:1:10: rank: \"fast\" must be jitter, error, margin or vco"}},
        Wrong{R"({"device": 40})",
              {"FILE:1:12: device must be a text in quotes, not a number"}},
        Wrong{"{\"outputs\": [1,2,3,4,5,6,7,8],\n \"inputs\": [1]}",
              {"FILE:1:13: outputs: at most 7 frequencies, not 8"}},
        Wrong{R"({"exact": true, "tolerance": 5, "inputs": [1], "outputs": [1]})",
              {"FILE:1:11: exact contradicts the tolerance"}},
        Wrong{R"({"outputs": [null]})",
              {"FILE:1:14: output 0 must be a number, a text in quotes or an object, not null"}},
        Wrong{R"({"outputs": ["-", {"frequency": "-"}], "inputs": [1]})",
              {"FILE:1:13: outputs: no output is used"}}));

TEST(RequestJson, TellsAllMistakesInTheOrderOfTheirPlaces) {
  Mistakes mistakes;
  EXPECT_FALSE(Read("{\"exact\": 1,\n"
                    " \"inputs\": [0, 1, 2],\n"
                    " \"outputs\": [{\"frequency\": 5, \"duty\": 101, \"phase\": 400},\n"
                    "   \"5 parsecs\"],\n"
                    " \"rank\": 3, \"speed\": 4}",
                    &mistakes));
  EXPECT_THAT(
      TextsOf(mistakes),
      ElementsAre("FILE:1:11: exact must be true or false, not a number",
                  "FILE:2:13: input 0: 0 must be greater than 0",
                  "FILE:3:39: output 0: duty: 101 must be above 0 and below 100",
                  "FILE:3:53: output 0: phase: 400 must be between -360 and 360",
                  "FILE:4:4: output 1: unknown unit \"parsecs\" in \"5 parsecs\"; the units of a "
                  "frequency are Hz, kHz, MHz and GHz, or ps, ns, us and ms for a period",
                  "FILE:5:10: rank must be a text in quotes, not a number",
                  testing::StartsWith("FILE:5:13: unknown entry \"speed\"")));
}

}  // namespace
}  // namespace planner::read
