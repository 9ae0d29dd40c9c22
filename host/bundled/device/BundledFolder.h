// Where the device files stand that come with the library.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_BUNDLEDFOLDER_H_
#define VORKEL_HOST_BUNDLED_DEVICE_BUNDLEDFOLDER_H_

#include <string>

namespace Device {

// The folder "devices" beside the library (or program) that this code is part of, as an
// absolute path. Empty when the system does not tell where that is.
const std::string& BundledFolder();

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_BUNDLEDFOLDER_H_
