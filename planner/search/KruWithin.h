// Whether a KRU has settings that meet some demands and keep some limits.
//
// What counts of an M and a D is which outputs the synthesiser can then serve; and likewise of a
// divide. There are few such sets: the demands of the outputs leave spans of M / D, and where the
// same spans overlap one quotient is as good as another, the one with the smallest D. So the sets
// of M and D are tried with those of the divides, and with all PHASE_SHIFTs at once.
//
// Tested by within_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_KRUWITHIN_H_
#define VORKEL_PLANNER_SEARCH_KRUWITHIN_H_

#include <optional>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"
#include "planner/search/KruTask.h"
#include "planner/search/Within.h"

namespace planner::search {

class KruWithin {
 public:
  KruWithin(const Request& request, const Device& device, Primitive primitive);
  KruWithin(const KruWithin&) = delete;
  KruWithin& operator=(const KruWithin&) = delete;

  std::optional<Settings> Find(const Relaxed& relaxed) const;

 private:
  class Question;

  Request request_;
  KruTask task_;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_KRUWITHIN_H_
