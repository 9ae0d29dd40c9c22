// The product and the plain solver side by side: both answer the same requests, and whatever a
// caller can see afterwards is compared bit for bit.
#ifndef VORKEL_TESTS_COMPARE_PLLPAIR_H_
#define VORKEL_TESTS_COMPARE_PLLPAIR_H_

#include <string>

#include "engine/Ip_VorkelImp.h"
#include "tests/compare/RequestGenerator.h"
#include "tests/plain/plain_pll.h"

namespace compare {

// The part whose speed data PublishLimits sets.
inline constexpr const char* kComparedPart = "dut";

// Gives limits to the product, as speed data of kComparedPart. Returns them as it reads them.
plain::PllLimits PublishLimits(const plain::PllLimits& limits, int prim);

// True when the plain search finds nothing within the first fudges: it would go on for up to
// seconds, and its trace for tens of megabytes, so that a run can afford few of these.
bool GoesFar(const Case& drawn);

class PllPair {
 public:
  PllPair();

  // Answers the case with both. Returns the first difference in words, empty when there is
  // none. `traced` compares the trace lines too, and then runs the product without trace once
  // more: the answer must not depend on the flag.
  std::string FirstDifference(const Case& drawn, bool traced);

  // The plain solver's last answer, and its trace when that was asked for.
  const plain::PllAnswer& Answer() const { return answer_; }
  const std::string& PlainTrace() const { return plainTrace_; }

 private:
  int RunProduct(const plain::PllRequest& request, bool traced);
  std::string CompareAnswers(int code);

  Ip::VorkelImp& imp_;
  plain::RequestLists lists_;
  plain::PllAnswer answer_;
  std::string plainTrace_;
  // What the limits keep from run to run: only a TSYN load sets the low-bandwidth maximum.
  double maxPfdLowB_ = 300.0;
};

}  // namespace compare

#endif  // VORKEL_TESTS_COMPARE_PLLPAIR_H_
