// The host's device personality: which device, package and speed grade a part name means.
#ifndef VORKEL_HOST_PM_PIC_H_
#define VORKEL_HOST_PM_PIC_H_

#include <memory>

#include "host/Port_StringBase.h"

// How a part name is bound to a device; 0 is the host's usual way.
enum PM_PARTNAME_BINDING : int { PM_PARTNAME_BINDING_USUAL = 0 };

class PM_PIC {
 public:
  // The host's own data of a personality.
  struct Data;

  // Finds the device that `partName` names. `isPartName` is true for a part name such as
  // "<device><package>-<grade>", of which package and grade may be missing, and false for a
  // bare device name. Throws Port::Exception when there is no such device, package or grade,
  // after the reason was issued through the message manager.
  PM_PIC(const Port::StringBase& partName, bool isPartName, PM_PARTNAME_BINDING binding);
  // The personality of a device that the host has already. Not for users of the interface, who
  // have no Data.
  explicit PM_PIC(std::unique_ptr<Data> data);
  virtual ~PM_PIC();
  PM_PIC(const PM_PIC&) = delete;
  PM_PIC& operator=(const PM_PIC&) = delete;

  // Fills the package and the speed grade that the part name left out with the device's
  // defaults. False when a default is needed and the device has none.
  bool fill_defaults();

  const Data& data() const { return *data_; }

 private:
  std::unique_ptr<Data> data_;
};

#endif  // VORKEL_HOST_PM_PIC_H_
