// What is wrong with a device file, what is doubtful about it, and what it leaves out.
//
// Tested by check_test.cpp.
#ifndef VORKEL_PLANNER_DEVICE_CHECK_H_
#define VORKEL_PLANNER_DEVICE_CHECK_H_

#include <compare>
#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "planner/device/Describe.h"

namespace planner::device {

// A mistake: something for which the file is refused. The same one at several places is one.
struct Mistake {
  struct Place {
    unsigned line = 1;  // both count from 1
    unsigned column = 1;
    auto operator<=>(const Place&) const = default;
  };
  std::vector<Place> places;  // none: about the file as a whole
  std::string reason;         // a sentence of the host
  // A name that there is not, when it is that: a key, a keyword or a coefficient.
  ::Device::NameKind kind = ::Device::NameKind::kNone;
  std::string unknown;
  std::vector<std::string> known;  // and those that there are
};

// What a doubt is about.
enum class DoubtKind {
  kNothingBetween,  // `keyword`, the lower end of a range, is above `other`, the higher one
  kLowUnused,       // `keyword`, the highest PFD with bandwidth LOW, is above `other`, the
                    // highest of all
  kTargetOutside,   // `keyword`, the VCO that is recommended, is not in the range of VCOs:
                    // `other` is the end beyond which it is
  kDoubledAbove,    // `keyword`, the shortest period with feedback from CLK2X, is below `other`,
                    // that with the usual feedback
  kNeverReached,    // `keyword`, a limit of VCO, PFD or outputs, is beyond `bound`, the most or
                    // the least that settings make of `other`
  kNotWhole,        // `keyword` counts VCO periods and is not whole
  kFewDividers,     // `keyword` lets no divider be above `bound`
  kLongSearch,      // `keyword`, an end of the range of VCOs, is so far beyond `bound` that calls
                    // of the engine can take longer than usual
};

// The range that is empty, or has an end that nothing reaches.
enum class RangeOf { kNone, kVco, kPfd, kPfdLow, kOutput, kOutput1, kPeriod };

// Limits that cannot be meant, or that are odd. The same one of several grades is one.
struct Doubt {
  DoubtKind kind;
  RangeOf range = RangeOf::kNone;
  std::string pin;                  // of kPeriod
  std::vector<std::string> grades;  // those that it is true of
  std::string keyword;
  hardware::Rational value;
  std::string text;   // the decimal of the file
  std::string other;  // empty when there is none
  hardware::Rational other_value;
  std::string other_text;
  hardware::Rational bound;
  std::vector<unsigned> lines;     // of the keyword, one for each grade
  std::vector<Primitive> touched;  // the primitives that it concerns
  std::vector<Primitive> lost;     // those of them that can do nothing with such limits
};

std::vector<Doubt> Doubts(const Description& description);
// Those of one grade.
std::vector<Doubt> Doubts(const GradeDescription& grade);

// How much of a primitive a grade has.
struct Coverage {
  Primitive primitive;
  int there = 0;  // keywords
  int needed = 0;
  int own = 0;  // of those that are there, those that no other primitive needs
  bool IsComplete() const { return there == needed; }
  // Whether something is missing, beside limits that are of no other use.
  bool IsBegun() const { return there != needed && own != 0; }
};
std::vector<Coverage> CoverageOf(const GradeDescription& grade);  // of all primitives, in order

// A keyword that a grade lacks, and the primitives that this costs: those that are begun.
struct Missing {
  Keyword keyword;
  std::vector<Primitive> costs;
};
std::vector<Missing> MissingOf(const GradeDescription& grade);

// More mistakes are not told.
inline constexpr std::size_t kMostMistakes = 20;

// All that is to be said of the text of a device file.
struct Checked {
  std::vector<Mistake> mistakes;  // in the order of their first places, kMostMistakes at most
  std::size_t untold = 0;         // how many there are beside them
  Description description;        // of a file with mistakes: as far as it could be read
  std::vector<Doubt> doubts;
};
Checked Check(std::string_view text, const std::string& path, std::string_view device);

}  // namespace planner::device

#endif  // VORKEL_PLANNER_DEVICE_CHECK_H_
