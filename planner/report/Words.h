// Parts of sentences.
#ifndef VORKEL_PLANNER_REPORT_WORDS_H_
#define VORKEL_PLANNER_REPORT_WORDS_H_

#include <string>
#include <string_view>
#include <vector>

namespace planner::report {

// "a, b, c", with any separator.
std::string Join(const std::vector<std::string>& words, std::string_view separator);

// "a", "a and b", "a, b and c"; `last` is the word before the last one.
std::string Enumerated(const std::vector<std::string>& words, std::string_view last = "and");

// "output 1", "outputs 1, 2 and 3".
std::string Outputs(const std::vector<int>& indices);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_WORDS_H_
