#include "plain_lists.h"

#include <cstddef>
#include <cstdlib>
#include <optional>

namespace plain {
namespace {

constexpr const char* kWhiteSpace = " \t\n\v\f\r";

// Takes the next word from `text` at `position`, which moves behind it. Only the blank separates
// words: a tab belongs to the word that it stands in.
std::optional<std::string> NextWord(const std::string& text, std::size_t& position) {
  const std::size_t begin = text.find_first_not_of(' ', position);
  if (begin == std::string::npos) return std::nullopt;
  std::size_t end = text.find(' ', begin);
  if (end == std::string::npos) end = text.size();
  position = end;
  return text.substr(begin, end - begin);
}

std::string Trimmed(const std::string& word) {
  const std::size_t first = word.find_first_not_of(kWhiteSpace);
  if (first == std::string::npos) return "";
  const std::size_t last = word.find_last_not_of(kWhiteSpace);
  return word.substr(first, last - first + 1);
}

}  // namespace

bool ParseList(const std::string& text, int count, int slots, double* list) {
  if (text.empty() || count < 1 || count > slots) return false;
  std::size_t position = 0;
  for (int i = 0; i < count; ++i) {
    const std::optional<std::string> word = NextWord(text, position);
    if (!word) return false;
    list[i] = std::strtod(Trimmed(*word).c_str(), nullptr);
  }
  return true;
}

}  // namespace plain
