// Standard output that is closed, full, slow, in memory, or stands for another file.

#include "engine/StandardOutput.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <thread>

#include "tests/support/CaptureTrace.h"

namespace {

using Ip::kStandsForAnother;
using Ip::kWritten;
using Ip::WriteToStandardOutput;

std::string TextOf(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), {}};
}

// A process whose standard output a test closes and replaces: the number 1, as a script does it.
class StandardOutputTest : public testing::Test {
 protected:
  StandardOutputTest() {
    std::string name = std::filesystem::temp_directory_path() / "vorkel_output_XXXXXX";
    const int file = mkstemp(name.data());
    path_ = name;
    close(file);
    std::fflush(stdout);
    saved_ = fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, 3);
  }
  ~StandardOutputTest() override {
    dup2(saved_, STDOUT_FILENO);
    close(saved_);
    std::filesystem::remove(path_);
  }

  // Opens the file with the number of standard output, which is closed before.
  void OpenInItsPlace(int flags) {
    close(STDOUT_FILENO);
    EXPECT_EQ(open(path_.c_str(), O_WRONLY | O_TRUNC | flags), STDOUT_FILENO);
  }

  std::string path_;
  int saved_ = -1;
};

TEST_F(StandardOutputTest, TakesATextBehindWhatCHasPrinted) {
  OpenInItsPlace(0);
  std::printf("before ");
  EXPECT_EQ(WriteToStandardOutput("text"), kWritten);
  EXPECT_EQ(TextOf(path_), "before text");
  std::printf(" after");
  std::fflush(stdout);
  EXPECT_EQ(TextOf(path_), "before text after");
}

// As dup2 puts a file there, which is how a program catches what is printed.
TEST_F(StandardOutputTest, MayBeAnotherFileThanAtFirst) {
  const int file = open(path_.c_str(), O_WRONLY | O_TRUNC | O_CLOEXEC);
  ASSERT_EQ(dup2(file, STDOUT_FILENO), STDOUT_FILENO);
  close(file);
  EXPECT_EQ(WriteToStandardOutput("text"), kWritten);
  EXPECT_EQ(TextOf(path_), "text");
}

TEST_F(StandardOutputTest, IsNotAFileThatSomebodyHasOpenedForHimself) {
  OpenInItsPlace(O_CLOEXEC);
  EXPECT_EQ(WriteToStandardOutput("text"), kStandsForAnother);
  EXPECT_EQ(TextOf(path_), "");
  EXPECT_EQ(write(STDOUT_FILENO, "his own", 7), 7);
  EXPECT_EQ(TextOf(path_), "his own");
}

TEST_F(StandardOutputTest, ThatIsClosedKeepsNothingForTheNextFile) {
  close(STDOUT_FILENO);
  EXPECT_EQ(WriteToStandardOutput("text"), EBADF);
  OpenInItsPlace(0);
  std::fflush(stdout);
  EXPECT_EQ(TextOf(path_), "");
}

TEST_F(StandardOutputTest, ThatIsFullSaysSo) {
  close(STDOUT_FILENO);
  ASSERT_EQ(open("/dev/full", O_WRONLY), STDOUT_FILENO);
  EXPECT_EQ(WriteToStandardOutput("text"), ENOSPC);
  OpenInItsPlace(0);
  EXPECT_EQ(WriteToStandardOutput("later"), kWritten);
  EXPECT_EQ(TextOf(path_), "later");
}

// A pipe as the number of standard output, which does not block; its other end.
int PipeThatDoesNotBlock() {
  std::array<int, 2> ends{};
  EXPECT_EQ(pipe2(ends.data(), O_CLOEXEC), 0);
  dup2(ends[1], STDOUT_FILENO);
  close(ends[1]);
  fcntl(STDOUT_FILENO, F_SETFL, O_NONBLOCK);
  return ends[0];
}

// The rest waits for the reader. What C still has when the pipe is full does, too.
TEST_F(StandardOutputTest, ThatDoesNotBlockGetsAll) {
  constexpr std::size_t kMuch = 1 << 20;
  const int other_end = PipeThatDoesNotBlock();
  std::array<char, 4096> page{};
  std::size_t filled = 0;
  while (write(STDOUT_FILENO, page.data(), page.size()) > 0) filled += page.size();
  std::printf("of C");
  std::size_t read_size = 0;
  std::thread reader([&] {
    std::array<char, 4096> buffer;
    for (ssize_t size; (size = read(other_end, buffer.data(), buffer.size())) > 0;) {
      read_size += static_cast<std::size_t>(size);
    }
  });
  EXPECT_EQ(WriteToStandardOutput(std::string(kMuch, 'x')), kWritten);
  close(STDOUT_FILENO);
  reader.join();
  close(other_end);
  EXPECT_EQ(read_size, filled + 4 + kMuch);
}

// As that of a console whose window is drawn by the thread that writes.
TEST_F(StandardOutputTest, ThatNobodyReadsHoldsNobodyUp) {
  const int other_end = PipeThatDoesNotBlock();
  EXPECT_EQ(WriteToStandardOutput(std::string(1 << 20, 'x')), EAGAIN);
  close(other_end);
}

TEST_F(StandardOutputTest, CanBeAStreamInMemory) {
  CaptureTrace capture;
  std::printf("before ");
  EXPECT_EQ(WriteToStandardOutput("text"), kWritten);
  EXPECT_EQ(capture.Text(), "before text");
}

}  // namespace
