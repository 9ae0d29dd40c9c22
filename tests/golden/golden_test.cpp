// Whole traces against the files of this folder.
//
// The files hold what the plain solver says. VORKEL_WRITE_GOLDEN in the environment writes them
// anew from it; what changed then shows in the difference to the last commit.

#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>
#include <sstream>

#include "tests/compare/PllPair.h"
#include "tests/golden/golden_cases.h"

namespace {

std::string PlainTrace(const compare::Case& run, int* code) {
  plain::RequestLists lists;
  plain::Trace trace(true);
  *code = plain::SolvePll(run.request, run.limits, lists, trace).code;
  return trace.Text();
}

class Golden : public testing::TestWithParam<GoldenCase> {};

TEST_P(Golden, Trace) {
  const GoldenCase& golden = GetParam();
  const std::string path = std::string(VORKEL_GOLDEN_DIR) + "/" + golden.name + ".trace";
  int code = 0;
  const std::string plainTrace = PlainTrace(golden.run, &code);
  if (std::getenv("VORKEL_WRITE_GOLDEN") != nullptr) std::ofstream(path) << plainTrace;
  std::ostringstream file;
  file << std::ifstream(path).rdbuf();

  EXPECT_EQ(code, golden.code);
  ASSERT_FALSE(file.str().empty()) << path;
  EXPECT_EQ(plainTrace, file.str()) << "the plain solver";
  // A fresh object, so that the run depends on nothing before it.
  compare::PllPair pair;
  EXPECT_EQ(pair.FirstDifference(golden.run, true), "") << "the product";
}

INSTANTIATE_TEST_SUITE_P(Runs, Golden, testing::ValuesIn(GoldenCases()),
                         [](const testing::TestParamInfo<GoldenCase>& parameter) {
                           return parameter.param.name;
                         });

}  // namespace
