#include "host/bundled/calculator/DeviceCalculator.h"

#include <utility>

#include "host/bundled/calculator/Argument.h"
#include "host/bundled/calculator/KruArguments.h"
#include "host/bundled/calculator/KruFigures.h"
#include "host/bundled/calculator/LoopArguments.h"
#include "host/bundled/calculator/LoopFigures.h"
#include "host/bundled/calculator/LoopTiming.h"

namespace Calculator {
namespace {

constexpr double kNanosecondsTimesMegahertz = 1000.0;

// Runs an operation: true when it returns, false with its sentence in `error` when an argument
// is refused.
template <typename Operation>
bool Answer(Port::StringBase* error, Operation operation) {
  try {
    operation();
    return true;
  } catch (const ArgumentError& refusal) {
    *error = Port::StringBase(refusal.what());
    return false;
  }
}

}  // namespace

DeviceCalculator::DeviceCalculator(std::shared_ptr<const Device::DeviceFile> file,
                                   const Device::Grade& grade,
                                   std::shared_ptr<std::atomic<Tw_BmCMBCalculator*>> place)
    : file_(std::move(file)),
      grade_(grade),
      device_name_(file_->device + '-' + grade.name),
      place_(std::move(place)) {
  if (grade_.Has(Device::CoefficientGroup::kLoop)) loop_ = LoopCoefficients::Of(grade_);
  if (grade_.Has(Device::CoefficientGroup::kKru)) kru_ = KruCoefficients::Of(grade_);
  *place_ = this;
}

DeviceCalculator::~DeviceCalculator() { *place_ = nullptr; }

void DeviceCalculator::RefuseWithout(const char* primitives) const {
  throw ArgumentError("Device " + device_name_ + " has no calculator coefficients for " +
                      primitives + ".");
}

const LoopCoefficients& DeviceCalculator::RequireLoop() const {
  if (!loop_) RefuseWithout("PLL and TSYN");
  return *loop_;
}

const KruCoefficients& DeviceCalculator::RequireKru() const {
  if (!kru_) RefuseWithout("KRU_SP and KRU_CLKGEN");
  return *kru_;
}

// a1 input frequency (MHz), a2 M, a3 D, a4 feedback divider (0 or 1: none). This is arithmetic,
// and so is answered beyond the range of the VCO, too: to hold it against that range is what it
// is asked for.
bool DeviceCalculator::VcoFrequency(double a1, double a2, double a3, double a4,
                                    Port::StringBase* error, double* frequency) {
  return Answer(error, [&] {
    LoopArguments arguments(grade_, device_name_);
    CheckInputFrequency(a1);
    arguments.CheckM(a2);
    arguments.CheckD(a3);
    arguments.CheckFeedbackDivider(a4);
    *frequency = a1 * a2 / a3 * (a4 == 0.0 ? 1.0 : a4);
  });
}

// a1 input frequency (MHz), a2 M, a3 D, t4 bandwidth, a5 output divider, a6 input jitter (ps).
bool DeviceCalculator::PllPkToPkJitter(double a1, double a2, double a3, Port::StringBase t4,
                                       double a5, double a6, Port::StringBase* error,
                                       double* jitter) {
  return Answer(error, [&] {
    LoopArguments arguments(grade_, device_name_);
    const LoopCoefficients& coefficients = RequireLoop();
    CheckInputFrequency(a1);
    arguments.CheckM(a2);
    arguments.CheckD(a3);
    const Bandwidth bandwidth = BandwidthOf(t4.View());
    arguments.CheckOutputDivider(a5);
    arguments.CheckInputJitter(a6);
    const Loop loop = {.pfd = a1 / a3, .vco = a1 * a2 / a3, .bandwidth = bandwidth};
    arguments.CheckPfd(loop.pfd, bandwidth);
    arguments.CheckVco(loop.vco);
    *jitter = LoopPkToPkJitter(coefficients, loop, a6);
  });
}

// a1 input frequency (MHz), f1 CLKIN_DIVIDE_BY_2, f2 feedback used, f3 fixed phase shift in use,
// a2 M, a3 D.
bool DeviceCalculator::KruPkToPkJitter(double a1, int pin, bool isKruClkgen, bool f1, bool f2,
                                       bool f3, const double& a2, const double& a3,
                                       Port::StringBase* error, double* jitter) {
  return Answer(error, [&] {
    auto arguments = KruArguments::Certain(grade_, device_name_,
                                           isKruClkgen ? Device::kKruClkgen : Device::kKruSp);
    const KruCoefficients& coefficients = RequireKru();
    CheckInputFrequency(a1);
    const KruPin& output = arguments.CheckPin(pin);
    arguments.CheckFlag("CLKIN_DIVIDE_BY_2", f1);
    arguments.CheckFlag("Feedback used", f2);
    arguments.CheckFlag("Fixed phase shift", f3);
    arguments.CheckM(a2);
    arguments.CheckD(a3);
    const KruSettings settings = {
        .input = a1, .divide_by_2 = f1, .feedback = f2, .phase_shift = f3, .m = a2, .d = a3};
    arguments.CheckFrequency(output.source == KruSource::kDivider ? LineFrequency(settings)
                                                                  : PinFrequency(output, settings));
    *jitter = Calculator::KruPkToPkJitter(coefficients, output, settings);
  });
}

// a1 input frequency (MHz), a2 D, t3 bandwidth.
bool DeviceCalculator::PllPhaseError(double a1, double a2, Port::StringBase t3,
                                     Port::StringBase* error, double* phaseError) {
  return Answer(error, [&] {
    LoopArguments arguments(grade_, device_name_);
    const LoopCoefficients& coefficients = RequireLoop();
    CheckInputFrequency(a1);
    arguments.CheckD(a2);
    const Bandwidth bandwidth = BandwidthOf(t3.View());
    const double pfd = a1 / a2;
    arguments.CheckPfd(pfd, bandwidth);
    *phaseError = LoopPhaseError(coefficients, pfd, bandwidth);
  });
}

bool DeviceCalculator::KruPhaseError(Port::StringBase* error, double* phaseError) {
  return Answer(error, [&] {
    KruArguments::Any(grade_, device_name_);
    *phaseError = RequireKru().phase_error;
  });
}

// a1 input frequency (MHz), f1 CLKIN_DIVIDE_BY_2, a2 M, a3 D, a4 CLKDV divide.
bool DeviceCalculator::KruPeriodPhaseDutyCycle(double a1, int pin, bool f1, double a2, double a3,
                                               double a4, Port::StringBase* error, double* period,
                                               double* phase, double* dutyCycle) {
  return Answer(error, [&] {
    auto arguments = KruArguments::Any(grade_, device_name_);
    CheckInputFrequency(a1);
    const KruPin& output = arguments.CheckPin(pin);
    arguments.CheckFlag("CLKIN_DIVIDE_BY_2", f1);
    arguments.CheckM(a2);
    arguments.CheckD(a3);
    arguments.CheckDivide(a4);
    const KruSettings settings = {.input = a1, .divide_by_2 = f1, .m = a2, .d = a3, .clkdv = a4};
    *period = kNanosecondsTimesMegahertz / PinFrequency(output, settings);
    *phase = output.phase;
    *dutyCycle = KruDutyCycle(output, settings);
  });
}

// a1 input frequency (MHz), a2 M, a3 D, a4 output divider, a5 requested phase (degrees), a6
// requested duty cycle (percent; 0: none), a7 largest high or low count (0: the device's). With
// a fractional M or divider there is no fixed step to choose: the output starts with the VCO's
// first phase and has half its cycle high.
bool DeviceCalculator::PllPeriodPhaseDutyCycle(double a1, double a2, double a3, double a4,
                                               double a5, double a6, double a7,
                                               Port::StringBase* error, double* period,
                                               double* phase, double* dutyCycle) {
  return Answer(error, [&] {
    LoopArguments arguments(grade_, device_name_);
    CheckInputFrequency(a1);
    arguments.CheckM(a2);
    arguments.CheckD(a3);
    arguments.CheckOutputDivider(a4);
    arguments.CheckRequestedPhase(a5);
    arguments.CheckRequestedDuty(a6);
    const double largest_count = arguments.CheckLargestCount(a7, a4);
    const bool fractional = IsFractional(a2) || IsFractional(a4);
    *period = kNanosecondsTimesMegahertz / (a1 * a2 / a3 / a4);
    *phase = fractional ? 0.0 : PhaseOnStep(a5, a4);
    *dutyCycle = fractional ? 50.0 : DutyOnStep(a6, a4, largest_count);
  });
}

}  // namespace Calculator
