// Where the device files stand that come with the library.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_BUNDLEDFOLDER_H_
#define VORKEL_HOST_BUNDLED_DEVICE_BUNDLEDFOLDER_H_

#include <string>

namespace Device {

// The folder "devices" that comes with the library (or program) that this code is part of, see
// Shipped.h, as an absolute path; the one beside it when there is none. Empty when the system does
// not tell where that is. Throws std::bad_alloc.
const std::string& BundledFolder();

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_BUNDLEDFOLDER_H_
