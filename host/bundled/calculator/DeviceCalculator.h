// The calculator of a device at one speed grade, from the coefficients of its device file.
//
// doc/calculator.md gives the arguments and answers of each operation.
//
// Tested by calculator_operations_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_CALCULATOR_DEVICECALCULATOR_H_
#define VORKEL_HOST_BUNDLED_CALCULATOR_DEVICECALCULATOR_H_

#include <atomic>
#include <memory>
#include <optional>
#include <string>

#include "host/Tw_BmCMBCalculator.h"
#include "host/bundled/calculator/Coefficients.h"
#include "host/bundled/device/DeviceFile.h"

namespace Calculator {

class DeviceCalculator final : public Tw_BmCMBCalculator {
 public:
  // `grade` is one of `file`. `place` is the controller's note of its living calculator: it names
  // this one until this one is destroyed.
  DeviceCalculator(std::shared_ptr<const Device::DeviceFile> file, const Device::Grade& grade,
                   std::shared_ptr<std::atomic<Tw_BmCMBCalculator*>> place);
  ~DeviceCalculator() override;

  bool VcoFrequency(double a1, double a2, double a3, double a4, Port::StringBase* error,
                    double* frequency) override;
  bool PllPkToPkJitter(double a1, double a2, double a3, Port::StringBase t4, double a5, double a6,
                       Port::StringBase* error, double* jitter) override;
  bool KruPkToPkJitter(double a1, int pin, bool isKruClkgen, bool f1, bool f2, bool f3,
                       const double& a2, const double& a3, Port::StringBase* error,
                       double* jitter) override;
  bool PllPhaseError(double a1, double a2, Port::StringBase t3, Port::StringBase* error,
                     double* phaseError) override;
  bool KruPhaseError(Port::StringBase* error, double* phaseError) override;
  bool KruPeriodPhaseDutyCycle(double a1, int pin, bool f1, double a2, double a3, double a4,
                               Port::StringBase* error, double* period, double* phase,
                               double* dutyCycle) override;
  bool PllPeriodPhaseDutyCycle(double a1, double a2, double a3, double a4, double a5, double a6,
                               double a7, Port::StringBase* error, double* period, double* phase,
                               double* dutyCycle) override;

 private:
  // Throw ArgumentError when the grade does not have the coefficients.
  const LoopCoefficients& RequireLoop() const;
  const KruCoefficients& RequireKru() const;
  [[noreturn]] void RefuseWithout(const char* primitives) const;

  std::shared_ptr<const Device::DeviceFile> file_;
  const Device::Grade& grade_;
  std::optional<LoopCoefficients> loop_;
  std::optional<KruCoefficients> kru_;
  std::string device_name_;  // for error sentences
  std::shared_ptr<std::atomic<Tw_BmCMBCalculator*>> place_;
};

}  // namespace Calculator

#endif  // VORKEL_HOST_BUNDLED_CALCULATOR_DEVICECALCULATOR_H_
