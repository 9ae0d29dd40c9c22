// Times the search of the product against the plain search, request by request.
//
//   search_bench [TABLE] [--benchmark_filter=REGEX]
//
// Each benchmark is one request; its name is that of the set, a slash and that of the request. The
// requests are those of requests.h and drawn ones, with limits drawn at random.
// An iteration is a round: both answer the request, each as often as fills a few milliseconds,
// and the one that begins changes from round to round. The times are the medians of the rounds.
// TABLE is the file that the summary goes to; without it, standard output.

#include <benchmark/benchmark.h>

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "bench/Contestants.h"
#include "bench/DrawnRequests.h"
#include "bench/Summary.h"
#include "bench/TableFile.h"
#include "bench/Timing.h"
#include "bench/requests.h"
#include "tests/compare/PllPair.h"
#include "tests/support/CaptureTrace.h"

namespace bench {
namespace {

constexpr double kEnough = 0.004;  // seconds that the calls of one contestant fill in a round

constexpr Goals kTracedGoals = {.geometricMean = 0.0, .everyRatio = 1.0, .slowest = 0.0};
constexpr int kTracedRounds = 7;
constexpr const char* kTracedSet = "traced";
constexpr const char* kTracedTitle = "traced, fudge up to 0.5 MHz";
// Beyond it a trace has tens of megabytes.
constexpr double kLargestTracedFudge = 0.5;  // MHz

constexpr double kSlowest = 0.004;  // seconds; no untraced request may take longer

// Of the drawn requests there are many, and nothing serves some: these take the plain search long.
constexpr Goals kDrawnGoals = {.geometricMean = 0.0, .everyRatio = 0.9, .slowest = kSlowest};
constexpr double kEnoughDrawn = 0.001;  // seconds
constexpr int kDrawnRounds = 3;

const plain::PllLimits& LimitsOf(const Request& request) {
  if (request.limits != nullptr) return *request.limits;
  return request.prim == kPll ? kPllLimits : kTsynLimits;
}

plain::PllRequest ToCall(const Request& request) {
  plain::PllRequest call;
  call.prim = request.prim;
  call.count = request.count;
  call.outFreqs = request.outFreqs;
  call.inFreq = request.inFreq;
  call.inFreq2 = request.inFreq2;
  call.preferMaxVco = request.preferMaxVco;
  call.lowBandwidth = request.lowBandwidth;
  if (request.phases != nullptr) {
    call.closest = true;
    call.phases = request.phases;
    for (int n = 0; n < request.count; ++n) call.dutyCycles += n == 0 ? "50" : " 50";
  }
  return call;
}

// The product is one object for all requests, as the object of a script is.
Product& TheProduct() {
  static Product product;
  return product;
}

constexpr double kRounding = 1e-9;  // of fudges, MHz

// Ends the program when a request is not what its set says.
void CheckClass(const RequestSet& set, const Request& request, const Outcome& outcome,
                const char* who) {
  const bool rightCode = set.code == kAnyCode || outcome.code == set.code;
  if (rightCode && outcome.fudge >= set.lowestFudge - kRounding &&
      outcome.fudge <= set.highestFudge + kRounding) {
    return;
  }
  std::fprintf(stderr,
               "search_bench: \"%s\" does not belong to the set \"%s\": the %s answers %d with "
               "a fudge of %.6f MHz\n",
               request.name, set.name, who, outcome.code, outcome.fudge);
  std::exit(1);
}

Outcome ProductOutcome(const Request& request) {
  compare::PublishLimits(LimitsOf(request), request.prim);
  return TheProduct().Found(TheProduct().Run(ToCall(request)));
}

// Runs the rounds of a benchmark. Both functions return the seconds of one call.
template <typename PlainTime, typename ProductTime>
void RunRounds(benchmark::State& state, PlainTime plainTime, ProductTime productTime) {
  std::vector<double> plainSeconds;
  std::vector<double> productSeconds;
  bool plainFirst = true;
  for ([[maybe_unused]] auto round : state) {
    if (plainFirst) plainSeconds.push_back(plainTime());
    productSeconds.push_back(productTime());
    if (!plainFirst) plainSeconds.push_back(plainTime());
    plainFirst = !plainFirst;
    state.SetIterationTime(productSeconds.back());
  }
  state.counters[kPlainSeconds] = Median(plainSeconds);
  state.counters[kProductSeconds] = Median(productSeconds);
}

// `check` gets what the plain search has found.
template <typename Check>
void Untraced(benchmark::State& state, const plain::PllRequest& call,
              const plain::PllLimits& limits, double enough, Check check) {
  Plain plain(compare::PublishLimits(limits, call.prim));
  RunRounds(
      state,
      [&] {
        const double seconds = SecondsOfCall(enough, [&] { plain.Run(call); });
        check(plain.Found());
        return seconds;
      },
      [&] { return SecondsOfCall(enough, [&] { TheProduct().Run(call); }); });
}

// Both traces go into memory that grows with them. The plain search formats every line twice, the
// first time for its length, which says nothing about the search: half of what its trace adds to
// its time is left out.
void Traced(benchmark::State& state, const Request& request) {
  const plain::PllRequest call = ToCall(request);
  Plain plain(compare::PublishLimits(LimitsOf(request), request.prim));
  std::size_t plainCharacters = 0;
  std::size_t productCharacters = 0;
  {
    CaptureTrace capture;
    TheProduct().Run(call, true);
    productCharacters = capture.Text().size();
  }
  RunRounds(
      state,
      [&] {
        const double untraced = SecondsOfCall(kEnough, [&] { plain.Run(call); });
        const double traced =
            SecondsOfCall(kEnough, [&] { plain.RunTraced(call, &plainCharacters); });
        return untraced + (traced - untraced) / 2.0;
      },
      [&] {
        return SecondsOfCall(kEnough, [&] {
          CaptureTrace capture;
          TheProduct().Run(call, true);
        });
      });
  if (plainCharacters != productCharacters) {
    std::fprintf(stderr, "search_bench: the traces of \"%s\" differ: %zu and %zu characters\n",
                 request.name, plainCharacters, productCharacters);
    std::exit(1);
  }
}

void RegisterUntraced(Summary& summary) {
  for (const RequestSet& set : kSets) {
    summary.AddSet(set.name, set.title,
                   {set.geometricMeanGoal, set.everyRatioGoal, kSlowest});
    for (const Request& request : set.requests) {
      CheckClass(set, request, ProductOutcome(request), "product");
      benchmark::RegisterBenchmark(
          (std::string(set.name) + "/" + request.name).c_str(),
          [&](benchmark::State& state) {
            Untraced(state, ToCall(request), LimitsOf(request), kEnough,
                     [&](const Outcome& outcome) {
                       CheckClass(set, request, outcome, "plain search");
                     });
          })
          ->UseManualTime()
          ->Iterations(set.rounds);
    }
  }
}

// Ends the program when the two do not agree.
void CheckSame(const DrawnRequest& request, const Outcome& plain) {
  const Outcome product = TheProduct().Found(TheProduct().Run(request.drawn.request));
  if (product.code == plain.code && std::fabs(product.fudge - plain.fudge) <= kRounding) return;
  std::fprintf(stderr, "search_bench: %s is answered %d and %d, with fudges of %.6f and %.6f MHz\n",
               request.name.c_str(), product.code, plain.code, product.fudge, plain.fudge);
  std::exit(1);
}

void RegisterDrawn(Summary& summary, const std::vector<std::vector<DrawnRequest>>& requests) {
  for (std::size_t i = 0; i < requests.size(); ++i) {
    const DrawnClass& drawnClass = DrawnClasses()[i];
    summary.AddSet(drawnClass.name, std::string("drawn: ") + drawnClass.title, kDrawnGoals);
    for (const DrawnRequest& request : requests[i]) {
      benchmark::RegisterBenchmark(
          (std::string(drawnClass.name) + "/" + request.name).c_str(),
          [&](benchmark::State& state) {
            Untraced(state, request.drawn.request, request.drawn.limits, kEnoughDrawn,
                     [&](const Outcome& outcome) { CheckSame(request, outcome); });
          })
          ->UseManualTime()
          ->Iterations(drawnClass.code == plain::kSolved ? kDrawnRounds : 1);
    }
  }
}

void RegisterTraced(Summary& summary) {
  summary.AddSet(kTracedSet, kTracedTitle, kTracedGoals);
  for (const RequestSet& set : kSets) {
    if (set.code != plain::kSolved) continue;
    for (const Request& request : set.requests) {
      if (ProductOutcome(request).fudge > kLargestTracedFudge) continue;
      benchmark::RegisterBenchmark(
          (std::string(kTracedSet) + "/" + set.name + ": " + request.name).c_str(),
          [&](benchmark::State& state) { Traced(state, request); })
          ->UseManualTime()
          ->Iterations(kTracedRounds);
    }
  }
}

}  // namespace
}  // namespace bench

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  std::FILE* file = bench::TableFile(argc, argv, 1);
  if (file == nullptr) {
    std::fprintf(stderr, "usage: search_bench [TABLE] [--benchmark_filter=REGEX]\n");
    return 2;
  }
  bench::Summary summary;
  const std::vector<std::vector<bench::DrawnRequest>> drawn = bench::DrawRequests();
  bench::RegisterDrawn(summary, drawn);
  bench::RegisterUntraced(summary);
  bench::RegisterTraced(summary);
  benchmark::RunSpecifiedBenchmarks(&summary);
  summary.WriteTable(file);
  return 0;
}
