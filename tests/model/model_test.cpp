// The package against a model of it, on random scripts.
//
// A script is drawn from its number; a difference names that, and what is left of the script when
// everything is taken away that the difference does not need, as a file of tcltest. Such files are
// kept in tests/model/. VORKEL_TEST_LONG in the environment asks for many more scripts.

#include <gtest/gtest.h>

#include <cstdlib>
#include <map>
#include <memory>

#include "tests/host/device_folder.h"
#include "tests/model/ScriptGenerator.h"
#include "tests/model/Shrink.h"

// Implementation objects live until the process ends; the leak checker need not tell.
extern "C" const char* __asan_default_options() { return "detect_leaks=0"; }

namespace model {
namespace {

constexpr int kStepsOfScript = 60;
// In the long run one of so many scripts has a search that goes far.
constexpr int kScriptsOfFar = 50;
// The plain search takes many times as long under the sanitizers.
#ifdef __SANITIZE_ADDRESS__
constexpr int kScripts = 20;
#else
constexpr int kScripts = 60;
#endif

std::unique_ptr<World> PlainWorld() { return std::make_unique<World>(); }

// A script and its devices.
struct Script {
  std::vector<DrawnDevice> devices;
  Steps steps;
};

std::map<std::string, std::string> FilesOf(const Script& script) {
  std::map<std::string, std::string> files;
  for (const DrawnDevice& device : script.devices) files[device.name] = device.file;
  return files;
}

// What the scripts have met.
struct Tally {
  std::map<std::string, int> methods;
  int steps = 0;
  int far_left = 0;  // how many may yet go far
};

// Draws a script step by step and runs it on the way. What differs, if anything does.
std::optional<Difference> RunDrawn(int number, Tally* tally, Script* script) {
  compare::Random random(static_cast<std::uint64_t>(number) + 1);
  script->devices = DrawDevices(2, random);
  const DeviceFolder folder;
  const SearchPath path(folder.path());
  for (const auto& [device, text] : FilesOf(*script)) folder.Write(device + ".toml", text);
  ScriptGenerator generator(random, script->devices);
  Session session(PlainWorld());
  Step step{Step::Kind::kCreate, 0, {}};
  while (static_cast<int>(script->steps.size()) < kStepsOfScript) {
    const bool is_far = session.world().GoesFar(step);
    if (!is_far || (step.words.back() != "true" && tally->far_left-- > 0)) {
      script->steps.push_back(step);
      if (auto difference = session.Run(step)) return difference;
      ++tally->steps;
      if (step.kind == Step::Kind::kCall && !step.words.empty()) {
        ++tally->methods[step.words.front()];
      }
    }
    step = generator.Draw();
  }
  return std::nullopt;
}

std::string Report(int number, const Script& script, const Difference& difference) {
  const DeviceFolder folder;
  const SearchPath path(folder.path());
  const auto files = FilesOf(script);
  for (const auto& [device, text] : files) folder.Write(device + ".toml", text);
  const Steps fewer = Shrunk(script.steps, PlainWorld);
  return "script " + std::to_string(number) + ", step " + std::to_string(difference.step) + ": " +
         difference.line + ": " + difference.text + "\n" +
         TclTest("script-" + std::to_string(number), fewer, PlainWorld, files);
}

TEST(ModelTest, ThePackageAnswersAsTheModel) {
  const bool is_long = std::getenv("VORKEL_TEST_LONG") != nullptr;
  const int scripts = is_long ? 20000 : kScripts;
  Tally tally;
  int differences = 0;
  for (int number = 0; number < scripts && differences < 3; ++number) {
    Script script;
    tally.far_left = is_long && number % kScriptsOfFar == 0 ? 1 : 0;
    if (const auto difference = RunDrawn(number, &tally, &script)) {
      ++differences;
      ADD_FAILURE() << Report(number, script, *difference);
    }
    if (is_long && number % 500 == 499) {
      std::printf("%d scripts, %d steps\n", number + 1, tally.steps);
      std::fflush(stdout);
    }
  }
  if (!is_long) std::printf("%d scripts, %d steps\n", scripts, tally.steps);
  // All methods were called, and those that calculate often.
  int methods = 0;
  for (const auto& [name, count] : tally.methods) methods += count > scripts / 20 ? 1 : 0;
  EXPECT_GE(methods, 40);
}

// A model that is wrong in one thing: it takes the M of a PLL for gone when a KRU has been asked for
// something on the same handle.
class ForgetfulWorld : public World {
 public:
  Answer Expect(const Step& step) override {
    Answer answer = World::Expect(step);
    if (step.kind == Step::Kind::kCreate) asked_.erase(step.handle);
    if (step.kind != Step::Kind::kCall || step.words.empty() || !answer.is_ok) return answer;
    const std::string& name = step.words.front();
    if (name == "KruCalculateActuals") asked_[step.handle] = true;
    if (name == "PLLCalculateActualOutFreqs") asked_[step.handle] = false;
    if (name == "GetChosenM" && asked_[step.handle]) answer.text = "0.000";
    return answer;
  }

