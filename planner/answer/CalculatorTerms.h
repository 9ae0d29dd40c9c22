// The planner's settings in the terms of the bundled timing calculator.
#ifndef VORKEL_PLANNER_ANSWER_CALCULATORTERMS_H_
#define VORKEL_PLANNER_ANSWER_CALCULATORTERMS_H_

#include "hardware/Kru.h"
#include "host/bundled/calculator/KruFigures.h"
#include "host/bundled/calculator/KruPin.h"
#include "host/bundled/calculator/LoopArguments.h"
#include "host/bundled/device/DeviceFile.h"
#include "planner/Device.h"
#include "planner/Settings.h"

namespace planner::answer {

// The grade with the coefficients; null of a device without any speed data.
const ::Device::Grade* GradeOf(const Device& device);

Calculator::Bandwidth CalculatorBandwidth(Bandwidth bandwidth);

// The pin with the clock that a pin has but for a divider that moves no edge: CLKFX for CLKFXDV,
// which the calculator does not know.
const Calculator::KruPin& CalculatorPin(hardware::Pin pin);

// `input` in MHz.
Calculator::KruSettings CalculatorSettings(const KruSettings& settings, double input);

}  // namespace planner::answer

#endif  // VORKEL_PLANNER_ANSWER_CALCULATORTERMS_H_
