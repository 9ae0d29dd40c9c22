#include "tests/model/Shrink.h"

#include <algorithm>

namespace model {

namespace {

class Shrinker {
 public:
  Shrinker(Steps steps, const NewWorld& new_world, bool far)
      : steps_(std::move(steps)), new_world_(new_world), far_(far) {}

  Steps Run() {
    for (std::size_t before = 0; before != steps_.size();) {
      before = steps_.size();
      for (std::size_t count = steps_.size(); count > 0; count /= 2) LeaveOut(count);
    }
    for (std::size_t i = 0; i < steps_.size(); ++i) {
      while (LeaveOutAnOutput(i)) {
      }
      ShortenWords(i);
    }
    return steps_;
  }

 private:
  // Takes the steps if they differ, too.
  bool Take(Steps steps) {
    if (steps.empty() || !Play(steps, new_world_, far_)) return false;
    steps_ = std::move(steps);
    return true;
  }

  // Leaves out so many steps in a row, wherever it can.
  void LeaveOut(std::size_t count) {
    for (std::size_t from = 0; from < steps_.size();) {
      Steps fewer(steps_.begin(), steps_.begin() + static_cast<std::ptrdiff_t>(from));
      const std::size_t rest = std::min(from + count, steps_.size());
      fewer.insert(fewer.end(), steps_.begin() + static_cast<std::ptrdiff_t>(rest), steps_.end());
      if (!Take(std::move(fewer))) from += count;
    }
  }

  // The last number of each list of a call, and one less where their number stands.
  bool LeaveOutAnOutput(std::size_t step) {
    Steps changed = steps_;
    std::size_t outputs = 0;
    for (std::string& word : changed[step].words) {
      const std::size_t last = word.rfind(' ');
      if (last == std::string::npos) continue;
      outputs = static_cast<std::size_t>(std::count(word.begin(), word.end(), ' ')) + 1;
      word.resize(last);
    }
    for (std::string& word : changed[step].words) {
      if (outputs > 0 && word == std::to_string(outputs)) word = std::to_string(outputs - 1);
    }
    return outputs > 0 && Take(std::move(changed));
  }

  // Words that say less, the plainest first.
  static Words Plainer(const std::string& word) {
    Words plainer;
    for (const char* candidate : {"0", "false"}) {
      if (word.size() > std::char_traits<char>::length(candidate)) plainer.emplace_back(candidate);
    }
    if (word != "0") plainer.emplace_back("0");
    const std::size_t last = word.rfind(' ');
    if (last != std::string::npos) plainer.push_back(word.substr(0, last));
    return plainer;
  }

  void ShortenWords(std::size_t step) {
    if (steps_[step].kind != Step::Kind::kCall) return;
    for (std::size_t word = 1; word < steps_[step].words.size(); ++word) {
      bool is_shorter = true;
      while (is_shorter) {
        is_shorter = false;
        const std::string now = steps_[step].words[word];
        for (const std::string& plainer : Plainer(now)) {
          Steps changed = steps_;
          changed[step].words[word] = plainer;
          is_shorter = plainer.size() < now.size() && Take(std::move(changed));
          if (is_shorter) break;
        }
      }
    }
  }

  Steps steps_;
  const NewWorld& new_world_;
  bool far_;
};

std::string LastOf(const std::string& name) { return name.substr(name.rfind('/') + 1); }

}  // namespace

Steps Shrunk(Steps steps, const NewWorld& new_world, bool far) {
  return Shrinker(std::move(steps), new_world, far).Run();
}

std::string TclTest(const std::string& name, const Steps& steps, const NewWorld& new_world,
                    const std::map<std::string, std::string>& devices) {
  std::string text = "source [file join $::env(VORKEL_SOURCE_DIR) tests/model/support.tcl]\n\n";
  for (const auto& [device, content] : devices) {
    text += "device " + List({device, content}) + "\n";
  }
  text += "test " + LastOf(name) + " {each line answers as it should} -body {\n  replay {\n";
  const std::unique_ptr<World> world = new_world();
  for (const Step& step : steps) {
    const Answer answer = world->Expect(step);
    // Of those that are not worked out only the status counts.
    text += "    " + List({TextOf(step), answer.is_ok ? "0" : "1",
                           answer.is_known ? answer.text : "*", answer.trace}) + "\n";
  }
  return text + "  }\n} -result {}\n\ncleanupTests\n";
}

}  // namespace model
