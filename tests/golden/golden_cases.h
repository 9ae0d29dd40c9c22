// The runs whose whole traces are kept as files.
#ifndef VORKEL_TESTS_GOLDEN_GOLDEN_CASES_H_
#define VORKEL_TESTS_GOLDEN_GOLDEN_CASES_H_

#include <ostream>
#include <string>
#include <vector>

#include "tests/compare/RequestGenerator.h"

struct GoldenCase {
  std::string name;  // of the file, without ".trace"
  int code;          // the result that the run is kept for
  compare::Case run;

  // What GoogleTest shows of a case.
  friend void PrintTo(const GoldenCase& golden, std::ostream* out) { *out << golden.name; }
};

// All runs, in the order of their files' contents: PLL and TSYN, minimum power and closest
// solution, each way in which a run can end.
std::vector<GoldenCase> GoldenCases();

#endif  // VORKEL_TESTS_GOLDEN_GOLDEN_CASES_H_
