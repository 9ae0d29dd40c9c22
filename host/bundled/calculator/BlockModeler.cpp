// How calculators are handed out.
//
// Tested by calculator_lifetime_test.cpp.
#include <memory>
#include <mutex>

#include "host/Dly_SpeedController.h"
#include "host/Tw_BmCMBCalculator.h"
#include "host/bundled/calculator/DeviceCalculator.h"
#include "host/bundled/device/Personality.h"

Tw_BmCMBCalculator::~Tw_BmCMBCalculator() = default;

bool Tw_BmCMBCalculator::Unused(Port::StringBase* error) {
  if (error != nullptr) *error = "This operation does nothing.";
  return false;
}

Tw_BmCMBCalculator* Tw_BmPhysicalBlockModeler::GetCMBCalculator(Dly_SpeedController* controller) {
  if (controller == nullptr) return nullptr;
  const Dly_SpeedController::Data& data = controller->data();
  // Of several threads that ask for the same controller one makes it.
  static constinit std::mutex making;
  const std::lock_guard lock(making);
  if (Tw_BmCMBCalculator* const made = *data.calculator) return made;
  const Device::Grade& grade = *data.grade;
  if (!grade.Has(Device::CoefficientGroup::kLoop) && !grade.Has(Device::CoefficientGroup::kKru)) {
    return nullptr;
  }
  // The caller owns it. It notes itself in the controller's place.
  return new Calculator::DeviceCalculator(data.file, grade, data.calculator);
}
