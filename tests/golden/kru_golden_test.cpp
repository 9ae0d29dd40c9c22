// Whole KRU traces against the files of this folder.
//
// The files hold what the plain solvers say. VORKEL_WRITE_GOLDEN in the environment writes them
// anew from them; what changed then shows in the difference to the last commit.

#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>
#include <sstream>

#include "tests/compare/KruPair.h"
#include "tests/golden/kru_golden_cases.h"

namespace {

class KruGolden : public testing::TestWithParam<KruGoldenCase> {};

TEST_P(KruGolden, Trace) {
  const KruGoldenCase& golden = GetParam();
  const std::string path = std::string(VORKEL_GOLDEN_DIR) + "/" + golden.name + ".trace";
  // A fresh object, so that the first run depends on nothing before it.
  compare::KruPair pair;
  std::string plainTrace;
  for (const compare::KruCase& run : golden.runs) {
    EXPECT_EQ(pair.FirstDifference(run), "") << "the product";
    plainTrace += pair.PlainTrace();
  }
  if (std::getenv("VORKEL_WRITE_GOLDEN") != nullptr) std::ofstream(path) << plainTrace;
  std::ostringstream file;
  file << std::ifstream(path).rdbuf();

  EXPECT_EQ(pair.Code(), golden.code);
  ASSERT_FALSE(file.str().empty()) << path;
  EXPECT_EQ(plainTrace, file.str()) << "the plain solvers";
}

INSTANTIATE_TEST_SUITE_P(Runs, KruGolden, testing::ValuesIn(KruGoldenCases()),
                         [](const testing::TestParamInfo<KruGoldenCase>& parameter) {
                           return parameter.param.name;
                         });

}  // namespace
