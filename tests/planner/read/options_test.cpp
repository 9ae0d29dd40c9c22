// Requests as options.
#include "planner/read/Options.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <random>

#include "tests/planner/read/read_support.h"

namespace planner::read {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

std::optional<Reading> Read(const std::vector<Option>& options, Mistakes* mistakes) {
  const Draft draft = ReadOptions(options, mistakes);
  return Finish(draft, Reader{}, mistakes);
}

Reading ReadGood(std::vector<Option> options) {
  Mistakes mistakes;
  std::optional<Reading> reading = Read(options, &mistakes);
  EXPECT_THAT(TextsOf(mistakes), IsEmpty());
  return reading ? *reading : Reading{};
}

std::vector<std::string> Complaints(std::vector<Option> options) {
  Mistakes mistakes;
  EXPECT_FALSE(Read(options, &mistakes));
  return TextsOf(mistakes);
}

TEST(Options, SayAllThatThereIs) {
  const Reading reading = ReadGood({{"--in", "27MHz,12.5ns"},
                                    {"--out", "148.5,-,27"},
                                    {"--phase", "90deg,-,-"},
                                    {"--duty", "-,-,0"},
                                    {"--device", "vk4"},
                                    {"--primitive", "kru_sp"},
                                    {"--bandwidth", "high"},
                                    {"--rank", "ERROR"},
                                    {"--prefer-max-vco", ""},
                                    {"--int-div0", "1"},
                                    {"--feedback", "true"},
                                    {"--engine", "1"},
                                    {"--any-order", "0"},
                                    {"--input-jitter", "0.05ns"},
                                    {"--tolerance", "20,-,30"},
                                    {"--phase-tolerance", "2"},
                                    {"--duty-tolerance", "1,2,3"},
                                    {"--max-jitter", "0.2ns"}});
  const Request& request = reading.request;
  EXPECT_EQ(reading.device->value, "vk4");
  EXPECT_THAT(request.inputs, ElementsAre(Rational(27), Rational(80)));
  ASSERT_EQ(request.outputs.size(), 3U);
  EXPECT_EQ(Shape(request.outputs[0].frequency), "297/2");
  EXPECT_EQ(Shape(request.outputs[0].phase), "90/1");
  EXPECT_EQ(Shape(request.outputs[0].tolerance), "20/1");
  EXPECT_FALSE(request.outputs[1].used);
  EXPECT_EQ(Shape(request.outputs[2].phase), "nothing");
  EXPECT_EQ(Shape(request.outputs[2].duty), "nothing");  // 0: any will do
  EXPECT_EQ(Shape(request.outputs[2].duty_tolerance), "3/1");
  EXPECT_EQ(request.primitive, Primitive::kKruSp);
  EXPECT_EQ(request.bandwidth, Bandwidth::kHigh);
  EXPECT_EQ(request.rank, Rank::kError);
  EXPECT_TRUE(request.prefer_max_vco && request.whole_divider_0 && request.feedback);
  EXPECT_TRUE(request.engine_only);
  EXPECT_FALSE(request.any_order);
  EXPECT_EQ(Shape(request.input_jitter), "50/1");
  EXPECT_EQ(Shape(request.tolerance), "100/1");
  EXPECT_EQ(Shape(request.ToleranceOf(request.outputs[1])), "100/1");
  EXPECT_EQ(Shape(request.phase_tolerance), "2/1");
  EXPECT_EQ(Shape(request.max_jitter), "200/1");
}

TEST(Options, PreferTheHighestVcoByItsRank) {
  EXPECT_EQ(ReadGood({{"--in", "1"}, {"--out", "1"}, {"--prefer-max-vco", ""}}).request.rank,
            Rank::kVco);
  EXPECT_EQ(ReadGood({{"--in", "1"}, {"--out", "1"}}).request.rank, Rank::kJitter);
}

TEST(Options, NarrowLoopsAndExactFrequenciesHaveTwoWords) {
  const Request request =
      ReadGood({{"--in", "1"}, {"--out", "1"}, {"--low-bandwidth", ""}, {"--exact", ""}}).request;
  EXPECT_EQ(request.bandwidth, Bandwidth::kLow);
  EXPECT_EQ(request.tolerance, 0);
  EXPECT_THAT(Complaints({{"--in", "1"},
                          {"--out", "1"},
                          {"--low-bandwidth", ""},
                          {"--bandwidth", "HIGH"},
                          {"--exact", ""},
                          {"--tolerance", "5"}}),
              ElementsAre("--exact and --tolerance 5 contradict each other",
                          "--low-bandwidth and --bandwidth HIGH contradict each other"));
  ReadGood({{"--in", "1"}, {"--out", "1"}, {"--exact", ""}, {"--tolerance", "0"}});
}

TEST(Options, AreRefusedWhereTheyAreWrong) {
  EXPECT_THAT(Complaints({}),
              ElementsAre("--in is missing: the input frequency, such as --in 100"));
  EXPECT_THAT(Complaints({{"--in", "100"}}),
              ElementsAre("--out is missing: the output frequencies, such as --out 200,50"));
  EXPECT_THAT(Complaints({{"--in", ""}, {"--out", "50,"}}),
              ElementsAre("--in: the list is empty", "--out: a number is missing in \"50,\""));
  EXPECT_THAT(Complaints({{"--in", "-"}, {"--out", "5"}}),
              ElementsAre("--in: \"-\" is not a frequency, such as 100, 148.5MHz, 100/3 or 8ns"));
  EXPECT_THAT(Complaints({{"--in", "1,2,3"}, {"--out", "1,2,3,4,5,6,7,8"}}),
              ElementsAre("--in: at most 2 frequencies, not 3",
                          "--out: at most 7 frequencies, not 8"));
  EXPECT_THAT(Complaints({{"--in", "1"},
                          {"--out", "5,6"},
                          {"--phase", "0"},
                          {"--tolerance", "1,2,3"}}),
              ElementsAre("--phase: 1 in the list, but there are 2 outputs",
                          "--tolerance: 3 in the list, but there are 2 outputs"));
  EXPECT_THAT(Complaints({{"--in", "1"}, {"--out", "5"}, {"--duty", "5,6"}}),
              ElementsAre("--duty: 2 in the list, but there is 1 output"));
  EXPECT_THAT(Complaints({{"--in", "1"}, {"--out", "-,-"}}),
              ElementsAre("--out: no output is used"));
  EXPECT_THAT(Complaints({{"--in", "1"}, {"--in", "2"}, {"--out", "5"}}),
              ElementsAre("--in is given twice"));
  EXPECT_THAT(Complaints({{"--feedback", "maybe"}}),
              ElementsAre("--feedback: \"maybe\" must be 1 or 0"));
  EXPECT_THAT(Complaints({{"--tolerence", "5"}}),
              ElementsAre("unknown option --tolerence; did you mean --tolerance?"));
}

TEST(Options, OfAPrimitiveHaveItsLimits) {
  const auto complaints = [](Primitive primitive, std::vector<Option> options) {
    Mistakes mistakes;
    EXPECT_FALSE(Finish(ReadOptions(options, &mistakes), Reader{primitive, ""}, &mistakes));
    return TextsOf(mistakes);
  };
  EXPECT_THAT(complaints(Primitive::kKruSp, {{"--in", "100,50"}, {"--out", "1,2,3,4,5,6,7"}}),
              ElementsAre("--in: at most 1 frequency of a KRU_SP, not 2",
                          "--out: at most 6 frequencies of a KRU_SP, not 7"));
  EXPECT_THAT(complaints(Primitive::kPll, {{"--in", "1"}, {"--out", "1"}, {"--primitive", "tsyn"}}),
              ElementsAre("--primitive: the request is for a TSYN, this command for a PLL"));
  Mistakes mistakes;
  const auto reading =
      Finish(ReadOptions(std::vector<Option>{{"--in", "1"}, {"--out", "1"}, {"--primitive", "auto"}},
                         &mistakes),
             Reader{Primitive::kPll, ""}, &mistakes);
  ASSERT_TRUE(reading);
  EXPECT_EQ(reading->request.primitive, Primitive::kPll);
}

// --- Decimal commas ---------------------------------------------------------------------------

std::vector<std::string> DoubtsOf(const std::string& in, const std::string& out) {
  std::vector<std::string> texts;
  for (const Doubt& doubt : ReadGood({{"--in", in}, {"--out", out}}).doubts) {
    texts.push_back(TextOf(doubt));
  }
  return texts;
}

TEST(DecimalCommas, AreDoubtedWhereAListOfTwoIsOdd) {
  EXPECT_THAT(DoubtsOf("148,5", "100"),
              ElementsAre("--in 148,5 is a list of two; with a decimal point it is 148.5"));
  EXPECT_THAT(DoubtsOf("33,333", "100"),
              ElementsAre("--in 33,333 is a list of two; with a decimal point it is 33.333"));
  EXPECT_THAT(DoubtsOf("100", "148,5"),
              ElementsAre("--out 148,5 is a list of two; with a decimal point it is 148.5"));
  EXPECT_THAT(DoubtsOf("100", "74,025"),
              ElementsAre("--out 74,025 is a list of two; with a decimal point it is 74.025"));
  // Two clocks as one would ask for them.
  EXPECT_THAT(DoubtsOf("25,50", "200,50"), IsEmpty());
  EXPECT_THAT(DoubtsOf("100,400", "148,74"), IsEmpty());
  EXPECT_THAT(DoubtsOf("148MHz,5MHz", "148.5,1"), IsEmpty());
  EXPECT_THAT(DoubtsOf("100", "5000,100"), IsEmpty());
  EXPECT_THAT(DoubtsOf("100", "148,5,20"), IsEmpty());
}

TEST(DecimalCommas, AreTheReasonForAListThatIsTooLong) {
  EXPECT_THAT(Complaints({{"--in", "100"}, {"--out", "148,5"}, {"--phase", "90"}}),
              ElementsAre("--phase: 1 in the list, but there are 2 outputs; with a decimal point "
                          "--out 148,5 is 148.5"));
}

// --- Other doubts -------------------------------------------------------------------------------

std::vector<std::string> DoubtsWith(std::vector<Option> options) {
  std::vector<std::string> texts;
  for (const Doubt& doubt : ReadGood(std::move(options)).doubts) texts.push_back(TextOf(doubt));
  return texts;
}

// The period of 27 MHz is 37037.037 ps, that of 80 MHz 12500 ps.
TEST(Doubts, AJitterOfTheInputIsAboveItsPeriod) {
  EXPECT_THAT(DoubtsWith({{"--in", "27"}, {"--out", "100"}, {"--input-jitter", "40ns"}}),
              ElementsAre("--input-jitter: a jitter of 40000 ps is above the period of the input, "
                          "37037.037 ps"));
  EXPECT_THAT(DoubtsWith({{"--in", "27,80"}, {"--out", "100"}, {"--input-jitter", "12500.5"}}),
              ElementsAre("--input-jitter: a jitter of 12500.5 ps is above the period of the "
                          "input, 12500.000 ps"));
  EXPECT_THAT(DoubtsWith({{"--in", "80"}, {"--out", "100"}, {"--input-jitter", "12500"}}),
              IsEmpty());
}

TEST(Doubts, ADutyCycleOfZeroAsksForNone) {
  EXPECT_THAT(DoubtsWith({{"--in", "27"}, {"--out", "100"}, {"--duty", "0"}}),
              ElementsAre("--duty: 0 asks for no duty cycle, as - does"));
  EXPECT_THAT(DoubtsWith({{"--in", "27"}, {"--out", "100,50"}, {"--duty", "0,50"}}), IsEmpty());
  EXPECT_THAT(DoubtsWith({{"--in", "27"}, {"--out", "100,50"}, {"--duty", "0,-"}}), IsEmpty());
}

// --- Writing ----------------------------------------------------------------------------------

std::string Words(const std::vector<Option>& options) {
  std::string words;
  for (const Option& option : options) {
    words += (words.empty() ? "" : " ") + option.name +
             (option.value.empty() ? "" : " " + option.value);
  }
  return words;
}

TEST(OptionsOfADraft, AreInTheWordsOfTheUser) {
  Mistakes mistakes;
  const std::vector<Option> options = {
      {"--exact", ""}, {"--out", "333MHz,8ns"}, {"--device", "vk4"}, {"--in", "100.50"}};
  EXPECT_EQ(Words(OptionsOf(ReadOptions(options, &mistakes))),
            "--in 100.50 --out 333MHz,8ns --device vk4 --exact");
}

TEST(OptionsOfARequest, LeaveOutWhatIsUsual) {
  Request request;
  request.inputs = {Rational(100, 3)};
  request.outputs.resize(2);
  request.outputs[0].frequency = Rational(297, 2);
  request.outputs[1].used = false;
  EXPECT_EQ(Words(OptionsOf(request)), "--in 100/3 --out 148.5,-");
  request.prefer_max_vco = true;
  request.rank = Rank::kVco;
  request.outputs[0].tolerance = 5;
  request.tolerance = 20;
  EXPECT_EQ(Words(OptionsOf(request)),
            "--in 100/3 --out 148.5,- --prefer-max-vco --tolerance 5,20");
}

TEST(OptionsOfADraft, AToleranceOfTheInputIsInTheWordsOfTheUser) {
  Mistakes mistakes;
  const std::vector<Option> options = {
      {"--input-tolerance", "50.0"}, {"--in", "100"}, {"--out", "50"}};
  EXPECT_EQ(Words(OptionsOf(ReadOptions(options, &mistakes))),
            "--in 100 --out 50 --input-tolerance 50.0");
}

// 50.5 ppm are more than none, which is usual; the one of the outputs is another.
TEST(OptionsOfARequest, SayTheToleranceOfTheInput) {
  Request request;
  request.inputs = {100};
  request.outputs.resize(1);
  request.outputs[0].frequency = 50;
  request.input_tolerance = Rational(101, 2);
  request.tolerance = 20;
  EXPECT_EQ(Words(OptionsOf(request)), "--in 100 --out 50 --input-tolerance 50.5 --tolerance 20");
}

// What is written is read as the same request: drawn requests, there and back.
TEST(OptionsOfARequest, AreReadAsTheSame) {
  std::mt19937 random(1);
  const auto draw = [&random](int most) {
    return static_cast<int>(random() % static_cast<unsigned>(most));
  };
  const auto maybe = [&](int lowest, int highest) -> std::optional<Rational> {
    if (draw(2) == 0) return std::nullopt;
    return Rational(lowest) + Rational(draw((highest - lowest) * 7) + 1, 7);
  };
  for (int round = 0; round < 500; ++round) {
    Request request;
    for (int i = draw(2); i >= 0; --i) request.inputs.push_back(Rational(1 + draw(9999), 13));
    for (int i = draw(7); i >= 0; --i) {
      Output output;
      output.used = request.outputs.empty() || draw(4) > 0;
      if (output.used) {
        output.frequency = Rational(1 + draw(99999), 64);
        output.phase = maybe(-360, 360);
        output.duty = maybe(0, 99);
        output.tolerance = maybe(0, 1000);
        output.phase_tolerance = maybe(0, 10);
        output.duty_tolerance = maybe(0, 10);
        output.max_jitter = maybe(0, 500);
      }
      request.outputs.push_back(output);
    }
    request.input_jitter = draw(500);
    if (draw(2) == 0) request.input_tolerance = Rational(draw(1000), 7);
    if (draw(2) == 0) request.tolerance = draw(300);
    if (draw(2) == 0) request.phase_tolerance = draw(10);
    request.max_jitter = maybe(0, 500);
    if (draw(2) == 0) request.bandwidth = hardware::kBandwidths[static_cast<std::size_t>(draw(3))];
    if (draw(2) == 0) request.primitive = hardware::kPrimitives[static_cast<std::size_t>(draw(4))];
    request.feedback = draw(2) == 0;
    request.whole_divider_0 = draw(2) == 0;
    request.prefer_max_vco = draw(2) == 0;
    request.any_order = draw(2) == 0;
    request.engine_only = draw(2) == 0;
    request.rank = static_cast<Rank>(draw(4));
    Mistakes mistakes;
    const std::vector<Option> options = OptionsOf(request);
    const auto reading = Read(options, &mistakes);
    ASSERT_THAT(TextsOf(mistakes), IsEmpty()) << Words(options);
    const Request& again = reading->request;
    ASSERT_EQ(again.inputs, request.inputs) << Words(options);
    ASSERT_EQ(again.outputs.size(), request.outputs.size());
    for (std::size_t i = 0; i < again.outputs.size(); ++i) {
      const Output& one = request.outputs[i];
      const Output& other = again.outputs[i];
      ASSERT_EQ(one.used, other.used);
      if (!one.used) continue;
      ASSERT_EQ(one.frequency, other.frequency);
      ASSERT_EQ(Shape(one.phase), Shape(other.phase));
      ASSERT_EQ(Shape(one.duty), Shape(other.duty));
      ASSERT_EQ(request.ToleranceOf(one), again.ToleranceOf(other)) << Words(options);
      ASSERT_EQ(request.PhaseToleranceOf(one), again.PhaseToleranceOf(other));
      ASSERT_EQ(request.DutyToleranceOf(one), again.DutyToleranceOf(other));
      ASSERT_EQ(Shape(request.MaxJitterOf(one)), Shape(again.MaxJitterOf(other)));
    }
    ASSERT_EQ(again.input_jitter, request.input_jitter);
    ASSERT_EQ(again.input_tolerance, request.input_tolerance) << Words(options);
    ASSERT_EQ(again.bandwidth, request.bandwidth);
    ASSERT_EQ(again.primitive, request.primitive);
    ASSERT_EQ(again.feedback, request.feedback);
    ASSERT_EQ(again.whole_divider_0, request.whole_divider_0);
    ASSERT_EQ(again.prefer_max_vco, request.prefer_max_vco);
    ASSERT_EQ(again.any_order, request.any_order);
    ASSERT_EQ(again.engine_only, request.engine_only);
    ASSERT_EQ(again.rank, request.rank) << Words(options);
  }
}

}  // namespace
}  // namespace planner::read
