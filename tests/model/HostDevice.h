// A device as the model of an object knows it: what the host's services say of it, asked for without
// the engine.
#ifndef VORKEL_TESTS_MODEL_HOSTDEVICE_H_
#define VORKEL_TESTS_MODEL_HOSTDEVICE_H_

#include <memory>
#include <optional>
#include <string>

#include "host/Dly_SpeedController.h"
#include "host/PM_PIC.h"
#include "host/Tw_BmCMBCalculator.h"

namespace model {

class HostDevice {
 public:
  // The device of a part name; null when there is none.
  static std::shared_ptr<const HostDevice> Find(const std::string& part);

  // The figure of a keyword as the engine is to read it: MHz, ns or a count.
  std::optional<double> Figure(const std::string& keyword) const;

  // Null when the device has none.
  Tw_BmCMBCalculator* calculator() const { return calculator_.get(); }

 private:
  explicit HostDevice(const std::string& part);

  PM_PIC personality_;
  std::unique_ptr<Dly_SpeedController> controller_;
  std::unique_ptr<Tw_BmCMBCalculator> calculator_;
};

}  // namespace model

#endif  // VORKEL_TESTS_MODEL_HOSTDEVICE_H_
