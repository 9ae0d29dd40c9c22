#include "bench/Summary.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdlib>

namespace bench {

namespace {

constexpr double kMilli = 1e3;  // of a second
constexpr double kMicro = 1e6;

// A ratio with three digits or all before the point.
std::string Times(double ratio) {
  std::array<char, 32> text;
  std::snprintf(text.data(), text.size(), ratio < 10 ? "%.2f" : ratio < 100 ? "%.1f" : "%.0f",
                ratio);
  return text.data();
}

}  // namespace

void Summary::AddSet(const std::string& name, const std::string& title, const Goals& goals) {
  sets_.push_back({name, title, goals, {}});
}

bool Summary::ReportContext(const Context&) { return true; }

void Summary::ReportRuns(const std::vector<Run>& runs) {
  for (const Run& run : runs) {
    const std::string name = run.run_name.function_name;
    if (run.error_occurred) {
      std::fprintf(stderr, "%s: %s\n", name.c_str(), run.error_message.c_str());
      std::exit(1);
    }
    const std::size_t slash = name.find('/');
    const auto set = std::find_if(sets_.begin(), sets_.end(), [&](const Set& candidate) {
      return candidate.name == name.substr(0, slash);
    });
    if (set == sets_.end()) continue;
    const Line line = {name.substr(slash + 1), run.counters.at(kPlainSeconds),
                       run.counters.at(kProductSeconds)};
    set->lines.push_back(line);
    std::printf("%-10s %-36s plain %10.3f ms  product %9.2f us  ratio %s\n", set->name.c_str(),
                line.request.c_str(), kMilli * line.plain, kMicro * line.product,
                Times(line.Ratio()).c_str());
    std::fflush(stdout);
  }
}

void Summary::WriteRow(const Set& set, std::FILE* file) {
  double logarithms = 0.0;
  double smallest = set.lines.front().Ratio();
  double largest = smallest;
  double slowestPlain = 0.0;
  double slowestProduct = 0.0;
  for (const Line& line : set.lines) {
    logarithms += std::log(line.Ratio());
    smallest = std::min(smallest, line.Ratio());
    largest = std::max(largest, line.Ratio());
    slowestPlain = std::max(slowestPlain, line.plain);
    slowestProduct = std::max(slowestProduct, line.product);
  }
  const double mean = std::exp(logarithms / static_cast<double>(set.lines.size()));
  std::string goals;
  auto judge = [&goals](const std::string& goal, bool reached) {
    goals += (goals.empty() ? "" : "; ") + goal + (reached ? ": reached" : ": missed");
  };
  if (set.goals.geometricMean > 0.0) {
    judge("mean " + Times(set.goals.geometricMean), mean >= set.goals.geometricMean);
  }
  if (set.goals.everyRatio > 0.0) {
    judge("each " + Times(set.goals.everyRatio), smallest >= set.goals.everyRatio);
  }
  if (set.goals.slowest > 0.0) {
    judge(Times(kMilli * set.goals.slowest) + " ms", slowestProduct <= set.goals.slowest);
  }
  std::fprintf(file, "| %s | %zu | %s | %s | %s | %.2f ms | %.3f ms | %s |\n", set.title.c_str(),
               set.lines.size(), Times(mean).c_str(), Times(smallest).c_str(),
               Times(largest).c_str(), kMilli * slowestPlain, kMilli * slowestProduct,
               goals.c_str());
}

void Summary::WriteMisses(const Set& set, std::FILE* file) {
  for (const Line& line : set.lines) {
    if (line.Ratio() < set.goals.everyRatio) {
      std::fprintf(file, "Not as fast as it should be: %s, %s (%s times the plain search)\n",
                   set.name.c_str(), line.request.c_str(), Times(line.Ratio()).c_str());
    }
    if (set.goals.slowest > 0.0 && line.product > set.goals.slowest) {
      std::fprintf(file, "Slower than %.0f ms: %s, %s (%.2f ms)\n", kMilli * set.goals.slowest,
                   set.name.c_str(), line.request.c_str(), kMilli * line.product);
    }
  }
}

void Summary::WriteTable(std::FILE* file) const {
  std::fprintf(file,
               "| Requests | Number | Times faster, geometric mean | smallest | largest "
               "| Plain, slowest | Product, slowest | Goals |\n"
               "|---|---:|---:|---:|---:|---:|---:|---|\n");
  for (const Set& set : sets_) {
    if (!set.lines.empty()) WriteRow(set, file);
  }
  std::fprintf(file, "\n");
  for (const Set& set : sets_) WriteMisses(set, file);
}

}  // namespace bench
