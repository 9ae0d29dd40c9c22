// What is wrong with what a user has written, as data: where it stands, what it is about, and the
// text itself. MistakeText.h makes sentences of it.
#ifndef VORKEL_PLANNER_READ_MISTAKE_H_
#define VORKEL_PLANNER_READ_MISTAKE_H_

#include <optional>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "hardware/Primitive.h"

namespace planner::read {

// What a value can be.
enum class ValueKind {
  kFrequency,       // MHz
  kPhase,           // degrees
  kDuty,            // percent
  kJitter,          // ps
  kTolerance,       // ppm
  kInputTolerance,  // ppm
  kNumber,          // without unit
  kPhaseTolerance,  // degrees
  kDutyTolerance,   // percent points
  kMaxJitter,       // ps
  kGap,             // of edges, ns
  kShare            // percent
};

// Where something stands, and what it is called there.
struct Place {
  std::string file;   // as the user has named it; empty: an option or the entry of a dict
  int line = 0;       // from 1; 0: the file as a whole
  int column = 0;     // from 1, counted in letters; 0: the line as a whole
  std::string entry;  // "--in" of options, "inputs" of files; empty: the request as a whole
  int index = -1;     // of one input or output, from 0; -1: the entry as a whole
  std::string key;    // of an output or an input: "phase"

  bool IsInFile() const { return !file.empty(); }
  bool operator==(const Place&) const = default;
};

enum class MistakeKind {
  // One value. `text` is all of it.
  kNotAValue,       // hint: the same with a decimal point, when it has a decimal comma; other: the
                    // entries of a list with commas, when it has blanks between them
  kNumberTooLarge,  // text: the number
  kNumberTooSmall,  // text: the number, which is not 0
  kTooManyDigits,   // text: the number
  kDividesByZero,
  kMustBe,       // demand
  kOutOfRange,   // of the kind of value
  kUnknownUnit,  // other: the unit
  kOtherUnit,    // other: a unit, such as mHz, that means something else than `hint`
  // A list of values.
  kNumberMissing,
  kEmptyList,
  kBareBesideUnit,  // text: an entry without a unit; other: one with the unit `hint`
  kTooMany,         // count, most; primitive when it is that one's limit
  kCountDiffers,    // count entries for `most` outputs; hint: the outputs, when these have been
                    // written with decimal commas, as `other`
  kNothingUsed,     // all outputs are "-"
  // Names and switches.
  kNotAName,        // text must be one of `known`
  kNotASwitch,      // text must be 1 or 0, true or false
  kContradiction,   // with the option or entry `other`, whose value is `text`
  kTwice,           // an option
  kOtherPrimitive,  // the request is for a `text`, the command for a `primitive`
  // Settings.
  kNoSetting,       // text is no `other`; hint: what it can be
  kNotOfPrimitive,  // the `primitive` has no such setting
  kUnset,           // output `count` has no divider or pin, `other`, but is asked for
  kNotAPlan,        // a JSON text without answers, or an answer without settings
  kNoAnswer,        // no answer of the plan has the number `count`
  // A request as a whole.
  kMissing,        // place.entry: what is not said, as an option; file: what does not say it;
                   // hint: of settings, what it is
  kUnknownEntry,   // text; known: those there are
  kUnknownOption,  // text; known: those there are
  // JSON and TOML.
  kSyntax,       // fault; text: what stands there, empty: the end of the file
  kWrongType,    // other: the type that is there; known: those that may be
  kNoFrequency,  // an output without a frequency
  // Tcl.
  kScript  // text: the sentence of the script's interpreter; other: a command that there
           // is not; known: those that there are
};

// What a number must be.
enum class NumberDemand {
  kNone,
  kAboveZero,
  kNotNegative,
  kAtMostOneMs,
  kPercentage,
  kPartOfPeriod,
  kTurn,
  kAtMostTenPercent
};

// How a JSON text is no JSON.
enum class SyntaxFault {
  kNone,
  kValueExpected,
  kNameExpected,
  kColonExpected,
  kCommaOrBracket,
  kCommaOrBrace,
  kMoreBehind,
  kEntryTwice,  // text: the name
  kTextNotClosed,
  kNoEscape,
  kControlLetter,
  kTooDeep,
  kNoUnicode,  // bytes that are no UTF-8
  kOther       // other: the sentence of the TOML reader
};

struct Mistake {
  MistakeKind kind = MistakeKind::kNotAValue;
  Place place;
  ValueKind value_kind = ValueKind::kFrequency;
  NumberDemand demand = NumberDemand::kNone;
  SyntaxFault fault = SyntaxFault::kNone;
  std::string text;  // as the user has written it
  std::string other;
  std::string hint;  // what to write instead, where that is known
  std::vector<std::string> known;
  int count = 0;
  int most = 0;
  std::optional<hardware::Primitive> primitive;

  bool operator==(const Mistake&) const = default;
};

using Mistakes = std::vector<Mistake>;

// For callers that want an exception; the readers themselves collect mistakes.
class MistakeError : public std::runtime_error {
 public:
  explicit MistakeError(Mistakes all);  // one at least
  const Mistakes& All() const { return all_; }

 private:
  Mistakes all_;
};

// Something that may not be meant, beside a request that can be read.
enum class DoubtKind {
  kDecimalComma,       // text: a list that looks like one number with a comma; hint: that number
  kJitterAbovePeriod,  // text: the jitter of the input; hint: the period that it is above; ps
  kNoDuty              // all duty cycles are 0, which asks for none
};

struct Doubt {
  DoubtKind kind = DoubtKind::kDecimalComma;
  Place place;
  std::string text;
  std::string hint;
  bool operator==(const Doubt&) const = default;
};

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_MISTAKE_H_
