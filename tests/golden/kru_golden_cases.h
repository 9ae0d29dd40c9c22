// The KRU runs whose whole traces are kept as files.
#ifndef VORKEL_TESTS_GOLDEN_KRU_GOLDEN_CASES_H_
#define VORKEL_TESTS_GOLDEN_KRU_GOLDEN_CASES_H_

#include <ostream>
#include <string>
#include <vector>

#include "tests/compare/KruGenerator.h"

struct KruGoldenCase {
  std::string name;                    // of the file, without ".trace"
  int code;                            // the result of the last run
  std::vector<compare::KruCase> runs;  // on one object, one after the other

  // What GoogleTest shows of a case.
  friend void PrintTo(const KruGoldenCase& golden, std::ostream* out) { *out << golden.name; }
};

// All cases: KRU_SP and KRU_CLKGEN, each pin family, each way in which a run can end.
std::vector<KruGoldenCase> KruGoldenCases();

#endif  // VORKEL_TESTS_GOLDEN_KRU_GOLDEN_CASES_H_
