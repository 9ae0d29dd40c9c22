// Looks for requests that take the planner long.
//
//   planner_climb [RESULT] [--seed N] [--climbs N] [--steps N] [--what plan|explain|verify]
//
// Each climb begins with a drawn request for a bundled device, with as many outputs as there can
// be. Each step changes something of the slowest request so far, and keeps what is slower. Times
// are those of the processor; what seems slower is timed again, and counts by its shorter time.
// With the same seed the same changes are tried; which of them are kept depends on times.
//
// Prints the slowest request of each climb, and writes a table to the file RESULT.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

#include "bench/PlannerRequests.h"
#include "bench/Timing.h"
#include "planner/explain/Explain.h"
#include "planner/plan/Plan.h"
#include "planner/report/Json.h"
#include "planner/verify/Verify.h"

namespace bench {
namespace {

using drawn::Random;
using hardware::Primitive;
using hardware::Rational;
using planner::Device;
using planner::Output;
using planner::Request;

constexpr std::size_t kMostOutputs = hardware::MostOutputs(Primitive::kPll);

struct Options {
  std::string result;
  std::uint64_t seed = 1;
  int climbs = 8;
  int steps = 150;
  std::vector<std::string> what = {"plan", "explain", "verify"};
};

// What is timed with a request.
using Job = std::function<void(const Request&, const Device&)>;

Job JobOf(const std::string& what) {
  if (what == "plan") {
    return
        [](const Request& request, const Device& device) { planner::plan::Make(request, device); };
  }
  if (what == "explain") {
    return [](const Request& request, const Device& device) {
      planner::explain::Explain(request, device, {});
    };
  }
  if (what != "verify") throw std::invalid_argument("--what is plan, explain or verify");
  return [](const Request& request, const Device& device) {
    const planner::plan::Plan plan = planner::plan::Make(request, device);
    if (!plan.IsSolved()) return;
    planner::verify::Verify(
        planner::report::Json(plan.request, device, planner::report::PlanEntries(plan, 1)), device);
  };
}

Rational Frequency(Random& random, const Request& request) {
  const Rational& input = request.inputs.front();
  switch (random.Int(0, 3)) {
    case 0:
      return input * random.Int(1, 64) / random.Int(1, 32);
    case 1:
      return Rational(random.Int(1000, 800000), 1000);
    case 2:
      return input * random.Int(1, 8);
    default:
      return random.Pick(request.outputs).frequency * random.Int(1, 3) / random.Int(1, 3);
  }
}

Output DrawOutput(Random& random, const Request& request) {
  Output output = random.Pick(request.outputs);
  output.frequency = Frequency(random, request);
  return output;
}

void ChangeOutput(Random& random, const Request& request, Output* output) {
  const std::vector<Rational> tolerances = {0, Rational(1, 100), 1, 30, 1000, 100000};
  switch (random.Int(0, 6)) {
    case 0:
    case 1:
      output->frequency = Frequency(random, request);
      break;
    case 2:
      output->phase.reset();
      if (!random.OneIn(4)) output->phase = Rational(random.Int(-3600, 3600), 10);
      break;
    case 3:
      output->duty.reset();
      if (!random.OneIn(4)) output->duty = Rational(random.Int(10, 1000), 10);
      break;
    case 4:
      output->tolerance.reset();
      if (!random.OneIn(3)) output->tolerance = random.Pick(tolerances);
      break;
    case 5:
      (random.OneIn(2) ? output->phase_tolerance : output->duty_tolerance) =
          random.Pick(tolerances) / 100;
      break;
    default:
      output->max_jitter.reset();
      if (random.OneIn(2)) output->max_jitter = random.Int(0, 600);
  }
}

void ChangeRest(Random& random, Request* request) {
  switch (random.Int(0, 7)) {
    case 0:
      request->inputs.front() = drawn::Input(random);
      break;
    case 1:
      request->inputs.resize(1);
      if (random.OneIn(2)) {
        request->inputs.push_back(request->inputs.front() * Rational(random.Int(970, 1030), 1000));
      }
      break;
    case 2:
      request->tolerance =
          random.Pick(std::vector<Rational>{0, 1, 100, 1000, 20000, 200000, 1500000});
      break;
    case 3:
      request->rank =
          random.Pick(std::vector<planner::Rank>{planner::Rank::kJitter, planner::Rank::kError,
                                                 planner::Rank::kMargin, planner::Rank::kVco});
      break;
    case 4:
      request->feedback = !request->feedback;
      break;
    case 5:
      request->whole_divider_0 = !request->whole_divider_0;
      break;
    case 6:
      request->max_jitter.reset();
      if (random.OneIn(2)) request->max_jitter = random.Int(0, 600);
      break;
    default:
      request->phase_tolerance = random.Pick(std::vector<Rational>{0, Rational(1, 2), 5, 90});
  }
}

Request Changed(Random& random, Request request) {
  const int changes = random.Int(1, 3);
  for (int i = 0; i < changes; ++i) {
    const int kind = random.Int(0, 9);
    if (kind == 0 && request.outputs.size() < kMostOutputs) {
      request.outputs.push_back(DrawOutput(random, request));
    } else if (kind == 1 && request.outputs.size() > 1) {
      request.outputs.pop_back();
    } else if (kind <= 6) {
      const auto last = static_cast<int>(request.outputs.size()) - 1;
      ChangeOutput(random, request,
                   &request.outputs[static_cast<std::size_t>(random.Int(0, last))]);
    } else {
      ChangeRest(random, &request);
    }
  }
  request.outputs.front().used = true;
  return request;
}

double TimeOf(const Job& job, const Request& request, const Device& device) {
  const double start = WorkedSeconds();
  job(request, device);
  return WorkedSeconds() - start;
}

struct Slowest {
  double seconds = 0;
  std::string device;
  Request request;
};

Slowest Climb(Random& random, const Job& job, const Device& device, int steps) {
  const Primitive primitive = random.Pick(device.primitives);
  Request request = drawn::RequestFor(random, device, primitive, drawn::Input(random),
                                      hardware::MostOutputs(primitive));
  Slowest slowest{TimeOf(job, request, device), device.part, request};
  for (int step = 0; step < steps; ++step) {
    const Request changed = Changed(random, slowest.request);
    double seconds = TimeOf(job, changed, device);
    if (seconds <= slowest.seconds) continue;
    seconds = std::min(seconds, TimeOf(job, changed, device));
    if (seconds > slowest.seconds) slowest = {seconds, device.part, changed};
  }
  return slowest;
}

Options OptionsOf(int argc, char** argv) {
  Options options;
  for (int i = 1; i < argc; ++i) {
    const std::string word = argv[i];
    if (word.rfind("--", 0) != 0) {
      options.result = word;
      continue;
    }
    if (i + 1 == argc) throw std::invalid_argument(word + " needs a value");
    const std::string value = argv[++i];
    if (word == "--seed") {
      options.seed = std::stoull(value);
    } else if (word == "--climbs") {
      options.climbs = std::stoi(value);
    } else if (word == "--steps") {
      options.steps = std::stoi(value);
    } else if (word == "--what") {
      options.what = {value};
    } else {
      throw std::invalid_argument("unknown option " + word);
    }
  }
  return options;
}

int Run(const Options& options) {
  std::vector<Device> devices;
  devices.push_back(drawn::Bundled("vk40", "2"));
  devices.push_back(drawn::Bundled("vk20", "2"));
  devices.push_back(drawn::Bundled("vk10", "1"));
  std::string table = "| The slowest request that a climb finds | Processor time |\n|---|---:|\n";
  for (const std::string& what : options.what) {
    const Job job = JobOf(what);
    Random random(options.seed);
    double worst = 0;
    for (int i = 0; i < options.climbs; ++i) {
      // The largest device every other time.
      const std::size_t place = i % 2 == 0 ? 0 : 1 + static_cast<std::size_t>(i / 2) % 2;
      const Slowest slowest = Climb(random, job, devices[place], options.steps);
      worst = std::max(worst, slowest.seconds);
      std::printf("%s, climb %d: %.1f ms, %s\n%s\n", what.c_str(), i + 1, slowest.seconds * 1e3,
                  slowest.device.c_str(), drawn::TextOf(slowest.request).c_str());
      std::fflush(stdout);
    }
    char row[100];
    std::snprintf(row, sizeof row, "| %s | %.0f ms |\n", what.c_str(), worst * 1e3);
    table += row;
  }
  if (options.result.empty()) return 0;
  std::FILE* const file = std::fopen(options.result.c_str(), "w");
  if (file == nullptr) throw std::runtime_error(options.result + " cannot be written");
  std::fputs(table.c_str(), file);
  std::fclose(file);
  return 0;
}

}  // namespace
}  // namespace bench

int main(int argc, char** argv) {
  try {
    return bench::Run(bench::OptionsOf(argc, argv));
  } catch (const std::exception& error) {
    std::fprintf(stderr, "planner_climb: %s\n", error.what());
    return 2;
  }
}
