// Tested by requests.test.
#include "tcl/Given.h"

#include <algorithm>

#include "planner/read/Options.h"
#include "planner/read/RequestTree.h"
#include "planner/read/Shown.h"
#include "planner/report/PartText.h"
#include "tcl/Failure.h"
#include "tcl/Folders.h"
#include "tcl/Objects.h"
#include "tcl/RequestTree.h"

namespace tcl {

namespace {

using planner::read::Draft;
using planner::read::Mistake;
using planner::read::MistakeKind;
using planner::read::Mistakes;
using planner::read::Option;
using planner::read::OptionFacts;
using std::string;

constexpr const char* kUsualDevice = "vk40";
constexpr int kMostCount = 1'000'000;

// A dash and a letter: "-90" is a phase.
bool IsOption(const string& word) {
  const std::size_t first = word.starts_with("--") ? 2 : 1;
  return word.size() > first && word[0] == '-' &&
         ((word[first] >= 'a' && word[first] <= 'z') || (word[first] >= 'A' && word[first] <= 'Z'));
}

class Reader {
 public:
  Reader(Words words, std::initializer_list<std::string_view> own) : words_(words), own_(own) {}

  Given Read() {
    Draft draft;
    if (!words_.empty() && !IsOption(Text(words_.front()))) {
      draft = planner::read::ReadTree(TreeOf(words_.front()), "", planner::read::Naming::kEntries,
                                      &mistakes_);
      place_ = 1;
    }
    while (place_ < words_.size()) ReadOption();
    const Draft options = planner::read::ReadOptions(options_, &mistakes_);
    if (!mistakes_.empty()) throw Failure::OfMistakes(mistakes_);
    given_.draft = planner::read::Over(options, draft);
    return std::move(given_);
  }

 private:
  void ReadOption() {
    const string word = Text(words_[place_]);
    if (!IsOption(word)) {
      throw Failure::OfUsage("no_option", word,
                             "\"" + planner::read::Shown(word) + "\" is no option");
    }
    ++place_;
    const string name = word.substr(word.starts_with("--") ? 2 : 1);
    if (std::find(own_.begin(), own_.end(), name) != own_.end()) {
      given_.own[name] = Value(word);
      return;
    }
    const OptionFacts* const facts = planner::read::FindOption("--" + name);
    if (facts == nullptr) return Unknown(word);
    if (facts->placeholder.empty()) return ReadSwitch("--" + name);
    Tcl_Obj* const value = Value(word);
    options_.push_back({"--" + name, facts->is_list ? WithCommas(value) : Text(value)});
  }

  // Any boolean of Tcl, or nothing.
  void ReadSwitch(const string& name) {
    string value;
    if (place_ < words_.size() && !IsOption(Text(words_[place_]))) {
      const auto truth = Boolean(words_[place_]);
      value = truth ? *truth ? "1" : "0" : Text(words_[place_]);
      ++place_;
    }
    options_.push_back({name, value});
  }

  Tcl_Obj* Value(const string& option) {
    if (place_ == words_.size()) {
      throw Failure::OfUsage("value_missing", option, option + ": the value is missing");
    }
    return words_[place_++];
  }

  void Unknown(const string& word) {
    Mistake mistake;
    mistake.kind = MistakeKind::kUnknownOption;
    mistake.text = word;
    for (const OptionFacts& facts : planner::read::RequestOptions()) {
      mistake.known.push_back(string(facts.name.substr(1)));
    }
    for (const std::string_view name : own_) mistake.known.push_back("-" + string(name));
    mistakes_.push_back(std::move(mistake));
    // Its value is no other option.
    if (place_ < words_.size() && !IsOption(Text(words_[place_]))) ++place_;
  }

  const Words words_;
  const std::vector<std::string_view> own_;
  std::size_t place_ = 0;
  std::vector<Option> options_;
  Mistakes mistakes_;
  Given given_;
};

}  // namespace

planner::Device DeviceOf(const planner::read::Reading& reading) {
  try {
    const auto files = DeviceFiles();
    planner::Device device = planner::device::Catalogue(*files).FindDevice(
        reading.device ? reading.device->value : kUsualDevice);
    const auto& primitive = reading.request.primitive;
    if (device.primitives.empty()) {
      throw Failure::OfUsage("no_primitive", device.part, planner::report::LacksAllText(device));
    }
    if (primitive && !device.Has(*primitive)) {
      throw Failure::OfUsage("no_primitive", device.part,
                             planner::report::LacksText(device, *primitive));
    }
    return device;
  } catch (const planner::device::PartError& error) {
    throw Failure::OfPart(error);
  }
}

std::size_t Given::Count(std::string_view name, std::size_t lowest, std::size_t usual) const {
  const auto found = own.find(name);
  if (found == own.end()) return usual;
  int count = 0;
  if (Tcl_GetIntFromObj(nullptr, found->second, &count) == TCL_OK && count >= 0 &&
      static_cast<std::size_t>(count) >= lowest && count <= kMostCount) {
    return static_cast<std::size_t>(count);
  }
  const string text = Text(found->second);
  throw Failure::OfUsage("must_be", text,
                         "-" + string(name) + ": \"" + planner::read::Shown(text) +
                             "\" must be a whole number from " + std::to_string(lowest) + " to " +
                             std::to_string(kMostCount));
}

Given ReadDraft(Words words, std::initializer_list<std::string_view> own) {
  return Reader(words, own).Read();
}

Given ReadGiven(Words words, std::initializer_list<std::string_view> own) {
  Given given = ReadDraft(words, own);
  Mistakes mistakes;
  auto reading = planner::read::Finish(given.draft, {}, &mistakes);
  if (!reading) throw Failure::OfMistakes(mistakes);
  given.reading = std::move(*reading);
  given.device = DeviceOf(given.reading);
  return given;
}

}  // namespace tcl
