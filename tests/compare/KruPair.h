// The product's KRU solvers and the plain ones side by side.
#ifndef VORKEL_TESTS_COMPARE_KRUPAIR_H_
#define VORKEL_TESTS_COMPARE_KRUPAIR_H_

#include <string>

#include "engine/Ip_VorkelImp.h"
#include "tests/compare/KruGenerator.h"
#include "tests/plain/plain_kru.h"

namespace compare {

// One object of each; what a run leaves behind, the next one finds.
class KruPair {
 public:
  KruPair();

  // Answers the case with both, with trace lines. Returns the first difference in words, empty
  // when there is none.
  std::string FirstDifference(const KruCase& drawn);

  // The plain solver's last result code and trace.
  int Code() const { return code_; }
  const std::string& PlainTrace() const { return plainTrace_; }

 private:
  std::string CompareState(int code) const;

  Ip::VorkelImp& imp_;
  plain::RequestLists lists_;
  plain::KruState state_;
  plain::KruLimits limits_;
  int code_ = 0;
  std::string plainTrace_;
};

}  // namespace compare

#endif  // VORKEL_TESTS_COMPARE_KRUPAIR_H_
