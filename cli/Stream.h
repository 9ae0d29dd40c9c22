// Output that is written piece by piece, for more than fits into memory.
//
// A file appears under its name when all of it is on the disk. Until then it stands beside that
// under another name: one of its own, gone when something goes wrong, or FILE.part, which is kept
// so that another run can go on with it.
//
// Tested by batch.test and reach.test.
#ifndef VORKEL_CLI_STREAM_H_
#define VORKEL_CLI_STREAM_H_

#include <optional>
#include <string>
#include <string_view>

namespace cli {

class Stream {
 public:
  enum class Draft { kDropped, kKept };
  // What an earlier run has left: so much of a file is right.
  struct Left {
    std::string path;
    long long size = 0;
  };

  // To the file of -o, or to standard output when its name is empty or "-". Throws Failure, so does
  // all else.
  Stream(const std::string& name, Draft draft, const std::optional<Left>& left = std::nullopt);
  ~Stream();
  Stream(const Stream&) = delete;
  Stream& operator=(const Stream&) = delete;

  // False: nobody reads standard output any more.
  bool Write(std::string_view text);
  // To be called when all is written.
  void Finish();

  // Where a run leaves what it has written until it is finished.
  static std::string PathOfLeft(const std::string& target);

 private:
  void OpenDraft(Draft draft, const std::optional<Left>& left);

  std::string name_;    // as the user has written it; empty: standard output
  std::string target_;  // behind links
  std::string draft_;   // empty: there is none
  bool is_kept_ = false;
  int descriptor_ = -1;
};

}  // namespace cli

#endif  // VORKEL_CLI_STREAM_H_
