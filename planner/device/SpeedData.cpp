#include "planner/device/SpeedData.h"

#include <optional>
#include <stdexcept>
#include <string>
#include <utility>

#include "host/Dly_SpeedController.h"
#include "host/PM_PIC.h"
#include "host/bundled/device/Personality.h"

namespace planner {
namespace {

// A controller keeps the file that it is given, so it is given no more than the one grade.
std::unique_ptr<Dly_SpeedController> ControllerFor(const ::Device::DeviceFile& file,
                                                   std::string_view grade) {
  const ::Device::Grade* const data = file.FindGrade(grade);
  if (data == nullptr) {
    throw std::invalid_argument("device " + file.device + " has no grade " + std::string(grade));
  }
  ::Device::DeviceFile part;
  part.path = file.path;
  part.device = file.device;
  part.grades.push_back(*data);
  const PM_PIC pic(std::make_unique<PM_PIC::Data>(
      PM_PIC::Data{::Device::Part{std::make_shared<const ::Device::DeviceFile>(std::move(part)),
                                  std::nullopt, data->name}}));
  return std::make_unique<Dly_SpeedController>(&pic);
}

}  // namespace

SpeedData::SpeedData(const ::Device::DeviceFile& file, std::string_view grade)
    : controller_(ControllerFor(file, grade)) {}

SpeedData::~SpeedData() = default;

const ::Device::Grade& SpeedData::grade() const { return *controller_->data().grade; }

}  // namespace planner
