// Candidate configurations of a PLL or TSYN, and the fixed table that holds them.
//
// Tested by vco_candidate_test.cpp.
#ifndef VORKEL_ENGINE_PLL_VCOCANDIDATE_H_
#define VORKEL_ENGINE_PLL_VCOCANDIDATE_H_

#include <array>
#include <cstddef>
#include <cstdint>

#include "engine/Requests.h"
#include "engine/pll/SlotSet.h"

namespace Ip::Pll {

// One slot for each output-0 divider step of the fractional walk: 1, 2, 2.125, ... 128.
inline constexpr int MAX_VCO_CANDIDATES = 1010;

// One candidate. The search fills it stage by stage; what no stage has written is 0.
struct VcoCandidate {
  double vco;   // VCO frequency, MHz
  double div0;  // divider of output 0: whole, or a multiple of 0.125
  double m;     // feedback multiplier M; 0 until the M and D search has accepted the candidate
  std::array<double, MAX_OUTPUTS> freqDiff;   // |actual - requested| frequency, MHz; [0] unused
  std::array<double, MAX_OUTPUTS> phase;      // achievable phase, degrees
  std::array<double, MAX_OUTPUTS> phaseDiff;  // its distance from the request, degrees
  std::array<double, MAX_OUTPUTS> dutyCycle;  // achievable duty cycle, a fraction
  std::array<double, MAX_OUTPUTS> dutyDiff;   // its distance from the request, a fraction
  std::uint32_t d;                            // input divider D
  std::array<std::uint32_t, MAX_OUTPUTS> divN;  // dividers of outputs 1 to 6; [0] unused

  bool HasMAndD() const { return m != 0.0; }

  // The divider of output n, 0 <= n < MAX_OUTPUTS.
  double Divider(int n) const {
    return n == 0 ? div0 : static_cast<double>(divN[static_cast<std::size_t>(n)]);
  }
};

// The table `_vcoCandidates`. A slot is the index of the output-0 divider step that made its
// candidate, so a walk over the table goes by rising Div0. The records stand in the table
// itself: making and dropping candidates allocates nothing.
class VcoCandidateTable {
 public:
  using Slots = SlotSet<MAX_VCO_CANDIDATES>;

  // The records are left as they are until a slot is taken: an object that never runs a
  // PLL search then costs no memory pages for them.
  VcoCandidateTable() {}  // NOLINT: not "= default", which would zero the records
  VcoCandidateTable(const VcoCandidateTable&) = delete;
  VcoCandidateTable& operator=(const VcoCandidateTable&) = delete;

  // The slots that hold a candidate.
  const Slots& Occupied() const { return occupied_; }

  // The candidate in an occupied slot.
  VcoCandidate& operator[](int slot) { return records_[static_cast<std::size_t>(slot)]; }
  const VcoCandidate& operator[](int slot) const {
    return records_[static_cast<std::size_t>(slot)];
  }

  // Puts a new candidate into `slot`, in place of any that is there.
  void Put(int slot, double vco, double div0) {
    VcoCandidate& candidate = (*this)[slot];
    candidate = VcoCandidate{};
    candidate.vco = vco;
    candidate.div0 = div0;
    occupied_.Insert(slot);
  }

  void Empty(int slot) { occupied_.Erase(slot); }
  void EmptyAll() { occupied_.Clear(); }
  // Empties every slot outside `kept`, which holds occupied slots only.
  void KeepOnly(const Slots& kept) { occupied_ = kept; }

 private:
  Slots occupied_;
  std::array<VcoCandidate, MAX_VCO_CANDIDATES> records_;
};

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_VCOCANDIDATE_H_
