// What the PLL/TSYN solver keeps in the implementation object.
#ifndef VORKEL_ENGINE_PLL_PLLSTATE_H_
#define VORKEL_ENGINE_PLL_PLLSTATE_H_

#include <array>
#include <cstddef>

#include "engine/pll/VcoCandidate.h"

namespace Ip::Pll {

// Candidates whose phases and duty cycles come close to the request; `_solutions` of the
// closest-solution mode. The entries belong to the candidate table: emptying a slot here
// leaves the candidate alone.
class SolutionTable {
 public:
  static constexpr int MAX_SOLUTIONS = 100;
  using Slots = SlotSet<MAX_SOLUTIONS>;

  const Slots& Occupied() const { return occupied_; }
  VcoCandidate* operator[](int slot) const { return entries_[static_cast<std::size_t>(slot)]; }

  void Put(int slot, VcoCandidate* candidate) {
    entries_[static_cast<std::size_t>(slot)] = candidate;
    occupied_.Insert(slot);
  }
  void EmptyAll() { occupied_.Clear(); }
  // Empties every slot outside `kept`, which holds occupied slots only.
  void KeepOnly(const Slots& kept) { occupied_ = kept; }

 private:
  Slots occupied_;
  std::array<VcoCandidate*, MAX_SOLUTIONS> entries_{};
};

struct PllState {
  // The working range of the run; M = VCO / input frequency.
  double minAdjVco = 400.0;  // MHz
  double maxAdjVco = 1200.0;
  double minM = 0.0;
  double maxM = 0.0;

  bool _preferMaxVco = false;  // closest-solution mode takes the largest VCO
  bool _intDiv0Only = false;   // TSYN: a whole divider on output 0
  bool _minPowerMode = false;  // smallest VCO, against closest-solution mode

  VcoCandidateTable _vcoCandidates;
  SolutionTable _solutions;

  // The answer of the last run; null when that found none. A pass chooses one of _vcoCandidates.
  // The end of the run keeps it in `answer`, since the next run of any object of this thread
  // takes the table over.
  const VcoCandidate* chosen = nullptr;
  VcoCandidate answer{};

  void KeepChosen() {
    if (chosen == nullptr || chosen == &answer) return;
    answer = *chosen;
    chosen = &answer;
  }
};

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_PLLSTATE_H_
