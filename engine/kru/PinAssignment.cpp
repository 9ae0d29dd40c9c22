// Which pin could serve each output: once for the list F (CLKIN_DIVIDE_BY_2 = FALSE) and once
// for the list T (TRUE), in which the primitive sees half the input frequency.
//
// The frequency picks one of three tables, or the search for a divided or synthesised clock;
// the phase picks the row. Phases count from the phase offset and compare exactly.
//
// Tested by kru_pin_assignment_test.cpp.

#include <algorithm>
#include <iterator>
#include <span>

#include "engine/kru/Stages.h"
#include "hardware/Kru.h"

namespace Ip::Kru {

namespace {

constexpr double kFrequencyTolerance = 0.001;  // MHz

// The values of the CLKDV divide, in the order in which they are tried. There is no 1.5, and
// there is a 17; both are meant so.
constexpr double kClkdvValues[] = {2.0, 2.5, 3.0, 3.5, 4.0, 4.5, 5.0,  5.5,  6.0,  6.5,  7.0,
                                   7.5, 8.0, 9.0, 10.0, 11.0, 12.0, 13.0, 14.0, 15.0, 16.0, 17.0};
static_assert(std::equal(std::begin(kClkdvValues), std::end(kClkdvValues),
                         hardware::kClkdvHalves.begin(), hardware::kClkdvHalves.end(),
                         [](double divide, int halves) { return 2.0 * divide == halves; }));

// Output 0 on CLK2X takes the feedback from there, and the maxima of the list's other outputs
// are then those of the 2X feedback.
struct Feedback2x {
  bool f = false;
  bool t = false;
};

// The range of a pin: which fields of the limits, and whose flag picks the maximum.
struct Range {
  double KruLimits::*min;
  double KruLimits::*max;
  double KruLimits::*max2x;
  bool Feedback2x::*flag;

  bool Holds(double f, const KruLimits& limits, const Feedback2x& feedback2x) const {
    return InRange(f, limits.*min, limits.*(feedback2x.*flag ? max2x : max));
  }
};

using L = KruLimits;
constexpr bool Feedback2x::*byF = &Feedback2x::f;
constexpr bool Feedback2x::*byT = &Feedback2x::t;
constexpr Range kClk0ByF = {&L::_kruClk0Min, &L::_kruClk0Max, &L::_kruClk0Max2x, byF};
constexpr Range kClk0ByT = {&L::_kruClk0Min, &L::_kruClk0Max, &L::_kruClk0Max2x, byT};
constexpr Range kClk90ByF = {&L::_kruClk90Min, &L::_kruClk90Max, &L::_kruClk90Max2x, byF};
constexpr Range kClk90ByT = {&L::_kruClk90Min, &L::_kruClk90Max, &L::_kruClk90Max2x, byT};
constexpr Range kClkdvByF = {&L::_kruClkdvMin, &L::_kruClkdvMax, &L::_kruClkdvMax2x, byF};
constexpr Range kClkdvByT = {&L::_kruClkdvMin, &L::_kruClkdvMax, &L::_kruClkdvMax2x, byT};
// One maximum only.
constexpr Range kClk2x = {&L::_kruClk2xMin, &L::_kruClk2xMax, &L::_kruClk2xMax, byF};
constexpr Range kClkfx = {&L::_kruClkfxMin, &L::_kruClkfxMax, &L::_kruClkfxMax, byF};

// A list of pins, and the flag that CLK2X on its output 0 sets.
struct List {
  KruPinList KruState::*pins;
  bool Feedback2x::*feedback2x;
};
constexpr List kListF = {&KruState::_kruPinsDivBy2F, byF};
constexpr List kListT = {&KruState::_kruPinsDivBy2T, byT};

// What a row puts into one list: a pin, when the frequency is in its range.
struct Use {
  List list = kListF;
  KruPin pin = KruPin::NONE;
  Range range = kClkfx;
};

// A row of a table: the phase above the offset; without feedback, the pin of both lists, if
// CLKFX has the range for it; with feedback, what goes into the lists, in the order in which the
// ranges are tested and their refusals traced, and the CLKDV value that list F needs then, whether
// or not its range test holds.
struct Row {
  double phase;
  KruPin withoutFeedback;
  Use first;
  Use second = {};
  double clkdvF = 0.0;
};

using enum KruPin;

// The output has the input frequency. That CLK90 goes by the flag of list T, and CLK270 by that
// of list F, is meant so.
constexpr Row kInputFrequency[] = {
    //  phase  no feedback  with feedback
    {0.0, CLKFX, {kListF, CLK0, kClk0ByF}, {kListT, CLK2X, kClk2x}},
    {90.0, NONE, {kListF, CLK90, kClk90ByT}},
    {180.0, CLKFX180, {kListF, CLK180, kClk0ByF}, {kListT, CLK2X180, kClk2x}},
    {270.0, NONE, {kListF, CLK270, kClk90ByF}},
};

// Half the input frequency. Where CLKDV is out of range its value is recorded all the same;
// that is meant so, and the search for one common value sees it. List T, whose CLK0 has the
// frequency as it is, comes first.
constexpr Row kHalfFrequency[] = {
    {0.0, CLKFX, {kListT, CLK0, kClk0ByT}, {kListF, CLKDV, kClkdvByF}, 2.0},
    {90.0, NONE, {kListT, CLK90, kClk90ByT}},
    {180.0, CLKFX180, {kListT, CLK180, kClk0ByT}},
    {270.0, NONE, {kListT, CLK270, kClk90ByT}},
};

// Twice the input frequency.
constexpr Row kDoubleFrequency[] = {
    {0.0, CLKFX, {kListF, CLK2X, kClk2x}, {kListT, CLKFX, kClkfx}},
    {180.0, CLKFX180, {kListF, CLK2X180, kClk2x}},
};

// The assignment of one run.
class Assignment {
 public:
  Assignment(VorkelImp& imp, const Run& run)
      : kru_(imp.kru), limits_(imp.kruLimits), requests_(imp.requests), run_(run) {}

