// Compares the engine with the plain solvers on drawn requests and limits, and prints the answers
// to the last bit: what the same program prints elsewhere, with another compiler or on another
// machine, must be the same.
//
//     vorkel_answers PERCENT
//
// PERCENT of the usual number of requests are drawn. Ends with 1 when engine and plain solvers
// differ.
#include <cstdio>
#include <cstdlib>
#include <string>

#include "tests/compare/KruPair.h"
#include "tests/compare/PllPair.h"
#include "tests/ports/bits.h"

namespace {

using compare::Kind;
using ports::Print;

constexpr int kPllRequests = 400;  // of each kind
constexpr int kFarRequests = 10;   // of those at most, which go through all fudges, a second each
constexpr int kKruRequests = 10000;

// Whether all engines answered as the plain solvers.
bool all_same = true;

void Note(const std::string& difference, const std::string& request) {
  if (difference.empty()) return;
  all_same = false;
  std::printf("\nDIFFERENT: %s\n  %s\n", difference.c_str(), request.c_str());
}

void PrintAnswer(const compare::PllPair& pair) {
  const plain::PllAnswer& answer = pair.Answer();
  Print(answer.code);
  for (const double value : {answer.vco, answer.m, answer.div0}) Print(value);
  Print(answer.d);
  for (int n = 0; n < plain::kMaxOutputs; ++n) {
    Print(answer.divN[n]);
    Print(answer.outFreq[n]);
    Print(answer.phase[n]);
    Print(answer.dutyCycle[n]);
  }
  Print(pair.PlainTrace());
}

void PrintPllAnswers(int percent) {
  compare::PllPair pair;
  for (int kind = 0; kind <= static_cast<int>(Kind::kBelowZero); ++kind) {
    int far_left = kFarRequests * percent / 100;
    for (int i = 0; i < kPllRequests * percent / 100; ++i) {
      compare::Random random(static_cast<unsigned>(kind * 1'000'003 + i));
      const compare::Case drawn = compare::DrawCase(static_cast<Kind>(kind), random);
      const bool is_far = compare::GoesFar(drawn);
      if (is_far && far_left-- <= 0) continue;
      std::printf("%s %d", compare::KindName(static_cast<Kind>(kind)), i);
      Note(pair.FirstDifference(drawn, !is_far), compare::Describe(drawn));
      PrintAnswer(pair);
      std::printf("\n");
    }
  }
}

void PrintKruAnswers(int percent) {
  compare::KruPair pair;
  for (int i = 0; i < kKruRequests * percent / 100; ++i) {
    compare::Random random(static_cast<unsigned>(i) + 77);
    const compare::KruCase drawn = compare::DrawKruCase(random);
    std::printf("%s %d", drawn.clkgen ? "KruClkgen" : "KruSp", i);
    Note(pair.FirstDifference(drawn), compare::Describe(drawn));
    Print(pair.Code());
    Print(pair.PlainTrace());  // has all that is chosen
    std::printf("\n");
  }
}

}  // namespace

int main(int argc, char** argv) {
  const int percent = argc == 2 ? std::atoi(argv[1]) : 0;
  if (percent <= 0) {
    std::fprintf(stderr, "usage: vorkel_answers PERCENT\n");
    return 2;
  }
  PrintPllAnswers(percent);
  PrintKruAnswers(percent);
  return all_same ? 0 : 1;
}
