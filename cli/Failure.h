// How a command ends when it does not end well.
#ifndef VORKEL_CLI_FAILURE_H_
#define VORKEL_CLI_FAILURE_H_

#include <exception>
#include <string>
#include <utility>
#include <vector>

namespace cli {

// The exit statuses. 5 is that of a set-up that fails, which is the script's.
inline constexpr int kDone = 0;
inline constexpr int kUnsolved = 1;
inline constexpr int kWrong = 2;  // wrong usage, or a file that cannot be read or written
inline constexpr int kOff = 3;
inline constexpr int kFailed = 4;

// Ends a command. What it has to say goes to standard error.
class Failure : public std::exception {
 public:
  // The text as it stands.
  Failure(int status, std::string text) : status_(status), text_(std::move(text)) {}

  // Sentences about what the user has said, a line each with the program's name before it. Where
  // the words were wrong, a line shows how the command is used.
  static Failure OfUsage(const std::vector<std::string>& reasons, bool words_were_wrong = true) {
    Failure failure(kWrong, "");
    for (const std::string& reason : reasons) failure.text_ += "vorkel: " + reason + "\n";
    failure.shows_usage_ = words_were_wrong;
    return failure;
  }
  static Failure OfUsage(std::string reason, bool words_were_wrong = true) {
    return OfUsage(std::vector<std::string>{std::move(reason)}, words_were_wrong);
  }

  const char* what() const noexcept override { return text_.c_str(); }
  int status() const { return status_; }
  const std::string& text() const { return text_; }
  bool shows_usage() const { return shows_usage_; }

 private:
  int status_;
  std::string text_;
  bool shows_usage_ = false;
};

}  // namespace cli

#endif  // VORKEL_CLI_FAILURE_H_
