// How fast the planner is as a library, as a table; and whether its memory stays as it is.
//
//   planner_table [TABLE]
//   planner_table --memory PLANS
//
// The table has plans a second, and the times of explanations; of each set of requests the best of
// several passes counts. With --memory it makes so many plans, tells the memory that the process
// has in between, and ends with 1 where that grows.
//
// Times are those of the processor. The table goes to the file TABLE, or to standard output.

#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <fstream>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "bench/PlannerRequests.h"
#include "bench/Timing.h"
#include "planner/explain/Explain.h"
#include "planner/plan/Plan.h"

namespace bench {
namespace {

using planner::Device;
using planner::Request;

constexpr int kDrawn = 500;
constexpr int kPasses = 5;
constexpr std::size_t kExplained = 50;  // of each set; they take longer

struct Set {
  std::string name;
  std::vector<Request> requests;
};

std::vector<Set> Sets(const Device& device) {
  Set readme{"those of this page", {}};
  for (Named& named : ReadmeRequests()) readme.requests.push_back(std::move(named.request));
  Set ordinary{"ordinary ones, drawn", {}};
  Set any{"any, drawn", {}};
  drawn::Random random(1);
  for (int i = 0; i < kDrawn; ++i) {
    ordinary.requests.push_back(OrdinaryRequest(random));
    any.requests.push_back(AnyRequest(random, device));
  }
  return {readme, ordinary, any};
}

struct Times {
  double mean = 0;     // s
  double slowest = 0;  // s
};

// The best of several passes; of each request its shortest time.
template <typename Job>
Times TimesOf(const std::vector<Request>& requests, int passes, const Job& job) {
  std::vector<double> shortest(requests.size(), 1e9);
  double best = 1e9;
  for (int pass = 0; pass < passes; ++pass) {
    const double start = WorkedSeconds();
    double before = start;
    for (std::size_t i = 0; i < requests.size(); ++i) {
      job(requests[i]);
      const double now = WorkedSeconds();
      shortest[i] = std::min(shortest[i], now - before);
      before = now;
    }
    best = std::min(best, before - start);
  }
  return {best / static_cast<double>(requests.size()),
          *std::max_element(shortest.begin(), shortest.end())};
}

std::string Row(const char* format, const std::string& name, const Times& plan,
                const Times& explain) {
  char row[300];
  std::snprintf(row, sizeof row, format, name.c_str(), 1 / plan.mean, plan.slowest * 1e3,
                explain.mean * 1e3, explain.slowest * 1e3);
  return row;
}

std::string Table() {
  const Device device = drawn::Bundled("vk40", "2");
  std::string table =
      "| Requests | Plans a second | Slowest plan | Explanation | Slowest explanation |\n"
      "|---|---:|---:|---:|---:|\n";
  for (const Set& set : Sets(device)) {
    const Times plan = TimesOf(set.requests, kPasses, [&](const Request& request) {
      planner::plan::Make(request, device);
    });
    std::vector<Request> explained = set.requests;
    explained.resize(std::min(explained.size(), kExplained));
    const Times explain = TimesOf(explained, 2, [&](const Request& request) {
      planner::explain::Explain(request, device, {});
    });
    table += Row("| %s | %.0f | %.1f ms | %.1f ms | %.1f ms |\n", set.name, plan, explain);
  }
  return table;
}

// The memory that the process has, MiB.
double Memory() {
  std::ifstream file("/proc/self/statm");
  double total = 0;
  double resident = 0;
  if (!(file >> total >> resident)) throw std::runtime_error("no memory is told by the system");
  return resident * static_cast<double>(sysconf(_SC_PAGESIZE)) / (1 << 20);
}

int WatchMemory(long plans) {
  // What the first plans leave behind in the allocator.
  constexpr long kFirst = 5000;
  constexpr long kParts = 10;
  constexpr double kMost = 2;  // MiB
  const Device device = drawn::Bundled("vk40", "2");
  drawn::Random random(1);
  double first = 0;
  double most = 0;
  for (long i = 1; i <= plans; ++i) {
    planner::plan::Make(i % 2 == 0 ? OrdinaryRequest(random) : AnyRequest(random, device), device);
    if (i == kFirst) first = Memory();
    if (i > kFirst) most = std::max(most, i % kFirst == 0 ? Memory() : 0);
    if (i == kFirst || i % std::max(plans / kParts, 1L) == 0) {
      std::printf("%ld plans: %.1f MiB\n", i, Memory());
      std::fflush(stdout);
    }
  }
  std::printf("from %.1f MiB after %ld plans to at most %.1f\n", first, kFirst, most);
  return most > first + kMost ? 1 : 0;
}

int Run(int argc, char** argv) {
  if (argc == 3 && std::string(argv[1]) == "--memory") return WatchMemory(std::atol(argv[2]));
  if (argc > 2) throw std::invalid_argument("usage: planner_table [TABLE] | --memory PLANS");
  const std::string table = Table();
  if (argc == 1) {
    std::fputs(table.c_str(), stdout);
    return 0;
  }
  std::ofstream file(argv[1]);
  if (!(file << table)) throw std::runtime_error(std::string(argv[1]) + " cannot be written");
  return 0;
}

}  // namespace
}  // namespace bench

int main(int argc, char** argv) {
  try {
    return bench::Run(argc, argv);
  } catch (const std::exception& error) {
    std::fprintf(stderr, "planner_table: %s\n", error.what());
    return 2;
  }
}
