// How the time of the search grows with the outputs, the fudge and the width of the VCO range.
//
//   search_growth [TABLE]
//
// Runs the product over drawn requests, and writes the mean and the slowest of each row to the file
// TABLE; without it, to standard output.

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

#include "bench/Contestants.h"
#include "bench/TableFile.h"
#include "bench/Timing.h"
#include "bench/requests.h"
#include "tests/compare/PllPair.h"
#include "tests/compare/Random.h"

namespace bench {
namespace {

using compare::Random;

constexpr int kRequestsOfRow = 400;
constexpr int kRequestsByFudge = 6000;
constexpr int kRepetitions = 3;
constexpr int kUsualOutputs = 3;

// Frequencies in MHz with three digits behind the point, of which few fit each other.
plain::PllRequest Draw(Random& random, int prim, int count) {
  plain::PllRequest request;
  request.prim = prim;
  request.count = count;
  request.inFreq = random.Int(12'000, 200'000) / 1000.0;
  for (int n = 0; n < count; ++n) {
    const int most = n == 0 && random.OneIn(2) ? 40'000 : 390'000;
    request.outFreqs += (n == 0 ? "" : " ") +
                        compare::Number("%.3f", random.Int(6'000, most) / 1000.0);
  }
  return request;
}

double SecondsOf(Product& product, const plain::PllRequest& request) {
  double shortest = 1.0;
  for (int i = 0; i < kRepetitions; ++i) {
    const double start = WorkedSeconds();
    product.Run(request);
    shortest = std::min(shortest, WorkedSeconds() - start);
  }
  return shortest;
}

void WriteRow(const std::string& name, const std::vector<double>& seconds, std::FILE* file) {
  double sum = 0.0;
  double slowest = 0.0;
  for (const double s : seconds) {
    sum += s;
    slowest = std::max(slowest, s);
  }
  const double mean = seconds.empty() ? 0.0 : sum / static_cast<double>(seconds.size());
  std::fprintf(file, "| %s | %zu | %.1f us | %.3f ms |\n", name.c_str(), seconds.size(), 1e6 * mean,
               1e3 * slowest);
}

void ByOutputs(Product& product, std::FILE* file) {
  for (const int prim : {kTsyn, kPll}) {
    compare::PublishLimits(prim == kPll ? kPllLimits : kTsynLimits, prim);
    for (int count = 1; count <= plain::kMaxOutputs; ++count) {
      Random random(static_cast<std::uint64_t>(1000 + 10 * prim + count));
      std::vector<double> seconds;
      for (int i = 0; i < kRequestsOfRow; ++i) {
        seconds.push_back(SecondsOf(product, Draw(random, prim, count)));
      }
      WriteRow((prim == kPll ? "PLL, " : "TSYN, ") + std::to_string(count) +
                   (count == 1 ? " output" : " outputs"),
               seconds, file);
    }
  }
}

void ByFudge(Product& product, std::FILE* file) {
  struct Row {
    const char* name;
    double largest;  // MHz
    std::vector<double> seconds;
  };
  std::vector<Row> rows = {
      {"fudge 0", 0.0, {}},             {"fudge up to 0.001", 0.0015, {}},
      {"fudge up to 0.01", 0.0105, {}}, {"fudge up to 0.1", 0.1005, {}},
      {"fudge up to 1", 1.0005, {}},    {"fudge up to 11", 11.0, {}}};
  Row unsolved = {"no solution", 0.0, {}};
  Random random(2000);
  compare::PublishLimits(kTsynLimits, kTsyn);
  for (int i = 0; i < kRequestsByFudge; ++i) {
    const plain::PllRequest request = Draw(random, kTsyn, random.Int(1, kUsualOutputs));
    const Outcome outcome = product.Found(product.Run(request));
    Row* row = &unsolved;
    if (outcome.code == plain::kSolved) {
      constexpr double kRounding = 1e-9;  // MHz
      row = &*std::find_if(rows.begin(), rows.end() - 1, [&](const Row& candidate) {
        return outcome.fudge <= candidate.largest + kRounding;
      });
    }
    row->seconds.push_back(SecondsOf(product, request));
  }
  for (const Row& row : rows) WriteRow(row.name, row.seconds, file);
  WriteRow(unsolved.name, unsolved.seconds, file);
}

void ByWidth(Product& product, std::FILE* file) {
  for (const double width : {1.1, 1.5, 2.0, 3.0, 4.0, 6.0}) {
    plain::PllLimits limits = kTsynLimits;
    limits.vcoMax = limits.vcoMin * width;
    compare::PublishLimits(limits, kTsyn);
    Random random(3000);
    std::vector<double> seconds;
    for (int i = 0; i < kRequestsOfRow; ++i) {
      seconds.push_back(SecondsOf(product, Draw(random, kTsyn, kUsualOutputs)));
    }
    WriteRow("VCO up to " + compare::Number("%g", width) + " times its lowest", seconds, file);
  }
}

void WriteTable(std::FILE* file) {
  Product product;
  std::fprintf(file, "| Requests | Number | Mean | Slowest |\n|---|---:|---:|---:|\n");
  ByOutputs(product, file);
  ByFudge(product, file);
  ByWidth(product, file);
}

}  // namespace
}  // namespace bench

int main(int argc, char** argv) {
  std::FILE* file = bench::TableFile(argc, argv, 1);
  if (file == nullptr) {
    std::fprintf(stderr, "usage: search_growth [TABLE]\n");
    return 2;
  }
  bench::WriteTable(file);
  return 0;
}
