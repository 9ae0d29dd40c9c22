#include "planner/engine/Ask.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <stdexcept>

#include "host/bundled/device/DeviceCatalogue.h"
#include "planner/device/Catalogue.h"
#include "tests/planner/engine/devices.h"

namespace {

using engine_test::Out;
using hardware::Bandwidth;
using hardware::Pin;
using hardware::Primitive;
using hardware::Rational;
using planner::Answer;
using planner::FindingKind;
using planner::KruSettings;
using planner::LoopSettings;
using planner::Request;
using testing::ElementsAre;

Request Wanted(std::vector<Rational> inputs, std::vector<planner::Output> outputs) {
  return engine_test::Ask(std::move(inputs), std::move(outputs));
}

class AskTest : public testing::Test {
 protected:
  std::vector<Answer> Ask(const Request& request, Primitive primitive) {
    return planner::engine::Ask(request, device_, primitive);
  }
  Answer One(const Request& request, Primitive primitive) {
    return planner::engine::AskOne(request, device_, primitive,
                                   planner::engine::AsRequested(request));
  }

  const planner::Device device_ = engine_test::Round();
};

// The variants of the answers with the bandwidth, M, D and first divider, in eighths, of each.
std::vector<std::string> Summaries(const std::vector<Answer>& answers) {
  std::vector<std::string> summaries;
  for (const Answer& answer : answers) {
    const auto& settings = std::get<LoopSettings>(answer.settings);
    summaries.push_back(answer.source.variant + "/" +
                        std::string(hardware::Name(settings.bandwidth)) + " " +
                        std::to_string(settings.m) + " " + std::to_string(settings.d) + " " +
                        std::to_string(settings.outputs[0].divider));
  }
  return summaries;
}

// VCOs of 400, 600, 800 and 1000 MHz: the smallest and the largest, and each bandwidth.
TEST_F(AskTest, AnswersAllVariants) {
  const auto answers = Ask(Wanted({100}, {Out(200), Out(50)}), Primitive::kPll);
  EXPECT_THAT(Summaries(answers),
              ElementsAre("smallest VCO/OPTIMIZED 32 1 16", "smallest VCO/LOW 32 1 16",
                          "smallest VCO/HIGH 32 1 16", "largest VCO/OPTIMIZED 80 1 40",
                          "largest VCO/LOW 80 1 40", "largest VCO/HIGH 80 1 40"));
  for (const Answer& answer : answers) {
    EXPECT_TRUE(answer.solved && answer.within);
    EXPECT_TRUE(answer.source.engine);
    EXPECT_FALSE(answer.source.search);
    EXPECT_EQ(answer.worst_ppm, Rational(0));
    EXPECT_EQ(answer.outputs[1].frequency, Rational(50));
  }
  EXPECT_EQ(answers[0].vco, Rational(400));
  EXPECT_EQ(answers[0].searched_vco, 400.0);
  EXPECT_EQ(answers[3].outputs[0].searched, 200.0);
}

// 350 x 2 is the only VCO; smallest and largest are the same.
TEST_F(AskTest, HasTheSameSettingsOnce) {
  Request request = Wanted({100}, {Out(350)});
  EXPECT_THAT(Summaries(Ask(request, Primitive::kPll)),
              ElementsAre("smallest VCO/OPTIMIZED 56 1 16", "smallest VCO/LOW 56 1 16",
                          "smallest VCO/HIGH 56 1 16"));
}

// a = 30, 32, 40 and 48 eighths (see run_test): 712.5, 760, 950 and 1140 MHz. Next to 900 is 950.
TEST_F(AskTest, AnswersTheSearchesOfATsyn) {
  Request request = Wanted({100}, {Out(190)});
  request.bandwidth = Bandwidth::kHigh;
  EXPECT_THAT(Summaries(Ask(request, Primitive::kTsyn)),
              ElementsAre("smallest VCO/HIGH 456 8 30", "target VCO/HIGH 152 2 40",
                          "largest VCO/HIGH 456 5 48", "integer divider 0/HIGH 304 5 32"));
}

TEST_F(AskTest, JudgesWhatTheEngineCountsWith) {
  Request request = Wanted({100}, {Out(Rational(3333, 10))});
  const Answer answer = One(request, Primitive::kPll);
  EXPECT_EQ(answer.outputs[0].frequency, Rational(1000, 3));
  EXPECT_EQ(answer.outputs[0].searched, 333.3);
  // (1000 / 3 - 333.3) / 333.3 = 1 / 9999: 100.01 ppm, and 100 are allowed.
  EXPECT_EQ(answer.worst_ppm, Rational(1000000, 9999));
  EXPECT_FALSE(answer.within);
  ASSERT_EQ(answer.outputs[0].misses.size(), 1u);
  EXPECT_EQ(answer.source.variant, "");
}

TEST_F(AskTest, SaysOnceWhyThereIsNothing) {
  const auto answers = Ask(Wanted({10}, {Out(100)}), Primitive::kPll);
  ASSERT_EQ(answers.size(), 1u);
  EXPECT_FALSE(answers[0].solved);
  EXPECT_EQ(answers[0].primitive, Primitive::kPll);
  EXPECT_TRUE(answers[0].source.engine);
  EXPECT_EQ(answers[0].source.variant, "");
  ASSERT_EQ(answers[0].refusals.size(), 1u);
  EXPECT_EQ(answers[0].refusals[0].kind, FindingKind::kUnsolved);
  EXPECT_EQ(answers[0].refusals[0].primitive, Primitive::kPll);
  EXPECT_EQ(answers[0].refusals[0].text,
            "Could not obtain valid VCO, M and D values with the given input freqs and the "
            "requested frequency.");
}

TEST_F(AskTest, DoesNotAskForMoreThanAPrimitiveHas) {
  const auto inputs = Ask(Wanted({100, 50}, {Out(100)}), Primitive::kKruSp);
  ASSERT_EQ(inputs.size(), 1u);
  ASSERT_EQ(inputs[0].refusals.size(), 1u);
  EXPECT_EQ(inputs[0].refusals[0].kind, FindingKind::kTooManyInputs);
  const auto outputs =
      Ask(Wanted({100}, std::vector<planner::Output>(7, Out(100))), Primitive::kKruClkgen);
  EXPECT_EQ(outputs[0].refusals[0].kind, FindingKind::kTooManyOutputs);
}

TEST_F(AskTest, IsOnlyForWhatTheDeviceHas) {
  planner::Device device = device_;
  device.primitives = {Primitive::kPll};
  EXPECT_THROW(planner::engine::Ask(Wanted({100}, {Out(100)}), device, Primitive::kTsyn),
               std::invalid_argument);
}

std::vector<KruSettings> KruSettingsOf(const std::vector<Answer>& answers) {
  std::vector<KruSettings> settings;
  for (const Answer& answer : answers) {
    settings.push_back(std::get<KruSettings>(answer.settings));
  }
  return settings;
}

// The engine has no phase of -90, which is 270, and no rest that 10.1 and 100.1 share.
TEST_F(AskTest, FindsThePhasesOfAKru) {
  EXPECT_THAT(KruSettingsOf(Ask(Wanted({100}, {Out(100, -90), Out(100)}), Primitive::kKruSp)),
              testing::Contains(KruSettings{.feedback = true,
                                            .pins = {Pin::kClk270, Pin::kClk0}}));
  const Answer answer = [&] {
    Request request = Wanted({100}, {Out(100, Rational(101, 10)), Out(100, Rational(1001, 10))});
    request.feedback = true;
    return One(request, Primitive::kKruSp);
  }();
  EXPECT_TRUE(answer.within);
  EXPECT_EQ(std::get<KruSettings>(answer.settings),
            (KruSettings{.feedback = true, .phase_shift = 7, .pins = {Pin::kClk0, Pin::kClk90}}));
  EXPECT_EQ(answer.outputs[0].phase, Rational(168, 17));
}

// 150 MHz come from CLKFX, with feedback and without.
TEST_F(AskTest, DoesNotTellOfAFeedbackThatChangesNothing) {
  const auto answers = Ask(Wanted({100}, {Out(150)}), Primitive::kKruSp);
  ASSERT_EQ(answers.size(), 1u);
  EXPECT_EQ(std::get<KruSettings>(answers[0].settings),
            (KruSettings{.m = 3, .d = 2, .pins = {Pin::kClkfx}}));
  EXPECT_EQ(answers[0].source.variant, "no feedback");
  // 100 MHz come from CLK0, and without feedback from CLKFX.
  EXPECT_EQ(Ask(Wanted({100}, {Out(100)}), Primitive::kKruSp).size(), 2u);
}

// Two outputs 10 and 20 degrees cannot both be had: the best of the tries.
TEST_F(AskTest, TakesTheBestOfTheTriesOfAKru) {
  const Answer answer =
      One(Wanted({100}, {Out(100, 10), Out(100, 20)}), Primitive::kKruSp);
  EXPECT_FALSE(answer.solved);
  EXPECT_EQ(answer.refusals[0].text,
            "The KRU_SP cannot support the requested output frequencies and phases.");
}

TEST_F(AskTest, TracesOnRequestOnly) {
  const Request request = Wanted({100}, {Out(200)});
  testing::internal::CaptureStdout();
  Ask(request, Primitive::kPll);
  EXPECT_EQ(testing::internal::GetCapturedStdout(), "");
  testing::internal::CaptureStdout();
  planner::engine::AskOne(request, device_, Primitive::kPll, {}, true);
  EXPECT_EQ(testing::internal::GetCapturedStdout().substr(0, 52),
            "DLL- starting to calculate min power output frequenc");
}

// Whatever is asked: the engine's complaints go to standard error, and there are none.
TEST_F(AskTest, LeavesStandardErrorAlone) {
  const std::vector<Request> requests = {
      Wanted({100}, {Out(200), Out({}), Out(50, 90, 30)}),
      Wanted({Rational(1, 1000)}, {Out(Rational(1, 1000000))}),
      Wanted({1000000}, {Out(1000000)}),
      Wanted({27, Rational(26999, 1000)}, {Out(Rational(297, 2), -90)}),
  };
  const auto files = planner::device::HostFiles(
      ::Device::DeviceCatalogue::ListFolders({BUNDLED_DEVICES}));
  const planner::device::Catalogue catalogue(*files);
  std::vector<planner::Device> devices = {device_};  // which has no coefficients
  for (const std::string& name : files->Names()) devices.push_back(catalogue.FindDevice(name));
  testing::internal::CaptureStderr();
  std::size_t answers = 0;
  for (const planner::Device& device : devices) {
    for (const Primitive primitive : device.primitives) {
      for (const Request& request : requests) {
        answers += planner::engine::Ask(request, device, primitive).size();
      }
    }
  }
  EXPECT_EQ(testing::internal::GetCapturedStderr(), "");
  EXPECT_GT(answers, 40u);
}

}  // namespace
