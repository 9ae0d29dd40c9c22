// Tested by jitter_test.cpp.
#include "planner/answer/CalculatorRefusal.h"

#include "host/bundled/calculator/Argument.h"
#include "host/bundled/calculator/KruArguments.h"
#include "host/bundled/calculator/LoopArguments.h"
#include "planner/answer/CalculatorTerms.h"

namespace planner::answer {

namespace {

// What checks refuse; they are made when the device has the coefficients.
template <typename Checks>
Refusal Refused(const Device& device, ::Device::CoefficientGroup group, Checks checks) {
  const ::Device::Grade* grade = GradeOf(device);
  if (grade == nullptr || !grade->Has(group)) return std::string();
  try {
    checks(*grade);
  } catch (const Calculator::ArgumentError& error) {
    std::string sentence = error.what();
    if (!sentence.empty() && sentence.back() == '.') sentence.pop_back();
    return sentence;
  }
  return std::nullopt;
}

double Number(int eighths) { return static_cast<double>(eighths) / hardware::kEighths; }

}  // namespace

Refusal LoopJitterRefusal(const Device& device, const Request& request,
                          const LoopSettings& settings, int divider_eighths) {
  return Refused(device, ::Device::CoefficientGroup::kLoop, [&](const ::Device::Grade& grade) {
    const double input = request.inputs.front().ToDouble();
    const double m = Number(settings.m);
    Calculator::LoopArguments arguments(grade, device.name);
    Calculator::CheckInputFrequency(input);
    arguments.CheckM(m);
    arguments.CheckD(settings.d);
    arguments.CheckOutputDivider(Number(divider_eighths));
    arguments.CheckInputJitter(request.input_jitter.ToDouble());
    arguments.CheckPfd(input / settings.d, CalculatorBandwidth(settings.bandwidth));
    arguments.CheckVco(input * m / settings.d);
  });
}

Refusal LoopPhaseErrorRefusal(const Device& device, const Request& request,
                              const LoopSettings& settings) {
  return Refused(device, ::Device::CoefficientGroup::kLoop, [&](const ::Device::Grade& grade) {
    const double input = request.inputs.front().ToDouble();
    Calculator::LoopArguments arguments(grade, device.name);
    Calculator::CheckInputFrequency(input);
    arguments.CheckD(settings.d);
    arguments.CheckPfd(input / settings.d, CalculatorBandwidth(settings.bandwidth));
  });
}

Refusal KruJitterRefusal(const Device& device, const Request& request, const KruSettings& settings,
                         hardware::Pin pin) {
  return Refused(device, ::Device::CoefficientGroup::kKru, [&](const ::Device::Grade& grade) {
    const Calculator::KruSettings model =
        CalculatorSettings(settings, request.inputs.front().ToDouble());
    auto arguments = Calculator::KruArguments::Certain(
        grade, device.name,
        settings.primitive == Primitive::kKruSp ? ::Device::kKruSp : ::Device::kKruClkgen);
    Calculator::CheckInputFrequency(model.input);
    const Calculator::KruPin& output = arguments.CheckPin(CalculatorPin(pin).code);
    arguments.CheckM(model.m);
    arguments.CheckD(model.d);
    arguments.CheckFrequency(output.source == Calculator::KruSource::kDivider
                                 ? Calculator::LineFrequency(model)
                                 : Calculator::PinFrequency(output, model));
  });
}

Refusal KruPhaseErrorRefusal(const Device& device) {
  return Refused(device, ::Device::CoefficientGroup::kKru, [](const ::Device::Grade&) {});
}

}  // namespace planner::answer
