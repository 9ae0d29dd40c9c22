// A trace on its way out: block by block, to its end, and where it cannot be written.

#include "engine/Trace.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <limits>
#include <string>

#include "engine/StandardOutput.h"
#include "tests/support/CaptureTrace.h"

namespace {

using Ip::Trace;

// Standard output on the device, while it lives.
class OutputTo {
 public:
  explicit OutputTo(const char* device) : saved_(fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, 3)) {
    std::fflush(stdout);
    close(STDOUT_FILENO);
    EXPECT_EQ(open(device, O_WRONLY), STDOUT_FILENO);
  }
  ~OutputTo() {
    dup2(saved_, STDOUT_FILENO);
    close(saved_);
  }
  OutputTo(const OutputTo&) = delete;
  OutputTo& operator=(const OutputTo&) = delete;

 private:
  int saved_;
};

TEST(Trace, HasAllItsLinesInTheirOrder) {
  constexpr int kLines = 20000;  // several blocks
  std::string expected;
  CaptureTrace capture;
  {
    const Trace trace(true);
    for (int i = 0; i < kLines; ++i) {
      TRACE(trace, "DLL - line %d of %d: %f\n", i, kLines, i / 8.0);
      char line[100];
      std::snprintf(line, sizeof line, "DLL - line %d of %d: %f\n", i, kLines, i / 8.0);
      expected += line;
    }
    EXPECT_GT(capture.Text().size(), expected.size() / 2) << "blocks are written on the way";
    EXPECT_TRUE(capture.Text().ends_with('\n')) << "and have whole lines";
  }
  EXPECT_EQ(capture.Text(), expected);
  EXPECT_EQ(Trace::LossOfLast(), Ip::kWritten);
}

// The longest numbers that there are, which the engine leaves to printf.
TEST(Trace, HasLinesOfAnyNumbers) {
  constexpr double kMost = std::numeric_limits<double>::max();
  std::string expected;
  CaptureTrace capture;
  {
    const Trace trace(true);
    for (int i = 0; i < 100; ++i) {
      TRACE(trace, "%f %3.3f %f %d\n", kMost, -kMost, -std::numeric_limits<double>::infinity(), i);
      char line[2000];
      std::snprintf(line, sizeof line, "%f %3.3f -inf %d\n", kMost, -kMost, i);
      expected += line;
    }
  }
  EXPECT_EQ(capture.Text(), expected);
}

TEST(Trace, PrintsNothingWhenItIsOff) {
  CaptureTrace capture;
  {
    const Trace trace(false);
    TRACE(trace, "%d\n", 1);
    trace.Print("%d\n", 2);
    EXPECT_FALSE(trace.On());
  }
  EXPECT_EQ(capture.Text(), "");
}

TEST(Trace, EndsWhereItCannotBeWritten) {
  int evaluated = 0;
  const OutputTo full("/dev/full");
  {
    const Trace trace(true);
    for (int i = 0; i < 100000; ++i) {
      TRACE(trace, "DLL - a line of some length, number %d\n", ++evaluated);
    }
    EXPECT_FALSE(trace.On());
    EXPECT_EQ(Trace::LossOfLast(), ENOSPC);
  }
  // A block has some 800 lines.
  EXPECT_LT(evaluated, 2000);
  EXPECT_EQ(Trace::LossOfLast(), ENOSPC);
}

TEST(Trace, TellsOfTheLastOneThatWasOn) {
  {
    const OutputTo full("/dev/full");
    const Trace trace(true);
    TRACE(trace, "DLL\n");
  }
  EXPECT_EQ(Trace::LossOfLast(), ENOSPC);
  { const Trace off(false); }
  EXPECT_EQ(Trace::LossOfLast(), ENOSPC);
  CaptureTrace capture;
  {
    const Trace trace(true);
    TRACE(trace, "DLL\n");
  }
  EXPECT_EQ(Trace::LossOfLast(), Ip::kWritten);
}

}  // namespace
