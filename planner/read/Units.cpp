// Tested by units_test.cpp.
#include "planner/read/Units.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdlib>
#include <span>
#include <utility>

#include "planner/read/Letters.h"

namespace planner::read {

namespace {

using hardware::Rational;

// What a unit does with the number before it: multiply it, or, as a period is made a frequency,
// divide by it. `power` is that of ten.
struct Unit {
  std::string_view name;  // in small letters
  int power;
  bool is_period = false;
};

constexpr std::array<Unit, 8> kFrequencyUnits = {{{"hz", -6},
                                                  {"khz", -3},
                                                  {"mhz", 0},
                                                  {"ghz", 3},
                                                  {"ps", 6, true},
                                                  {"ns", 3, true},
                                                  {"us", 0, true},
                                                  {"ms", -3, true}}};
// A degree sign is two bytes in UTF-8, and one in the encodings before it.
constexpr std::array<Unit, 5> kPhaseUnits = {
    {{"deg", 0}, {"degree", 0}, {"degrees", 0}, {"\xc2\xb0", 0}, {"\xb0", 0}}};
constexpr std::array<Unit, 2> kDutyUnits = {{{"%", 0}, {"percent", 0}}};
constexpr std::array<Unit, 5> kJitterUnits = {
    {{"fs", -3}, {"ps", 0}, {"ns", 3}, {"us", 6}, {"ms", 9}}};
constexpr std::array<Unit, 5> kGapUnits = {
    {{"fs", -6}, {"ps", -3}, {"ns", 0}, {"us", 3}, {"ms", 6}}};
constexpr std::array<Unit, 3> kToleranceUnits = {{{"ppm", 0}, {"ppb", -3}, {"%", 4}}};

std::span<const Unit> UnitsOf(ValueKind kind) {
  switch (kind) {
    case ValueKind::kFrequency:
      return kFrequencyUnits;
    case ValueKind::kPhase:
    case ValueKind::kPhaseTolerance:
      return kPhaseUnits;
    case ValueKind::kDuty:
    case ValueKind::kDutyTolerance:
    case ValueKind::kShare:
      return kDutyUnits;
    case ValueKind::kGap:
      return kGapUnits;
    case ValueKind::kTolerance:
    case ValueKind::kInputTolerance:
      return kToleranceUnits;
    case ValueKind::kNumber:
      return {};
    case ValueKind::kJitter:
    case ValueKind::kMaxJitter:
      break;
  }
  return kJitterUnits;
}

const Unit* FindUnit(std::string_view name, ValueKind kind) {
  for (const Unit& unit : UnitsOf(kind)) {
    if (IsSameWord(unit.name, name)) return &unit;
  }
  return nullptr;
}

// Units whose case says something else than what is nearly always meant, and what to write. All
// capitals, or none, say nothing.
std::string_view MeantFor(std::string_view unit) {
  if (unit == "mHz" || unit == "mHZ") return "MHz";
  if (unit == "Ps") return "ps";
  if (unit == "Ms") return "ms";
  return "";
}

// What a number of a kind must be, and is not.
NumberDemand DemandOn(const Rational& value, ValueKind kind) {
  static const Rational kMillisecond = 1'000'000'000;  // ps: beyond any clock
  static const Rational kGapMillisecond = 1'000'000;   // ns
  static const Rational kTenPercent = 100'000;         // ppm: beyond any oscillator
  switch (kind) {
    case ValueKind::kFrequency:
      return value > 0 ? NumberDemand::kNone : NumberDemand::kAboveZero;
    case ValueKind::kPhase:
      return value.Absolute() <= 360 ? NumberDemand::kNone : NumberDemand::kTurn;
    case ValueKind::kDuty:
      // 0 asks for none, as of the engine.
      return value >= 0 && value < 100 ? NumberDemand::kNone : NumberDemand::kPartOfPeriod;
    case ValueKind::kMaxJitter:
      if (value <= 0) return NumberDemand::kAboveZero;
      [[fallthrough]];
    case ValueKind::kJitter:
      if (value > kMillisecond) return NumberDemand::kAtMostOneMs;
      break;
    case ValueKind::kInputTolerance:
      if (value > kTenPercent) return NumberDemand::kAtMostTenPercent;
      break;
    case ValueKind::kTolerance:
    case ValueKind::kPhaseTolerance:
    case ValueKind::kDutyTolerance:
      break;
    case ValueKind::kNumber:
      return NumberDemand::kNone;
    case ValueKind::kGap:
      if (value > kGapMillisecond) return NumberDemand::kAtMostOneMs;
      return value > 0 ? NumberDemand::kNone : NumberDemand::kAboveZero;
    case ValueKind::kShare:
      if (value > 100) return NumberDemand::kPercentage;
      return value > 0 ? NumberDemand::kNone : NumberDemand::kAboveZero;
  }
  return value >= 0 ? NumberDemand::kNone : NumberDemand::kNotNegative;
}

// The range of what is shown in columns, in the unit of the kind.
bool IsInBounds(const Rational& value, ValueKind kind) {
  static const Rational kHertz(1, 1'000'000);
  switch (kind) {
    case ValueKind::kFrequency:
      return value >= kHertz && value <= 1'000'000;
    case ValueKind::kTolerance:
      return value <= 1'000'000'000;
    case ValueKind::kPhaseTolerance:
      return value <= 360;
    case ValueKind::kDutyTolerance:
      return value <= 100;
    default:
      return true;
  }
}

// --- Numbers --------------------------------------------------------------------------------

// A text as it is read from its beginning on.
class Scanner {
 public:
  explicit Scanner(std::string_view text) : text_(text) {}

