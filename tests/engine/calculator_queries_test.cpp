// Tests of the queries of the host's calculator: how it is obtained, what goes to it and what
// comes back, and what a period query keeps.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "host/Tw_BmCMBCalculator.h"
#include "tests/engine/EngineTest.h"
#include "tests/support/FakeHost.h"

namespace {

using engine_test::kInfinity;
using engine_test::kNan;
using Ip::VorkelImp;
using Port::StringBase;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr char kPart[] = "timed";
constexpr char kNoCalculator[] =
    "Internal getCMBCalculator() error -- could not obtain CMBCalculator\n";
constexpr double kUntouched = -77.0;

// Writes down each call, and answers what the test has set.
class RecordingCalculator : public Tw_BmCMBCalculator {
 public:
  std::vector<std::string> calls;
  bool answer = true;
  std::string error;
  double figure = 0.0, phase = 0.0, dutyCycle = 0.0;
  int* destroyed = nullptr;

  ~RecordingCalculator() override {
    if (destroyed != nullptr) ++*destroyed;
  }

  bool VcoFrequency(double a1, double a2, double a3, double a4, StringBase* text,
                    double* frequency) override {
    Record("1", {a1, a2, a3, a4});
    return Answer(text, frequency);
  }
  bool PllPkToPkJitter(double a1, double a2, double a3, StringBase t4, double a5, double a6,
                       StringBase* text, double* jitter) override {
    Record("2", {a1, a2, a3}, t4.CStr(), {a5, a6});
    return Answer(text, jitter);
  }
  bool Unused(StringBase*) override {
    calls.emplace_back("3");
    return false;
  }
  bool KruPkToPkJitter(double a1, int pin, bool isKruClkgen, bool f1, bool f2, bool f3,
                       const double& a2, const double& a3, StringBase* text,
                       double* jitter) override {
    Record("4", {a1},
           "pin " + std::to_string(pin) + " clkgen " + Text(isKruClkgen) + ' ' + Text(f1) + ' ' +
               Text(f2) + ' ' + Text(f3),
           {a2, a3});
    return Answer(text, jitter);
  }
  bool PllPhaseError(double a1, double a2, StringBase t3, StringBase* text,
                     double* phaseError) override {
    Record("5", {a1, a2}, t3.CStr());
    return Answer(text, phaseError);
  }
  bool KruPhaseError(StringBase* text, double* phaseError) override {
    Record("6", {});
    return Answer(text, phaseError);
  }
  bool KruPeriodPhaseDutyCycle(double a1, int pin, bool f1, double a2, double a3, double a4,
                               StringBase* text, double* period, double* phaseOut,
                               double* dutyOut) override {
    Record("7", {a1}, "pin " + std::to_string(pin) + ' ' + Text(f1), {a2, a3, a4});
    return AnswerAll(text, period, phaseOut, dutyOut);
  }
  bool PllPeriodPhaseDutyCycle(double a1, double a2, double a3, double a4, double a5, double a6,
                               double a7, StringBase* text, double* period, double* phaseOut,
                               double* dutyOut) override {
    Record("8", {a1, a2, a3, a4, a5, a6, a7});
    return AnswerAll(text, period, phaseOut, dutyOut);
  }

 private:
  static std::string Text(bool flag) { return flag ? "true" : "false"; }

  void Record(const std::string& operation, const std::vector<double>& before,
              const std::string& text = "", const std::vector<double>& after = {}) {
    std::string call = operation;
    char number[400];
    for (const double value : before) {
      std::snprintf(number, sizeof number, " %g", value);
      call += number;
    }
    if (!text.empty()) call += " [" + text + ']';
    for (const double value : after) {
      std::snprintf(number, sizeof number, " %g", value);
      call += number;
    }
    calls.push_back(call);
  }
  bool Answer(StringBase* text, double* out) {
    if (!error.empty()) *text = StringBase(error);
    *out = figure;
    return answer;
  }
  bool AnswerAll(StringBase* text, double* period, double* phaseOut, double* dutyOut) {
    *phaseOut = phase;
    *dutyOut = dutyCycle;
    return Answer(text, period);
  }
};

class CalculatorQueries : public testing::Test {
 protected:
  CalculatorQueries() {
    host_.Reset();
    host_.devices[kPart] = {{"KEY", 1e-9}};
    host_.calculator = &calculator_;
    imp_.SetDevice(kPart);
  }
  // The object lives on; the calculator is the test's own.
  ~CalculatorQueries() override {
    imp_.cmbCalculator = nullptr;
    host_.Reset();
  }

