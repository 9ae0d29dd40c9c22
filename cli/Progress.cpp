#include "cli/Progress.h"

#include "cli/Output.h"

namespace cli {

namespace {

// To the beginning of the line, and away with what stands there.
constexpr const char* kAfresh = "\r\x1b[K";

}  // namespace

bool Progress::IsDue() {
  constexpr std::chrono::milliseconds kBetween(200);
  if (!is_enabled_) return false;
  const auto now = std::chrono::steady_clock::now();
  if (now < next_) return false;
  next_ = now + kBetween;
  return true;
}

void Progress::Show(const std::string& text) {
  WriteError(kAfresh + text);
  is_shown_ = true;
}

void Progress::Clear() {
  if (is_shown_) WriteError(kAfresh);
  is_shown_ = false;
}

}  // namespace cli
