// Random requests to the KRU solvers, and random limits.
//
// The same seed gives the same requests on every machine.
#ifndef VORKEL_TESTS_COMPARE_KRUGENERATOR_H_
#define VORKEL_TESTS_COMPARE_KRUGENERATOR_H_

#include <array>
#include <string>

#include "tests/compare/Random.h"
#include "tests/plain/plain_kru.h"

namespace compare {

// The keywords of the KRU_SP limits in the order of KruCase::periods.
extern const std::array<const char*, 13> kKruKeywords;

struct KruCase {
  bool clkgen = false;               // KRU_CLKGEN, else KRU_SP
  std::array<double, 13> periods{};  // speed data of the device, ns
  bool readable = true;              // the last keyword is there, too
  plain::KruRequest request;
};

KruCase DrawKruCase(Random& random);

// A case in words.
std::string Describe(const KruCase& drawn);

}  // namespace compare

#endif  // VORKEL_TESTS_COMPARE_KRUGENERATOR_H_
