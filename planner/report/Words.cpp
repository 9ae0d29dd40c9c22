// Tested by table_test.cpp.
#include "planner/report/Words.h"

#include <cstddef>

namespace planner::report {

std::string Join(const std::vector<std::string>& words, std::string_view separator) {
  std::string text;
  for (std::size_t i = 0; i < words.size(); ++i) {
    if (i > 0) text += separator;
    text += words[i];
  }
  return text;
}

std::string Enumerated(const std::vector<std::string>& words, std::string_view last) {
  if (words.size() < 2) return Join(words, "");
  const std::vector<std::string> first(words.begin(), words.end() - 1);
  return Join(first, ", ") + " " + std::string(last) + " " + words.back();
}

std::string Outputs(const std::vector<int>& indices) {
  std::vector<std::string> words;
  for (const int index : indices) words.push_back(std::to_string(index));
  return (indices.size() > 1 ? "outputs " : "output ") + Enumerated(words);
}

}  // namespace planner::report
