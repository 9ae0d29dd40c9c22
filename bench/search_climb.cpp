// Looks for requests that take the search long: climbs from drawn requests towards slower ones.
//
//   search_climb [TABLE] [CLIMBS] [STEPS] [SEED]
//
// Each step changes something of the slowest request so far, and keeps what is slower. Times are
// those of the processor; what seems slower is timed again and counts by its shortest time. Half of
// the climbs keep to devices as they are built, the others change limits, too. TABLE gets what they
// have found; without it, standard output. With the same seed the same changes are tried; which of
// them are kept depends on times.

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "bench/Contestants.h"
#include "bench/TableFile.h"
#include "bench/Timing.h"
#include "bench/requests.h"
#include "tests/compare/PllPair.h"
#include "tests/compare/Random.h"
#include "tests/compare/RequestGenerator.h"

namespace bench {
namespace {

using compare::Random;

constexpr int kRepetitions = 4;
constexpr int kShown = 3;  // of the climbs on devices as they are built, and of the others

// A request whose outputs can be changed one by one.
struct Place {
  compare::Case drawn;
  std::vector<double> outFreqs;  // MHz
  bool ownLimits = false;
  double seconds = 0.0;
};

double Frequency(Random& random, const Place& place) {
  const double other = random.Pick(place.outFreqs);
  switch (random.Int(0, 5)) {
    case 0: return random.Int(5'000, 400'000) / 1000.0;
    case 1: return random.Int(5'000, 40'000) / 1000.0;
    case 2: return random.Int(5, 60);
    case 3: return other * random.Int(1, 4) / random.Int(1, 4);
    case 4: return other + random.Int(-500, 500) / 1000.0;
    default: return other * random.Real(0.97, 1.03);
  }
}

void ChangeLimits(Random& random, plain::PllLimits* limits) {
  const double factor = random.Real(0.8, 1.25);
  switch (random.Int(0, 5)) {
    case 0: limits->vcoMin *= factor; break;
    case 1: limits->vcoMax *= factor; break;
    case 2: limits->pfdMin *= factor; break;
    case 3: limits->pfdMax *= factor; break;
    case 4: limits->clkoutMin *= factor; break;
    default: limits->clkoutMax *= factor;
  }
}

void Change(Random& random, Place* place) {
  plain::PllRequest& request = place->drawn.request;
  switch (random.Int(0, place->ownLimits ? 8 : 7)) {
    case 0: request.inFreq = random.Int(10'000, 100'000) / 1000.0; break;
    case 1: request.inFreq *= random.Real(0.98, 1.02); break;
    case 2:
      request.inFreq2 = random.OneIn(2) ? 0.0 : request.inFreq * random.Real(0.95, 1.05);
      break;
    case 3:
      if (place->outFreqs.size() < plain::kMaxOutputs) {
        place->outFreqs.push_back(Frequency(random, *place));
        break;
      }
      [[fallthrough]];
    case 4:
    case 5: {
      const int n = random.Int(0, static_cast<int>(place->outFreqs.size()) - 1);
      place->outFreqs[static_cast<std::size_t>(n)] = Frequency(random, *place);
      break;
    }
    case 6: (random.OneIn(2) ? request.lowBandwidth : request.preferMaxVco) ^= true; break;
    case 7: request.closest = random.OneIn(2); break;
    default: ChangeLimits(random, &place->drawn.limits);
  }
  request.count = static_cast<int>(place->outFreqs.size());
  request.outFreqs.clear();
  request.phases.clear();
  request.dutyCycles.clear();
  for (const double f : place->outFreqs) {
    request.outFreqs += compare::Number("%.10g ", f);
    if (!request.closest) continue;
    request.phases += compare::Number("%g ", 45 * random.Int(0, 7));
    request.dutyCycles += "50 ";
  }
}

Place Begin(Random& random, bool ownLimits) {
  Place place;
  place.ownLimits = ownLimits;
  place.drawn.request.prim = random.OneIn(3) ? kPll : kTsyn;
  place.drawn.limits = place.drawn.request.prim == kPll ? kPllLimits : kTsynLimits;
  place.drawn.request.inFreq = 25;
  place.outFreqs = {12, 50, 74.25};
  for (int i = 0; i < 10; ++i) Change(random, &place);
  return place;
}

double SecondsOf(Product& product, const compare::Case& drawn, double toBeat) {
  compare::PublishLimits(drawn.limits, drawn.request.prim);
  double shortest = 1e9;
  for (int i = 0; i < kRepetitions && shortest > toBeat; ++i) {
    const double start = WorkedSeconds();
    product.Run(drawn.request);
    shortest = std::min(shortest, WorkedSeconds() - start);
  }
  return shortest;
}

Place Climb(Product& product, Random& random, bool ownLimits, int steps) {
  Place slowest = Begin(random, ownLimits);
  slowest.seconds = SecondsOf(product, slowest.drawn, 0.0);
  for (int step = 0; step < steps; ++step) {
    Place place = slowest;
    for (int changes = random.Int(1, 2); changes > 0; --changes) Change(random, &place);
    place.seconds = SecondsOf(product, place.drawn, slowest.seconds);
    if (place.seconds > slowest.seconds) slowest = place;
  }
  return slowest;
}

void WriteClimbs(int climbs, int steps, std::uint64_t seed, std::FILE* file) {
  Product product;
  std::vector<Place> found;
  for (int i = 0; i < climbs; ++i) {
    Random random(seed + static_cast<std::uint64_t>(i));
    found.push_back(Climb(product, random, i % 2 == 1, steps));
  }
  std::sort(found.begin(), found.end(),
            [](const Place& a, const Place& b) { return a.seconds > b.seconds; });
  std::fprintf(file, "%d climbs of %d steps; the slowest, beside the plain search:\n\n", climbs,
               steps);
  int shown[2] = {0, 0};
  for (const Place& place : found) {
    if (++shown[place.ownLimits ? 1 : 0] > kShown) continue;
    const compare::Case& drawn = place.drawn;
    Plain plain(compare::PublishLimits(drawn.limits, drawn.request.prim));
    const double start = WorkedSeconds();
    plain.Run(drawn.request);
    std::fprintf(file, "- %.3f ms (plain %.0f ms), %s:\n  %s\n", 1e3 * place.seconds,
                 1e3 * (WorkedSeconds() - start),
                 place.ownLimits ? "with limits of its own" : "on a device as they are built",
                 compare::Describe(drawn).c_str());
  }
}

}  // namespace
}  // namespace bench

int main(int argc, char** argv) {
  std::FILE* file = bench::TableFile(argc, argv, 4);
  if (file == nullptr) {
    std::fprintf(stderr, "usage: search_climb [TABLE] [CLIMBS] [STEPS] [SEED]\n");
    return 2;
  }
  const int climbs = argc > 2 ? std::atoi(argv[2]) : 24;
  const int steps = argc > 3 ? std::atoi(argv[3]) : 1500;
  bench::WriteClimbs(climbs, steps, argc > 4 ? std::strtoull(argv[4], nullptr, 10) : 1, file);
  return 0;
}
