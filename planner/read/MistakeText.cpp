// Tested by mistake_text_test.cpp.
#include "planner/read/MistakeText.h"

#include <fmt/format.h>

#include <cassert>
#include <string_view>

#include "planner/read/Shown.h"

namespace planner::read {

namespace {

// What messages say of a kind of value.
struct KindText {
  std::string_view article;
  std::string_view examples;
  std::string_view units;
  std::string_view bounds;
  std::string_view usual_unit;  // of a number without one, as it is named and written
};

KindText TextOf(ValueKind kind) {
  switch (kind) {
    case ValueKind::kFrequency:
      return {"a frequency", "100, 148.5MHz, 100/3 or 8ns",
              "Hz, kHz, MHz and GHz, or ps, ns, us and ms for a period", "1 Hz to 1000 GHz", "MHz"};
    case ValueKind::kPhase:
      return {"a phase", "90, 90deg or -45", "deg", "-360 to 360 degrees", "degrees"};
    case ValueKind::kDuty:
      return {"a duty cycle", "50, 50% or 33.3", "%", "0 to 100 percent", "percent"};
    case ValueKind::kJitter:
      return {"a jitter", "50, 50ps or 0.05ns", "fs, ps, ns, us and ms", "0 to 1 ms", "ps"};
    case ValueKind::kTolerance:
      return {"a tolerance", "100, 100ppm or 0.01%", "ppm, ppb and %", "0 to 1000000000 ppm",
              "ppm"};
    case ValueKind::kInputTolerance:
      return {"a tolerance of the input", "50, 50ppm or 0.005%", "ppm, ppb and %",
              "0 to 100000 ppm", "ppm"};
    case ValueKind::kNumber:
      return {"a number", "44 or 41.625", "", "", ""};
    case ValueKind::kPhaseTolerance:
      return {"a tolerance of a phase", "0.5, 0.5deg or 5", "deg", "0 to 360 degrees", "degrees"};
    case ValueKind::kDutyTolerance:
      return {"a tolerance of a duty cycle", "0.5, 0.5% or 5", "%", "0 to 100 percent points",
              "percent"};
    case ValueKind::kGap:
      // Or a share of a period, which is a kind of its own.
      return {"a gap", "0.5, 0.5ns, 500ps or 20%", "fs, ps, ns, us, ms and %", "0 to 1 ms", "ns"};
    case ValueKind::kShare:
      return {"a share", "25%", "%", "0 to 100 percent", "percent"};
    case ValueKind::kMaxJitter:
      break;
  }
  return {"a jitter", "200, 200ps or 0.2ns", "fs, ps, ns, us and ms", "0 to 1 ms", "ps"};
}

std::string_view TextOf(NumberDemand demand) {
  switch (demand) {
    case NumberDemand::kAboveZero:
      return "greater than 0";
    case NumberDemand::kNotNegative:
      return "0 or greater";
    case NumberDemand::kAtMostOneMs:
      return "at most 1 ms";
    case NumberDemand::kPercentage:
      return "between 0 and 100";
    case NumberDemand::kPartOfPeriod:
      return "above 0 and below 100";
    case NumberDemand::kAtMostTenPercent:
      return "at most 100000 ppm";
    case NumberDemand::kTurn:
      return "between -360 and 360";
    case NumberDemand::kNone:
      break;
  }
  return "";
}

// A type of JSON or TOML with its article.
std::string TypeText(std::string_view type, bool is_there) {
  if (type == "object") return "an object";
  if (type == "array") return "an array";
  if (type == "string") return "a text in quotes";
  if (type == "boolean") return is_there ? "a boolean" : "true or false";
  if (type == "null") return "null";
  return fmt::format("a {}", type);
}

std::string SyntaxText(const Mistake& mistake) {
  const std::string seen = mistake.text.empty()   ? "the end of the file"
                           : mistake.text == "\"" ? "'\"'"
                                                  : fmt::format("\"{}\"", Shown(mistake.text));
  switch (mistake.fault) {
    case SyntaxFault::kValueExpected:
      return fmt::format("a value must be here, not {}", seen);
    case SyntaxFault::kNameExpected:
      return fmt::format("a name in quotes must be here, not {}", seen);
    case SyntaxFault::kColonExpected:
      return fmt::format("a colon must be here, not {}", seen);
    case SyntaxFault::kCommaOrBracket:
      return fmt::format("a comma or ] must be here, not {}", seen);
    case SyntaxFault::kCommaOrBrace:
      return fmt::format("a comma or }} must be here, not {}", seen);
    case SyntaxFault::kMoreBehind:
      return fmt::format("there is more behind the end, {}", seen);
    case SyntaxFault::kEntryTwice:
      return fmt::format("the entry \"{}\" is there twice", Shown(mistake.text));
    case SyntaxFault::kTextNotClosed:
      return "the text in quotes that begins here does not end";
    case SyntaxFault::kNoEscape:
      return "JSON has no such escape";
    case SyntaxFault::kControlLetter:
      return "a control character must be written as an escape";
    case SyntaxFault::kTooDeep:
      return "it is nested too deeply";
    case SyntaxFault::kNoUnicode:
      return "the text is not UTF-8 here";
    case SyntaxFault::kOther:
    case SyntaxFault::kNone:
      break;
  }
  return ShownWhole(mistake.other);
}

std::string Outputs(int count) {
  return count == 1 ? "is 1 output" : fmt::format("are {} outputs", count);
}

// "--in is missing: the input frequency, such as --in 100". A line of a batch has no options beside
// it: its place says so.
std::string MissingText(const Mistake& mistake) {
  if (!mistake.hint.empty()) {
    return fmt::format("{} is missing: {}", mistake.place.entry, mistake.hint);
  }
  if (mistake.place.line > 0) {
    return fmt::format("{}:{}: the request has no {}", ShownWhole(mistake.place.file),
                       mistake.place.line, mistake.place.entry);
  }
  const bool is_input = mistake.place.entry == "--in";
  std::string missing = fmt::format("{} is missing", mistake.place.entry);
  if (mistake.place.IsInFile()) {
    missing = fmt::format("{} has no {}, and {}", ShownWhole(mistake.place.file),
                          is_input ? "inputs" : "outputs", missing);
  }
  return fmt::format(
      "{}: the {}", missing,
      is_input ? "input frequency, such as --in 100" : "output frequencies, such as --out 200,50");
}

// A sentence that its place does not begin: nothing for all others.
std::string WithoutPlace(const Mistake& mistake) {
  switch (mistake.kind) {
    case MistakeKind::kMissing:
      return MissingText(mistake);
    case MistakeKind::kTwice:
      return fmt::format("{} is given twice", mistake.place.entry);
    case MistakeKind::kUnknownOption:
      return fmt::format("unknown option {}{}", Shown(mistake.text),
                         DidYouMean(mistake.text, mistake.known));
    case MistakeKind::kNoFrequency:
      return fmt::format("{} has no frequency", TextOf(mistake.place));
    case MistakeKind::kContradiction:
      if (mistake.place.IsInFile()) {
        return fmt::format("{} contradicts the {}", TextOf(mistake.place), mistake.other);
      }
      return fmt::format("{} and {} {} contradict each other", mistake.place.entry, mistake.other,
                         Shown(mistake.text));
    default:
      return "";
  }
}

// What is wrong with a single value.
std::string ValueText(const Mistake& mistake) {
  const KindText kind = TextOf(mistake.value_kind);
  const std::string shown = Shown(mistake.text);
  switch (mistake.kind) {
    case MistakeKind::kNotAValue: {
      if (!mistake.other.empty()) {
        return fmt::format("\"{}\" is a list without commas; write {}", shown,
                           Shown(mistake.other));
      }
      const std::string point =
          mistake.hint.empty()
              ? ""
              : fmt::format("; with a decimal point it is {}", Shown(mistake.hint));
      return fmt::format("\"{}\" is not {}, such as {}{}", shown, kind.article, kind.examples,
                         point);
    }
    case MistakeKind::kNumberTooLarge:
      return fmt::format("{} is too large", shown);
    case MistakeKind::kNumberTooSmall:
      return fmt::format("{} is too small", shown);
    case MistakeKind::kTooManyDigits:
      return fmt::format("{} has more than 100 digits", shown);
    case MistakeKind::kDividesByZero:
      return fmt::format("\"{}\" divides by 0", shown);
    case MistakeKind::kMustBe:
      return fmt::format("{} must be {}", shown, TextOf(mistake.demand));
    case MistakeKind::kOutOfRange:
      return fmt::format("{} is out of range: {} is from {}", shown, kind.article, kind.bounds);
    case MistakeKind::kUnknownUnit:
      if (kind.units.empty()) return fmt::format("\"{}\" is a number with a unit", shown);
      return fmt::format("unknown unit \"{}\" in \"{}\"; the units of {} are {}",
                         Shown(mistake.other), shown, kind.article, kind.units);
    case MistakeKind::kOtherUnit:
      return fmt::format("{} in \"{}\" is {}; write {}", mistake.other, shown,
                         mistake.other == "Ps"   ? "petaseconds"
                         : mistake.other == "Ms" ? "megaseconds"
                                                 : "millihertz",
                         mistake.hint);
    default:
      return "";
  }
}

// What is wrong with a list or a name.
std::string ListText(const Mistake& mistake) {
  const std::string shown = Shown(mistake.text);
  switch (mistake.kind) {
    case MistakeKind::kNumberMissing:
      return fmt::format("a number is missing in \"{}\"", shown);
    case MistakeKind::kEmptyList:
      return "the list is empty";
    case MistakeKind::kBareBesideUnit: {
      const std::string_view usual = TextOf(mistake.value_kind).usual_unit;
      return fmt::format(
          "\"{0}\" has no unit, and beside \"{1}\" it could be in {2} or in {3}; write {0}{2} or "
          "{0}{3}",
          shown, Shown(mistake.other), usual, mistake.hint);
    }
    case MistakeKind::kTooMany:
      return fmt::format(
          "at most {} {}{}, not {}", mistake.most, mistake.most == 1 ? "frequency" : "frequencies",
          mistake.primitive ? fmt::format(" of a {}", hardware::Name(*mistake.primitive)) : "",
          mistake.count);
    case MistakeKind::kCountDiffers:
      return fmt::format("{} in the list, but there {}{}", mistake.count, Outputs(mistake.most),
                         mistake.hint.empty() ? ""
                                              : fmt::format("; with a decimal point {} is {}",
                                                            mistake.other, mistake.hint));
    case MistakeKind::kNothingUsed:
      return "no output is used";
    case MistakeKind::kNotAName:
      return fmt::format("\"{}\" must be {}", shown, Enumerated(mistake.known, "or"));
    case MistakeKind::kNotASwitch:
      return fmt::format("\"{}\" must be 1 or 0", shown);
    case MistakeKind::kOtherPrimitive:
      return fmt::format("the request is for a {}, this command for a {}", mistake.text,
                         hardware::Name(*mistake.primitive));
    default:
      return "";
  }
}

// What is wrong with settings.
std::string SettingText(const Mistake& mistake) {
  switch (mistake.kind) {
    case MistakeKind::kNoSetting:
      return fmt::format("{} is no {}: {}", Shown(mistake.text), mistake.other, mistake.hint);
    case MistakeKind::kNotOfPrimitive:
      return fmt::format("a {} has no such setting", hardware::Name(*mistake.primitive));
    case MistakeKind::kUnset:
      return fmt::format("output {} has no {}, but is asked for", mistake.count, mistake.other);
    case MistakeKind::kNotAPlan:
      return "no plan with settings, such as --format json writes";
    case MistakeKind::kNoAnswer:
      return fmt::format("the plan has no answer with number {}", mistake.count);
    default:
      return "";
  }
}

// What is wrong with a file.
std::string FileText(const Mistake& mistake) {
  switch (mistake.kind) {
    case MistakeKind::kUnknownEntry: {
      std::string entries;
      for (const std::string& name : mistake.known) {
        entries += (entries.empty() ? "" : ", ") + name;
      }
      return fmt::format("unknown entry \"{}\"; the entries are {}{}", Shown(mistake.text), entries,
                         DidYouMean(mistake.text, mistake.known));
    }
    case MistakeKind::kSyntax:
      return fmt::format("no valid {}: {}", mistake.fault == SyntaxFault::kOther ? "TOML" : "JSON",
                         SyntaxText(mistake));
    case MistakeKind::kWrongType: {
      std::vector<std::string> wanted;
      for (const std::string& type : mistake.known) wanted.push_back(TypeText(type, false));
      const bool is_whole = mistake.place.entry.empty();
      return fmt::format("{}must be {}, not {}", is_whole ? "no request: it " : "",
                         Enumerated(wanted, "or"), TypeText(mistake.other, true));
    }
    case MistakeKind::kScript:
      return ShownWhole(mistake.text) + DidYouMean(mistake.other, mistake.known);
    default:                       // not reached: the others have words for all other kinds
      return (assert(false), "");  // not reached: as above
  }
}

}  // namespace

std::string TextOf(const Place& place) {
  std::string name = place.entry;
  if (place.index >= 0) {
    // The entries are lists: "output 0" is one of the outputs.
    if (!name.empty() && name.back() == 's') name.pop_back();
    name += fmt::format(" {}", place.index);
  }
  if (!place.key.empty()) name += ": " + place.key;
  if (!place.IsInFile()) return name;
  std::string text = ShownWhole(place.file);
  if (place.line > 0) text += fmt::format(":{}", place.line);
  if (place.column > 0) text += fmt::format(":{}", place.column);
  return name.empty() ? text : fmt::format("{}: {}", text, name);
}

std::string TextOf(const Mistake& mistake) {
  std::string text = WithoutPlace(mistake);
  if (!text.empty()) return text;
  text = ValueText(mistake);
  if (text.empty()) text = ListText(mistake);
  if (text.empty()) text = SettingText(mistake);
  if (text.empty()) text = FileText(mistake);
  const std::string place = TextOf(mistake.place);
  if (mistake.kind == MistakeKind::kWrongType && !mistake.place.entry.empty()) {
    return fmt::format("{} {}", place, text);
  }
  return place.empty() ? text : fmt::format("{}: {}", place, text);
}

std::string TextOf(const Doubt& doubt) {
  const std::string place = TextOf(doubt.place);
  switch (doubt.kind) {
    case DoubtKind::kJitterAbovePeriod:
      return fmt::format("{}: a jitter of {} ps is above the period of the input, {} ps", place,
                         Shown(doubt.text), doubt.hint);
    case DoubtKind::kNoDuty:
      return fmt::format("{}: 0 asks for no duty cycle, as - does", place);
    case DoubtKind::kDecimalComma:
      break;
  }
  return fmt::format("{} {} is a list of two; with a decimal point it is {}", place,
                     Shown(doubt.text), doubt.hint);
}

MistakeError::MistakeError(Mistakes all)
    : std::runtime_error(TextOf(all.front())), all_(std::move(all)) {}

}  // namespace planner::read
