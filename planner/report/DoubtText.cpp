// Tested by devices_text_test.cpp.
#include "planner/report/DoubtText.h"

#include <cassert>

#include "hardware/Loop.h"
#include "planner/report/Numbers.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using device::DoubtKind;
using device::RangeOf;
using std::string;

string KeywordWords(const device::Doubt& doubt) { return doubt.keyword + ", " + doubt.text; }
string OtherWords(const device::Doubt& doubt) { return doubt.other + ", " + doubt.other_text; }

// "FIRST, 6000, is above OTHER, 1440".
string Compared(const device::Doubt& doubt) {
  const char* const where = doubt.value > doubt.other_value ? ", is above " : ", is below ";
  return KeywordWords(doubt) + where + OtherWords(doubt);
}

string RangeWords(const device::Doubt& doubt) {
  switch (doubt.range) {
    case RangeOf::kVco:
      return "VCO frequency";
    case RangeOf::kPfd:
      return "PFD frequency";
    case RangeOf::kPfdLow:
      return "PFD frequency with bandwidth LOW";
    case RangeOf::kOutput:
      return "output frequency";
    case RangeOf::kOutput1:
      return "frequency of output 1";
    case RangeOf::kPeriod:
      return "period of " + doubt.pin;
    case RangeOf::kNone:  // not reached: it is a range that is empty or has an end
      break;              // not reached: as above
  }
  return (assert(false), "");  // not reached: as above
}

string NeverReached(const device::Doubt& doubt) {
  const bool is_above = doubt.value > doubt.bound;
  string text = KeywordWords(doubt) + ", is never reached: with " + OtherWords(doubt);
  text += is_above ? ", settings go up to " : ", settings go down to ";
  return text + General(doubt.bound, 6) + " MHz";
}

string FewDividers(const device::Doubt& doubt) {
  const string largest = Short(doubt.bound, 0);
  return KeywordWords(doubt) + ", is so low that no divider can be above " +
         (doubt.bound > Rational(1) ? "twice that, " + largest : largest) +
         ": its high and low times do not fit; the engine takes up to " +
         std::to_string(hardware::kLargestDivider) + " all the same";
}

string LongSearch(const device::Doubt& doubt) {
  const bool is_slow = doubt.value < doubt.bound;
  string text = KeywordWords(doubt) + (is_slow ? ", is below " : ", is above ");
  text += Short(doubt.bound, 0) + " MHz: ";
  text += is_slow ? "so slow a VCO has many dividers for an output 0 that is shifted"
                  : "so fast a VCO makes nothing else of an output 0 that is shifted, and no other "
                    "phases";
  return text + "; a call of the engine that finds nothing can take longer than 10 ms" +
         (is_slow ? "" : ", and up to a second");
}

}  // namespace

string NothingWords(const device::Doubt& doubt) {
  return doubt.kind == DoubtKind::kNothingBetween ? RangeWords(doubt) : "";
}

string DoubtText(const device::Doubt& doubt) {
  switch (doubt.kind) {
    case DoubtKind::kNothingBetween:
      return Compared(doubt) + ": there is no " + RangeWords(doubt);
    case DoubtKind::kLowUnused:
      return Compared(doubt) + ", which is the highest PFD frequency with bandwidth LOW, too";
    case DoubtKind::kTargetOutside:
      return Compared(doubt) + ": the VCO frequency that is recommended is outside of its range";
    case DoubtKind::kDoubledAbove:
      return Compared(doubt) + ": with feedback from CLK2X, " +
             (doubt.pin.empty() ? "the pin" : doubt.pin) + " would be faster than without";
    case DoubtKind::kNeverReached:
      return NeverReached(doubt);
    case DoubtKind::kNotWhole:
      return KeywordWords(doubt) + ", is a count of VCO cycles and should be a whole number";
    case DoubtKind::kFewDividers:
      return FewDividers(doubt);
    case DoubtKind::kLongSearch:
      break;
  }
  return LongSearch(doubt);
}

string GradesWords(const device::Doubt& doubt) {
  return (doubt.grades.size() > 1 ? "grades " : "grade ") + Enumerated(doubt.grades);
}

}  // namespace planner::report
