// What KRU_SP and KRU_CLKGEN accept.
//
// A pin that does not need M and D, or the divide, leaves them without effect. They may then be
// 0, which is what the accessors of the solver answer for a value that it has not chosen; any
// other value must be legal all the same.
//
// Tested by calculator_kru_arguments_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_CALCULATOR_KRUARGUMENTS_H_
#define VORKEL_HOST_BUNDLED_CALCULATOR_KRUARGUMENTS_H_

#include <string_view>

#include "host/bundled/calculator/Candidates.h"
#include "host/bundled/calculator/KruPin.h"
#include "host/bundled/device/DeviceFile.h"

namespace Calculator {

// Checks the arguments of one query about one pin. Every check throws ArgumentError when no KRU
// that is meant can take the argument together with those before it.
class KruArguments {
 public:
  // A query about any KRU of the device, and one about a certain one. Throw ArgumentError when
  // the grade has none or not that one; `device_name` is for the sentence. The grade must
  // outlive the checks.
  static KruArguments Any(const Device::Grade& grade, std::string_view device_name);
  static KruArguments Certain(const Device::Grade& grade, std::string_view device_name,
                              Device::Primitive primitive);

  // The pin of a code. To be asked before the checks below.
  const KruPin& CheckPin(int code);

  // A flag that only the KRU_SP can have set.
  void CheckFlag(std::string_view what, bool flag);
  void CheckM(double m);
  void CheckD(double d);
  void CheckDivide(double divide);  // of CLKDV

  // Holds the frequency in MHz at which the pin would run against the device's limits. A CLKDV
  // pin is judged by the frequency of the delay line.
  void CheckFrequency(double frequency) const;

 private:
  KruArguments(const Device::Grade& grade, std::vector<Device::Primitive> primitives);
  void CheckRatioPart(std::string_view what, double value, double lowest);

  const Device::Grade& grade_;
  Candidates candidates_;
  const KruPin* pin_ = nullptr;
};

}  // namespace Calculator

#endif  // VORKEL_HOST_BUNDLED_CALCULATOR_KRUARGUMENTS_H_
