// The words of script calls, against a model of the handles (tests/model/). A line of an input is
// a step of a script; its words are apart by tabs:
//
//     +0                    makes the handle 0
//     =0 name           renames it
//     -0                    destroys it
//     0 SetDevice vk40        calls it

#include <cstdlib>

#include "fuzz/Fuzz.h"
#include "tests/model/Session.h"

namespace {

using model::Step;

constexpr std::size_t kMostSteps = 25;

// Control characters and what is no ASCII are shown in messages as the host shows them.
bool IsPlain(std::string_view text) {
  for (const char letter : text) {
    if (letter != '\n' && letter != '\t' && (letter < ' ' || letter > '~')) return false;
  }
  return true;
}

// A name that no command of Tcl has.
std::string NameOf(const std::string& word) {
  std::string name = "clock_";
  for (const char letter : word) {
    if ((letter >= 'a' && letter <= 'z') || (letter >= '0' && letter <= '9')) name += letter;
  }
  return name;
}

Step StepOf(const std::string& line) {
  model::Words words = fuzz::Split(line, '\t');
  std::string handle = words.front();
  words.erase(words.begin());
  Step step;
  if (handle.starts_with('+')) step.kind = Step::Kind::kCreate;
  if (handle.starts_with('-')) step.kind = Step::Kind::kDestroy;
  if (handle.starts_with('=')) step.kind = Step::Kind::kRename;
  if (step.kind != Step::Kind::kCall) handle.erase(0, 1);
  step.handle = static_cast<int>(std::strtol(handle.c_str(), nullptr, 10)) & 3;
  if (step.kind == Step::Kind::kRename) words = {NameOf(words.empty() ? "" : words.front())};
  if (step.kind == Step::Kind::kCall || step.kind == Step::Kind::kRename) step.words = words;
  return step;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static const bool are_devices_found =
      setenv("VORKEL_DEVICES", VORKEL_SOURCE_DIR "/devices", 1) == 0;
  if (!are_devices_found) return -1;
  const std::string_view text = fuzz::TextOf(data, size);
  // The names of handles differ from run to run, and are not compared.
  if (!IsPlain(text) || text.find("::Script::handle") != std::string_view::npos) return -1;
  model::Steps steps = {{Step::Kind::kCreate, 0, {}}};
  for (const std::string& line : fuzz::Split(text, '\n')) {
    if (steps.size() < kMostSteps && !line.empty()) steps.push_back(StepOf(line));
  }
  const auto difference = model::Play(steps, [] { return std::make_unique<model::World>(); });
  if (difference) fuzz::Found(difference->line + ": " + difference->text);
  return 0;
}