 private:
  std::map<int, bool> asked_;
};

// A script with all that the mistake needs, and much beside it.
Steps LongScript() {
  const auto call = [](int handle, Words words) {
    return Step{Step::Kind::kCall, handle, std::move(words)};
  };
  Steps steps;
  for (int handle : {0, 1, 2}) steps.push_back({Step::Kind::kCreate, handle, {}});
  for (int handle : {0, 1, 2}) steps.push_back(call(handle, {"SetDevice", "vk40"}));
  for (int handle : {2, 1}) {
    steps.push_back(call(handle, {"SetLowBandwidth", "true"}));
    steps.push_back(call(handle, {"PLLCalculateActualOutFreqs", "150 75 50", "100", "0", "3",
                                  "false", "false", "true"}));
    steps.push_back(call(handle, {"GetChosenVCO"}));
  }
  steps.push_back({Step::Kind::kRename, 1, {"clock1"}});
  for (int handle : {0, 1}) {
    steps.push_back(call(handle, {"KruCalculateActuals", "50 25", "0 0", "50", "2", "true",
                                  "true"}));
    steps.push_back(call(handle, {"GetKruChosenPinname", "1"}));
  }
  for (int handle : {0, 1, 2}) steps.push_back(call(handle, {"GetChosenM"}));
  steps.push_back({Step::Kind::kDestroy, 1, {}});
  return steps;
}

const NewWorld kForgetful = [] { return std::make_unique<ForgetfulWorld>(); };

// 150 MHz from 100 take an M of 9 and a D of 2 for a VCO of 450 MHz, the smallest; without the device
// nothing is solved, and without the request to a KRU, which need not be one, nothing is forgotten.
TEST(ModelTest, ADifferenceIsShrunk) {
  const Steps steps = LongScript();
  EXPECT_FALSE(Play(steps, PlainWorld));
  const auto difference = Play(steps, kForgetful);
  ASSERT_TRUE(difference);
  EXPECT_EQ(difference->text, "\"9.000\", expected \"0.000\"");
  const Steps fewer = Shrunk(steps, kForgetful);
  std::vector<std::string> lines;
  for (const Step& step : fewer) lines.push_back(TextOf(step));
  const std::vector<std::string> expected = {
      "set h1 [Ip::Vorkel::Init]",
      "$h1 SetDevice vk40",
      "$h1 PLLCalculateActualOutFreqs 150 100 0 1 0 0 0",
      "$h1 KruCalculateActuals 0 0 0 1 0 0",
      "$h1 GetChosenM",
  };
  EXPECT_EQ(lines, expected);
}

// What is written of a difference fails as a test, and passes when the model is right.
TEST(ModelTest, ADifferenceReplays) {
  const Steps fewer = Shrunk(LongScript(), kForgetful);
  const std::string wrong = TclTest("forgetful", fewer, kForgetful);
  const std::string right = TclTest("right", fewer, PlainWorld);
  const DeviceFolder folder;
  const auto passes = [&](const std::string& text) {
    const std::string file = folder.Write("found.test", text);
    const std::string run =
        "env " VORKEL_TCL_ENVIRONMENT " tclsh8.6 " VORKEL_SOURCE_DIR
        "/tests/support/run_tcl_test.tcl " + file + " >" + folder.File("log") + " 2>&1";
    return std::system(run.c_str()) == 0;
  };
  EXPECT_TRUE(passes(right)) << right;
  EXPECT_FALSE(passes(wrong)) << wrong;
}

}  // namespace
}  // namespace model