  void SkipBlanks() {
    while (place_ < text_.size() && IsBlank(text_[place_])) ++place_;
  }
  bool Take(char letter) {
    if (place_ == text_.size() || text_[place_] != letter) return false;
    ++place_;
    return true;
  }
  std::string_view TakeDigits() {
    const std::size_t begin = place_;
    while (place_ < text_.size() && IsDigit(text_[place_])) ++place_;
    return text_.substr(begin, place_ - begin);
  }
  // A decimal number, empty where none begins.
  std::string_view TakeNumber() {
    const std::size_t begin = place_;
    if (!Take('+')) Take('-');
    const bool has_whole = !TakeDigits().empty();
    const bool has_point = Take('.');
    const bool has_fraction = has_point && !TakeDigits().empty();
    if (!has_whole && !has_fraction) {
      place_ = begin;
      return {};
    }
    TakeExponent();
    return text_.substr(begin, place_ - begin);
  }
  std::string_view Rest() const { return text_.substr(place_); }
  std::size_t Place() const { return place_; }
  void Return(std::size_t place) { place_ = place; }

 private:
  void TakeExponent() {
    const std::size_t begin = place_;
    if (!Take('e') && !Take('E')) return;
    if (!Take('+')) Take('-');
    if (TakeDigits().empty()) place_ = begin;
  }

  std::string_view text_;
  std::size_t place_ = 0;
};

// Digits that count; more of them are a slip, and slow to reckon with.
constexpr std::size_t kMostDigits = 100;
// The number of digits before the point that a number can have, and of zeros behind it.
constexpr long kLargestPower = 309;
constexpr long kSmallestPower = -1000;

// The value of a number that a Scanner has taken, or what is wrong with it.
std::pair<Rational, std::optional<MistakeKind>> ValueOf(std::string_view number) {
  Scanner scanner(number);
  const bool is_negative = scanner.Take('-');
  if (!is_negative) scanner.Take('+');
  std::string digits(scanner.TakeDigits());
  long power = 0;
  if (scanner.Take('.')) {
    const std::string_view fraction = scanner.TakeDigits();
    digits += fraction;
    power = -static_cast<long>(fraction.size());
  }
  digits.erase(0, std::min(digits.find_first_not_of('0'), digits.size()));
  while (!digits.empty() && digits.back() == '0') {
    digits.pop_back();
    ++power;
  }
  if (digits.empty()) return {};
  if (digits.size() > kMostDigits) return {0, MistakeKind::kTooManyDigits};
  if (scanner.Take('e') || scanner.Take('E')) {
    const bool is_small = scanner.Take('-');
    if (!is_small) scanner.Take('+');
    constexpr long kEnough = 1'000'000;  // beyond all bounds, with any number of digits
    long exponent = 0;
    for (const char digit : scanner.TakeDigits()) {
      exponent = std::min(kEnough, exponent * 10 + (digit - '0'));
    }
    power += is_small ? -exponent : exponent;
  }
  const long leading = power + static_cast<long>(digits.size());
  if (leading > kLargestPower) return {0, MistakeKind::kNumberTooLarge};
  if (leading < kSmallestPower) return {0, MistakeKind::kNumberTooSmall};
  const Rational value = Rational::FromDecimal(digits, static_cast<int>(power));
  return {is_negative ? -value : value, std::nullopt};
}

Rational PowerOfTen(int power) { return Rational::FromDecimal("1", power); }

// --- Values ---------------------------------------------------------------------------------

// A value, and what an entry of a list has to do with its neighbours.
struct Parsed {
  Rational value;
  std::string_view unit;  // as it is written
  bool is_usual = true;   // the unit is that of a number without one
};

// One reading of a text.
class ValueReader {
 public:
  ValueReader(std::string_view text, ValueKind kind, const Place& place, Mistakes* mistakes)
      : text_(text), kind_(kind), place_(place), mistakes_(mistakes) {}