  ClkdvLists AssignAll() {
    for (int n = 0; n < run_.numOut; ++n) Assign(n);
    return clkdv_;
  }

 private:
  void Assign(int n) {
    output_ = static_cast<std::size_t>(n);
    frequency_ = requests_.reqOutFreq[output_];
    TRACE(run_.trace, "DLL ------ Clk_Out%d ofreq = %3.3f; phase = %3.3f\n", n, frequency_,
          requests_.reqPhase[output_]);
    const double half = run_.inFreq * 0.5;
    if (FrequencyIs(run_.inFreq)) {
      AssignByTable(kInputFrequency);
    } else if (FrequencyIs(half)) {
      AssignByTable(kHalfFrequency);
    } else if (FrequencyIs(run_.inFreq * 2.0)) {
      AssignByTable(kDoubleFrequency);
    } else {
      AssignOther(half);
    }
  }

  bool FrequencyIs(double f) const { return Matches(frequency_, f, kFrequencyTolerance); }
  bool PhaseIs(double phase) const {
    return requests_.reqPhase[output_] == kru_._kruPhaseOffset + phase;
  }

  void AssignByTable(std::span<const Row> table) {
    for (const Row& row : table) {
      if (!PhaseIs(row.phase)) continue;
      if (run_.feedbackUsed) {
        Put(row.first);
        Put(row.second);
        clkdv_.f[output_] = row.clkdvF;
      } else if (row.withoutFeedback != NONE && InRangeOf(row.withoutFeedback, kClkfx)) {
        kru_._kruPinsDivBy2F[output_] = row.withoutFeedback;
        kru_._kruPinsDivBy2T[output_] = row.withoutFeedback;
      }
      return;
    }
  }

  // Puts a pin into its list, if its range holds the frequency.
  void Put(const Use& use) {
    if (use.pin == NONE || !InRangeOf(use.pin, use.range)) return;
    (kru_.*use.list.pins)[output_] = use.pin;
    if (use.pin == CLK2X && output_ == 0) feedback2x_.*use.list.feedback2x = true;
  }

