// Tested by lines_test.cpp.
#include "planner/batch/Lines.h"

#include <algorithm>
#include <utility>

#include "planner/read/Letters.h"

namespace planner::batch {

std::string Digest::Text(std::uint64_t value) {
  constexpr int kDigits = 16;
  constexpr const char* kDigit = "0123456789abcdef";
  std::string text(kDigits, '0');
  for (auto digit = text.rbegin(); digit != text.rend(); ++digit) {
    *digit = kDigit[value % kDigits];
    value /= kDigits;
  }
  return text;
}

bool Line::IsBlank() const { return !is_too_long && read::Trimmed(text).empty(); }

void Lines::Start() {
  line_ = {};
  digest_ = start_;
  has_begun_ = false;
}

void Lines::AddToLine(std::string_view piece) {
  has_begun_ = has_begun_ || !piece.empty();
  digest_.Add(piece);
  line_.size += piece.size();
  const std::size_t kept = std::min(piece.size(), most_ - line_.text.size());
  line_.text.append(piece.substr(0, kept));
  line_.is_too_long = line_.is_too_long || kept < piece.size();
}

Line Lines::Ended() {
  Line line = std::move(line_);
  line.number = ++count_;
  line.digest = digest_.Value();
  Start();
  return line;
}

}  // namespace planner::batch
