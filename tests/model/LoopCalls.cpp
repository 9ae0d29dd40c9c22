// PLL and TSYN.

#include "tests/model/ObjectModel.h"

namespace model {

namespace {

using L = plain::PllLimits;

struct LimitKey {
  const char* keyword;
  double L::*limit;
};

// In the order in which they are read; the first that is missing ends it.
const std::vector<LimitKey> kPllKeys = {
    {"VCOCLK_FREQ_MIN", &L::vcoMin},          {"VCOCLK_FREQ_MAX", &L::vcoMax},
    {"CLKOUT_FREQ_MIN_GCLK", &L::clkoutMin},  {"CLKOUT_FREQ_MAX_GCLK", &L::clkoutMax},
    {"CLKPFD_FREQ_MIN", &L::pfdMin},          {"CLKPFD_FREQ_MAX", &L::pfdMax},
    {"O_MAX_HT_LT", &L::maxHighLowCount},     {"CLKOUT_FREQ_MAX_IOCLK", &L::clkoutMaxIo},
    {"O_MAX_HT_LT", &L::maxHighLowCount}};
const std::vector<LimitKey> kTsynKeys = {
    {"TSYN_VCOCLK_FREQ_MIN", &L::vcoMin},       {"TSYN_VCOCLK_FREQ_MAX", &L::vcoMax},
    {"TSYN_CLKOUT_FREQ_MIN", &L::clkoutMin},    {"TSYN_CLKOUT_FREQ_MAX", &L::clkoutMax},
    {"TSYN_CLKPFD_FREQ_MIN", &L::pfdMin},       {"TSYN_CLKPFD_FREQ_MAX", &L::pfdMax},
    {"TSYN_VCOCLK_FREQ_TARGET", &L::vcoTarget}, {"O_MAX_HT_LT", &L::maxHighLowCount},
    {"TSYN_CLKPFD_FREQ_MAX_LBW", &L::maxPfdLowB}};

bool IsVerbose(const Words& words) { return Flag(words.back()); }

std::string ResultText(const std::string& method, int code, int count) {
  const std::string none = "Could not obtain valid VCO, M and D values with ";
  switch (code) {
    case plain::kSolved: return "1";
    case plain::kNoLimits: return "Could not get data from speedsfile.";
    case plain::kEmptyRange:
      return "Could not obtain a valid VCO because the 2 input clock freqs are too far apart in "
             "range.";
    default: break;
  }
  if (method == "TSYNCalculateActualOutFreqs") {
    return none + (count > 1 ? "these requested frequencies." : "the requested frequency.");
  }
  const bool is_one = method == "PLLCalculateActualOutFreqs" && count <= 1;
  return none + "the given input freqs and the requested " +
         (is_one ? "frequency." : "frequencies.");
}

}  // namespace

bool ObjectModel::LoadLoopLimits(int primitive, Answer* answer) {
  for (const LimitKey& key : primitive == plain::kPrimPll ? kPllKeys : kTsynKeys) {
    const std::optional<double> figure = Figure(key.keyword, answer);
    if (!figure) return false;
    loop_limits_.*key.limit = *figure;
  }
  return true;
}

plain::PllRequest ObjectModel::LoopRequest(const Words& words) const {
  plain::PllRequest request;
  request.closest = words[0] == "GetClosestSolution";
  request.lowBandwidth = low_bandwidth_;
  request.outFreqs = words[1];
  std::size_t next = 2;
  if (request.closest) {
    request.phases = words[next++];
    request.dutyCycles = words[next++];
  }
  request.inFreq = Number(words[next]);
  request.inFreq2 = Number(words[next + 1]);
  request.count = Count(words[next + 2]);
  request.preferMaxVco = Flag(words[next + 3]);
  request.intDiv0Only = Flag(words[next + 4]);
  const bool is_pll =
      request.closest ? Flag(words[next + 5]) : words[0] == "PLLCalculateActualOutFreqs";
  request.prim = is_pll ? plain::kPrimPll : plain::kPrimTsyn;
  return request;
}

// Lists that are short, and no input clock, end a run before the limits are read.
bool ObjectModel::ReachesLoopLimits(const plain::PllRequest& request) const {
  double numbers[plain::kMaxOutputs];
  const auto is_complete = [&](const std::string& list) {
    return plain::ParseList(list, request.count, plain::kMaxOutputs, numbers);
  };
  if (request.closest && !(is_complete(request.phases) && is_complete(request.dutyCycles))) {
    return false;
  }
  return is_complete(request.outFreqs) && request.inFreq != 0.0;
}

void ObjectModel::SolveLoop(const Words& words, Answer* answer) {
  const plain::PllRequest request = LoopRequest(words);
  loop_limits_.readable =
      !ReachesLoopLimits(request) || LoadLoopLimits(request.prim, answer);
  plain::Trace trace(IsVerbose(words));
  loop_ = plain::SolvePll(request, loop_limits_, lists_, trace);
  answer->trace = trace.Text();
  answer->text = ResultText(words[0], loop_.code, request.count);
}

bool ObjectModel::GoesFar(const Words& words) const {
  const Method* const method = words.empty() ? nullptr : Find(words[0]);
  if (method == nullptr || method->call != &ObjectModel::SolveLoop ||
      words.size() != method->arguments + 1) {
    return false;
  }
  ObjectModel later(*this);
  const plain::PllRequest request = LoopRequest(words);
  Answer ignored;
  if (!ReachesLoopLimits(request) || !later.LoadLoopLimits(request.prim, &ignored)) return false;
  constexpr int kNearPasses = 1;
  return plain::GoesFar(request, later.loop_limits_, lists_, kNearPasses);
}

void ObjectModel::CallLoop(const Words& words, Answer* answer) {
  const std::string& name = words[0];
  const int n = words.size() > 1 ? Count(words[1]) : 0;
  const bool is_output = n >= 0 && n < plain::kMaxOutputs;
  const auto whole = [](double value) { return std::to_string(static_cast<int>(value)); };
  if (name == "GetChosenM") answer->text = Written("%3.3f", loop_.m);
  if (name == "GetChosenMInt") answer->text = whole(loop_.m);
  if (name == "GetChosenD") answer->text = std::to_string(loop_.d);
  if (name == "GetChosenDiv0") answer->text = Written("%3.3f", loop_.div0);
  if (name == "GetChosenDiv0Int") answer->text = whole(loop_.div0);
  if (name == "GetChosenDivN") answer->text = std::to_string(is_output ? loop_.divN[n] : 0);
  if (name == "GetChosenVCO") answer->text = Written("%4.3f", loop_.vco);
  const auto figure = [&](const double* list) {
    answer->text = Written("%4.3f", is_output ? list[n] : 0.0);
  };
  if (name == "GetChosenOutFreqN") figure(loop_.outFreq);
  if (name == "GetChosenPhaseN") figure(loop_.phase);
  if (name == "GetChosenDutyCycleN") figure(loop_.dutyCycle);
}

}  // namespace model
