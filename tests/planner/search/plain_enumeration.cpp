#include "plain_enumeration.h"

#include <algorithm>
#include <cstddef>
#include <utility>

namespace plain {

using planner::Request;

std::vector<planner::Rational> CornersOf(const planner::Request& request) {
  std::vector<planner::Rational> corners;
  for (const planner::Rational& input : request.inputs) {
    const planner::Rational off = input * request.input_tolerance / 1000000;
    corners.push_back(input - off);
    corners.push_back(input + off);
  }
  return corners;
}

bool IsBefore(const Request& request, const Ranked& a, const Ranked& b) {
  const auto by_key = planner::answer::Compare(planner::answer::Order(request), a.key, b.key);
  if (by_key.order != 0) return by_key.order < 0;
  return planner::answer::CompareSettings(a.settings, b.settings).order < 0;
}

std::vector<Ranked> FrontOf(const Request& request, const std::vector<Ranked>& all) {
  if (all.empty()) return {};
  const auto first = std::min_element(all.begin(), all.end(), [](const auto& a, const auto& b) {
    return a.key.rank_class < b.key.rank_class;
  });
  std::vector<const Ranked*> order;
  for (const Ranked& one : all) {
    if (one.key.rank_class == first->key.rank_class) order.push_back(&one);
  }
  std::sort(order.begin(), order.end(), [&](const Ranked* a, const Ranked* b) {
    if (a->key.worst_error != b->key.worst_error) return a->key.worst_error < b->key.worst_error;
    if (a->key.jitter != b->key.jitter) return a->key.jitter < b->key.jitter;
    return IsBefore(request, *a, *b);
  });
  std::vector<Ranked> front;
  for (const Ranked* const one : order) {
    if (front.empty() || one->key.jitter < front.back().key.jitter) front.push_back(*one);
  }
  return front;
}

Found Enumerate(const Request& request, const planner::Device& device,
                planner::Primitive primitive, Effort effort) {
  return hardware::IsLoop(primitive) ? EnumerateLoop(request, device, primitive, effort)
                                     : EnumerateKru(request, device, primitive, effort);
}

}  // namespace plain
