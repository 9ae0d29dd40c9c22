// The host's speed-data service: the figures of one device at one speed grade, by keyword.
#ifndef VORKEL_HOST_DLY_SPEEDCONTROLLER_H_
#define VORKEL_HOST_DLY_SPEEDCONTROLLER_H_

#include <memory>

#include "host/Port_StringBase.h"

class PM_PIC;
class Pds_PdmBlock;  // a placed block of the design; queries about the device pass none

class Dly_SpeedController {
 public:
  // The host's own data of a controller.
  struct Data;

  // Reads the speed data of the device that `pic` stands for; `pic` is not kept. Throws
  // Port::Exception when there is none, after the reason was issued through the message
  // manager.
  explicit Dly_SpeedController(const PM_PIC* pic);
  virtual ~Dly_SpeedController();
  Dly_SpeedController(const Dly_SpeedController&) = delete;
  Dly_SpeedController& operator=(const Dly_SpeedController&) = delete;

  // The figure of a keyword, scaled so that its product with 1e9 is a frequency in MHz, a
  // period in ns or a plain count. The largest finite double when there is no such keyword.
  double GetBelDelay(const Port::StringBase& key, const Pds_PdmBlock* block) const;

  const Data& data() const { return *data_; }

 private:
  std::unique_ptr<Data> data_;
};

#endif  // VORKEL_HOST_DLY_SPEEDCONTROLLER_H_
