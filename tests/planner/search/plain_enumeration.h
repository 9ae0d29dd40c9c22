// The search a second time, in the plainest way: everything that can be set is tried, one after the
// other, in exact arithmetic, and nothing is left out because of what came before. It shares no
// code with planner/search.
//
// What each divider, pin and PHASE_SHIFT does to an output is worked out from hardware/ as the
// judge of answers does; an order of all settings is that of answer/Rank.h.
#ifndef VORKEL_TESTS_PLANNER_SEARCH_PLAIN_ENUMERATION_H_
#define VORKEL_TESTS_PLANNER_SEARCH_PLAIN_ENUMERATION_H_

#include <cstdint>
#include <vector>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"
#include "planner/answer/Rank.h"

namespace plain {

struct Ranked {
  planner::Settings settings;
  planner::answer::RankKey key;
};

struct Found {
  std::vector<Ranked> best;   // for each bandwidth that has settings; of a KRU one
  std::vector<Ranked> front;
  std::int64_t tried = 0;
};

enum class Effort {
  // Nothing but exact arithmetic and nested loops.
  kAll,
  // For devices with many settings: of the dividers of an output only those are worked out exactly
  // that doubles have within a millionth of the best, or of meeting the demands; and the pins of
  // the outputs of a KRU are chosen one by one, as they do not depend on each other but through
  // the largest jitter.
  kLess,
};

Found Enumerate(const planner::Request& request, const planner::Device& device,
                planner::Primitive primitive, Effort effort);

// What the inputs of a request can be at the ends of their tolerance, each of them.
std::vector<planner::Rational> CornersOf(const planner::Request& request);

// The order of all settings.
bool IsBefore(const planner::Request& request, const Ranked& a, const Ranked& b);

// Keeps the settings that are on the front: of the class of the best, each with less jitter than
// all that have a smaller error or the same.
std::vector<Ranked> FrontOf(const planner::Request& request, const std::vector<Ranked>& all);

Found EnumerateLoop(const planner::Request& request, const planner::Device& device,
                    planner::Primitive primitive, Effort effort);
Found EnumerateKru(const planner::Request& request, const planner::Device& device,
                   planner::Primitive primitive, Effort effort);

}  // namespace plain

#endif  // VORKEL_TESTS_PLANNER_SEARCH_PLAIN_ENUMERATION_H_
