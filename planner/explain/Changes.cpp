// Tested by changes_test.cpp.
#include "planner/explain/Changes.h"

#include <algorithm>
#include <functional>
#include <optional>
#include <utility>

#include "planner/answer/Demands.h"
#include "planner/answer/Jitter.h"
#include "planner/explain/Smallest.h"

namespace planner::explain {

namespace {

using Kind = DemandKind;

Output& OutputOf(Question* question, const Demand& demand) {
  return question->request.outputs[static_cast<std::size_t>(demand.output)];
}

const OutputAnswer& AnswerOf(const Answer& answer, const Demand& demand) {
  return answer.outputs[static_cast<std::size_t>(demand.output)];
}

// Which way a value is moved.
enum class Side { kBelow, kAbove };
constexpr Side kSides[] = {Side::kBelow, Side::kAbove};

Rational Moved(const Rational& value, const Rational& by, Side side) {
  return side == Side::kBelow ? value - by : value + by;
}

// Moves a value of the request to one side: the output may lie in the interval from the value on,
// which is asked for as its middle with half of its width as the tolerance.
struct Window {
  // Sets the interval of some width.
  std::function<void(Question*, const Rational& width)> set;
  // How far settings are from the value, to this side.
  std::function<Rational(const Answer&)> distance;
  Rational widest;
};

std::optional<Allowance> Nearest(const Question& question, const Window& window) {
  const auto find = [&](const Rational& width) {
    Question changed = question;
    window.set(&changed, width);
    return changed.Ask();
  };
  const auto needs = [&](const Settings& settings) {
    return window.distance(question.Judge(settings));
  };
  return FindSmallest(find, needs, window.widest);
}

// A frequency is at most moved to nothing, or as far the other way as four times itself.
Window FrequencyWindow(const Question& question, const Demand& demand, Side side) {
  Question original = question;
  const Rational frequency = OutputOf(&original, demand).frequency;
  Window window;
  window.widest = side == Side::kBelow ? frequency * Rational(999, 1000) : frequency * 3;
  window.set = [=](Question* changed, const Rational& width) {
    Output& output = OutputOf(changed, demand);
    output.frequency = Moved(frequency, width / 2, side);
    output.tolerance = width / 2 / output.frequency * 1000000;
  };
  window.distance = [=](const Answer& answer) {
    return (AnswerOf(answer, demand).frequency - frequency).Absolute();
  };
  return window;
}

Window PhaseWindow(const Question& question, const Demand& demand, Side side) {
  Question original = question;
  const Rational phase = *OutputOf(&original, demand).phase;
  Window window;
  window.widest = 180;
  window.set = [=](Question* changed, const Rational& width) {
    Output& output = OutputOf(changed, demand);
    output.phase = hardware::TurnedToHalf(Moved(phase, width / 2, side));
    output.phase_tolerance = width / 2;
  };
  window.distance = [=](const Answer& answer) {
    const Rational& actual = AnswerOf(answer, demand).phase;
    return hardware::TurnedToFull(side == Side::kBelow ? phase - actual : actual - phase);
  };
  return window;
}

Window DutyWindow(const Question& question, const Demand& demand, Side side) {
  Question original = question;
  const Rational duty = *OutputOf(&original, demand).duty;
  Window window;
  window.widest = side == Side::kBelow ? duty : Rational(100) - duty;
  window.set = [=](Question* changed, const Rational& width) {
    Output& output = OutputOf(changed, demand);
    output.duty = Moved(duty, width / 2, side);
    output.duty_tolerance = width / 2;
  };
  window.distance = [=](const Answer& answer) {
    return (AnswerOf(answer, demand).duty - duty).Absolute();
  };
  return window;
}

// The value moved to either side, as far as it takes.
void AddMoves(const Question& question, const Demand& demand, ChangeKind kind,
              const Rational& value,
              const std::function<Window(const Question&, const Demand&, Side)>& window_of,
              std::vector<Change>* changes) {
  for (const Side side : kSides) {
    std::optional<Allowance> found = Nearest(question, window_of(question, demand, side));
    if (!found) continue;
    changes->push_back(
        {kind, demand, Moved(value, found->value, side), value, std::move(found->settings)});
  }
}

// The smallest tolerance of one output.
void AddTolerance(const Question& question, const Demand& demand, std::vector<Change>* changes) {
  Question original = question;
  const auto find = [&](const Rational& tolerance) {
    Question changed = question;
    OutputOf(&changed, demand).tolerance = tolerance;
    return changed.Ask();
  };
  const auto needs = [&](const Settings& settings) {
    return AnswerOf(question.Judge(settings), demand).error_ppm.Absolute();
  };
  std::optional<Allowance> found = FindSmallest(find, needs, 1000000);
  if (!found) return;
  const Rational before = question.request.ToleranceOf(OutputOf(&original, demand));
  changes->push_back(
      {ChangeKind::kTolerance, demand, found->value, before, std::move(found->settings)});
}

// The jitter of an output, ps. An answer has none of settings beyond the ranges of VCO and PFD,
// which count here where these ranges are left out.
double JitterOf(const Question& question, const Demand& demand, const Settings& settings) {
  if (const auto* const loop = std::get_if<LoopSettings>(&settings)) {
    return answer::LoopJitter(question.device, question.request)
        .PeakToPeak(loop->m, loop->d, loop->bandwidth);
  }
  return AnswerOf(question.Judge(settings), demand).jitter.value_or(answer::kUnknownJitter);
}

void AddJitter(const Question& question, const Demand& demand, std::vector<Change>* changes) {
  Question original = question;
  const Rational before = *question.request.MaxJitterOf(OutputOf(&original, demand));
  const auto find = [&](const Rational& jitter) {
    Question changed = question;
    OutputOf(&changed, demand).max_jitter = jitter;
    return changed.Ask();
  };
  const auto needs = [&](const Settings& settings) {
    const double jitter = JitterOf(question, demand, settings);
    return jitter < answer::kUnknownJitter ? Rational::FromDouble(jitter) : before;
  };
  std::optional<Allowance> found = FindSmallest(find, needs, 1000000000);
  if (!found) return;
  changes->push_back(
      {ChangeKind::kJitter, demand, found->value, before, std::move(found->settings)});
}

// The values of settings that a range of the device is for.
using ValuesOf = std::function<std::vector<Rational>(const Answer&)>;

std::vector<Rational> WithEachInput(const Question& question, const Rational& value) {
  std::vector<Rational> values = {value};
  if (question.request.inputs.size() > 1 && !question.relaxed.second_input) {
    values.push_back(value / question.request.inputs[0] * question.request.inputs[1]);
  }
  return values;
}

// How far the frequencies of settings can be above or below what they are, as a fraction.
Rational OffBy(const Question& question) {
  return question.relaxed.input_tolerance ? Rational(0)
                                          : question.request.input_tolerance / 1'000'000;
}

// The largest tolerance of the input, ppm, with which settings keep all limits that count.
Rational LargestTolerance(const Question& question, const Settings& settings) {
  Question nominal = question;
  nominal.request.input_tolerance = 0;
  const Answer answer = nominal.Judge(settings);
  std::optional<Rational> least;
  const auto hold = [&](const Rational& value, const Range& range) {
    for (const Rational& one : WithEachInput(question, value)) {
      Rational largest = range.highest / one - 1;
      if (range.lowest > 0) largest = std::min(largest, 1 - range.lowest / one);
      if (!least || largest < *least) least = largest;
    }
  };
  const auto* const loop = std::get_if<LoopSettings>(&settings);
  if (loop != nullptr) {
    const LoopLimits& limits = nominal.Limits();
    if (!question.relaxed.vco) hold(answer.vco, limits.vco);
    if (!question.relaxed.pfd) hold(answer.pfd, limits.PfdOf(loop->bandwidth));
  }
  for (std::size_t i = 0; i < answer.outputs.size(); ++i) {
    if (!answer.outputs[i].used || question.relaxed.outputs[i].range) continue;
    if (loop != nullptr) {
      hold(answer.outputs[i].frequency, nominal.Limits().OutputOf(static_cast<int>(i)));
      continue;
    }
    const auto& kru = std::get<KruSettings>(settings);
    hold(answer.outputs[i].frequency, nominal.device.Pins(question.primitive)
                                          .Of(kru.pins[i], kru.pins[0] == hardware::Pin::kClk2x));
  }
  const Rational asked = question.request.input_tolerance;
  return least ? std::min(asked, std::max(Rational(0), *least * 1'000'000)) : asked;
}

// The largest tolerance of the input below the one that is asked for.
void AddInputTolerance(const Question& question, const Demand& demand,
                       std::vector<Change>* changes) {
  const Rational asked = question.request.input_tolerance;
  const auto find = [&](const Rational& less) {
    Question changed = question;
    changed.request.input_tolerance = asked - less;
    return changed.Ask();
  };
  const auto needs = [&](const Settings& settings) {
    return asked - LargestTolerance(question, settings);
  };
  std::optional<Allowance> found = FindSmallest(find, needs, asked);
  if (!found) return;
  changes->push_back({ChangeKind::kInputTolerance, demand, asked - found->value, asked,
                      std::move(found->settings)});
}

// A range widened at one end.
void AddRange(const Question& question, const Demand& demand, const ValuesOf& values_of,
              const std::function<Range&(Question*)>& range_of, std::vector<Change>* changes) {
  Question original = question;
  const Range range = range_of(&original);
  for (const Side side : kSides) {
    const auto find = [&](const Rational& by) {
      Question changed = question;
      Range& widened = range_of(&changed);
      Rational& end = side == Side::kBelow ? widened.lowest : widened.highest;
      end = Moved(end, by, side);
      return changed.Ask();
    };
    const auto needs = [&](const Settings& settings) {
      Rational most = 0;
      const Rational off = OffBy(question);
      for (const Rational& value : values_of(question.Judge(settings))) {
        const Rational beyond = side == Side::kBelow ? range.lowest - value * (1 - off)
                                                     : value * (1 + off) - range.highest;
        if (beyond > most) most = beyond;
      }
      return most;
    };
    const Rational& end = side == Side::kBelow ? range.lowest : range.highest;
    std::optional<Allowance> found =
        FindSmallest(find, needs, side == Side::kBelow ? end * Rational(999, 1000) : end * 3);
    if (!found) continue;
    changes->push_back({side == Side::kBelow ? ChangeKind::kLowest : ChangeKind::kHighest, demand,
                        Moved(end, found->value, side), end, std::move(found->settings)});
  }
}

void AddLimit(const Question& question, const Demand& demand, std::vector<Change>* changes) {
  const ValuesOf vcos = [&](const Answer& answer) { return WithEachInput(question, answer.vco); };
  const ValuesOf pfds = [&](const Answer& answer) { return WithEachInput(question, answer.pfd); };
  const ValuesOf frequencies = [&](const Answer& answer) {
    return WithEachInput(question, AnswerOf(answer, demand).frequency);
  };
  switch (demand.kind) {
    case Kind::kVco:
      AddRange(
          question, demand, vcos, [](Question* changed) -> Range& { return changed->Limits().vco; },
          changes);
      break;
    case Kind::kPfd:
      AddRange(
          question, demand, pfds, [](Question* changed) -> Range& { return changed->Limits().pfd; },
          changes);
      break;
    default:
      AddRange(
          question, demand, frequencies,
          [&](Question* changed) -> Range& {
            LoopLimits& limits = changed->Limits();
            return demand.output == 1 ? limits.output_1 : limits.output;
          },
          changes);
      break;
  }
}

// The demand goes, where that is enough.
void AddLoss(const Question& question, const Demand& demand, std::vector<Change>* changes) {
  Question changed = question;
  Relax(demand, &changed.relaxed);
  std::optional<Settings> settings = changed.Ask();
  if (!settings) return;
  const ChangeKind kind =
      demand.kind == Kind::kBandwidth ? ChangeKind::kBandwidth : ChangeKind::kWithout;
  changes->push_back({kind, demand, 0, 0, std::move(*settings)});
}

}  // namespace

std::vector<Change> ChangesOf(const Question& question, const Demand& demand) {
  Question original = question;
  std::vector<Change> changes;
  switch (demand.kind) {
    case Kind::kFrequency:
      AddMoves(question, demand, ChangeKind::kFrequency, OutputOf(&original, demand).frequency,
               FrequencyWindow, &changes);
      AddTolerance(question, demand, &changes);
      break;
    case Kind::kPhase:
      AddMoves(question, demand, ChangeKind::kPhase, *OutputOf(&original, demand).phase,
               PhaseWindow, &changes);
      break;
    case Kind::kDuty:
      AddMoves(question, demand, ChangeKind::kDuty, *OutputOf(&original, demand).duty, DutyWindow,
               &changes);
      break;
    case Kind::kJitter:
      AddJitter(question, demand, &changes);
      break;
    case Kind::kVco:
    case Kind::kPfd:
      AddLimit(question, demand, &changes);
      break;
    case Kind::kOutputRange:
      if (hardware::IsLoop(question.primitive)) AddLimit(question, demand, &changes);
      break;
    case Kind::kInputTolerance:
      AddInputTolerance(question, demand, &changes);
      break;
    default:
      break;
  }
  if (changes.empty()) AddLoss(question, demand, &changes);
  return changes;
}

std::vector<Change> CommonTolerance(const Question& question) {
  const auto find = [&](const Rational& tolerance) {
    Question changed = question;
    changed.request.tolerance = tolerance;
    for (Output& output : changed.request.outputs) output.tolerance.reset();
    return changed.Ask();
  };
  const auto needs = [&](const Settings& settings) {
    Rational worst = 0;
    for (const OutputAnswer& output : question.Judge(settings).outputs) {
      if (output.used) worst = std::max(worst, output.error_ppm.Absolute());
    }
    return worst;
  };
  std::optional<Allowance> found = FindSmallest(find, needs, 1000000);
  if (!found) return {};
  return {{ChangeKind::kTolerance, Demand{Kind::kFrequency, -1}, found->value,
           question.request.tolerance, std::move(found->settings)}};
}

std::vector<Change> CommonJitter(const Question& question) {
  std::vector<Demand> limited;
  std::optional<Rational> lowest;
  for (std::size_t i = 0; i < question.request.outputs.size(); ++i) {
    const Output& output = question.request.outputs[i];
    const std::optional<Rational> limit = question.request.MaxJitterOf(output);
    if (!output.used || !limit) continue;
    limited.push_back({Kind::kJitter, static_cast<int>(i)});
    lowest = lowest ? std::min(*lowest, *limit) : *limit;
  }
  if (limited.size() < 2) return {};
  const auto limit_of = [&](const Demand& demand) {
    return *question.request.MaxJitterOf(
        question.request.outputs[static_cast<std::size_t>(demand.output)]);
  };
  const auto find = [&](const Rational& jitter) {
    Question changed = question;
    for (const Demand& demand : limited) {
      OutputOf(&changed, demand).max_jitter = std::max(jitter, limit_of(demand));
    }
    return changed.Ask();
  };
  // Of an output that keeps its own limit it takes nothing.
  const auto needs = [&](const Settings& settings) {
    Rational most = *lowest;
    for (const Demand& demand : limited) {
      const double jitter = JitterOf(question, demand, settings);
      if (jitter >= answer::kUnknownJitter) continue;
      const Rational exact = Rational::FromDouble(jitter);
      if (exact > limit_of(demand)) most = std::max(most, exact);
    }
    return most;
  };
  std::optional<Allowance> found = FindSmallest(find, needs, 1000000000);
  if (!found) return {};
  return {{ChangeKind::kJitter, Demand{Kind::kJitter, -1}, found->value, *lowest,
           std::move(found->settings)}};
}

}  // namespace planner::explain
