// Tested by explain.test.
#include <optional>
#include <vector>

#include "planner/explain/Explain.h"
#include "planner/read/Units.h"
#include "planner/report/ExplainText.h"
#include "tcl/Commands.h"
#include "tcl/Failure.h"
#include "tcl/RequestTree.h"

namespace tcl {

namespace {

// The input frequencies to try.
std::vector<planner::Rational> Oscillators(const Given& given) {
  const auto own = given.own.find("oscillators");
  if (own == given.own.end()) return planner::explain::StockOscillators();
  planner::read::Place place;
  place.entry = "-oscillators";
  planner::read::Mistakes mistakes;
  const auto values = planner::read::ReadValues(
      WithCommas(own->second), planner::read::ValueKind::kFrequency, place, false, &mistakes);
  if (!values) throw Failure::OfMistakes(mistakes);
  std::vector<planner::Rational> inputs;
  for (const auto& value : *values) inputs.push_back(*value);
  return inputs;
}

}  // namespace

std::string Explain(Words words) {
  const Given given = ReadGiven(words, {"oscillators"});
  return planner::report::ExplainTcl(
      planner::explain::Explain(given.request(), given.device, Oscillators(given)), given.device);
}

}  // namespace tcl
