#include "tests/model/HostDevice.h"

#include <limits>

#include "host/Port_Exception.h"

namespace model {

HostDevice::HostDevice(const std::string& part)
    : personality_(part.c_str(), true, PM_PARTNAME_BINDING_USUAL) {
  personality_.fill_defaults();
  controller_ = std::make_unique<Dly_SpeedController>(&personality_);
  calculator_.reset(Tw_BmPhysicalBlockModeler::GetCMBCalculator(controller_.get()));
}

std::shared_ptr<const HostDevice> HostDevice::Find(const std::string& part) {
  try {
    return std::shared_ptr<const HostDevice>(new HostDevice(part));
  } catch (const Port::Exception&) {
    return nullptr;
  }
}

std::optional<double> HostDevice::Figure(const std::string& keyword) const {
  constexpr double kScale = 1e9;
  const double figure = controller_->GetBelDelay(keyword.c_str(), nullptr);
  if (figure == std::numeric_limits<double>::max()) return std::nullopt;
  return figure * kScale;
}

}  // namespace model
