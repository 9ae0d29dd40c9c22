// The product's KRU_SP and KRU_CLKGEN solvers against the plain ones, over generated requests.
//
// VORKEL_TEST_LONG in the environment asks for the long comparison.

#include <gtest/gtest.h>

#include <cstdlib>
#include <map>
#include <string>

#include "tests/compare/KruPair.h"

namespace compare {
namespace {

// Lines that a comparison worth the name has met: every pin in either list, every way of
// failing, every stage of the searches.
const char* const kLines[] = {
    "_kruPinsDivBy2False[0] = CLK0\n",
    "_kruPinsDivBy2False[0] = CLK90\n",
    "_kruPinsDivBy2False[0] = CLK180\n",
    "_kruPinsDivBy2False[0] = CLK270\n",
    "_kruPinsDivBy2False[0] = CLK2X\n",
    "_kruPinsDivBy2False[0] = CLK2X180\n",
    "_kruPinsDivBy2False[0] = CLKDV\n",
    "_kruPinsDivBy2False[0] = CLKFX\n",
    "_kruPinsDivBy2False[0] = CLKFX180\n",
    "_kruPinsDivBy2True[0] = CLK0\n",
    "_kruPinsDivBy2True[0] = CLK90\n",
    "_kruPinsDivBy2True[0] = CLK180\n",
    "_kruPinsDivBy2True[0] = CLK270\n",
    "_kruPinsDivBy2True[0] = CLK2X\n",
    "_kruPinsDivBy2True[0] = CLK2X180\n",
    "_kruPinsDivBy2True[0] = CLKDV\n",
    "_kruPinsDivBy2True[0] = CLKFX\n",
    "_kruPinsDivBy2True[0] = CLKFX180\n",
    "Can't use CLK0 because",
    "Can't use CLK90 because",
    "Can't use CLK180 because",
    "Can't use CLK270 because",
    "Can't use CLK2X because",
    "Can't use CLK2X180 because",
    "Can't use CLKDV because",
    "Can't potentially use CLKFX because",
    "Can't potentially use CLKFX180 because",
    "isn't filled, so KRU won't work for DivBy2 = F",
    "isn't filled, so KRU won't work for DivyBy2 = T",
    "_kruPinsDivBy2F list works!",
    "_kruPinsDivBy2T list works!",
    "CLKDV is used, with this value",
    "changing divBy2F[",
    "changing divBy2T[",
    "removed possible M = ",
    "couldn't find and M and Ds for clknum",
    "all phases have 0 offset",
    "found non-zero offset",
    "offset was used for all outclks",
    "offset (should be negative) was used for all outclks",
    "so offsets won't work!",
    "so negOffsets won't work!",
    "is out of valid range!",
    "Can't use CLKFX because",
    "found match: CLKFX\n",
    "found match: CLKFX180\n",
    "CLKFX doesn't work, so trying CLKFXDV",
    "Can't use CLKFXDV because phase is set to",
    "Can't use CLKFXDV because requested freq",
    "didn't work, so remove M = ",
    "not a CLKFXDV solution, so remove M = ",
    "chosen DV = ",
    "chosen CLKDV = ",
};

TEST(KruCompare, ProductAnswersAsThePlainSolvers) {
  const int requests = std::getenv("VORKEL_TEST_LONG") != nullptr ? 300000 : 20000;
  KruPair pair;
  std::map<std::string, int> met;
  int differences = 0;
  for (int i = 0; i < requests && differences < 5; ++i) {
    Random random(static_cast<std::uint64_t>(i) + 77);
    const KruCase drawn = DrawKruCase(random);
    const std::string difference = pair.FirstDifference(drawn);
    if (!difference.empty()) {
      ++differences;
      ADD_FAILURE() << "request " << i << ": " << difference << "\n  " << Describe(drawn);
    }
    for (const char* line : kLines) {
      if (pair.PlainTrace().find(line) != std::string::npos) ++met[line];
    }
  }
  for (const char* line : kLines) EXPECT_GT(met[line], 0) << "never met: " << line;
}

}  // namespace
}  // namespace compare
