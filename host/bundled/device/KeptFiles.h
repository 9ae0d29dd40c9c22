// Device files that were read before.
//
// Every script handle names its device anew, and most name the same one. Parsing its file is what
// takes the time, so what came of it is kept, with the text that it came of. The file is read at
// every call all the same and its text compared: whatever is wrong with it now is found now, and
// no change is missed, however soon after the last one and under whatever date it was made.
//
// Tested by kept_files_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_KEPTFILES_H_
#define VORKEL_HOST_BUNDLED_DEVICE_KEPTFILES_H_

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>

#include "host/bundled/device/DeviceFile.h"

namespace Device {

// How many files are kept; of more, those that were asked for last.
inline constexpr std::size_t kMostKeptFiles = 16;

// As DeviceFile::Read, for files that nobody changes. Of a file that still has the text that it
// had when it was last asked for, the answer is the same object. Can be called from several
// threads at once.
std::shared_ptr<const DeviceFile> ReadKept(const std::string& path, std::string_view device);

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_KEPTFILES_H_
