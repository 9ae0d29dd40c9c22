// Tested by front_test.cpp.
#include "planner/answer/Front.h"

#include <algorithm>

namespace planner::answer {

std::vector<std::size_t> FrontOf(const std::vector<RankKey>& keys,
                                 const std::function<bool(std::size_t, std::size_t)>& before) {
  Class best = Class::kUnsolved;
  for (const RankKey& key : keys) best = std::min(best, key.rank_class);
  std::vector<std::size_t> places;
  if (best == Class::kUnsolved) return places;
  for (std::size_t i = 0; i < keys.size(); ++i) {
    if (keys[i].rank_class == best) places.push_back(i);
  }
  std::sort(places.begin(), places.end(), [&](std::size_t a, std::size_t b) {
    const RankKey& x = keys[a];
    const RankKey& y = keys[b];
    if (x.worst_error != y.worst_error) return x.worst_error < y.worst_error;
    if (x.jitter != y.jitter) return x.jitter < y.jitter;
    return a != b && before(a, b);
  });
  // Of those with larger errors only what has less jitter than all before it.
  std::vector<std::size_t> front = {places.front()};
  for (const std::size_t place : places) {
    if (keys[place].jitter < keys[front.back()].jitter) front.push_back(place);
  }
  return front;
}

Front FrontOf(const Request& request, const std::vector<Answer>& answers) {
  std::vector<RankKey> keys;
  keys.reserve(answers.size());
  for (const Answer& answer : answers) keys.push_back(KeyOf(answer));
  Front front;
  for (const std::size_t place : FrontOf(keys, [&](std::size_t a, std::size_t b) {
         return Before(request, answers[a], answers[b]);
       })) {
    front.push_back(answers[place]);
  }
  return front;
}

}  // namespace planner::answer
