#include "cli/Words.h"

#include <fmt/format.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <utility>

#include "cli/Failure.h"
#include "cli/Options.h"
#include "planner/read/Letters.h"
#include "planner/read/Shown.h"
#include "planner/read/Units.h"

namespace cli {

namespace {

using planner::read::Shown;

class Reader {
 public:
  Reader(std::string_view command, const std::vector<std::string>& words)
      : command_(command), words_(words) {
    app_.set_help_flag();
    for (const OptionRow* row : OptionsOf(command)) {
      const std::string name(row->name);
      CLI::Option* option = row->placeholder.empty() ? app_.add_flag(name) : app_.add_option(name);
      option->type_name(std::string(row->placeholder));
    }
  }

  Given Read() {
    while (next_ < words_.size()) {
      const std::string& word = words_[next_++];
      if (word == "--") {
        given_.operands.insert(given_.operands.end(), words_.begin() + Offset(next_), words_.end());
        break;
      }
      if (word.size() < 2 || word.front() != '-') {
        given_.operands.push_back(word);
      } else {
        Take(word);
      }
    }
    return std::move(given_);
  }

 private:
  static std::ptrdiff_t Offset(std::size_t place) { return static_cast<std::ptrdiff_t>(place); }

  void Take(const std::string& word) {
    const std::size_t equals = word.compare(0, 2, "--") == 0 ? word.find('=') : std::string::npos;
    const std::string name = word.substr(0, equals);
    CLI::Option* option = app_.get_option_no_throw(name);
    if (!option) Unknown(name);
    if (option->count() > 0) throw Failure::OfUsage(fmt::format("{} is given twice", name));
    const bool is_switch = option->get_items_expected_max() == 0;
    std::string value = "1";
    if (equals != std::string::npos) {
      if (is_switch) throw Failure::OfUsage(fmt::format("{} takes no value", name));
      value = word.substr(equals + 1);
    } else if (!is_switch) {
      value = NextValue(name, option->get_type_name());
    }
    if (!is_switch) AddWords(name, &value);
    option->add_result(value);
    given_.options.push_back({name, value});
  }

  // A value may begin with a dash, as a phase does, but an option is not a value.
  std::string NextValue(const std::string& name, const std::string& placeholder) {
    if (next_ == words_.size() || words_[next_].compare(0, 2, "--") == 0) {
      throw Failure::OfUsage(fmt::format("{0} needs a value: {0} {1}", name, placeholder));
    }
    return words_[next_++];
  }

  // Adds the words behind a value that belong to it.
  void AddWords(const std::string& name, std::string* value) {
    const std::optional<ValueFacts> facts = ValueOf(name);
    if (!facts) return;
    while (next_ < words_.size() && Belongs(*value, words_[next_], *facts)) {
      *value += " " + words_[next_++];
    }
  }

  static bool Belongs(std::string_view value, std::string_view word, const ValueFacts& facts) {
    value = planner::read::Trimmed(value);
    if (value.empty() || word.empty()) return false;
    const std::string_view unit = word.substr(0, word.find(','));
    if (planner::read::IsDigit(value.back()) && planner::read::IsUnit(unit, facts.kind)) {
      return true;
    }
    if (!facts.is_list) return false;
    if (word.front() == ',') return true;
    // Blanks for commas: the reader of the list tells what to write.
    if (value.back() != ',') return IsValue(word, facts.kind);
    // The next entry: a number, or "-" for nothing, but no option.
    return word.front() != '-' || word.size() == 1 || word[1] == ',' || word[1] == '.' ||
           planner::read::IsDigit(word[1]);
  }

  static bool IsValue(std::string_view word, planner::read::ValueKind kind) {
    planner::read::Mistakes mistakes;
    return planner::read::ReadValue(word, kind, {}, &mistakes).has_value();
  }

  // Another command may have the option.
  [[noreturn]] void Unknown(const std::string& name) {
    const std::vector<std::string> takers = TakersOf(name);
    if (!takers.empty()) {
      const std::string_view reason = ReasonAgainst(command_, name);
      throw Failure::OfUsage(fmt::format("option {} is not of the command {}; it is of {}{}{}",
                                         name, command_, planner::read::Enumerated(takers),
                                         reason.empty() ? "" : ": ", reason));
    }
    const bool is_letter_and_more = name.size() > 2 && name[1] != '-';
    CLI::Option* option =
        is_letter_and_more ? app_.get_option_no_throw(name.substr(0, 2)) : nullptr;
    if (option) {
      throw Failure::OfUsage(fmt::format("unknown option {}; a value stands apart: {} {}",
                                         Shown(name), name.substr(0, 2), option->get_type_name()));
    }
    std::vector<std::string> known;
    for (const OptionRow* row : OptionsOf(command_)) known.emplace_back(row->name);
    std::string meant = planner::read::DidYouMean(name, known);
    if (meant.empty()) meant = DidYouMeanItsBeginning(name, known);
    throw Failure::OfUsage(fmt::format("unknown option {}{}", Shown(name), meant));
  }

  // "--in" for "--input" and "--out" for "--outputs".
  static std::string DidYouMeanItsBeginning(const std::string& name,
                                            const std::vector<std::string>& known) {
    constexpr std::size_t kShortest = 4;
    std::string longest;
    for (const std::string& one : known) {
      const bool begins = one.size() >= kShortest && name.compare(0, one.size(), one) == 0;
      if (begins && one.size() > longest.size()) longest = one;
    }
    return longest.empty() ? "" : "; did you mean " + longest + "?";
  }

  std::string_view command_;
  const std::vector<std::string>& words_;
  std::size_t next_ = 0;
  CLI::App app_;
  Given given_;
};

// What to write for a word that is no option: a frequency without --in is the input's.
std::string Meant(std::string_view command, const Given& given, const std::string& word) {
  planner::read::Mistakes mistakes;
  const bool is_frequency =
      planner::read::ReadValue(word, planner::read::ValueKind::kFrequency, {}, &mistakes)
          .has_value();
  if (!is_frequency || given.Has("--in") || !Takes(command, "--in")) return "";
  return fmt::format("; did you mean --in {}?", Shown(word));
}

}  // namespace

std::optional<std::string> Given::Value(std::string_view name) const {
  for (const planner::read::Option& option : options) {
    if (option.name == name) return option.value;
  }
  return std::nullopt;
}

Given ReadWords(std::string_view command, const std::vector<std::string>& words,
                std::size_t most_operands) {
  Given given = Reader(command, words).Read();
  if (given.operands.size() > most_operands) {
    const std::string& word = given.operands[most_operands];
    throw Failure::OfUsage(
        fmt::format("unexpected word \"{}\"{}", Shown(word), Meant(command, given, word)));
  }
  return given;
}

}  // namespace cli
