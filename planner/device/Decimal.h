// The figures of a grade, exactly.
//
// Tested by decimal_test.cpp.
#ifndef VORKEL_PLANNER_DEVICE_DECIMAL_H_
#define VORKEL_PLANNER_DEVICE_DECIMAL_H_

#include <cstddef>
#include <optional>
#include <string_view>

#include "hardware/Exact.h"
#include "hardware/Primitive.h"
#include "host/bundled/device/DeviceFile.h"
#include "host/bundled/device/KeywordTable.h"

namespace planner::device {

// The value of a decimal such as "187.617", "10e-3" or ".5": digits, maybe with a point among
// them, maybe with an exponent.
hardware::Rational ExactDecimal(std::string_view decimal);

// The figure of a keyword, by its index in ::Device::Keywords(); none when the grade does not
// give it. That of a grade without sources is the double.
std::optional<hardware::Rational> ExactFigure(const ::Device::Grade& grade, std::size_t index);

// The same primitive for the host.
::Device::Primitive HostPrimitive(hardware::Primitive primitive);

}  // namespace planner::device

#endif  // VORKEL_PLANNER_DEVICE_DECIMAL_H_