  std::optional<Parsed> Read() {
    Scanner scanner(text_);
    scanner.SkipBlanks();
    const std::string_view first = scanner.TakeNumber();
    const std::string_view second = TakeDivisor(&scanner);
    scanner.SkipBlanks();
    const std::string_view unit = scanner.Rest();
    if (first.empty() || !CanBeUnit(unit)) return NotAValue();
    std::optional<Rational> value = Number(first);
    if (value && !second.empty()) value = Quotient(*value, second);
    if (!value || !IsAsDemanded(*value)) return std::nullopt;
    return InUnit(*value, Trimmed(unit));
  }

 private:
  static std::string_view TakeDivisor(Scanner* scanner) {
    const std::size_t back = scanner->Place();
    scanner->SkipBlanks();
    if (scanner->Take('/')) {
      scanner->SkipBlanks();
      const std::string_view divisor = scanner->TakeNumber();
      if (!divisor.empty()) return divisor;
    }
    scanner->Return(back);
    return {};
  }

  static bool CanBeUnit(std::string_view text) {
    const auto is_foreign = [](char letter) { return IsDigit(letter) || letter == ','; };
    return text.empty() ||
           (text.front() != '.' && std::none_of(text.begin(), text.end(), is_foreign));
  }

  Mistake& Add(MistakeKind kind, std::string_view text) {
    Mistake mistake;
    mistake.kind = kind;
    mistake.place = place_;
    mistake.value_kind = kind_;
    mistake.text = text;
    return mistakes_->emplace_back(std::move(mistake));
  }

  std::nullopt_t NotAValue() {
    Add(MistakeKind::kNotAValue, text_).hint = WithDecimalPoint();
    return std::nullopt;
  }

  // "148.5MHz" for "148,5MHz", or nothing.
  std::string WithDecimalPoint() const {
    const std::size_t comma = text_.find(',');
    if (comma == std::string_view::npos) return "";
    std::string changed(Trimmed(text_));
    changed[changed.find(',')] = '.';
    Mistakes ignored;
    Scanner scanner(changed);
    const std::string_view number = scanner.TakeNumber();
    const std::size_t point = number.find('.');
    if (point == std::string_view::npos || point == 0 || point + 1 == number.size()) return "";
    return ValueReader(changed, kind_, place_, &ignored).Read() ? changed : "";
  }

  std::optional<Rational> Number(std::string_view number) {
    const auto [value, trouble] = ValueOf(number);
    if (!trouble) return value;
    Add(*trouble, number);
    return std::nullopt;
  }

  std::optional<Rational> Quotient(const Rational& dividend, std::string_view number) {
    const std::optional<Rational> divisor = Number(number);
    if (!divisor) return std::nullopt;
    if (*divisor == 0) {
      Add(MistakeKind::kDividesByZero, text_);
      return std::nullopt;
    }
    return dividend / *divisor;
  }

  bool IsAsDemanded(const Rational& value) {
    const NumberDemand demand = DemandOn(value, kind_);
    if (demand == NumberDemand::kNone) return true;
    Add(MistakeKind::kMustBe, text_).demand = demand;
    return false;
  }

  std::optional<Parsed> InUnit(const Rational& number, std::string_view name) {
    const Unit* unit = name.empty() ? nullptr : FindUnit(name, kind_);
    const std::string_view meant = MeantFor(name);
    if (!meant.empty() && FindUnit(meant, kind_)) {
      Mistake& mistake = Add(MistakeKind::kOtherUnit, text_);
      mistake.other = name;
      mistake.hint = meant;
      return std::nullopt;
    }
    if (!unit && !name.empty()) {
      Add(MistakeKind::kUnknownUnit, text_).other = name;
      return std::nullopt;
    }
    Parsed parsed{number, name, !unit || (unit->power == 0 && !unit->is_period)};
    if (unit) {
      const Rational factor = PowerOfTen(unit->power);
      parsed.value = unit->is_period ? factor / number : number * factor;
    }
    if (!IsAsDemanded(parsed.value)) return std::nullopt;
    if (!IsInBounds(parsed.value, kind_)) {
      Add(MistakeKind::kOutOfRange, text_);
      return std::nullopt;
    }
    return parsed;
  }

