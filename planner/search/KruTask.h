// A request to a KRU, prepared: what its pins make, how far that is off, and how errors compare.
//
// Tested by search_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_KRUTASK_H_
#define VORKEL_PLANNER_SEARCH_KRUTASK_H_

#include <array>
#include <compare>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <memory>
#include <utility>
#include <vector>

#include "hardware/Kru.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"
#include "planner/answer/Jitter.h"
#include "planner/search/FrequencyDemand.h"
#include "planner/search/JitterDemand.h"
#include "planner/search/Near.h"
#include "planner/search/PhaseTable.h"
#include "planner/search/RatioRange.h"

namespace planner::search {

using hardware::Pin;
using hardware::PinSource;

inline constexpr std::size_t kMostKruOutputs = 6;

// The settings of a KRU but for PHASE_SHIFT and pins. M, D and the divide are 0 where they are not
// set.
struct KruBase {
  bool feedback = false;
  bool divide_by_2 = false;
  int m = 0;
  int d = 0;
  int divide_halves = 0;
};

// a / b of the input.
struct KruRatio {
  std::int64_t a;
  std::int64_t b;
};
KruRatio RatioOf(PinSource source, const KruBase& base);

// An error of an output, |error| / unit, with all that it takes to work it out again exactly.
struct KruError {
  enum class Demand : std::uint8_t { kNone, kFrequency, kPhase, kDuty, kJitter, kGiven };
  Near near;
  Demand demand = Demand::kNone;
  std::uint8_t output = 0;  // the place among the used ones
  // kFrequency: the ratio to the input. kPhase: the quarter of the pin, and PHASE_SHIFT. kDuty:
  // whether the pin is that of the divider, and its divide in halves. kGiven: KruTask has it.
  std::int32_t a = 0;
  std::int32_t b = 0;
  double jitter = 0;  // kJitter
};

// A pin that the primitive has.
struct KruPin {
  const hardware::PinFacts* facts;
  int quarter;
  // That of the family of the pin, which the same ranges share.
  const RatioRange* usual;
  const RatioRange* doubled;  // with feedback from CLK2X
};

inline bool UsesM(PinSource source) {
  return source == PinSource::kSynthesiser || source == PinSource::kDividedSynthesiser;
}
inline bool UsesM(const KruPin& pin) { return UsesM(pin.facts->source); }
inline bool UsesDivide(PinSource source) {
  return source == PinSource::kDivider || source == PinSource::kDividedSynthesiser;
}
inline bool UsesDivide(const KruPin& pin) { return UsesDivide(pin.facts->source); }

// Whether all that a pin needs is set.
inline bool IsSet(PinSource source, const KruBase& base) {
  return (base.m != 0 || !UsesM(source)) && (base.divide_halves != 0 || !UsesDivide(source));
}
inline bool IsSet(const KruPin& pin, const KruBase& base) { return IsSet(pin.facts->source, base); }

// Whether an output of a KRU_SP, or of a KRU_CLKGEN, can be on a pin; `doubled` says that output 0
// of a KRU_SP is on CLK2X, where the feedback then comes from.
inline bool IsConnected(const KruPin& pin, bool is_sp, int output, bool feedback, bool doubled) {
  if (pin.facts->needs_feedback && !feedback) return false;
  if (output != 0) return true;
  return is_sp ? doubled == (pin.facts->pin == Pin::kClk2x) : pin.facts->pin == Pin::kClkfx;
}

class KruOutput {
 public:
  KruOutput(const Request& request, int index, std::size_t shifts);

  int Index() const { return index_; }
  const Output& Asked() const { return *asked_; }
  const FrequencyDemand& Frequency() const { return frequency_; }
  // Null where no phase is asked for.
  const PhaseTable* Phases() const { return phases_.get(); }
  const JitterDemand& Jitter() const { return jitter_; }
  bool AsksForDuty() const { return asked_->duty.has_value(); }
  Near DutyError(PinSource source, int divide_halves) const;
  bool IsDutyMet(PinSource source, int divide_halves) const;
  Rational ExactDutyError(PinSource source, int divide_halves) const;

 private:
  // Half-integral divides have other duty cycles than 50 percent.
  struct Duty {
    Near error;
    bool is_met = true;
  };
  Duty DutyOf(const Rational& percent) const;
  Duty Of(PinSource source, int divide_halves) const;

  const Request* request_;
  int index_;
  const Output* asked_;
  FrequencyDemand frequency_;
  std::unique_ptr<const PhaseTable> phases_;
  JitterDemand jitter_;
  Duty even_;
  std::vector<Duty> divided_;  // by the divide in halves
};

class KruTask {
 public:
  // Of a primitive that the device has. Both must outlive it.
  KruTask(const Request& request, const Device& device, Primitive primitive);
  KruTask(const KruTask&) = delete;
  KruTask& operator=(const KruTask&) = delete;

  const Request& Asked() const { return request_; }
  Primitive Which() const { return primitive_; }
  bool IsSp() const { return primitive_ == Primitive::kKruSp; }
  const std::vector<KruOutput>& Outputs() const { return outputs_; }
  // The pins of the primitive, by their codes.
  const std::vector<KruPin>& Pins() const { return pins_; }
  bool AsksForPhase() const { return asks_for_phase_; }
  const answer::KruJitter& Model() const { return jitter_; }
  // Whether CLKFX, where an output can be on it, has a jitter that is known, or nothing has.
  bool IsJitterAllKnown() const { return is_jitter_all_known_; }

  double JitterOf(const KruBase& base, Pin pin, bool shifted) const;

  // The errors of an output by their kinds.
  KruError FrequencyError(std::size_t place, const KruRatio& ratio) const;
  KruError PhaseError(std::size_t place, int quarter, int shift) const;
  KruError DutyError(std::size_t place, PinSource source, int divide_halves) const;
  KruError JitterError(std::size_t place, double jitter) const;
  // Something just above an error that comes from elsewhere. There is one at a time.
  KruError JustAbove(const Rational& error);

  Rational Exact(const KruError& error) const;
  std::strong_ordering Compare(const KruError& a, const KruError& b) const;
  const KruError& LargerOf(const KruError& a, const KruError& b) const {
    return Compare(a, b) < 0 ? b : a;
  }

 private:
  static bool IsSame(const KruError& a, const KruError& b);
  const RatioRange* Shared(const Range& range);

  const Request& request_;
  Primitive primitive_;
  Inputs inputs_;
  std::vector<KruOutput> outputs_;
  std::deque<std::pair<Range, RatioRange>> ranges_;
  std::vector<KruPin> pins_;
  bool asks_for_phase_ = false;
  bool is_jitter_all_known_ = false;
  answer::KruJitter jitter_;
  Rational given_ = 0;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_KRUTASK_H_
