// Request lists of the plain solvers and the parser that fills them.

#ifndef TESTS_PLAIN_PLAIN_LISTS_H_
#define TESTS_PLAIN_PLAIN_LISTS_H_

#include <string>

namespace plain {

inline constexpr int kMaxOutputs = 7;

// What the caller asks of each output. The lists belong to the object and not to one request: a
// request that does not write a list works with what an earlier one left there.
struct RequestLists {
  double outFreq[kMaxOutputs]{};    // MHz
  double phase[kMaxOutputs]{};      // degrees, signed
  double dutyCycle[kMaxOutputs]{};  // percent
};

// Reads `count` numbers from `text` into the first slots of `list`. Numbers are separated by runs
// of blanks, trimmed of white space and converted like atof, so a word that is no number reads as
// 0. Words beyond `count` are ignored.
//
// Returns true when `count` numbers were stored. When the text runs out early the numbers read so
// far stay stored and the result is false. An empty text, a count below 1 and a count above
// `slots` store nothing and give false.
bool ParseList(const std::string& text, int count, int slots, double* list);

}  // namespace plain

#endif  // TESTS_PLAIN_PLAIN_LISTS_H_
