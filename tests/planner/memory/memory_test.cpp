// What the planner does when memory runs out: each allocation of each operation is refused in turn.
// The operation then throws std::bad_alloc, or does without; and the next one is as if nothing had
// been.
//
// The first allocations are refused one by one, later ones at growing distances; all of them with
// VORKEL_TEST_LONG in the environment.
//
// JSON is read here, and not written or verified: the library of its values allocates in their
// destructors, and so ends the process when memory runs out just there.
#include <gtest/gtest.h>

#include <cstdlib>
#include <exception>
#include <fstream>
#include <memory>
#include <new>
#include <ostream>
#include <sstream>
#include <string>

#include "host/bundled/device/DeviceCatalogue.h"
#include "planner/batch/Answerer.h"
#include "planner/device/Catalogue.h"
#include "planner/device/Check.h"
#include "planner/device/Files.h"
#include "planner/explain/Explain.h"
#include "planner/plan/Plan.h"
#include "planner/reach/Find.h"
#include "planner/read/MistakeText.h"
#include "planner/read/RequestJson.h"
#include "planner/read/RequestToml.h"
#include "planner/report/BatchText.h"
#include "planner/report/ExplainText.h"
#include "planner/report/PlanText.h"
#include "planner/report/Sdc.h"
#include "tests/support/RefusingAllocator.h"

namespace planner {
namespace {

using std::string;

std::unique_ptr<const device::Files> Bundled() {
  return device::HostFiles(::Device::DeviceCatalogue::ListFolders({BUNDLED_DEVICES}));
}

const Device& Vk40() {
  static const Device device = device::Catalogue(*Bundled()).FindDevice("vk40");
  return device;
}

Request VideoClocks() {
  Request request;
  request.inputs = {27};
  request.outputs.resize(2);
  request.outputs[0].frequency = {297, 2};
  request.outputs[1].frequency = {297, 4};
  request.outputs[1].phase = 90;
  return request;
}

string TextsOf(const read::Mistakes& mistakes) {
  string texts;
  for (const read::Mistake& mistake : mistakes) texts += TextOf(mistake) + "\n";
  return texts;
}

// --- The operations ----------------------------------------------------------------------------

string FromToml() {
  read::Mistakes mistakes;
  read::ReadToml("input = \"27 MHz\"\noutputs = [148.5, {frequency = \"74.25\", phase = 90}]\n"
                 "tolerance = \"one\"\nunknown = [1, {a = 'b'}]\n",
                 "request.toml", &mistakes);
  return TextsOf(mistakes);
}

string FromJson() {
  read::Mistakes mistakes;
  read::ReadJson(R"({"inputs": [27], "outputs": [148.5, {"frequency": "74.25", "phase": "x"}]})",
                 "request.json", &mistakes);
  return TextsOf(mistakes);
}

string FromDeviceFile() {
  static const string text = [] {
    std::ostringstream all;
    all << std::ifstream(string(BUNDLED_DEVICES) + "/vk40.toml").rdbuf();
    return all.str() + "\n[grade.odd]\nVCOCLK_FREQ_MIN = 'x'\n";
  }();
  return std::to_string(device::Check(text, "vk40.toml", "vk40").mistakes.size());
}

string FromCatalogue() { return device::Catalogue(*Bundled()).FindDevice("vk20").part; }

string PlanAndFormats() {
  const plan::Plan plan = plan::Make(VideoClocks(), Vk40());
  return report::PlanText(plan, Vk40(), 1, {}, {}) +
         report::Sdc(plan.request, Vk40(), plan.ranked.front());
}

string Explanation() {
  Request request;
  request.primitive = Primitive::kPll;
  request.inputs = {27};
  request.outputs.resize(2);
  request.outputs[0].frequency = {1123, 10};
  request.outputs[1].frequency = 99;
  return report::ExplainText(explain::Explain(request, Vk40(), {25}), Vk40(), {}, {}, true);
}

string ReachOfAnOutput() {
  const reach::Reach reach(VideoClocks(), Vk40(), Primitive::kPll, 0);
  return std::to_string(reach::Count(reach, {100, 101}).count);
}

struct Operation {
  const char* name;
  string (*run)();

  friend void PrintTo(const Operation& one, std::ostream* out) { *out << one.name; }
};

// The number of the next allocation to be refused.
int After(int number) {
  constexpr int kParts = 40;
  const bool is_long = std::getenv("VORKEL_TEST_LONG") != nullptr;
  return number + (is_long || number < 2 * kParts ? 1 : number / kParts);
}

class PlannerMemory : public testing::TestWithParam<Operation> {};

TEST_P(PlannerMemory, EachRefusalIsThrownOrDoneWithout) {
  const Operation& operation = GetParam();
  const string right = operation.run();
  ASSERT_FALSE(right.empty());
  int thrown = 0;
  for (int number = 0;; number = After(number)) {
    string answer;
    bool is_thrown = false;
    bool is_refused = false;
    {
      const RefuseAfter refuse(number);
      try {
        answer = operation.run();
      } catch (const std::bad_alloc&) {
        is_thrown = true;
      } catch (const std::exception& error) {
        // What the host throws in its place.
        is_thrown = string(error.what()) == "out of memory";
      }
      is_refused = Refusals() > 0;
    }
    if (!is_refused) break;
    thrown += is_thrown ? 1 : 0;
    if (!is_thrown) {
      ASSERT_EQ(answer, right) << "without allocation " << number;
    }
  }
  EXPECT_GT(thrown, 0);
  EXPECT_EQ(operation.run(), right);
}

INSTANTIATE_TEST_SUITE_P(
    Operations, PlannerMemory,
    testing::Values(Operation{"Toml", FromToml}, Operation{"Json", FromJson},
                    Operation{"DeviceFile", FromDeviceFile},
                    Operation{"Catalogue", FromCatalogue}, Operation{"Plan", PlanAndFormats},
                    Operation{"Explanation", Explanation}, Operation{"Reach", ReachOfAnOutput}),
    [](const testing::TestParamInfo<Operation>& one) { return string(one.param.name); });

// A batch goes on: the line has failed, and the next is answered.
TEST(BatchMemory, ALineThatHasNoMemoryHasFailed) {
  const auto files = Bundled();
  batch::Line line;
  line.number = 1;
  line.text = R"({"id": "a", "inputs": [27], "outputs": [148.5], "primitive": "PLL"})";
  const auto lines_of = [&](batch::Answerer* answerer) {
    return report::BatchLines(answerer->Answer(line), {});
  };
  batch::Answerer lasting({"some.jsonl", {}, "vk40"}, *files);
  const string right = lines_of(&lasting);
  int failed = 0;
  for (int number = 0;; number = After(number)) {
    batch::Answerer answerer({"some.jsonl", {}, "vk40"}, *files);
    batch::Outcome outcome;
    bool is_refused = false;
    {
      const RefuseAfter refuse(number);
      ASSERT_NO_THROW(outcome = answerer.Answer(line)) << "without allocation " << number;
      is_refused = Refusals() > 0;
    }
    if (!is_refused) break;
    if (outcome.status == batch::Status::kFailed) {
      ++failed;
    } else {
      ASSERT_EQ(report::BatchLines(outcome, {}), right) << "without allocation " << number;
    }
    ASSERT_EQ(lines_of(&answerer), right) << "after allocation " << number;
  }
  EXPECT_GT(failed, 0);
}

}  // namespace
}  // namespace planner
