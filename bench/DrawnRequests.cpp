#include "bench/DrawnRequests.h"

#include <cstddef>
#include <cstdint>
#include <limits>

#include "bench/Contestants.h"
#include "tests/compare/PllPair.h"

namespace bench {

namespace {

using compare::Kind;

constexpr Kind kKinds[] = {Kind::kCommon,    Kind::kConstructed, Kind::kShifted,
                           Kind::kRoundFigures, Kind::kLowOutput, Kind::kInfeasible};
constexpr int kMostDraws = 20'000;
constexpr unsigned kSeed = 41'000'000;

constexpr double kRounding = 1e-9;  // MHz

bool IsFull(const std::vector<std::vector<DrawnRequest>>& requests) {
  for (std::size_t i = 0; i < requests.size(); ++i) {
    if (requests[i].size() < static_cast<std::size_t>(DrawnClasses()[i].wanted)) return false;
  }
  return true;
}

}  // namespace

const std::vector<DrawnClass>& DrawnClasses() {
  static const std::vector<DrawnClass> classes = {
      {"drawn infeasible", "nothing serves the request", 5, 0, 0, 40},
      {"drawn none", "solved as asked for", 1, 0, 0, 100},
      {"drawn few passes", "output 0 shifted by up to 0.01 MHz", 1, 0.001, 0.01, 100},
      {"drawn small", "output 0 shifted by 0.011 to 0.1 MHz", 1, 0.011, 0.1, 80},
      {"drawn large", "output 0 shifted by more", 1, 0.101,
       std::numeric_limits<double>::infinity(), 60},
  };
  return classes;
}

std::vector<std::vector<DrawnRequest>> DrawRequests() {
  const std::vector<DrawnClass>& classes = DrawnClasses();
  std::vector<std::vector<DrawnRequest>> requests(classes.size());
  Product product;
  for (int number = 0; number < kMostDraws && !IsFull(requests); ++number) {
    const Kind kind = kKinds[static_cast<std::size_t>(number) % std::size(kKinds)];
    compare::Random random(kSeed + static_cast<std::uint64_t>(number));
    compare::Case drawn = compare::DrawCase(kind, random);
    // What a PLL takes for it depends on the calls before.
    if (drawn.request.prim == plain::kPrimPll) drawn.request.lowBandwidth = false;
    compare::PublishLimits(drawn.limits, drawn.request.prim);
    const Outcome outcome = product.Found(product.Run(drawn.request));
    for (std::size_t i = 0; i < classes.size(); ++i) {
      const DrawnClass& c = classes[i];
      if (outcome.code != c.code || outcome.fudge < c.lowestFudge - kRounding ||
          outcome.fudge > c.highestFudge + kRounding ||
          requests[i].size() == static_cast<std::size_t>(c.wanted)) {
        continue;
      }
      requests[i].push_back(
          {std::string(compare::KindName(kind)) + " " + std::to_string(number), drawn});
    }
  }
  return requests;
}

}  // namespace bench
