// Looks for the slowest request: runs the product over requests that are drawn at random, of all
// kinds, and reports the ones that took longest.
//
//   worst_case [TABLE]
//
// Lists what took longer than it may, and writes the summary to the file TABLE; without it, to
// standard output.
//
// The draws are those of the comparison with the plain search: a kind and a number name the same
// request here and there.

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <vector>

#include "bench/Contestants.h"
#include "bench/TableFile.h"
#include "bench/Timing.h"
#include "tests/compare/PllPair.h"
#include "tests/compare/RequestGenerator.h"

namespace bench {
namespace {

using compare::Kind;

constexpr Kind kKinds[] = {Kind::kCommon,      Kind::kConstructed,  Kind::kShifted,
                           Kind::kRangeEnds,   Kind::kMeetingEnds,  Kind::kRoundFigures,
                           Kind::kInfeasible,  Kind::kLowOutput,    Kind::kSlowVco,
                           Kind::kWild};
constexpr int kRequestsOfKind = 20'000;
constexpr unsigned kSeedsOfKind = 1'000'003;

// A run that took this long is repeated: what it took may be an accident.
constexpr double kWorthRepeating = 0.0005;  // seconds
constexpr int kRepetitions = 5;

constexpr double kAim = 0.002;    // seconds
constexpr double kLimit = 0.010;  // seconds; no request may take longer

struct Draw {
  Kind kind;
  int number;
  double seconds;
};

compare::Case CaseOf(Kind kind, int number) {
  compare::Random random(static_cast<std::uint64_t>(kind) * kSeedsOfKind +
                         static_cast<unsigned>(number));
  return compare::DrawCase(kind, random);
}

double SecondsOf(Product& product, const plain::PllRequest& request) {
  auto once = [&] {
    const double start = WorkedSeconds();
    product.Run(request);
    return WorkedSeconds() - start;
  };
  const double first = once();
  if (first < kWorthRepeating) return first;
  std::vector<double> seconds;
  for (int i = 0; i < kRepetitions; ++i) seconds.push_back(once());
  return Median(seconds);
}

std::vector<Draw> RunKind(Product& product, Kind kind) {
  std::vector<Draw> draws;
  for (int number = 0; number < kRequestsOfKind; ++number) {
    const compare::Case drawn = CaseOf(kind, number);
    compare::PublishLimits(drawn.limits, drawn.request.prim);
    draws.push_back({kind, number, SecondsOf(product, drawn.request)});
  }
  std::sort(draws.begin(), draws.end(),
            [](const Draw& a, const Draw& b) { return a.seconds > b.seconds; });
  return draws;
}

long CountAbove(const std::vector<Draw>& draws, double seconds) {
  return std::count_if(draws.begin(), draws.end(),
                       [&](const Draw& draw) { return draw.seconds > seconds; });
}

void WriteRow(Kind kind, const std::vector<Draw>& draws, std::FILE* file) {
  double sum = 0.0;
  for (const Draw& draw : draws) sum += draw.seconds;
  std::fprintf(file, "| %s | %zu | %.3f ms | %.3f ms | %ld | %ld |\n", KindName(kind),
               draws.size(), 1e3 * sum / static_cast<double>(draws.size()),
               1e3 * draws.front().seconds, CountAbove(draws, kAim), CountAbove(draws, kLimit));
}

void List(const Draw& draw, std::FILE* file) {
  std::fprintf(file, "%.3f ms: %s request %d, %s\n", 1e3 * draw.seconds, KindName(draw.kind),
               draw.number, Describe(CaseOf(draw.kind, draw.number)).c_str());
}

void Hunt(std::FILE* file) {
  Product product;
  std::vector<Draw> slowest;
  std::fprintf(file, "| Kind | Requests | Mean | Slowest | above 2 ms | above 10 ms |\n"
                     "|---|---:|---:|---:|---:|---:|\n");
  for (const Kind kind : kKinds) {
    const std::vector<Draw> draws = RunKind(product, kind);
    WriteRow(kind, draws, file);
    slowest.push_back(draws.front());
    for (const Draw& draw : draws) {
      if (draw.seconds > kLimit) List(draw, stdout);
    }
  }
  std::fprintf(file, "\nThe slowest of each kind:\n\n");
  for (const Draw& draw : slowest) List(draw, file);
}

}  // namespace
}  // namespace bench

int main(int argc, char** argv) {
  std::FILE* file = bench::TableFile(argc, argv, 1);
  if (file == nullptr) {
    std::fprintf(stderr, "usage: worst_case [TABLE]\n");
    return 2;
  }
  bench::Hunt(file);
  return 0;
}
