// KRU_SP and KRU_CLKGEN.

#include "tests/model/ObjectModel.h"
#include "tests/plain/plain_kru_clkgen.h"

namespace model {

namespace {

using L = plain::KruLimits;

struct LimitKey {
  const char* keyword;  // of a period, without what all begin with
  double L::*limit;     // a frequency
};

// In the order in which they are read; the first that is missing ends it.
const std::vector<LimitKey> kKeys = {
    {"CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", &L::clk0Max},
    {"CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", &L::clk0Min},
    {"CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD", &L::clk0Max2x},
    {"CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", &L::clk90Max},
    {"CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", &L::clk90Min},
    {"CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD", &L::clk90Max2x},
    {"CLK2X_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", &L::clk2xMax},
    {"CLK2X_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", &L::clk2xMin},
    {"CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", &L::clkdvMax},
    {"CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", &L::clkdvMin},
    {"CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD", &L::clkdvMax2x},
    {"CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", &L::clkfxMax},
    {"CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", &L::clkfxMin}};

std::string ResultText(const std::string& primitive, int code, int count) {
  switch (code) {
    case plain::kKruSolved: return "1";
    case plain::kKruNoLimits: return "Could not get data from speedsfile.";
    default: break;
  }
  return "The " + primitive + " cannot support the requested output " +
         (count == 1 ? "frequency and phase." : "frequencies and phases.");
}

}  // namespace

bool ObjectModel::LoadKruLimits(Answer* answer) {
  for (const LimitKey& key : kKeys) {
    const std::optional<double> period = Figure(std::string("D_KRU_") + key.keyword, answer);
    if (!period) return false;
    kru_limits_.*key.limit = 1000.0 / *period;
  }
  return true;
}

// A KRU_CLKGEN reads no limits: it takes those that are there.
void ObjectModel::SolveKru(const Words& words, Answer* answer) {
  const bool is_clkgen = words[0] == "KruClkgenCalculateActuals";
  plain::KruRequest request;
  request.outFreqs = words[1];
  request.phases = words[2];
  request.inFreq = Number(words[3]);
  request.numOut = Count(words[4]);
  request.feedbackUsed = !is_clkgen && Flag(words[5]);
  double numbers[plain::kMaxOutputs];
  const auto is_complete = [&](const std::string& list) {
    return plain::ParseList(list, request.numOut, plain::kKruOutputs, numbers);
  };
  const bool reads_limits = !is_clkgen && is_complete(request.outFreqs) &&
                            is_complete(request.phases) && request.inFreq != 0.0;
  kru_limits_.readable = !reads_limits || LoadKruLimits(answer);
  plain::Trace trace(Flag(words.back()));
  const int code = is_clkgen
                       ? plain::SolveKruClkgen(request, kru_limits_, lists_, kru_, trace)
                       : plain::SolveKru(request, kru_limits_, lists_, kru_, trace);
  answer->trace = trace.Text();
  answer->text = ResultText(is_clkgen ? "KRU_CLKGEN" : "KRU_SP", code, request.numOut);
}

void ObjectModel::CallKru(const Words& words, Answer* answer) {
  const std::string& name = words[0];
  if (name == "GetKruChosenM") answer->text = std::to_string(kru_.m);
  if (name == "GetKruChosenD") answer->text = std::to_string(kru_.d);
  if (name == "GetKruChosenPhaseShift") answer->text = std::to_string(KruPhaseShift(kru_));
  if (name == "GetKruChosenPhaseOffset") answer->text = Written("%3.3f", kru_.phaseOffset);
  if (name == "GetKruChosenClkdv") answer->text = Written("%2.1f", kru_.clkdv);
  if (name == "GetKruChosenClkfxdv") answer->text = Written("%2.0f", kru_.clkdv);
  if (name == "GetKruChosenDivBy2") answer->text = kru_.divBy2 ? "true" : "false";
  if (name == "GetKruChosenPinname") answer->text = KruPinName(kru_, Count(words[1]));
  if (name == "GetKruChosenOutFreqN") {
    answer->text = Written("%4.3f", KruOutFreq(kru_, Number(words[1]), Count(words[2])));
  }
}

}  // namespace model