  // True when the range holds the frequency; else the trace says that the pin cannot be used.
  bool InRangeOf(KruPin pin, const Range& range) const {
    if (range.Holds(frequency_, limits_, feedback2x_)) return true;
    TraceOutOfRange(pin);
    return false;
  }

  void TraceOutOfRange(KruPin pin) const {
    TRACE(run_.trace, "DLL -!!!!!! Can't %suse %s because requested freq %3.3f is out of range\n",
          UsesSynthesiser(pin) ? "potentially " : "", KruPinName(pin).CStr(), frequency_);
  }

  // Any other frequency: CLKDV where a value divides the input to it, else CLKFX.
  void AssignOther(double half) {
    bool foundF = false;
    bool foundT = false;
    if (run_.feedbackUsed) {
      for (const double value : kClkdvValues) {
        if (foundF && foundT) return;
        if (!foundF && FrequencyIs(run_.inFreq / value)) {
          // This value is not tried for list T, whatever comes of it here.
          if (!PhaseIs(0.0) || !InRangeOf(CLKDV, kClkdvByF)) continue;
          PutClkdv(kru_._kruPinsDivBy2F, clkdv_.f, value);
          foundF = true;
        } else if (!foundT && FrequencyIs(half / value)) {
          if (!PhaseIs(0.0)) {
            // The words speak of the frequency; they stand for the phase, too.
            TraceOutOfRange(CLKDV);
          } else if (kClkdvByT.Holds(frequency_, limits_, feedback2x_)) {
            PutClkdv(kru_._kruPinsDivBy2T, clkdv_.t, value);
            foundT = true;
          }
        }
      }
      if (foundF && foundT) return;
    }
    if (PhaseIs(0.0) && InRangeOf(CLKFX, kClkfx)) {
      if (!foundF) kru_._kruPinsDivBy2F[output_] = CLKFX;
      if (!foundT) kru_._kruPinsDivBy2T[output_] = CLKFX;
    }
    if (PhaseIs(180.0) && InRangeOf(CLKFX180, kClkfx)) {
      // Without feedback list F stays unfilled; that is meant so.
      if (run_.feedbackUsed) kru_._kruPinsDivBy2F[output_] = CLKFX180;
      kru_._kruPinsDivBy2T[output_] = CLKFX180;
    }
  }

  void PutClkdv(KruPinList& list, ClkdvList& values, double value) {
    list[output_] = CLKDV;
    values[output_] = value;
  }

  KruState& kru_;
  const KruLimits& limits_;
  const Requests& requests_;
  const Run& run_;
  Feedback2x feedback2x_;
  ClkdvLists clkdv_;

  // The output at hand.
  std::size_t output_ = 0;
  double frequency_ = 0.0;
};

}  // namespace

ClkdvLists AssignPins(VorkelImp& imp, const Run& run) {
  KruState& kru = imp.kru;
  kru._kruChosenM = 0;
  kru._kruChosenD = 0;
  TRACE(run.trace, "DLL ---- Checking if KRU will work\n");
  kru._kruChosenPin.fill(NONE);
  kru._kruPinsDivBy2T.fill(NONE);
  kru._kruPinsDivBy2F.fill(NONE);

  const ClkdvLists clkdv = Assignment(imp, run).AssignAll();

  for (int n = 0; n < run.numOut; ++n) {
    TRACE(run.trace, "DLL --------- _kruPinsDivBy2False[%d] = %s\n", n,
          KruPinName(kru._kruPinsDivBy2F[static_cast<std::size_t>(n)]).CStr());
  }
  for (int n = 0; n < run.numOut; ++n) {
    TRACE(run.trace, "DLL --------- _kruPinsDivBy2True[%d] = %s\n", n,
          KruPinName(kru._kruPinsDivBy2T[static_cast<std::size_t>(n)]).CStr());
  }
  return clkdv;
}

}  // namespace Ip::Kru
