// Traces that cannot be written. What they print where they can is tested with the stages.
#include "engine/Trace.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdio>
#include <string>
#include <vector>

#include "tests/support/FakeHost.h"

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr char kFull[] =
    "Internal trace error -- could not write to standard output: No space left on device\n";
constexpr char kClosed[] =
    "Internal trace error -- could not write to standard output: Bad file descriptor\n";

// Standard output of C on a file of its own, while it lives.
class Output {
 public:
  explicit Output(const char* path) : saved_(stdout) { stdout = std::fopen(path, "w"); }
  ~Output() { End(); }
  Output(const Output&) = delete;
  Output& operator=(const Output&) = delete;

  // Closes the file below C's stream, as `close stdout` does.
  void Close() {
    descriptor_ = fileno(stdout);
    close(descriptor_);
  }

  // Opens an empty file, which is in its place as the first that is free, and answers what is in
  // it at the end.
  std::string TextOfNextFile() {
    std::FILE* const next = std::tmpfile();
    EXPECT_EQ(fileno(next), descriptor_);
    const int kept = dup(descriptor_);
    End();
    char text[256];
    const ssize_t size = pread(kept, text, sizeof text, 0);
    close(kept);
    std::fclose(next);
    return size < 0 ? "cannot be read" : std::string(text, static_cast<std::size_t>(size));
  }

 private:
  void End() {
    if (stdout == saved_) return;
    std::fclose(stdout);
    stdout = saved_;
  }

  std::FILE* const saved_;
  int descriptor_ = -1;
};

class TraceTest : public testing::Test {
 protected:
  TraceTest() { FakeHost::Instance().Reset(); }
  ~TraceTest() override { FakeHost::Instance().Reset(); }

  static std::vector<std::string> Messages() { return FakeHost::Instance().MessageTexts(); }
};

TEST_F(TraceTest, AFullDeviceIsTold) {
  Output output("/dev/full");
  {
    const Ip::Trace trace(true);
    TRACE(trace, "DLL %d\n", 1);
    EXPECT_TRUE(trace.On());
    EXPECT_THAT(Messages(), IsEmpty());
  }
  EXPECT_THAT(Messages(), ElementsAre(kFull));
  EXPECT_EQ(FakeHost::Instance().messages[0].category, "DesignEntry");
}

TEST_F(TraceTest, ALongTraceIsToldOnceAndEndsEarly) {
  Output output("/dev/full");
  {
    const Ip::Trace trace(true);
    for (int i = 0; i < 100000; ++i) TRACE(trace, "DLL - a line of some length, number %d\n", i);
    EXPECT_THAT(Messages(), IsEmpty());
  }
  EXPECT_THAT(Messages(), ElementsAre(kFull));
  // Nothing is left for those who print next.
  EXPECT_EQ(std::fflush(stdout), 0);
}

TEST_F(TraceTest, EachRunTells) {
  Output output("/dev/full");
  for (int run = 0; run < 2; ++run) {
    const Ip::Trace trace(true);
    TRACE(trace, "DLL\n");
  }
  EXPECT_THAT(Messages(), ElementsAre(kFull, kFull));
}

TEST_F(TraceTest, WhatAClosedOutputHasNotTakenIsGone) {
  Output output("/dev/null");
  output.Close();
  {
    const Ip::Trace trace(true);
    TRACE(trace, "DLL\n");
  }
  EXPECT_THAT(Messages(), ElementsAre(kClosed));
  EXPECT_EQ(output.TextOfNextFile(), "");
}

TEST_F(TraceTest, WithoutATraceNothingIsWrittenOrTold) {
  Output output("/dev/null");
  std::printf("of the host");
  output.Close();
  {
    const Ip::Trace trace(false);
    TRACE(trace, "DLL\n");
  }
  EXPECT_THAT(Messages(), IsEmpty());
  EXPECT_EQ(output.TextOfNextFile(), "of the host");
}

}  // namespace
