// Requests drawn at random, with devices whose limits are drawn too, in classes by how far the
// search has to go for them.
#ifndef VORKEL_BENCH_DRAWNREQUESTS_H_
#define VORKEL_BENCH_DRAWNREQUESTS_H_

#include <string>
#include <vector>

#include "tests/compare/RequestGenerator.h"

namespace bench {

struct DrawnClass {
  const char* name;
  const char* title;
  int code;             // 1 solved, 5 nothing serves the request
  double lowestFudge;   // MHz; the range of the fudges
  double highestFudge;
  int wanted;           // how many to draw
};

// The classes, in the order in which they are shown.
const std::vector<DrawnClass>& DrawnClasses();

struct DrawnRequest {
  std::string name;  // the kind and the number of the draw; names the same request everywhere
  compare::Case drawn;
};

// The requests of each class, drawn until all have theirs. The same ones every time.
std::vector<std::vector<DrawnRequest>> DrawRequests();

}  // namespace bench

#endif  // VORKEL_BENCH_DRAWNREQUESTS_H_
