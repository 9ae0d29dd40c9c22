// The calculator beside the solvers: whatever a solver chooses on a bundled device, the
// calculator takes, and it answers with the solver's own frequencies, phases and duty cycles.
#include <gtest/gtest.h>

#include <cmath>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "engine/Ip_VorkelImp.h"
#include "host/bundled/calculator/Argument.h"
#include "tests/host/calculator_support.h"

namespace {

using Port::StringBase;

// Objects live until the process ends: controllers are shared by the address of a personality.
Ip::VorkelImp& NewImp(const char* part) {
  static auto* const objects = new std::vector<std::unique_ptr<Ip::VorkelImp>>;
  objects->push_back(std::make_unique<Ip::VorkelImp>(nullptr));
  objects->back()->SetDevice(part);
  return *objects->back();
}

std::string List(const std::vector<double>& numbers) {
  std::string text;
  for (const double number : numbers) {
    if (!text.empty()) text += ' ';
    text += Calculator::NumberText(number);
  }
  return text;
}

struct Output {
  double period = 0, phase = 0, duty = 0;
};

// The devices are looked for when they are first needed.
class CalculatorAndSolver : public testing::Test {
 private:
  SearchPath path_{BUNDLED_DEVICES};
};

// A PLL or TSYN, with the calculator asked about what it has chosen.
class Solved {
 public:
  Solved(const char* part, bool is_pll) : imp_(NewImp(part)), is_pll_(is_pll) {}

  bool Solve(const std::vector<double>& freqs, const std::vector<double>& phases,
             const std::vector<double>& duties, double input) {
    return imp_.GetClosestSolution(
               StringBase(List(freqs)), StringBase(List(phases)), StringBase(List(duties)), input,
               0, static_cast<int>(freqs.size()), false, false, is_pll_ ? 1 : 0, false) == 1;
  }

  double DividerOf(int n) const { return n == 0 ? imp_.GetChosenDiv0() : imp_.GetChosenDivN(n); }

  Output OutputOf(int n, double input, double phase, double duty) {
    Output output;
    StringBase error;
    EXPECT_TRUE(imp_.GetPLLPeriodPhaseDutyCycle(input, imp_.GetChosenM(), imp_.GetChosenD(),
                                                DividerOf(n), phase, duty, 0, &error,
                                                &output.period, &output.phase, &output.duty))
        << error.CStr();
    return output;
  }

  void ExpectFigures(int n, double input, const char* bandwidth) {
    StringBase error;
    double figure = 0;
    EXPECT_TRUE(imp_.GetVcoFreq(input, imp_.GetChosenM(), imp_.GetChosenD(), 0, &error, &figure))
        << error.CStr();
    // The solver's slack: D is off by less than 0.0005.
    EXPECT_NEAR(figure, imp_.GetChosenVCO(), imp_.GetChosenVCO() * 0.0005);
    EXPECT_TRUE(imp_.GetPLLPkToPkJitter(input, imp_.GetChosenM(), imp_.GetChosenD(), bandwidth,
                                        DividerOf(n), 50, &error, &figure))
        << error.CStr();
    EXPECT_GT(figure, 0);
    EXPECT_TRUE(imp_.GetPLLPhaseError(input, imp_.GetChosenD(), bandwidth, &error, &figure))
        << error.CStr();
    EXPECT_GT(figure, 0);
  }

  Ip::VorkelImp& imp() { return imp_; }