  std::string_view text_;
  ValueKind kind_;
  const Place& place_;
  Mistakes* mistakes_;
};

// The entries of a list, without the blanks around them.
std::vector<std::string_view> EntriesOf(std::string_view text) {
  std::vector<std::string_view> entries;
  for (std::size_t comma = 0; comma != std::string_view::npos;) {
    comma = text.find(',');
    entries.push_back(Trimmed(text.substr(0, comma)));
    if (comma != std::string_view::npos) text.remove_prefix(comma + 1);
  }
  return entries;
}

// The values of a text with blanks between them, with commas instead: "148.5MHz,-,27" for
// "148.5 MHz - 27"; empty when it is no such text. Where `optional`, "-" is an entry, too.
std::string WithCommas(std::string_view text, ValueKind kind, const Place& place, bool optional) {
  std::string list;
  std::size_t count = 0;
  for (;;) {
    while (!text.empty() && IsBlank(text.front())) text.remove_prefix(1);
    if (text.empty()) break;
    const auto end = std::find_if(text.begin(), text.end(), IsBlank);
    const std::string_view word = text.substr(0, static_cast<std::size_t>(end - text.begin()));
    text.remove_prefix(word.size());
    if (!list.empty() && IsDigit(list.back()) && IsUnit(word, kind)) {
      list += word;
      continue;
    }
    Mistakes ignored;
    const bool is_value = ValueReader(word, kind, place, &ignored).Read().has_value();
    if (!is_value && !(optional && word == "-")) return "";
    list += (count++ > 0 ? "," : "") + std::string(word);
  }
  return count > 1 ? list : "";
}

Mistake ListMistake(MistakeKind kind, std::string_view text, ValueKind value_kind,
                    const Place& place) {
  Mistake mistake;
  mistake.kind = kind;
  mistake.place = place;
  mistake.value_kind = value_kind;
  mistake.text = text;
  return mistake;
}

}  // namespace

std::optional<Rational> ReadValue(std::string_view text, ValueKind kind, const Place& place,
                                  Mistakes* mistakes) {
  const std::optional<Parsed> parsed = ValueReader(text, kind, place, mistakes).Read();
  return parsed ? std::optional(parsed->value) : std::nullopt;
}

std::optional<Values> ReadValues(std::string_view text, ValueKind kind, const Place& place,
                                 bool optional, Mistakes* mistakes) {
  if (Trimmed(text).empty()) {
    mistakes->push_back(ListMistake(MistakeKind::kEmptyList, text, kind, place));
    return std::nullopt;
  }
  const std::size_t before = mistakes->size();
  Values values;
  // The last entries without a unit, and with one that is not the usual one: who writes "8,16ns"
  // means ns for both.
  std::string_view bare, strange, strange_unit;
  for (const std::string_view entry : EntriesOf(text)) {
    if (entry.empty()) {
      mistakes->push_back(ListMistake(MistakeKind::kNumberMissing, text, kind, place));
      return std::nullopt;
    }
    if (optional && entry == "-") {
      values.emplace_back();
      continue;
    }
    const std::optional<Parsed> parsed = ValueReader(entry, kind, place, mistakes).Read();
    if (!parsed) {
      Mistake& mistake = mistakes->back();
      if (mistake.kind == MistakeKind::kNotAValue) {
        mistake.other = WithCommas(entry, kind, place, optional);
      }
      continue;
    }
    values.emplace_back(parsed->value);
    if (parsed->unit.empty()) bare = entry;
    if (!parsed->is_usual) {
      strange = entry;
      strange_unit = parsed->unit;
    }
  }
  if (!bare.empty() && !strange.empty()) {
    Mistake mistake = ListMistake(MistakeKind::kBareBesideUnit, bare, kind, place);
    mistake.other = strange;
    mistake.hint = strange_unit;
    mistakes->push_back(std::move(mistake));
  }
  return mistakes->size() == before ? std::optional(std::move(values)) : std::nullopt;
}

bool IsUnit(std::string_view word, ValueKind kind) {
  return !word.empty() && (FindUnit(word, kind) || FindUnit(MeantFor(word), kind));
}

std::string Written(const Rational& value) {
  // A quotient ends as a decimal when its denominator has no other prime factors than 2 and 5;
  // each decimal takes away one of either.
  constexpr int kMostDecimals = 12;
  Rational scaled = value;
  for (int decimals = 0; decimals <= kMostDecimals; ++decimals, scaled *= 10) {
    if (scaled.IsWhole()) return value.Fixed(decimals);
  }
  return value.NumeratorText() + "/" + value.DenominatorText();
}

}  // namespace planner::read
