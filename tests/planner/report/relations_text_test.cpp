#include <gtest/gtest.h>

#include "made.h"
#include "planner/report/Relations.h"

namespace planner::report {
namespace {

const Style kPlain{};

// 100 MHz times 8; by 8 at 36 degrees, 1 ns of 10, by 10 and by 11, 12.5 and 13.75 ns. 12.5 and
// 13.75 ns are 1.25 ns apart, and so is 10 ns from 13.75.
Answer MadeAnswer(const Request& request) {
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 64, 1, {64, 80, 88}, 100);
  answer.outputs[0].phase = 36;
  return answer;
}

TEST(RelationsText, AllOfOneInput) {
  const Request request = MadeRequest({100}, {100, 80, Rational(800, 11)});
  EXPECT_EQ(RelationsText(request, MadeDevice(), MadeAnswer(request), {}, kPlain),
            "device     vk40b484-2 PLL\n"
            "input      100 MHz\n"
            "settings   M 8, D 1 and dividers 8, 10 and 11\n"
            "least gap  25 % of the shorter period\n"
            "\n"
            "clock         MHz  period ns  rises ns  falls ns\n"
            "in     100.000000         10         0         5\n"
            "out0   100.000000         10         1         6\n"
            "out1    80.000000       12.5         0      6.25\n"
            "out2    72.727273      13.75         0     6.875\n"
            "\n"
            // The common steps: 2.5 ns of 10 and 12.5, 1.25 of 10 and 13.75 and of 12.5 and 13.75.
            "from  to    ratio  phase deg  gap ns  hyperperiod ns  edges  crossing\n"
            "in    out0      1     36.000       1              10    1:1  relaxed\n"
            "in    out1    4/5      0.000     2.5              50    5:4  short\n"
            "in    out2   8/11      0.000    1.25             110   11:8  FIFO\n"
            "out0  in        1    324.000       9              10    1:1  phase\n"
            // -1 of 12.5 ns is 331.2 degrees, and 1.5 of 2.5 ns.
            "out0  out1    4/5    331.200     1.5              50    5:4  FIFO\n"
            // -1 of 13.75 is 333.818 degrees, and 0.25 of 1.25 ns.
            "out0  out2   8/11    333.818    0.25             110   11:8  FIFO\n"
            "out1  in      5/4      0.000     2.5              50    4:5  short\n"
            "out1  out0    5/4     36.000       1              50    4:5  FIFO\n"
            "out1  out2  10/11      0.000    1.25           137.5  11:10  FIFO\n"
            "out2  in     11/8      0.000    1.25             110   8:11  FIFO\n"
            "out2  out0   11/8     36.000       1             110   8:11  FIFO\n"
            "out2  out1  11/10      0.000    1.25           137.5  10:11  FIFO\n"
            "\n"
            "from  to    rise to fall  fall to rise  fall to fall  hold\n"
            "in    out0             6             6             1     9\n"
            // A fall at 6.25 is 1.25 beyond two steps, one at 5 on a step.
            "in    out1          1.25           2.5          1.25     0\n"
            // 6.875 is half a step beyond five.
            "in    out2         0.625          1.25         0.625     0\n"
            "out0  in               4             4             9     1\n"
            // 6.25 - 1 = 5.25; -6 = -7.5 + 1.5; 6.25 - 6 = 0.25; hold 1 of 2.5.
            "out0  out1          0.25           1.5          0.25     1\n"
            // 6.875 - 1 = 5.875 = 5 + 0.875; -6 = -6.25 + 0.25; 0.875; hold 1 of 1.25.
            "out0  out2         0.875          0.25         0.875     1\n"
            "out1  in             2.5          1.25          1.25     0\n"
            // 6 = 5 + 1; 1 - 6.25 = -7.5 + 2.25; 6 - 6.25 = -2.5 + 2.25; -1 = -2.5 + 1.5.
            "out1  out0             1          2.25          2.25   1.5\n"
            "out1  out2         0.625          1.25         0.625     0\n"
            "out2  in            1.25         0.625         0.625     0\n"
            // 6 = 5 + 1; 1 - 6.875 = -6.25 + 0.375; -0.875 = -1.25 + 0.375; -1 = -1.25 + 0.25.
            "out2  out0             1         0.375         0.375  0.25\n"
            "out2  out1          1.25         0.625         0.625     0\n"
            "\n"
            "phase: the same frequency at another phase. Timed as it stands, with the gap.\n"
            "short: timed as it stands, with less than a period of the faster clock: keep\n"
            "  the logic between short.\n"
            "relaxed: the gap is too small, but the same behind every launch. It needs a\n"
            "  relaxed constraint: a multicycle path of 2 gives data a period of the faster\n"
            "  clock more, if no path is shorter than the gap; else a FIFO or a handshake.\n"
            "FIFO: synchronous, but the gap is too small: data needs a FIFO or a handshake.\n"
            "hold: by how much a capturing edge is before a launch at least; 0 is the usual\n"
            "  hold check.\n"
            "FIFO or handshake: in and out2; out0 and out1; out0 and out2; out1 and out2\n");
}

TEST(RelationsText, ARuleOfOnesOwnAndNoFifo) {
  const Request request = MadeRequest({100}, {100, 80, Rational(800, 11)});
  const std::string text =
      RelationsText(request, MadeDevice(), MadeAnswer(request), {Rational(1, 5), {}}, kPlain);
  EXPECT_NE(text.find("least gap  0.2 ns\n"), std::string::npos);
  EXPECT_NE(text.find("FIFO or handshake: no crossing needs one\n"), std::string::npos);
}

TEST(RelationsText, OneDirectionAlone) {
  // 1.5 ns one way and 1 ns the other, of 10 and 12.5 ns.
  const Request request = MadeRequest({100}, {100, 80, Rational(800, 11)});
  const std::string text =
      RelationsText(request, MadeDevice(), MadeAnswer(request), {Rational(6, 5), {}}, kPlain);
  EXPECT_NE(text.find("FIFO or handshake: out0 and out2; out1 to out0\n"), std::string::npos)
      << text;
}

TEST(RelationsText, TwoInputs) {
  const Request request = MadeRequest({100, 50}, {100, Rational(800, 9)});
  // By 8 and 9: an eighth of the period of the first.
  const std::string text =
      RelationsText(request, MadeDevice(),
                    MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 64, 1, {64, 72}, 100),
                    {Rational(2), {}}, kPlain);
  EXPECT_NE(text.find("input      100 MHz and 50 MHz\n"), std::string::npos);
  EXPECT_NE(text.find("\nwith input 1, 100 MHz:\n\nclock"), std::string::npos);
  EXPECT_NE(text.find("\nwith input 2, 50 MHz:\n\nclock"), std::string::npos);
  EXPECT_NE(text.find("out0  out1    8/9      0.000    1.25              90    9:8  FIFO\n"),
            std::string::npos)
      << text;
  EXPECT_NE(text.find("out0  out1    8/9      0.000     2.5             180    9:8  short\n"),
            std::string::npos)
      << text;
  EXPECT_NE(text.find("FIFO or handshake: in and out1 with input 1; out0 and out1 with input 1\n"),
            std::string::npos);
  EXPECT_NE(text.find("\ntwo inputs: they are not related"), std::string::npos);
}

TEST(RelationsText, OutputsOnTheSamePinAreOneClock) {
  const Request request = MadeRequest({100}, {150, 100, 150});
  KruSettings settings;
  settings.m = 3;
  settings.d = 2;
  settings.pins = {Pin::kClkfx, Pin::kClk0, Pin::kClkfx};
  const std::string text =
      RelationsText(request, MadeDevice(),
                    MadeKru(request, settings, {Rational(3, 2), 1, Rational(3, 2)}, 1), {}, kPlain);
  EXPECT_NE(text.find("\nout0,out2  150.000000"), std::string::npos) << text;
  EXPECT_NE(text.find("\nout0  out1    2/3 "), std::string::npos);
  EXPECT_EQ(text.find("\nout2 "), std::string::npos);
}

}  // namespace
}  // namespace planner::report
