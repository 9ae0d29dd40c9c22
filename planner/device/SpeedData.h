// What of a device only the engine and the jitter model need: the host's speed data.
//
// Tested by from_file_test.cpp.
#ifndef VORKEL_PLANNER_DEVICE_SPEEDDATA_H_
#define VORKEL_PLANNER_DEVICE_SPEEDDATA_H_

#include <memory>
#include <string_view>

class Dly_SpeedController;

namespace Device {
struct DeviceFile;
struct Grade;
}  // namespace Device

namespace planner {

// Of one grade. Nothing of it changes, so that many threads can use one, but for the host's
// calculator: Tw_BmPhysicalBlockModeler::GetCMBCalculator notes in the controller which
// calculator it has handed out, and the one who asked owns it. Planners do not ask for one; the
// jitter model takes the coefficients of the grade.
class SpeedData {
 public:
  // Throws std::invalid_argument when the file has no such grade.
  SpeedData(const ::Device::DeviceFile& file, std::string_view grade);
  ~SpeedData();
  SpeedData(const SpeedData&) = delete;
  SpeedData& operator=(const SpeedData&) = delete;

  // The host's controller, from which the engine reads its limits. The engine wants it as a
  // pointer to what it could change, and changes nothing.
  Dly_SpeedController* controller() const { return controller_.get(); }

  // The figures and coefficients as the device file has them.
  const ::Device::Grade& grade() const;

 private:
  std::unique_ptr<Dly_SpeedController> controller_;
};

}  // namespace planner

#endif  // VORKEL_PLANNER_DEVICE_SPEEDDATA_H_
