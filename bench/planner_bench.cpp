// Times the planner: the search over all settings, and the questions of an explanation.
//
//   planner_bench [--benchmark_filter=REGEX]
//
// plan/NAME is a whole plan, plan/ordinary and plan/any are those of many drawn requests;
// search/NAME is a request to all primitives of a device; drawn/PRIMITIVE are requests drawn at
// random on the bundled devices, with the slowest of them beside the mean; within/NAME are
// questions with demands and limits switched off. Times are those of the processor.

#include <benchmark/benchmark.h>

#include <algorithm>
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "hardware/Primitive.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "bench/PlannerRequests.h"
#include "planner/plan/Plan.h"
#include "planner/search/Search.h"
#include "planner/search/Within.h"
#include "tests/planner/search/drawn.h"

namespace bench {
namespace {

using hardware::Primitive;
using planner::Device;
using planner::Request;

double Seconds() {
  timespec now{};
  clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &now);
  return static_cast<double>(now.tv_sec) + 1e-9 * static_cast<double>(now.tv_nsec);
}

void SearchAll(benchmark::State& state, const Device& device, const Request& request) {
  planner::search::Counts counts;
  for (auto _ : state) {
    counts = {};
    for (const Primitive primitive : device.primitives) {
      const auto found = planner::search::Search(request, device, primitive);
      benchmark::DoNotOptimize(found.best.data());
      counts.pairs += found.counts.pairs;
      counts.judged += found.counts.judged;
    }
  }
  state.counters["pairs"] = static_cast<double>(counts.pairs);
  state.counters["judged"] = static_cast<double>(counts.judged);
}

void SearchOne(benchmark::State& state, const Device& device, const Request& request,
               Primitive primitive) {
  for (auto _ : state) {
    const auto found = planner::search::Search(request, device, primitive);
    benchmark::DoNotOptimize(found.best.data());
  }
}

void MakePlan(benchmark::State& state, const Device& device, const Request& request) {
  for (auto _ : state) {
    const planner::plan::Plan plan = planner::plan::Make(request, device);
    benchmark::DoNotOptimize(plan.ranked.data());
  }
}

// Plans of many requests, each once.
void MakePlans(benchmark::State& state, const Device& device,
               const std::vector<Request>& requests) {
  double slowest = 0;
  for (auto _ : state) {
    for (const Request& request : requests) {
      const double start = Seconds();
      const planner::plan::Plan plan = planner::plan::Make(request, device);
      benchmark::DoNotOptimize(plan.ranked.data());
      slowest = std::max(slowest, Seconds() - start);
    }
  }
  state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(requests.size()));
  state.counters["slowest_ms"] = slowest * 1e3;
}

// Many requests, each once.
void SearchDrawn(benchmark::State& state, const Device& device, Primitive primitive, int count,
                 bool large) {
  drawn::Random random(large ? 12 : 11);
  std::vector<Request> requests;
  const int most = hardware::MostOutputs(primitive);
  while (static_cast<int>(requests.size()) < count) {
    Request request =
        drawn::RequestFor(random, device, primitive, drawn::Input(random), large ? most : 4);
    if (large && static_cast<int>(request.outputs.size()) < most) continue;
    requests.push_back(std::move(request));
  }
  double slowest = 0;
  const Request* slow = nullptr;
  for (auto _ : state) {
    for (const Request& request : requests) {
      const double start = Seconds();
      const auto found = planner::search::Search(request, device, primitive);
      benchmark::DoNotOptimize(found.best.data());
      const double time = Seconds() - start;
      if (time > slowest) {
        slowest = time;
        slow = &request;
      }
    }
  }
  state.SetItemsProcessed(state.iterations() * count);
  state.counters["slowest_ms"] = slowest * 1e3;
  if (slow != nullptr && std::getenv("PLANNER_BENCH_SLOWEST") != nullptr) {
    std::printf("%s\n", drawn::TextOf(*slow).c_str());
  }
}

