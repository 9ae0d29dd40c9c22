// Requests as options: pairs of a name and a value, as they come from the command line or from a
// dict of a script.
//
// Tested by options_test.cpp.
#ifndef VORKEL_PLANNER_READ_OPTIONS_H_
#define VORKEL_PLANNER_READ_OPTIONS_H_

#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "planner/read/Draft.h"

namespace planner::read {

// The options of a request.
struct OptionFacts {
  std::string_view name;          // "--in"
  std::string_view placeholder;   // of its value: "F[,F2]"; empty: a switch
  std::optional<ValueKind> kind;  // of values
  bool is_list = false;
};
std::span<const OptionFacts> RequestOptions();
// Nothing when there is no such option.
const OptionFacts* FindOption(std::string_view name);

// An option that was given. That a switch is set is said by the value "1", "true" or nothing;
// "0" and "false" say that it is not.
struct Option {
  std::string name;
  std::string value;
};

// Reads them. Each may be there once; a name that is no option of a request is a mistake.
Draft ReadOptions(std::span<const Option> options, Mistakes* mistakes);

// The options that say what a draft says, in the order of RequestOptions.
std::vector<Option> OptionsOf(const Draft& draft);
// The same of a request, without what is as by default.
std::vector<Option> OptionsOf(const Request& request);

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_OPTIONS_H_
