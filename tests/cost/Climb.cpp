#include "tests/cost/Climb.h"

#include <algorithm>
#include <cmath>
#include <vector>

#include "tests/cost/CountedCalls.h"

namespace cost {
namespace {

using compare::Number;
using compare::Random;

// Requests on which long climbs have ended, in MHz on a device with this highest VCO.
struct Known {
  double vcoMax;
  double inFreq;
  double inFreq2;
  std::vector<double> outFreqs;
};
const std::vector<Known> kKnown = {
    {1440, 10.285, 0, {15.19, 11.1423, 11.207, 15, 27.7498}},
    {1440, 786, 779.045, {10.0765, 10.3111, 9.9475, 10.1266, 1.6529}},
    {144, 103.691, 0, {0.1182, 28.1164, 8.2425, 8.3891, 20.0387}},
    {14.4, 13.862, 0, {-0.3241, 1.2584, 0.6292, 0.3654, 1.8875}},
    {1440, 815.682, 0, {4.3564, 3.0293, 11.0163, 0.2797, 4.4406}},
    {1440, 591.559, 603.242, {1.2822, 4.0155, 4, 4.0309, 3.9574}},
    {1440, 699.648, 699.855, {4.3474, 4.2047, 4.4714, 4.0451, 4.2751}},
    {360, 2.5202, 2.3752, {11.25, 2.8224, 2.805, 2.804, 5.3203}},
    {1440, 376.377, -297.117, {1.2659, 7.5431, 8.4367, 7.6734, 7.6834}},
    {1440, 295.33, -0.02268, {-1.4362, 7.4964, 7.8701, 7.6399, 7.6834}},
    {1.3521604449, 0.98631, 0, {0.01806, 0.01358, 0.009024, 0.01723, 0.02174}}};

// A request whose outputs can be changed one by one.
struct Place {
  Clocks clocks = Clocks::kAboveZero;
  compare::Case drawn;
  std::vector<double> outFreqs;  // MHz
  std::vector<double> phases;    // degrees
};

double DrawFrequency(const Place& place, Random& random) {
  const plain::PllLimits& limits = place.drawn.limits;
  const double other = random.Pick(place.outFreqs);
  switch (random.Int(0, 6)) {
    case 0: return limits.vcoMin / random.Int(1, 140);
    case 1: return limits.vcoMax / random.Int(1, 140);
    case 2: return random.Real(limits.vcoMin / 130, limits.vcoMin / 20);
    case 3: return other * 0.25 * random.Int(1, 16);
    case 4: return other + 0.001 * random.Int(-500, 500);
    case 5: return other * random.Real(0.97, 1.03);
    default: return limits.clkoutMin * random.Real(0.8, 3);
  }
}

void ChangeBelowZero(Place& place, Random& random) {
  if (random.OneIn(2)) {
    place.drawn.request.inFreq2 = -std::pow(10.0, random.Real(-2, 3));
  } else {
    place.outFreqs[0] = random.Real(-4, 4);
  }
}

void ChangeInputs(plain::PllRequest& request, Random& random) {
  switch (random.Int(0, 2)) {
    case 0: request.inFreq = std::pow(10.0, random.Real(0, 3)); break;
    case 1: request.inFreq *= random.Real(0.98, 1.02); break;
    default: request.inFreq2 = random.OneIn(2) ? 0.0 : request.inFreq * random.Real(0.9, 1.1);
  }
}

void ChangeOptions(Place& place, Random& random) {
  plain::PllRequest& request = place.drawn.request;
  request.closest = random.OneIn(2);
  request.lowBandwidth = random.OneIn(2);
  request.intDiv0Only = random.OneIn(2);
  request.preferMaxVco = random.OneIn(2);
  random.OneIn(3) ? place.phases.assign(1, 2000) : place.phases.assign(1, 0);
}

void ChangeOutputs(Place& place, Random& random) {
  const int last = static_cast<int>(place.outFreqs.size()) - 1;
  const int n = random.Int(0, std::min(last + 1, plain::kMaxOutputs - 1));
  const double frequency = DrawFrequency(place, random);
  if (n > last) {
    place.outFreqs.push_back(frequency);
  } else if (last > 0 && random.OneIn(6)) {
    place.outFreqs.pop_back();
  } else {
    place.outFreqs[static_cast<std::size_t>(n)] = frequency;
  }
}

// Writes the outputs into the request. Phases are those of the first outputs; the others have 0.
void WriteOutputs(Place& place) {
  plain::PllRequest& request = place.drawn.request;
  request.count = static_cast<int>(place.outFreqs.size());
  request.outFreqs = request.phases = request.dutyCycles = "";
  for (std::size_t n = 0; n < place.outFreqs.size(); ++n) {
    request.outFreqs += Number("%.10g ", place.outFreqs[n]);
    request.phases += Number("%.10g ", n < place.phases.size() ? place.phases[n] : 0.0);
    request.dutyCycles += "50 ";
  }
}

void Change(Place& place, Random& random) {
  if (place.clocks == Clocks::kBelowZeroToo && random.OneIn(4)) {
    ChangeBelowZero(place, random);
    WriteOutputs(place);
    return;
  }
  switch (random.Int(0, 6)) {
    case 0:
    case 1: ChangeInputs(place.drawn.request, random); break;
    case 2: ChangeOptions(place, random); break;
    default: ChangeOutputs(place, random);
  }
  WriteOutputs(place);
}

Place Begin(const Device& device, int number, Clocks clocks, Random& random) {
  Place place;
  place.clocks = clocks;
  place.drawn.limits = device.limits;
  place.drawn.request.prim = device.prim;
  if (number % 2 == 0) {
    const Known& known = kKnown[static_cast<std::size_t>(number / 2) % kKnown.size()];
    const double scale = device.limits.vcoMax / known.vcoMax;
    place.drawn.request.inFreq = known.inFreq * scale;
    place.drawn.request.inFreq2 = known.inFreq2 * scale;
    for (const double frequency : known.outFreqs) place.outFreqs.push_back(frequency * scale);
  } else {
    place.drawn.request.inFreq = std::pow(10.0, random.Real(0.5, 2.5));
    place.outFreqs = {device.limits.vcoMin / random.Int(20, 130)};
    for (int i = 0; i < 8; ++i) Change(place, random);
  }
  WriteOutputs(place);
  return place;
}

}  // namespace

Summit Climb(const Device& device, int number, int steps, Clocks clocks) {
  Random random(static_cast<std::uint64_t>(number));
  Place best = Begin(device, number, clocks, random);
  CountedCalls calls(FileOf(device));
  std::uint64_t most = calls.WorkOf(best.drawn.request);
  for (int step = 0; step < steps; ++step) {
    Place place = best;
    for (int changes = random.Int(1, 2); changes > 0; --changes) Change(place, random);
    const std::uint64_t work = calls.WorkOf(place.drawn.request);
    if (work < most) continue;
    most = work;
    best = place;
  }
  return {most, best.drawn};
}

Summit AskForNoPhase(const Device& device) {
  Summit most;
  CountedCalls calls(FileOf(device));
  for (const int divider : {1, 2, 3, 4, 5, 8, 16, 64}) {
    for (const int slower : {1, 2, 4, 16}) {
      Place place;
      place.drawn.limits = device.limits;
      plain::PllRequest& request = place.drawn.request;
      request.prim = device.prim;
      request.closest = true;
      request.intDiv0Only = true;
      request.inFreq = device.limits.vcoMax / slower;
      place.outFreqs.assign(plain::kMaxOutputs, device.limits.vcoMax / divider);
      place.phases.assign(plain::kMaxOutputs, 2000);
      WriteOutputs(place);
      request.dutyCycles = "99 99 99 99 99 99 99";
      const std::uint64_t work = calls.WorkOf(request);
      if (work > most.work) most = {work, place.drawn};
    }
  }
  return most;
}

}  // namespace cost
