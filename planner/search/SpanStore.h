// The spans of the VCO that an output leaves, kept for many questions.
//
// Tested by span_store_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_SPANSTORE_H_
#define VORKEL_PLANNER_SEARCH_SPANSTORE_H_

#include <bitset>
#include <cstddef>
#include <memory>
#include <mutex>
#include <utility>
#include <vector>

#include "planner/search/VcoSpans.h"

namespace planner::search {

// What the spans of an output depend on, of all that a question can switch.
struct SpanCase {
  bool frequency;  // does not count; likewise the next three
  bool phase;
  bool duty;
  bool range;
  bool dividers;      // are beyond the hardware's
  bool second_input;  // does not count
  bool moves;         // phase and duty cycle
  bool in_eighths;    // are the dividers
};

// May be asked from several threads at once.
class SpanStore {
 public:
  using Kept = std::shared_ptr<const Spans>;

  // The spans of a case, which `make` works out when they are not there. None the first time,
  // unless many are wanted: who asks but once for a few of them has these sooner by himself.
  template <typename Make>
  Kept Of(const SpanCase& one, bool wants_many, const Make& make) {
    const std::lock_guard lock(mutex_);
    const std::size_t place = PlaceOf(one);
    Kept& kept = kept_[place];
    if (kept) return kept;
    if (!wants_many && !was_asked_[place]) {
      was_asked_[place] = true;
      return nullptr;
    }
    Spans spans = make();
    count_ += spans.size();
    if (count_ > kMost) {
      // 8 MB are enough: questions that follow each other differ in little.
      count_ = spans.size();
      for (Kept& other : kept_) other.reset();
    }
    return kept = std::make_shared<const Spans>(std::move(spans));
  }

 private:
  static constexpr std::size_t kMost = 500'000;
  static constexpr std::size_t kPlaces = std::size_t{1} << 8;

  static std::size_t PlaceOf(const SpanCase& one) {
    std::size_t place = 0;
    for (const bool bit : {one.frequency, one.phase, one.duty, one.range, one.dividers,
                           one.second_input, one.moves, one.in_eighths}) {
      place = place << 1 | (bit ? 1 : 0);
    }
    return place;
  }

  std::mutex mutex_;
  std::vector<Kept> kept_ = std::vector<Kept>(kPlaces);
  std::bitset<kPlaces> was_asked_;
  std::size_t count_ = 0;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_SPANSTORE_H_
