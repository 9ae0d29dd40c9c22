// Prints what the bundled host answers to drawn queries on a device file, to the last bit: figures
// of the calculator, and the configurations that the engine chooses with its limits. What the same
// program prints elsewhere must be the same.
//
//     VORKEL_DEVICES=FOLDER vorkel_figures QUERIES PART...
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <string>
#include <vector>

#include "engine/Ip_VorkelImp.h"
#include "tests/compare/Random.h"
#include "tests/ports/bits.h"

namespace {

using ports::Print;

constexpr const char* kPins[] = {"CLK0",     "CLK90", "CLK180", "CLK270",  "CLK2X",
                                 "CLK2X180", "CLKDV", "CLKFX",  "CLKFX180"};
constexpr const char* kBandwidths[] = {"LOW", "OPTIMIZED", "HIGH"};
constexpr double kDvs[] = {0, 2, 2.5, 3, 7.5, 9, 16};

// An implementation object that lives as long as the process, as in the package: speed controllers
// are shared by the address of the personality, so one at an address that was used before would meet
// the controller of another device.
Ip::VorkelImp& NewImp() {
  static auto* const objects = new std::vector<std::unique_ptr<Ip::VorkelImp>>;
  objects->push_back(std::make_unique<Ip::VorkelImp>(nullptr));
  return *objects->back();
}

// Compilers work out the arguments of a call in orders of their own, so each draw is a statement.
class Queries {
 public:
  Queries(const std::string& part, std::uint64_t seed) : random_(seed), imp_(NewImp()) {
    imp_.SetDevice(part.c_str());
  }

  void Run() {
    Choose();
    AskLoop();
    AskKru();
  }

 private:
  // A TSYN or a PLL for two outputs, with what it has chosen.
  void Choose() {
    input_ = random_.Real(10, 300);
    std::string outputs = compare::Number("%.17g", random_.Real(5, 400));
    outputs += " ";
    outputs += compare::Number("%.17g", random_.Real(5, 400));
    const int prim = random_.Int(0, 1);
    const bool prefer_max_vco = random_.OneIn(2);
    const bool whole_dividers = random_.OneIn(2);
    const int code = imp_.GetClosestSolution(outputs.c_str(), "45 90", "50 40", input_, 0, 2,
                                             prefer_max_vco, whole_dividers, prim, false);
    std::printf("chosen");
    Print(prim);
    Print(code);
    Print(imp_.GetChosenVCO());
    Print(imp_.GetChosenM());
    Print(imp_.GetChosenD());
    Print(imp_.GetChosenDiv0());
    Print(imp_.GetChosenDivN(1));
    for (const int n : {0, 1}) {
      Print(imp_.GetChosenOutFreqN(n));
      Print(imp_.GetChosenPhaseN(n));
      Print(imp_.GetChosenDutyCycleN(n));
    }
    std::printf("\n");
  }

  void PrintQuery(const char* name, bool answered, const Port::StringBase& error, double figure) {
    std::printf("%s", name);
    Print(answered ? 1 : 0);
    Print(figure);
    std::printf(" %s\n", error.CStr());
  }

  void AskLoop() {
    const bool is_chosen = imp_.GetChosenM() != 0;
    const double m = is_chosen ? imp_.GetChosenM() : random_.Int(1, 64);
    const double d = is_chosen ? imp_.GetChosenD() : random_.Int(1, 10);
    const double o = is_chosen ? imp_.GetChosenDiv0() : random_.Int(1, 128);
    const char* const bandwidth = kBandwidths[random_.Int(0, 2)];
    double figure = 0;
    Port::StringBase error;
    bool answered = imp_.GetPLLPkToPkJitter(input_, m, d, bandwidth, o, random_.Real(0, 1000),
                                            &error, &figure);
    PrintQuery("jitter", answered, error, figure);
    answered = imp_.GetPLLPhaseError(input_, d, bandwidth, &error, &figure);
    PrintQuery("phase error", answered, error, figure);
    answered = imp_.GetVcoFreq(input_, m, d, 0, &error, &figure);
    PrintQuery("vco", answered, error, figure);
    double phase = 0;
    double duty = 0;
    double asked_phase = random_.Real(-360, 360);
    double asked_duty = random_.Real(0, 100);
    answered = imp_.GetPLLPeriodPhaseDutyCycle(input_, m, d, o, asked_phase, asked_duty, 0, &error,
                                               &figure, &phase, &duty);
    PrintQuery("period", answered, error, figure);
    Print(phase);
    Print(duty);
    asked_phase = random_.Real(-360, 360);
    asked_duty = random_.Real(0, 100);
    Print(imp_.TSYNCalculateActualPhase(&asked_phase, &o, false));
    Print(imp_.TSYNCalculateActualDutyCycle(&asked_duty, &o));
    std::printf("\n");
  }

  void AskKru() {
    const char* const pin = kPins[random_.Int(0, 8)];
    const double m = random_.Int(2, 32);
    const double d = random_.Int(1, 32);
    double figure = 0;
    Port::StringBase error;
    const bool is_clkgen = random_.OneIn(4);
    const bool first = random_.OneIn(4);
    const bool second = random_.OneIn(2);
    const bool third = random_.OneIn(4);
    bool answered = imp_.GetKruPkToPkJitter(input_, pin, is_clkgen, first, second, third, m, d,
                                            &error, &figure);
    PrintQuery("KRU jitter", answered, error, figure);
    answered = imp_.GetKRUPhaseError(&error, &figure);
    PrintQuery("KRU phase error", answered, error, figure);
    double phase = 0;
    double duty = 0;
    const bool flag = random_.OneIn(4);
    const double dv = kDvs[random_.Int(0, 6)];
    answered = imp_.GetKRUPeriodPhaseDutyCycle(input_, pin, flag, m, d, dv, &error, &figure, &phase,
                                               &duty);
    PrintQuery("KRU period", answered, error, figure);
    Print(phase);
    Print(duty);
    std::printf("\n");
  }

  compare::Random random_;
  Ip::VorkelImp& imp_;
  double input_ = 0;
};

}  // namespace

int main(int argc, char** argv) {
  const int queries = argc > 2 ? std::atoi(argv[1]) : 0;
  if (queries <= 0) {
    std::fprintf(stderr, "usage: vorkel_figures QUERIES PART...\n");
    return 2;
  }
  for (int part = 2; part < argc; ++part) {
    std::printf("%s\n", argv[part]);
    for (int i = 0; i < queries; ++i) Queries(argv[part], static_cast<unsigned>(i)).Run();
  }
  return 0;
}
