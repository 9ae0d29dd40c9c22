// How far a long command is, on one line of a terminal that is written again and again.
//
// Tested by batch.test.
#ifndef VORKEL_CLI_PROGRESS_H_
#define VORKEL_CLI_PROGRESS_H_

#include <chrono>
#include <string>

namespace cli {

class Progress {
 public:
  // Does nothing unless it is enabled.
  explicit Progress(bool is_enabled) : is_enabled_(is_enabled) {}
  ~Progress() { Clear(); }
  Progress(const Progress&) = delete;
  Progress& operator=(const Progress&) = delete;

  // Whether it is time to show something new.
  bool IsDue();
  void Show(const std::string& text);
  void Clear();

 private:
  bool is_enabled_;
  bool is_shown_ = false;
  std::chrono::steady_clock::time_point next_{};
};

}  // namespace cli

#endif  // VORKEL_CLI_PROGRESS_H_