// Every question that leaves out up to two of the demands and limits.
void AskWithin(benchmark::State& state, const Device& device, const Request& request,
               Primitive primitive) {
  using planner::search::Relaxed;
  std::vector<bool (*)(Relaxed&)> hardware = {
      [](Relaxed& r) { return r.vco = true; },   [](Relaxed& r) { return r.pfd = true; },
      [](Relaxed& r) { return r.m = true; },     [](Relaxed& r) { return r.d = true; },
      [](Relaxed& r) { return r.whole = true; }, [](Relaxed& r) { return r.dividers = true; }};
  std::vector<Relaxed> questions;
  const std::size_t outputs = request.outputs.size();
  const std::size_t switches = hardware.size() + 3 * outputs;
  for (std::size_t i = 0; i <= switches; ++i) {
    for (std::size_t k = i; k <= switches; ++k) {
      Relaxed relaxed;
      for (const std::size_t one : {i, k}) {
        if (one < hardware.size()) {
          hardware[one](relaxed);
        } else if (one < switches) {
          const std::size_t place = one - hardware.size();
          auto& own = relaxed.outputs[place / 3];
          (place % 3 == 0 ? own.frequency : place % 3 == 1 ? own.phase : own.range) = true;
        }
      }
      questions.push_back(relaxed);
    }
  }
  const planner::search::Within within(request, device, primitive);
  double slowest = 0;
  std::size_t yes = 0;
  for (auto _ : state) {
    yes = 0;
    for (const Relaxed& question : questions) {
      const double start = Seconds();
      if (within.Exists(question)) ++yes;
      slowest = std::max(slowest, Seconds() - start);
    }
  }
  state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(questions.size()));
  state.counters["questions"] = static_cast<double>(questions.size());
  state.counters["yes"] = static_cast<double>(yes);
  state.counters["slowest_us"] = slowest * 1e6;
}

void RegisterAll() {
  static const Device device = drawn::Bundled("vk40", "2");
  std::vector<Named> all = ReadmeRequests();
  for (Named& slow : SlowRequests()) all.push_back(std::move(slow));
  for (const Named& named : all) {
    benchmark::RegisterBenchmark(("plan/" + named.name).c_str(), [named](auto& state) {
      MakePlan(state, device, named.request);
    })->Unit(benchmark::kMicrosecond);
    benchmark::RegisterBenchmark(("search/" + named.name).c_str(), [named](auto& state) {
      SearchAll(state, device, named.request);
    })->Unit(benchmark::kMicrosecond);
    for (const Primitive primitive : device.primitives) {
      const std::string own = named.name + "/" + std::string(Name(primitive));
      benchmark::RegisterBenchmark(("one/" + own).c_str(), [named, primitive](auto& state) {
        SearchOne(state, device, named.request, primitive);
      })->Unit(benchmark::kMicrosecond);
      benchmark::RegisterBenchmark(("within/" + own).c_str(), [named, primitive](auto& state) {
        AskWithin(state, device, named.request, primitive);
      })->Unit(benchmark::kMicrosecond);
    }
  }
  constexpr int kPlans = 300;
  drawn::Random random(1);
  std::vector<Request> ordinary;
  std::vector<Request> any;
  for (int i = 0; i < kPlans; ++i) {
    ordinary.push_back(OrdinaryRequest(random));
    any.push_back(AnyRequest(random, device));
  }
  benchmark::RegisterBenchmark("plan/ordinary", [ordinary](auto& state) {
    MakePlans(state, device, ordinary);
  })->Unit(benchmark::kMillisecond);
  benchmark::RegisterBenchmark("plan/any", [any](auto& state) {
    MakePlans(state, device, any);
  })->Unit(benchmark::kMillisecond);
  for (const Primitive primitive : device.primitives) {
    for (const bool large : {false, true}) {
      const std::string name =
          std::string(large ? "drawn_large/" : "drawn/") + std::string(Name(primitive));
      benchmark::RegisterBenchmark(name.c_str(), [primitive, large](auto& state) {
        SearchDrawn(state, device, primitive, 300, large);
      })->Unit(benchmark::kMillisecond)->Iterations(1);
    }
  }
}

}  // namespace
}  // namespace bench

int main(int argc, char** argv) {
  bench::RegisterAll();
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 2;
  benchmark::RunSpecifiedBenchmarks();
  return 0;
}