  std::string Call() const { return calculator_.calls.empty() ? "" : calculator_.calls.back(); }

  FakeHost& host_ = FakeHost::Instance();
  RecordingCalculator calculator_;
  VorkelImp& imp_ = engine_test::NewImp();
  StringBase error_;
  double figure_ = kUntouched, phase_ = kUntouched, duty_ = kUntouched;

  // One call of each query, with arguments that can be told apart.
  const std::vector<std::function<bool()>> queries_ = {
      [this] { return imp_.GetVcoFreq(1, 2, 3, 4, &error_, &figure_); },
      [this] { return imp_.GetPLLPkToPkJitter(1, 2, 3, "HIGH", 5, 6, &error_, &figure_); },
      [this] {
        return imp_.GetKruPkToPkJitter(1, "CLK0", true, true, false, true, 2, 3, &error_, &figure_);
      },
      [this] { return imp_.GetPLLPhaseError(1, 2, "LOW", &error_, &figure_); },
      [this] { return imp_.GetKRUPhaseError(&error_, &figure_); },
      [this] {
        return imp_.GetKRUPeriodPhaseDutyCycle(1, "CLKDV", true, 2, 3, 4, &error_, &figure_,
                                               &phase_, &duty_);
      },
      [this] {
        return imp_.GetPLLPeriodPhaseDutyCycle(1, 2, 3, 4, 5, 6, 7, &error_, &figure_, &phase_,
                                               &duty_);
      },
  };
};

// --- What goes to the calculator -------------------------------------------------------------

TEST_F(CalculatorQueries, PassTheirArgumentsInOrder) {
  for (const auto& query : queries_) EXPECT_TRUE(query());
  EXPECT_THAT(
      calculator_.calls,
      ElementsAre("1 1 2 3 4", "2 1 2 3 [HIGH] 5 6", "4 1 [pin 1 clkgen true true false true] 2 3",
                  "5 1 2 [LOW]", "6", "7 1 [pin 10 true] 2 3 4", "8 1 2 3 4 5 6 7"));
}

TEST_F(CalculatorQueries, PassEachFlagToItsPlace) {
  for (int bits = 0; bits < 16; ++bits) {
    const bool clkgen = (bits & 1) != 0, f1 = (bits & 2) != 0, f2 = (bits & 4) != 0,
               f3 = (bits & 8) != 0;
    const auto text = [](bool flag) { return std::string(flag ? " true" : " false"); };
    imp_.GetKruPkToPkJitter(100, "CLKFX", clkgen, f1, f2, f3, 5, 4, &error_, &figure_);
    EXPECT_EQ(Call(),
              "4 100 [pin 8 clkgen" + text(clkgen) + text(f1) + text(f2) + text(f3) + "] 5 4");
  }
  for (const bool f1 : {false, true}) {
    imp_.GetKRUPeriodPhaseDutyCycle(100, "CLK2X", f1, 5, 4, 3, &error_, &figure_, &phase_, &duty_);
    EXPECT_EQ(Call(), std::string("7 100 [pin 5 ") + (f1 ? "true" : "false") + "] 5 4 3");
  }
}

TEST_F(CalculatorQueries, TurnPinNamesIntoCodes) {
  const std::pair<const char*, int> pins[] = {
      {"CLK0", 1},  {"CLK90", 2},    {"CLK180", 3}, {"CLK270", 4},   {"CLK2X", 5}, {"CLK2X180", 7},
      {"CLKFX", 8}, {"CLKFX180", 9}, {"CLKDV", 10}, {"CLKFXDV", 12}, {"clk0", 12}, {"", 12}};
  for (const auto& [pin, code] : pins) {
    const std::string text = "[pin " + std::to_string(code);
    imp_.GetKruPkToPkJitter(1, pin, false, false, false, false, 2, 3, &error_, &figure_);
    EXPECT_THAT(Call(), testing::HasSubstr(text + " ")) << pin;
    imp_.GetKRUPeriodPhaseDutyCycle(1, pin, false, 2, 3, 4, &error_, &figure_, &phase_, &duty_);
    EXPECT_THAT(Call(), testing::HasSubstr(text + " ")) << pin;
  }
}

// Nothing is checked or cleaned on the way: that is the calculator's affair.
TEST_F(CalculatorQueries, PassAnyNumberAndText) {
  imp_.GetVcoFreq(kNan, kInfinity, -kInfinity, -0.0, &error_, &figure_);
  EXPECT_EQ(Call(), "1 nan inf -inf -0");
  imp_.GetPLLPkToPkJitter(-1, 0, 1e300, " low\t%s", -5, 5e-324, &error_, &figure_);
  EXPECT_EQ(Call(), "2 -1 0 1e+300 [ low\t%s] -5 4.94066e-324");
  imp_.GetPLLPhaseError(0, 0, "", &error_, &figure_);
  EXPECT_EQ(Call(), "5 0 0");
}

// --- What comes back -------------------------------------------------------------------------

TEST_F(CalculatorQueries, ReturnTheFigureUnread) {
  for (const double value : {0.0, 123.4567, -5.0, 1e300, kInfinity, kNan}) {
    calculator_.figure = value;
    for (const auto& query : queries_) {
      figure_ = kUntouched;
      EXPECT_TRUE(query());
      EXPECT_TRUE(figure_ == value || (std::isnan(value) && std::isnan(figure_))) << value;
      EXPECT_TRUE(error_.IsEmpty());
    }
  }
}

TEST_F(CalculatorQueries, ReturnTheErrorUnread) {
  calculator_.answer = false;
  calculator_.error = "Input frequency is 0 MHz, but must be 1% of \\n %s.";
  for (const auto& query : queries_) {
    error_ = StringBase();
    EXPECT_FALSE(query());
    EXPECT_EQ(error_.CStr(), calculator_.error);
  }
  EXPECT_THAT(host_.messages, IsEmpty()) << "a refusal is no message";
}

// Whatever the calculator means by them.
TEST_F(CalculatorQueries, ReturnTheAnswerAndTheTextEachAsItIs) {
  calculator_.answer = true;
  calculator_.error = "a word of warning";
  EXPECT_TRUE(queries_[0]());
  EXPECT_EQ(error_, StringBase("a word of warning"));
  calculator_.answer = false;
  calculator_.error = "";
  error_ = StringBase();
  EXPECT_FALSE(queries_[0]());
  EXPECT_TRUE(error_.IsEmpty());
}

// --- How the calculator is obtained ----------------------------------------------------------

TEST_F(CalculatorQueries, AskForTheCalculatorEachTime) {
  int requests = 0;
  for (int round = 0; round < 2; ++round) {
    for (const auto& query : queries_) {
      query();
      EXPECT_EQ(host_.calculatorRequests, ++requests);
    }
  }
  EXPECT_EQ(calculator_.calls.size(), 14u);
}

TEST_F(CalculatorQueries, FollowTheHost) {
  RecordingCalculator other;
  for (const auto& query : queries_) {
    host_.calculator = &calculator_;
    query();
    EXPECT_EQ(imp_.cmbCalculator, &calculator_);
    host_.calculator = &other;
    query();
    EXPECT_EQ(imp_.cmbCalculator, &other);
  }
  EXPECT_EQ(calculator_.calls, other.calls);
}

// The host may answer with the same calculator again.
TEST_F(CalculatorQueries, DoNotDeleteTheOneBefore) {
  int destroyed = 0;
  RecordingCalculator first, second;
  first.destroyed = second.destroyed = &destroyed;
  for (RecordingCalculator* calculator : {&first, &second, &first}) {
    host_.calculator = calculator;
    queries_[0]();
  }
  host_.calculator = nullptr;
  queries_[0]();
  EXPECT_EQ(destroyed, 0);
  EXPECT_EQ(imp_.cmbCalculator, nullptr);
}

TEST_F(CalculatorQueries, AnObjectDeletesTheOneThatItHolds) {
  int destroyed = 0;
  auto owned = std::make_unique<RecordingCalculator>();
  owned->destroyed = &destroyed;
  {
    VorkelImp imp(nullptr);
    imp.SetDevice(kPart);
    host_.calculator = owned.release();
    EXPECT_TRUE(imp.GetKRUPhaseError(&error_, &figure_));
    EXPECT_EQ(destroyed, 0);
    // Controllers are shared by the address of the personality, so this one must not come back.
    static const PM_PIC* kept = nullptr;
    kept = imp.pic;
    imp.pic = nullptr;
    EXPECT_NE(kept, nullptr);
  }
  EXPECT_EQ(destroyed, 1);
}

TEST_F(CalculatorQueries, NeedADevice) {
  VorkelImp& bare = engine_test::NewImp();
  EXPECT_FALSE(bare.GetPLLPhaseError(1, 2, "LOW", &error_, &figure_));
  EXPECT_TRUE(error_.IsEmpty());
  EXPECT_EQ(figure_, kUntouched);
  EXPECT_EQ(host_.calculatorRequests, 0);
  EXPECT_THAT(host_.MessageTexts(), ElementsAre(kNoCalculator));
}

TEST_F(CalculatorQueries, NeedADeviceThatThereIs) {
  VorkelImp& unknown = engine_test::NewImp();
  unknown.SetDevice("unknown");
  EXPECT_FALSE(unknown.GetKRUPhaseError(&error_, &figure_));
  EXPECT_THAT(host_.MessageTexts(), ElementsAre(kNoCalculator))
      << "no message of its own for the speed data";
  // The next one works once there is one.
  unknown.SetDevice(kPart);
  EXPECT_TRUE(unknown.GetKRUPhaseError(&error_, &figure_));
  unknown.cmbCalculator = nullptr;
}

TEST_F(CalculatorQueries, NeedAHostThatMakesTheCalculator) {
  queries_[0]();
  for (const auto& action : engine_test::Throwers()) {
    for (const auto& query : queries_) {
      host_.whileCalculatorIsMade = action;
      host_.messages.clear();
      EXPECT_FALSE(query());
      EXPECT_TRUE(error_.IsEmpty());
      EXPECT_THAT(host_.MessageTexts(), ElementsAre(kNoCalculator));
      EXPECT_EQ(imp_.cmbCalculator, nullptr) << "the earlier one is no answer";
      host_.whileCalculatorIsMade = nullptr;
      EXPECT_TRUE(query());
    }
  }
}

TEST_F(CalculatorQueries, NeedSpeedData) {
  host_.withoutSpeedData.push_back(kPart);
  EXPECT_FALSE(queries_[0]());
  EXPECT_EQ(host_.calculatorRequests, 0);
  EXPECT_THAT(host_.MessageTexts(), ElementsAre(kNoCalculator));
}

TEST_F(CalculatorQueries, IssueOneMessageEachWithoutACalculator) {
  host_.calculator = nullptr;
  imp_.cmbCalculator = nullptr;
  std::size_t failed = 0;
  for (const auto& query : queries_) {
    EXPECT_FALSE(query());
    EXPECT_TRUE(error_.IsEmpty());
    EXPECT_EQ(figure_, kUntouched);
    ASSERT_EQ(host_.messages.size(), ++failed);
    EXPECT_EQ(host_.messages.back().text, kNoCalculator);
    EXPECT_EQ(host_.messages.back().category, "DesignEntry");
    EXPECT_EQ(host_.messages.back().source, "../s/Ip_VorkelImp");
    EXPECT_EQ(host_.messages.back().line, host_.messages.front().line);
  }
}

TEST_F(CalculatorQueries, ReadNoSpeedData) {
  for (const auto& query : queries_) query();
  EXPECT_THAT(host_.reads, IsEmpty());
}

// The device is that of the first need, for the calculator as for the speed data.
TEST_F(CalculatorQueries, KeepTheFirstDevice) {
  queries_[0]();
  const auto* const controller = imp_.speedController;
  ASSERT_NE(controller, nullptr);
  host_.devices["other"] = {};
  imp_.SetDevice("other");
  queries_[0]();
  EXPECT_EQ(imp_.speedController, controller);
}

// --- Latest phase and duty cycle -------------------------------------------------------------

TEST_F(CalculatorQueries, KeepNothingBeforeTheFirstPeriod) {
  for (int i = 0; i < 5; ++i) queries_[static_cast<std::size_t>(i)]();
  EXPECT_EQ(imp_.GetLatestPhase(), 0.0);
  EXPECT_EQ(imp_.GetLatestDutyCycle(), 0.0);
}

TEST_F(CalculatorQueries, AKruPhaseIsKeptInWholeDegrees) {
  const struct {
    double fraction, degrees, kept;
  } cases[] = {
      {0.25, 90.0, 90.0},
      {0.2499, 0.2499 * 360.0, 89.0},
      {89.9 / 360.0, 89.9 / 360.0 * 360.0, 89.0},
      {-12.7 / 360.0, -12.7 / 360.0 * 360.0, -12.0},
      {0.999999, 0.999999 * 360.0, 359.0},
      {-0.001, -0.36, 0.0},
      {0.0, 0.0, 0.0},
      {10.0, 3600.0, 3600.0},
      // Beyond the range of a whole number of 32 bits there is none to keep.
      {1e10, 3.6e12, 0.0},
  };
  for (const auto& [fraction, degrees, kept] : cases) {
    calculator_.phase = fraction;
    calculator_.dutyCycle = 50.0 + fraction;
    ASSERT_TRUE(imp_.GetKRUPeriodPhaseDutyCycle(1, "CLK0", false, 2, 3, 4, &error_, &figure_,
                                                &phase_, &duty_));
    EXPECT_EQ(phase_, degrees);
    EXPECT_EQ(duty_, 50.0 + fraction);
    EXPECT_EQ(imp_.GetLatestPhase(), kept) << degrees;
    EXPECT_EQ(imp_.GetLatestDutyCycle(), 50.0 + fraction);
  }
}

TEST_F(CalculatorQueries, APllPhaseIsKeptAsItIs) {
  for (const double phase : {0.25, 89.9, -12.7, 359.999, 1e10, kInfinity}) {
    calculator_.phase = phase;
    calculator_.dutyCycle = phase / 2;
    ASSERT_TRUE(queries_[6]());
    EXPECT_EQ(phase_, phase);
    EXPECT_EQ(duty_, phase / 2);
    EXPECT_EQ(imp_.GetLatestPhase(), phase);
    EXPECT_EQ(imp_.GetLatestDutyCycle(), phase / 2);
  }
}

TEST_F(CalculatorQueries, AFailedPeriodKeepsTheOneBefore) {
  calculator_.phase = 0.125;
  calculator_.dutyCycle = 37.5;
  ASSERT_TRUE(queries_[5]());
  ASSERT_EQ(imp_.GetLatestPhase(), 45.0);
  calculator_.answer = false;
  calculator_.phase = 0.5;
  calculator_.dutyCycle = 99.0;
  EXPECT_FALSE(queries_[5]());
  EXPECT_FALSE(queries_[6]());
  host_.calculator = nullptr;
  EXPECT_FALSE(queries_[5]());
  EXPECT_FALSE(queries_[6]());
  EXPECT_EQ(imp_.GetLatestPhase(), 45.0);
  EXPECT_EQ(imp_.GetLatestDutyCycle(), 37.5);
}

TEST_F(CalculatorQueries, OtherQueriesKeepThem) {
  calculator_.phase = 0.125;
  calculator_.dutyCycle = 37.5;
  queries_[5]();
  for (int i = 0; i < 5; ++i) queries_[static_cast<std::size_t>(i)]();
  const double request = 100, divider = 4;
  imp_.TSYNCalculateActualPhase(&request, &divider, true);
  imp_.TSYNCalculateActualDutyCycle(&request, &divider);
  EXPECT_EQ(imp_.GetLatestPhase(), 45.0);
  EXPECT_EQ(imp_.GetLatestDutyCycle(), 37.5);
}

TEST_F(CalculatorQueries, TheLatestValuesAreAnObjectsOwn) {
  calculator_.phase = 30;
  queries_[6]();
  EXPECT_EQ(engine_test::NewImp().GetLatestPhase(), 0.0);
  EXPECT_EQ(imp_.GetLatestPhase(), 30.0);
}

}  // namespace
