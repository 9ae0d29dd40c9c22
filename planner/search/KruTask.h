// A request to a KRU, prepared: what its pins make, how far that is off, and how errors compare.
//
// Tested by search_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_KRUTASK_H_
#define VORKEL_PLANNER_SEARCH_KRUTASK_H_

#include <array>
#include <compare>
#include <cstddef>
#include <cstdint>
#include <memory>
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
  enum class Demand { kNone, kFrequency, kPhase, kDuty, kJitter };
  Near near;
  Demand demand = Demand::kNone;
  std::size_t output = 0;   // the place among the used ones
  KruRatio ratio = {0, 1};  // kFrequency
  int quarter = 0;          // kPhase: that of the pin,
  int shift = 0;            // and PHASE_SHIFT
  PinSource source = PinSource::kLine;  // kDuty,
  int divide_halves = 0;                // with the divide
  double jitter = 0;                    // kJitter
};

// A pin that the primitive has.
struct KruPin {
  const hardware::PinFacts* facts;
  int quarter;
  RatioRange usual;
  RatioRange doubled;  // with feedback from CLK2X
};

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

  Rational Exact(const KruError& error) const;
  std::strong_ordering Compare(const KruError& a, const KruError& b) const;
  const KruError& LargerOf(const KruError& a, const KruError& b) const {
    return Compare(a, b) < 0 ? b : a;
  }

 private:
  static bool IsSame(const KruError& a, const KruError& b);

  const Request& request_;
  Primitive primitive_;
  Inputs inputs_;
  std::vector<KruOutput> outputs_;
  std::vector<KruPin> pins_;
  bool asks_for_phase_ = false;
  bool is_jitter_all_known_ = false;
  answer::KruJitter jitter_;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_KRUTASK_H_