 private:
  Ip::VorkelImp& imp_;
  bool is_pll_;
};

void CompareLoops(const char* part, bool is_pll, unsigned seed) {
  Solved solved(part, is_pll);
  std::mt19937 random(seed);
  const auto pick = [&](double lowest, double highest) {
    return std::round(std::uniform_real_distribution(lowest, highest)(random) * 8) / 8;
  };
  int compared = 0;
  for (int run = 0; run < 60; ++run) {
    const double input = pick(20, 400);
    const std::vector<double> freqs = {pick(10, 350), pick(10, 350)};
    const std::vector<double> phases = {pick(0, 300), pick(-300, 300)};
    const std::vector<double> duties = {pick(10, 80), pick(10, 80)};
    if (!solved.Solve(freqs, phases, duties, input)) continue;
    for (int n = 0; n < 2; ++n) {
      const auto index = static_cast<std::size_t>(n);
      solved.ExpectFigures(n, input, "OPTIMIZED");
      solved.ExpectFigures(n, input, "HIGH");
      const Output requested = solved.OutputOf(n, input, phases[index], duties[index]);
      const double frequency = solved.imp().GetChosenOutFreqN(n);
      EXPECT_NEAR(1000 / requested.period, frequency, frequency * 0.0005);
      // Chosen values are steps, and stay as they are.
      const double phase = solved.imp().GetChosenPhaseN(n);
      const double duty = solved.imp().GetChosenDutyCycleN(n) * 100;
      const Output chosen = solved.OutputOf(n, input, phase, duty);
      EXPECT_NEAR(chosen.phase, phase, 1e-9);
      EXPECT_NEAR(chosen.duty, duty, 1e-9);
      ++compared;
    }
  }
  EXPECT_GT(compared, 40) << part;
}

TEST_F(CalculatorAndSolver, AgreeOnPll) {
  CompareLoops("vk10", true, 1);
  CompareLoops("vk40-1", true, 2);
}

TEST_F(CalculatorAndSolver, AgreeOnTsyn) {
  CompareLoops("vk20", false, 3);
  CompareLoops("vk40-2", false, 4);
}

// Low bandwidth: the solver keeps to the PFD limit that the calculator checks.
TEST_F(CalculatorAndSolver, AgreeOnLowBandwidth) {
  Solved solved("vk20", false);
  solved.imp().SetLowBandwidth(true);
  int compared = 0;
  for (double input = 310; input < 500; input += 20) {
    if (!solved.Solve({100}, {0}, {50}, input)) continue;
    EXPECT_GT(solved.imp().GetChosenD(), 1) << "the input is above the limit";
    solved.ExpectFigures(0, input, "LOW");
    ++compared;
  }
  EXPECT_GT(compared, 5);
}

// --- KRU -------------------------------------------------------------------------------------

class KruSolved {
 public:
  KruSolved() : imp_(NewImp("vk40")) {}

  // Asks the calculator about output n of the last run.
  void Compare(int n, double input, bool clkgen, bool feedback) {
    StringBase error;
    Output output;
    const StringBase pin = imp_.GetKruChosenPinname(n);
    const bool divided = !clkgen && imp_.GetKruChosenDivBy2();
    ASSERT_TRUE(imp_.GetKRUPeriodPhaseDutyCycle(
        input, pin, divided, imp_.GetKruChosenM(), imp_.GetKruChosenD(), imp_.GetKruChosenClkdv(),
        &error, &output.period, &output.phase, &output.duty))
        << pin.CStr() << ": " << error.CStr();
    EXPECT_EQ(output.period, 1000 / imp_.GetKruChosenOutFreqN(input, n)) << pin.CStr();
    double jitter = 0;
    ASSERT_TRUE(imp_.GetKruPkToPkJitter(input, pin, clkgen, divided, feedback, false,
                                        imp_.GetKruChosenM(), imp_.GetKruChosenD(), &error,
                                        &jitter))
        << pin.CStr() << ": " << error.CStr();
    EXPECT_GT(jitter, 0);
    pins_ += pin.CStr();
    pins_ += ' ';
  }

  Ip::VorkelImp& imp() { return imp_; }
  const std::string& pins() const { return pins_; }

 private:
  Ip::VorkelImp& imp_;
  std::string pins_;
};

TEST_F(CalculatorAndSolver, AgreeOnKru) {
  KruSolved solved;
  int compared = 0;
  for (const double input : {20.0, 40.0, 66.0, 100.0, 150.0}) {
    for (const double ratio : {0.2, 0.25, 0.4, 0.5, 1.0, 1.5, 2.0, 2.25}) {
      for (const double phase : {0.0, 90.0, 180.0, 270.0}) {
        if (solved.imp().KruCalculateActuals(StringBase(List({input, input * ratio})),
                                             StringBase(List({0, phase})), input, 2, true,
                                             false) != 1) {
          continue;
        }
        for (int n = 0; n < 2; ++n) {
          solved.Compare(n, input, false, true);
          ++compared;
        }
      }
    }
  }
  EXPECT_GT(compared, 80);
  for (const char* pin : {"CLK0 ", "CLK90 ", "CLK180 ", "CLK270 ", "CLK2X ", "CLK2X180 ", "CLKFX ",
                          "CLKFX180 ", "CLKDV "}) {
    EXPECT_NE(solved.pins().find(pin), std::string::npos) << pin << "was never chosen";
  }
}

TEST_F(CalculatorAndSolver, AgreeOnKruClkgen) {
  KruSolved solved;
  int compared = 0;
  for (const double input : {20.0, 33.0, 100.0}) {
    for (const double output : {10.0, 37.5, 66.0, 125.0, 320.0}) {
      if (solved.imp().KruClkgenCalculateActuals(StringBase(List({output, output})), "0 180", input,
                                                 2, false) != 1) {
        continue;
      }
      for (int n = 0; n < 2; ++n) {
        solved.Compare(n, input, true, false);
        ++compared;
      }
    }
  }
  EXPECT_GT(compared, 20);
}

}  // namespace
