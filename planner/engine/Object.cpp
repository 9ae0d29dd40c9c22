#include "planner/engine/Object.h"

#include <cmath>
#include <cstdint>
#include <cstdio>
#include <string>

#include "engine/CLocale.h"
#include "planner/device/SpeedData.h"

namespace planner::engine {

std::unique_ptr<Ip::VorkelImp> MakeObject(const Device& device) {
  auto object = std::make_unique<Ip::VorkelImp>(nullptr);
  object->SetDevice(Port::StringBase(std::string_view(device.part)));
  // With this one the engine asks the host for none, which would look the part up by its name.
  // The object does not own it.
  object->speedController = device.speed_data->controller();
  return object;
}

namespace {

std::string TextOf(double number) {
  // Most are whole, and those are quickly written.
  constexpr double kLargestWhole = 1e15;
  if (std::fabs(number) < kLargestWhole && number == std::floor(number) && !std::signbit(number)) {
    return std::to_string(static_cast<std::int64_t>(number));
  }
  const Ip::CLocale in_c_locale;
  char text[40];
  std::snprintf(text, sizeof text, "%.17g", number);
  return text;
}

}  // namespace

Port::StringBase ListOf(const std::vector<double>& numbers) {
  std::string list;
  for (const double number : numbers) {
    if (!list.empty()) list += ' ';
    list += TextOf(number);
  }
  return Port::StringBase(std::string_view(list));
}

std::vector<std::size_t> UsedOutputs(const Request& request) {
  std::vector<std::size_t> used;
  for (std::size_t i = 0; i < request.outputs.size(); ++i) {
    if (request.outputs[i].used) used.push_back(i);
  }
  return used;
}

std::vector<double> Frequencies(const Request& request) {
  std::vector<double> frequencies;
  for (const std::size_t index : UsedOutputs(request)) {
    frequencies.push_back(request.outputs[index].frequency.ToDouble());
  }
  return frequencies;
}

}  // namespace planner::engine
