// The words of a command, taken apart into options and others.
//
// Options are `--name value`, `--name=value`, `--name` for a switch, and `-o value`; behind "--"
// there are none. CLI::App holds the options that there are and what was given for them; the words
// are walked here, because it would take `-out 50` as `-o ut`, take an option for the value of the
// one before it, pass over the empty value of `--in=`, and tell mistakes as sentences only.
//
// A value with a unit can come as several words, as a shell makes them of `27 MHz` and of
// `148.5, 74.25, 27`. So can a list without commas, `148.5 74.25`, which is then refused as one.
//
// Tested by words.test and wrong.test.
#ifndef VORKEL_CLI_WORDS_H_
#define VORKEL_CLI_WORDS_H_

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "planner/read/Options.h"

namespace cli {

struct Given {
  std::vector<planner::read::Option> options;  // in the order of the words, each once
  std::vector<std::string> operands;

  // The value of an option, nothing when it was not given.
  std::optional<std::string> Value(std::string_view name) const;
  bool Has(std::string_view name) const { return Value(name).has_value(); }
};

// Throws Failure for what the command does not take. At most so many operands are allowed.
Given ReadWords(std::string_view command, const std::vector<std::string>& words,
                std::size_t most_operands = 0);

}  // namespace cli

#endif  // VORKEL_CLI_WORDS_H_
