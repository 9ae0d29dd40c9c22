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

// One candidate. The search fills it stage by stage. Many are made and few get far, so what later
// stages write is left as it was until the M and D search accepts the candidate; then it is 0.
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

  // Makes 0 what no stage has written for a candidate with dividers for `count` outputs.
  void ClearWhatIsLeft(int count) {
    phase.fill(0.0);
    phaseDiff.fill(0.0);
    dutyCycle.fill(0.0);
    dutyDiff.fill(0.0);
    freqDiff[0] = 0.0;
    divN[0] = 0;
    for (auto n = static_cast<std::size_t>(count < 1 ? 1 : count); n < MAX_OUTPUTS; ++n) {
      freqDiff[n] = 0.0;
      divN[n] = 0;
    }
  }

  // The divider of output n, 0 <= n < MAX_OUTPUTS.
  double Divider(int n) const {
    return n == 0 ? div0 : static_cast<double>(divN[static_cast<std::size_t>(n)]);
  }
};

// The table `_vcoCandidates`. A slot is the index of the output-0 divider step that made its
// candidate, so a walk over the table goes by rising Div0.
//
// The records take a third of a megabyte and are of no use after a run, so all tables of a thread
// have the same ones: a table that is emptied takes them over, and the candidates of another are
// gone. Making and dropping candidates allocates nothing.
class VcoCandidateTable {
 public:
  using Slots = SlotSet<MAX_VCO_CANDIDATES>;

  VcoCandidateTable() = default;
  VcoCandidateTable(const VcoCandidateTable&) = delete;
  VcoCandidateTable& operator=(const VcoCandidateTable&) = delete;

  // The slots that hold a candidate.
  const Slots& Occupied() const { return occupied_; }

  // The candidate in an occupied slot.
  VcoCandidate& operator[](int slot) { return records_[slot]; }
  const VcoCandidate& operator[](int slot) const { return records_[slot]; }

  // Puts a new candidate into `slot`, in place of any that is there. It has no M and no D yet. A
  // table that was never emptied takes the records first.
  void Put(int slot, double vco, double div0) {
    if (records_ == nullptr) records_ = RecordsOfThread();
    VcoCandidate& candidate = (*this)[slot];
    candidate.vco = vco;
    candidate.div0 = div0;
    candidate.m = 0.0;
    candidate.d = 0;
    occupied_.Insert(slot);
  }

  void Empty(int slot) { occupied_.Erase(slot); }
  // Takes the records of the running thread. Throws std::bad_alloc where there is no memory for
  // them, at the first time in a thread.
  void EmptyAll() {
    occupied_.Clear();
    records_ = RecordsOfThread();
  }
  // Empties every slot outside `kept`, which holds occupied slots only.
  void KeepOnly(const Slots& kept) { occupied_ = kept; }

 private:
  static VcoCandidate* RecordsOfThread();

  Slots occupied_;
  VcoCandidate* records_ = nullptr;  // MAX_VCO_CANDIDATES
};

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_VCOCANDIDATE_H_
