// The table of the search benchmarks: one line for each request as it is done, and at the end
// one for each set, as Markdown.
#ifndef VORKEL_BENCH_SUMMARY_H_
#define VORKEL_BENCH_SUMMARY_H_

#include <benchmark/benchmark.h>

#include <cstdio>
#include <string>
#include <vector>

namespace bench {

// The counters that a benchmark of this program sets.
inline constexpr const char* kPlainSeconds = "plain";
inline constexpr const char* kProductSeconds = "product";

// What the table holds a set to. 0: nothing.
struct Goals {
  double geometricMean = 0.0;  // of how many times faster the product is
  double everyRatio = 0.0;     // the same, of each request
  double slowest = 0.0;        // seconds the product may take for a request
};

class Summary : public benchmark::BenchmarkReporter {
 public:
  // A set by the part of the benchmark names before the first slash.
  void AddSet(const std::string& name, const std::string& title, const Goals& goals);

  bool ReportContext(const Context& context) override;
  void ReportRuns(const std::vector<Run>& runs) override;

  // Writes the table, and below it the requests that miss a goal.
  void WriteTable(std::FILE* file) const;

 private:
  struct Line {
    std::string request;
    double plain;    // seconds
    double product;  // seconds
    double Ratio() const { return plain / product; }
  };
  struct Set {
    std::string name;
    std::string title;
    Goals goals;
    std::vector<Line> lines;
  };

  static void WriteRow(const Set& set, std::FILE* file);
  static void WriteMisses(const Set& set, std::FILE* file);

  std::vector<Set> sets_;
};

}  // namespace bench

#endif  // VORKEL_BENCH_SUMMARY_H_
